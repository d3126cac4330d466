// A grey picture. The surface's only channel, which Cairo takes for opacity, is the brightness: white ink lays it on
// and black ink takes it off, so that its rows are those of the picture.
#include <png.h>

#include <cmath>
#include <csetjmp>
#include <cstdio>
#include <vector>

#include "cairo/outputs.h"
#include "partnerkit/run_time_error.h"
#include "platform/posix_calls.h"

namespace partnerkit::cairo {

namespace {

// Bars and letters on white have nothing that a filter or a longer search would find.
constexpr int kCompression = 3;
constexpr double kInchesPerMetre = 1 / 0.0254;

class PngWriter {
 public:
  explicit PngWriter(SinkStream& stream)
      : stream_(stream),
        png_(png_create_write_struct(PNG_LIBPNG_VER_STRING, this, Fail, [](png_struct*, const char*) {})) {
    if (png_ != nullptr) info_ = png_create_info_struct(png_);
    if (info_ == nullptr) {
      png_destroy_write_struct(&png_, nullptr);
      platform::Raise(run_time::kOutOfMemory, "PNG", "libpng takes more than there is");
    }
  }
  ~PngWriter() { png_destroy_write_struct(&png_, &info_); }
  PngWriter(const PngWriter&) = delete;
  PngWriter& operator=(const PngWriter&) = delete;

  void Write(std::vector<png_byte*>& rows, int width, int dotsPerInch) {
    if (Written(rows.data(), {static_cast<png_uint_32>(width), static_cast<png_uint_32>(rows.size())},
                static_cast<png_uint_32>(std::lround(dotsPerInch * kInchesPerMetre)))) {
      return;
    }
    stream_.RaiseFailure();
    platform::Raise(run_time::kDeviceError, "PNG", cause_);
  }

 private:
  struct Size {
    png_uint_32 width, height;
  };

  [[noreturn]] static void Fail(png_struct* png, const char* cause) {
    auto& writer = *static_cast<PngWriter*>(png_get_error_ptr(png));
    std::snprintf(writer.cause_, sizeof writer.cause_, "%s", cause);
    png_longjmp(png, 1);
  }
  static void Take(png_struct* png, png_byte* bytes, std::size_t length) {
    auto& stream = *static_cast<SinkStream*>(png_get_io_ptr(png));
    if (!stream.Write({reinterpret_cast<const char*>(bytes), length})) png_error(png, "not taken");
  }

  // A failure jumps back to here: no object made below may need to be destroyed.
  bool Written(png_byte** rows, Size size, png_uint_32 dotsPerMetre) {
    if (setjmp(png_jmpbuf(png_)) != 0) return false;
    png_set_write_fn(png_, &stream_, Take, nullptr);
    png_set_filter(png_, PNG_FILTER_TYPE_BASE, PNG_FILTER_NONE);
    png_set_compression_level(png_, kCompression);
    png_set_IHDR(png_, info_, size.width, size.height, 8, PNG_COLOR_TYPE_GRAY, PNG_INTERLACE_NONE,
                 PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
    png_set_pHYs(png_, info_, dotsPerMetre, dotsPerMetre, PNG_RESOLUTION_METER);
    png_write_info(png_, info_);
    png_write_image(png_, rows);
    png_write_end(png_, info_);
    return true;
  }

  SinkStream& stream_;
  png_struct* png_;
  png_info* info_ = nullptr;
  char cause_[128] = "";
};

class PngOutput : public Output {
 public:
  PngOutput(ByteSink sink, int dotsPerInch) : Output(std::move(sink)), dotsPerInch_(dotsPerInch) {}

  double UnitsPerPixel() const override { return 1; }

  void StartPage(const PageSize& size) override {
    if (surface_) RaiseInvalidCall("A PNG has one page");
    surface_.reset(cairo_image_surface_create(CAIRO_FORMAT_A8, size.across, size.down));
    const Context page(cairo_create(surface_.get()));
    Use(page.get(), Ink::kWhite);
    cairo_paint(page.get());
  }

  void EndPage(cairo_t*) override {}

  void EndDoc() override {
    cairo_surface_flush(surface_.get());
    unsigned char* const picture = cairo_image_surface_get_data(surface_.get());
    const int stride = cairo_image_surface_get_stride(surface_.get());
    std::vector<png_byte*> rows(static_cast<std::size_t>(cairo_image_surface_get_height(surface_.get())));
    for (std::size_t row = 0; row < rows.size(); ++row) rows[row] = picture + row * static_cast<std::size_t>(stride);
    PngWriter(stream_).Write(rows, cairo_image_surface_get_width(surface_.get()), dotsPerInch_);
    cairo_surface_finish(surface_.get());
  }

  void Use(cairo_t* page, Ink ink) const override {
    cairo_set_source_rgba(page, 0, 0, 0, 1);
    cairo_set_operator(page, ink == Ink::kWhite ? CAIRO_OPERATOR_OVER : CAIRO_OPERATOR_CLEAR);
  }

 private:
  int dotsPerInch_;
};

}  // namespace

std::unique_ptr<Output> MakePngOutput(ByteSink sink, int dotsPerInch) {
  return std::make_unique<PngOutput>(std::move(sink), dotsPerInch);
}

}  // namespace partnerkit::cairo

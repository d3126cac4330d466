// PDF and SVG.
#include <cairo-pdf.h>
#include <cairo-svg.h>

#include "cairo/outputs.h"
#include "values/windows_1252.h"

namespace partnerkit::cairo {

namespace {

constexpr double kPointsPerInch = 72;

// A printer blackens each dot that a shape touches, however little. Cairo rounds to 1/256 of a point, so that a bar
// that ends with a pixel may reach into the next one, which widens it by a whole dot.
constexpr double kInset = 1.0 / 32;

class VectorOutput : public Output {
 public:
  VectorOutput(ByteSink sink, int dotsPerInch)
      : Output(std::move(sink)), unitsPerPixel_(kPointsPerInch / dotsPerInch) {}

  double UnitsPerPixel() const override { return unitsPerPixel_; }
  double Inset() const override { return kInset; }

 private:
  double unitsPerPixel_;
};

class PdfOutput : public VectorOutput {
 public:
  PdfOutput(ByteSink sink, const PdfOptions& options)
      : VectorOutput(std::move(sink), options.dotsPerInch), title_(Utf8(options.title)), created_(options.created) {}

  void StartPage(const PageSize& size) override {
    if (surface_) {
      cairo_pdf_surface_set_size(surface_.get(), size.width, size.height);
      return;
    }
    surface_.reset(cairo_pdf_surface_create_for_stream(SinkStream::WriteForCairo, &stream_, size.width, size.height));
    cairo_pdf_surface_set_metadata(surface_.get(), CAIRO_PDF_METADATA_TITLE, title_.c_str());
    // Unless told, Cairo writes the time of day; told an empty one, none.
    cairo_pdf_surface_set_metadata(surface_.get(), CAIRO_PDF_METADATA_CREATE_DATE, created_.c_str());
  }

 private:
  std::string title_, created_;
};

class SvgOutput : public VectorOutput {
 public:
  using VectorOutput::VectorOutput;

  void StartPage(const PageSize& size) override {
    if (surface_) RaiseInvalidCall("An SVG has one page");
    surface_.reset(cairo_svg_surface_create_for_stream(SinkStream::WriteForCairo, &stream_, size.width, size.height));
    // Viewers put an SVG on any ground, a dark one too.
    const Context page(cairo_create(surface_.get()));
    Use(page.get(), Ink::kWhite);
    cairo_paint(page.get());
  }
};

}  // namespace

std::unique_ptr<Output> MakePdfOutput(ByteSink sink, const PdfOptions& options) {
  return std::make_unique<PdfOutput>(std::move(sink), options);
}

std::unique_ptr<Output> MakeSvgOutput(ByteSink sink, int dotsPerInch) {
  return std::make_unique<SvgOutput>(std::move(sink), dotsPerInch);
}

}  // namespace partnerkit::cairo

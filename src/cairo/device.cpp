#include <algorithm>
#include <cmath>
#include <cstdint>
#include <optional>
#include <vector>

#include "cairo/devices.h"
#include "cairo/fonts.h"
#include "cairo/outputs.h"

namespace partnerkit::cairo {

namespace {

constexpr double kTwipsPerInch = 1440;
constexpr double kPointsPerInch = 72;
constexpr int kMostHundredths = 20000;
constexpr int kMostDotsPerInch = 9600;
constexpr int kDefaultPoints = 12;
// Of a character cell, either way; FreeType scales no font to 65,536 pixels.
constexpr double kMostPixels = 16384;
constexpr std::size_t kMostBars = 1024;

struct Box {
  std::int64_t left, top, right, bottom;
};

class CairoDevice : public DrawingDevice {
 public:
  CairoDevice(std::unique_ptr<Output> output, int dotsPerInch)
      : dotsPerInch_(dotsPerInch), output_(std::move(output)), fonts_(output_->UnitsPerPixel()) {}

  double TwipsPerPixelX() const override { return kTwipsPerInch / dotsPerInch_; }
  double TwipsPerPixelY() const override { return kTwipsPerInch / dotsPerInch_; }

  void StartPage(int width, int height) override;
  void EndPage() override;
  void EndDoc() override;
  void Rectangle(const PixelRect& rect, int penWidth) override;
  void Text(int x, int y, std::string_view text, const Font& font, const TextInks& inks) override;

 private:
  int Pixels(int hundredths) const {
    return std::max(1, static_cast<int>(std::lround(hundredths / 100.0 * dotsPerInch_)));
  }
  cairo_t* Page() const {
    if (!page_) RaiseInvalidCall();
    return page_.get();
  }
  void Use(Ink ink);
  void AddBar(const Box& box);
  void AddPath(const Box& box);
  void DrawBars();
  void Fill(const Box& box, Ink ink);
  std::optional<Box> OnPage(const Box& box) const;
  double LayOut(int x, double baseline, std::string_view text, SizedFont& font);
  void DrawGlyphs(const SizedFont& font, Ink ink);

  const int dotsPerInch_;
  std::unique_ptr<Output> output_;
  Fonts fonts_;
  PageSize size_{};
  Context page_;
  std::optional<Ink> ink_;
  bool ended_ = false;
  std::vector<Box> bars_;  // black ones that are still to be drawn
  // The text in hand; kept for their memory.
  std::string utf8_;
  std::vector<cairo_glyph_t> glyphs_;
  std::vector<cairo_text_cluster_t> clusters_;
};

void CairoDevice::StartPage(int width, int height) {
  if (page_ || ended_) RaiseInvalidCall();
  if (std::min(width, height) <= 0 || std::max(width, height) > kMostHundredths) {
    RaiseInvalidCall("A page of " + std::to_string(width) + " x " + std::to_string(height) + " hundredths of an inch");
  }
  size_ = {width / 100.0 * kPointsPerInch, height / 100.0 * kPointsPerInch, Pixels(width), Pixels(height)};
  output_->CheckAll(CAIRO_STATUS_SUCCESS);
  output_->StartPage(size_);
  output_->CheckAll(CAIRO_STATUS_SUCCESS);
  Context page(cairo_create(output_->PageSurface()));
  output_->CheckAll(cairo_status(page.get()));
  cairo_scale(page.get(), output_->UnitsPerPixel(), output_->UnitsPerPixel());
  cairo_set_antialias(page.get(), CAIRO_ANTIALIAS_NONE);
  page_ = std::move(page);
  ink_.reset();
}

void CairoDevice::EndPage() {
  cairo_t* page = Page();
  DrawBars();
  output_->EndPage(page);
  const cairo_status_t status = cairo_status(page);
  page_.reset();
  output_->CheckAll(status);
}

void CairoDevice::EndDoc() {
  if (page_ || ended_) RaiseInvalidCall();
  ended_ = true;
  if (output_->PageSurface() == nullptr) return;
  output_->CheckAll(CAIRO_STATUS_SUCCESS);
  output_->EndDoc();
  output_->CheckAll(CAIRO_STATUS_SUCCESS);
}

void CairoDevice::Use(Ink ink) {
  if (ink_ != ink) output_->Use(page_.get(), ink);
  ink_ = ink;
}

void CairoDevice::Rectangle(const PixelRect& rect, int penWidth) {
  Page();
  const auto [left, right] = std::minmax<std::int64_t>({rect.left, rect.right});
  const auto [top, bottom] = std::minmax<std::int64_t>({rect.top, rect.bottom});
  if (left == right || top == bottom) return;
  const std::int64_t pen = std::max(1, penWidth), before = pen / 2;
  const Box outer{left - before, top - before, right - 1 - before + pen, bottom - 1 - before + pen};
  const Box inner{outer.left + pen, outer.top + pen, outer.right - pen, outer.bottom - pen};
  if (inner.left >= inner.right || inner.top >= inner.bottom) {
    AddBar(outer);
    return;
  }
  AddBar({outer.left, outer.top, outer.right, inner.top});
  AddBar({outer.left, inner.bottom, outer.right, outer.bottom});
  AddBar({outer.left, outer.top, inner.left, outer.bottom});
  AddBar({inner.right, outer.top, outer.right, outer.bottom});
}

// Bars that touch become one, so that no viewer shows a seam between a symbol's modules.
void CairoDevice::AddBar(const Box& box) {
  const std::optional<Box> bar = OnPage(box);
  if (!bar) return;
  if (!bars_.empty()) {
    Box& last = bars_.back();
    if (last.top == bar->top && last.bottom == bar->bottom && last.right == bar->left) {
      last.right = bar->right;
      return;
    }
  }
  if (bars_.size() == kMostBars) DrawBars();
  bars_.push_back(*bar);
}

void CairoDevice::AddPath(const Box& box) {
  const double inset = output_->Inset();
  cairo_rectangle(page_.get(), static_cast<double>(box.left) + inset, static_cast<double>(box.top) + inset,
                  static_cast<double>(box.right - box.left) - 2 * inset,
                  static_cast<double>(box.bottom - box.top) - 2 * inset);
}

void CairoDevice::DrawBars() {
  if (bars_.empty()) return;
  Use(Ink::kBlack);
  for (const Box& bar : bars_) AddPath(bar);
  bars_.clear();
  cairo_fill(page_.get());
  output_->CheckAll(cairo_status(page_.get()));
}

void CairoDevice::Fill(const Box& box, Ink ink) {
  const std::optional<Box> seen = OnPage(box);
  if (!seen) return;
  Use(ink);
  AddPath(*seen);
  cairo_fill(page_.get());
}

// Cairo counts in 24 bits before the point: what lies outside of the page is cut off here.
std::optional<Box> CairoDevice::OnPage(const Box& box) const {
  const Box seen{std::max<std::int64_t>(box.left, 0), std::max<std::int64_t>(box.top, 0),
                 std::min<std::int64_t>(box.right, size_.across), std::min<std::int64_t>(box.bottom, size_.down)};
  if (seen.left >= seen.right || seen.top >= seen.bottom) return std::nullopt;
  return seen;
}

void CairoDevice::Text(int x, int y, std::string_view text, const Font& font, const TextInks& inks) {
  Page();
  const double height = font.height == 0 ? std::round(kDefaultPoints / kPointsPerInch * dotsPerInch_)
                                         : std::abs(static_cast<double>(font.height));
  const double width = std::abs(static_cast<double>(font.width));
  if (std::max(height, width) > kMostPixels) {
    RaiseInvalidCall("A font of " + std::to_string(font.height) + " x " + std::to_string(font.width) + " pixels");
  }
  if (y >= size_.down || y + height <= 0) return;
  SizedFont& sized = fonts_.Find(font, static_cast<int>(height), static_cast<int>(width));
  const double right = LayOut(x, y + sized.face.Ascent() * sized.sizeY, text, sized);
  DrawBars();
  if (inks.ground != Ink::kWhite) {
    Fill({x, y, static_cast<std::int64_t>(std::ceil(right)), y + static_cast<std::int64_t>(height)}, inks.ground);
  }
  DrawGlyphs(sized, inks.text);
  output_->CheckAll(cairo_status(page_.get()));
}

// Gives where the text ends. Only what may be seen is laid out: letters lean out of their cell by less than its size.
double CairoDevice::LayOut(int x, double baseline, std::string_view text, SizedFont& font) {
  utf8_.clear();
  glyphs_.clear();
  clusters_.clear();
  const double margin = std::max(font.sizeX, font.sizeY);
  double at = x;
  for (const char byte : text) {
    const Character& character = font.face.Of(byte);
    if (!character.drawn) continue;
    const double next = at + character.advance * font.sizeX;
    if (next > -margin && at < size_.across + margin) {
      glyphs_.push_back({character.glyph, at, baseline});
      clusters_.push_back({static_cast<int>(character.utf8.size()), 1});
      utf8_ += character.utf8;
    }
    at = next;
  }
  return at;
}

void CairoDevice::DrawGlyphs(const SizedFont& font, Ink ink) {
  if (glyphs_.empty()) return;
  Use(ink);
  cairo_set_scaled_font(page_.get(), font.scaled.get());
  cairo_show_text_glyphs(page_.get(), utf8_.data(), static_cast<int>(utf8_.size()), glyphs_.data(),
                         static_cast<int>(glyphs_.size()), clusters_.data(), static_cast<int>(clusters_.size()), {});
}

std::unique_ptr<DrawingDevice> MakeDevice(std::unique_ptr<Output> output, int dotsPerInch) {
  return std::make_unique<CairoDevice>(std::move(output), dotsPerInch);
}

int Checked(int dotsPerInch) {
  if (dotsPerInch <= 0 || dotsPerInch > kMostDotsPerInch)
    RaiseInvalidCall(std::to_string(dotsPerInch) + " dots per inch");
  return dotsPerInch;
}

}  // namespace

std::unique_ptr<DrawingDevice> MakePdfDevice(ByteSink sink, const PdfOptions& options) {
  Checked(options.dotsPerInch);
  return MakeDevice(MakePdfOutput(std::move(sink), options), options.dotsPerInch);
}

std::unique_ptr<DrawingDevice> MakePngDevice(ByteSink sink, int dotsPerInch) {
  return MakeDevice(MakePngOutput(std::move(sink), Checked(dotsPerInch)), dotsPerInch);
}

std::unique_ptr<DrawingDevice> MakeSvgDevice(ByteSink sink, int dotsPerInch) {
  return MakeDevice(MakeSvgOutput(std::move(sink), Checked(dotsPerInch)), dotsPerInch);
}

}  // namespace partnerkit::cairo

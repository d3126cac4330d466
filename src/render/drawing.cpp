#include "render/drawing.h"

#include <cmath>

#include "render/barcode.h"
#include "values/numbers.h"

namespace partnerkit::render {

namespace {

constexpr double kTwipsPerMillimetre = 56;

// Far less than the finest fraction that whole millimetres and a resolution of two decimal places give, and more than
// binary fractions lose: 6 mm at 4.8 twips are 70 pixels, not 69.
constexpr double kSlack = 1e-4;

double Pixels(double millimetres, double twipsPerPixel) {
  if (twipsPerPixel == 0) throw RunTimeError(run_time::kDivisionByZero, "Division by zero");
  return millimetres / twipsPerPixel * kTwipsPerMillimetre;
}

int WholePixels(double millimetres, double twipsPerPixel) {
  return ToLong(std::floor(Pixels(millimetres, twipsPerPixel) + kSlack));
}

int Sum(int left, int right) {
  int sum = 0;
  if (__builtin_add_overflow(left, right, &sum)) throw RunTimeError(run_time::kOverflow, "Overflow");
  return sum;
}

double OneUnlessAboveZero(double twipsPerPixel) { return twipsPerPixel > 0 ? twipsPerPixel : 1; }

}  // namespace

// The outline of a dark module, in pixels, and the way to the next module.
struct Drawing::Bars {
  int x, y, height;
  int pathWidth;  // from the module's x to the right edge of its outline
  int pen, step;
};

void Drawing::DrawBars(DrawingDevice& device, std::string_view pattern, const Bars& bars) {
  const int bottom = Sum(bars.y, bars.height);
  int x = bars.x;
  for (const char module : pattern) {
    if (module == '1') {
      Attempt(errors_, [&] { device.Rectangle({Sum(x, -1), bars.y, Sum(x, bars.pathWidth), bottom}, bars.pen); });
    }
    x = Sum(x, bars.step);
  }
}

void Drawing::EAN128Barcode(const DrawingContext& context, std::string_view data, const BarcodePlace& place) {
  Guarded(errors_, "Sub EAN128Barcode", [&] {
    const double perX = OneUnlessAboveZero(context.twipsPerPixelX), perY = OneUnlessAboveZero(context.twipsPerPixelY);
    const int pen = ToLong(RoundHalfEven(Pixels(place.barWidth, perX), 0));
    const Bars bars{.x = WholePixels(place.x, perX),
                    .y = WholePixels(place.y, perY),
                    .height = WholePixels(place.height, perY),
                    .pathWidth = 0,
                    .pen = pen,
                    .step = pen};
    const std::string pattern =
        Guarded(errors_, "Function BarPattern", std::string(), [&](std::string& result) { result = BarPattern(data); });
    DrawBars(context.device, pattern, bars);
  });
}

void Drawing::EAN13Barcode(const DrawingContext& context, std::string_view data, const BarcodePlace& place) {
  Guarded(errors_, "Sub EAN13Barcode", [&] {
    const int pen = WholePixels(place.barWidth, context.twipsPerPixelX);
    const Bars bars{.x = WholePixels(place.x, context.twipsPerPixelX),
                    .y = WholePixels(place.y, context.twipsPerPixelY),
                    .height = WholePixels(place.height, context.twipsPerPixelY),
                    .pathWidth = pen,
                    .pen = pen,
                    .step = Sum(pen, pen)};
    const std::string pattern = Guarded(errors_, "Function BuildBarcode", std::string(),
                                        [&](std::string& result) { result = BuildBarcode(data); });
    DrawBars(context.device, pattern, bars);
  });
}

void Drawing::PrintText(const DrawingContext& context, std::string_view text, const TextPlace& place,
                        const TextFont& font, const TextInks& inks) {
  Guarded(errors_, "Sub PrintText", [&] {
    const double perX = OneUnlessAboveZero(context.twipsPerPixelX), perY = OneUnlessAboveZero(context.twipsPerPixelY);
    const Font sized{.height = WholePixels(place.height, perY),
                     .width = WholePixels(place.width, perX),
                     .weight = font.weight,
                     .characterSet = font.characterSet,
                     .name = font.name};
    const int x = WholePixels(place.x, perX), y = WholePixels(place.y, perY);
    Attempt(errors_, [&] { context.device.Text(x, y, text, sized, inks); });
  });
}

void Drawing::PrintLine(const DrawingContext& context, const LinePlace& place) {
  Guarded(errors_, "Sub PrintLine", [&] {
    const auto across = [&](int millimetres) { return WholePixels(millimetres, context.twipsPerPixelX); };
    const auto down = [&](int millimetres) { return WholePixels(millimetres, context.twipsPerPixelY); };
    const PixelRect rect{across(place.x1), down(place.y1), Sum(across(place.x2), 1), Sum(down(place.y2), 1)};
    const int pen = across(place.thickness);
    Attempt(errors_, [&] { context.device.Rectangle(rect, pen); });
  });
}

}  // namespace partnerkit::render

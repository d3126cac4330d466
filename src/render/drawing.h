// Draws barcodes, texts and lines in millimetres on a drawing device.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "frame/procedure.h"
#include "partnerkit/drawing.h"

namespace partnerkit::render {

// A device and the resolution that counts for it, which a printer's entry may give in a rounded form.
struct DrawingContext {
  DrawingDevice& device;
  double twipsPerPixelX;
  double twipsPerPixelY;
};

// In millimetres, from the upper left corner of the page.
struct BarcodePlace {
  int x, y, height;
  double barWidth;
};

struct TextPlace {
  int x, y, width, height;  // width of the average character, height of the character cell; a width of 0 is natural
};

struct LinePlace {
  int x1, y1, x2, y2, thickness;
};

struct TextFont {
  int characterSet = 0;
  int weight = 400;
  std::string_view name;
};

// A millimetre counts as 56 twips, and fractions of a pixel are dropped. An error leaves the rest of one drawing undone
// and is told by the error trail.
class Drawing {
 public:
  explicit Drawing(const Ports& ports) : errors_("mWinPrint", ports) {}

  // GS1-128. The bar width is rounded to the nearest pixel, so that all modules are alike.
  void EAN128Barcode(const DrawingContext& context, std::string_view data, const BarcodePlace& place);
  // `data` is all 13 digits. A module is two bar widths wide.
  void EAN13Barcode(const DrawingContext& context, std::string_view data, const BarcodePlace& place);
  void PrintText(const DrawingContext& context, std::string_view text, const TextPlace& place, const TextFont& font,
                 const TextInks& inks);
  // The outline of the rectangle between two corners: a line where they share a row or a column.
  void PrintLine(const DrawingContext& context, const LinePlace& place);

 private:
  struct Bars;

  void DrawBars(DrawingDevice& device, std::string_view pattern, const Bars& bars);

  ErrorHandling errors_;
};

}  // namespace partnerkit::render

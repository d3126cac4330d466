// The drawing port: what a label or ticket on an ordinary printer is drawn with. Positions and sizes are device pixels,
// x to the right and y down from the upper left corner of the page. Every operation may raise RunTimeError; drawing
// outside of a page raises error 5.
#pragma once

#include <string_view>

namespace partnerkit {

enum class Ink { kBlack, kWhite };

// Corners in any order; of the pixels between them, the rightmost column and the lowest row count as outside. Without
// an inside, nothing is drawn.
struct PixelRect {
  int left, top, right, bottom;
  friend bool operator==(const PixelRect&, const PixelRect&) = default;
};

struct Font {
  int height = 0;    // of the character cell, from the top of accents to the foot of descenders; 0: 12 points
  int width = 0;     // of the average character; 0: as the font's design has it
  int weight = 400;  // bold from 600
  int characterSet = 0;
  std::string_view name;
};

struct TextInks {
  Ink text = Ink::kBlack;
  Ink ground = Ink::kWhite;
};

class DrawingDevice {
 public:
  virtual ~DrawingDevice() = default;

  virtual double TwipsPerPixelX() const = 0;  // 1,440 twips are an inch
  virtual double TwipsPerPixelY() const = 0;

  // `width` and `height` are hundredths of an inch.
  virtual void StartPage(int width, int height) = 0;
  virtual void EndPage() = 0;
  // No page may follow. A document let go without it is not delivered.
  virtual void EndDoc() = 0;

  // Draws the outline with a black pen and leaves the inside as it is. The pen covers `penWidth` pixels (0: one) and is
  // centred on the outermost pixels of the rectangle; of an even width, the larger half lies to the left and above.
  //
  // So a rectangle one pixel wide comes out as wide as the pen, and one a pixel wider than the pen as wide as two pens,
  // without a gap: bars drawn side by side in steps of their own width meet exactly.
  virtual void Rectangle(const PixelRect& rect, int penWidth) = 0;

  // Draws 8-bit text (Windows-1252) on a ground as long as the text and as high as the font, the upper left corner of
  // which is at (x, y). A white ground is the paper's own and hides nothing: texts of a label may overlap with their
  // cells, for a printer's fonts fill less of these than a screen's.
  virtual void Text(int x, int y, std::string_view text, const Font& font, const TextInks& inks) = 0;
};

}  // namespace partnerkit

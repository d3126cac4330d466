// Fonts by name, weight and size in pixels.
#pragma once

#include <array>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <tuple>

#include "cairo/handles.h"
#include "partnerkit/drawing.h"

namespace partnerkit::cairo {

struct Character {
  bool drawn = false;  // controls and bytes that Windows-1252 leaves free aren't
  unsigned long glyph = 0;
  double advance = 0;  // for a font of size 1
  std::string utf8;
};

// The measures are those of the outlines, the same at every size and resolution.
class Face {
 public:
  Face(std::string_view name, bool bold);

  const std::string& Name() const { return name_; }
  cairo_font_face_t* Handle() const { return face_.get(); }
  double Ascent() const { return ascent_; }
  double CellHeight() const { return cellHeight_; }
  const Character& Of(char byte);
  // Of the lower-case letters and the blank as often as they come in English, as fonts declare their width.
  double AverageWidth();

 private:
  void Measure(char byte, Character& character);

  std::string name_;
  FontFace face_;
  ScaledFont measured_;
  double ascent_ = 0, cellHeight_ = 0;
  struct Known {
    bool known = false;
    Character character;
  };
  std::array<Known, 256> characters_;
};

struct SizedFont {
  Face& face;
  ScaledFont scaled;
  double sizeX, sizeY;  // in pixels; the advances and the ascent are to be multiplied by them
};

class Fonts {
 public:
  // For surfaces with that many units of their own to a pixel.
  explicit Fonts(double unitsPerPixel) : unitsPerPixel_(unitsPerPixel) {}

  // `height` and `width` are pixels of the cell, the width 0 where it is natural.
  SizedFont& Find(const Font& font, int height, int width);

 private:
  // Name, bold; and height, width. A stored key's name is that of its face.
  using FaceKey = std::tuple<std::string_view, bool>;
  using FontKey = std::tuple<std::string_view, bool, int, int>;

  Face& FindFace(std::string_view name, bool bold);
  SizedFont Scaled(Face& face, int height, int width) const;

  double unitsPerPixel_;
  std::map<FaceKey, std::unique_ptr<Face>> faces_;
  std::map<FontKey, SizedFont> fonts_;
};

}  // namespace partnerkit::cairo

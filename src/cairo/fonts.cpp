#include "cairo/fonts.h"

#include <strings.h>

#include <utility>

#include "partnerkit/run_time_error.h"
#include "platform/posix_calls.h"
#include "values/windows_1252.h"

namespace partnerkit::cairo {

namespace {

constexpr int kBold = 600;

// Large enough for the fractions that outlines are drawn in.
constexpr double kMeasuredSize = 2048;

// The weights of the letters in a font's average width, by its OpenType table OS/2. They sum to 1000 with the blank.
constexpr int kLetterWeights[26] = {64, 14, 27, 35, 100, 20, 14, 42, 63, 3,  6, 35, 20,
                                    56, 56, 17, 4,  49,  56, 71, 31, 10, 18, 3, 18, 2};
constexpr int kBlankWeight = 166;

FontOptions Unhinted() {
  FontOptions options(cairo_font_options_create());
  cairo_font_options_set_hint_style(options.get(), CAIRO_HINT_STYLE_NONE);
  cairo_font_options_set_hint_metrics(options.get(), CAIRO_HINT_METRICS_OFF);
  cairo_font_options_set_antialias(options.get(), CAIRO_ANTIALIAS_GRAY);
  return options;
}

ScaledFont Scale(cairo_font_face_t* face, double sizeX, double sizeY, double unitsPerPixel) {
  cairo_matrix_t size, page;
  cairo_matrix_init_scale(&size, sizeX, sizeY);
  cairo_matrix_init_scale(&page, unitsPerPixel, unitsPerPixel);
  return ScaledFont(cairo_scaled_font_create(face, &size, &page, Unhinted().get()));
}

// The family that is drawn. Labels are laid out for Arial, whose free twin has the same widths.
std::string Family(std::string_view name) {
  const std::string family = Utf8(name.substr(0, name.find('\0')));
  return family.empty() || strcasecmp(family.c_str(), "Arial") == 0 ? "Liberation Sans" : family;
}

}  // namespace

Face::Face(std::string_view name, bool bold) : name_(name) {
  const std::string family = Family(name);
  face_.reset(cairo_toy_font_face_create(family.c_str(), CAIRO_FONT_SLANT_NORMAL,
                                         bold ? CAIRO_FONT_WEIGHT_BOLD : CAIRO_FONT_WEIGHT_NORMAL));
  Check(cairo_font_face_status(face_.get()), family);
  measured_ = Scale(face_.get(), kMeasuredSize, kMeasuredSize, 1);
  cairo_font_extents_t extents;
  cairo_scaled_font_extents(measured_.get(), &extents);
  Check(cairo_scaled_font_status(measured_.get()), family);
  ascent_ = extents.ascent / kMeasuredSize;
  cellHeight_ = (extents.ascent + extents.descent) / kMeasuredSize;
  if (!(cellHeight_ > 0)) platform::Raise(run_time::kDeviceError, family, "The font has no height");
}

const Character& Face::Of(char byte) {
  Known& entry = characters_[static_cast<unsigned char>(byte)];
  if (!entry.known) Measure(byte, entry.character);
  entry.known = true;
  return entry.character;
}

void Face::Measure(char byte, Character& character) {
  const char16_t code = FromWindows1252(byte);
  if (code < 0x20 || (code >= 0x7F && code < 0xA0)) return;
  character.utf8.clear();
  AppendUtf8(character.utf8, code);
  cairo_glyph_t place, *glyph = &place;
  int glyphs = 1;
  Check(cairo_scaled_font_text_to_glyphs(measured_.get(), 0, 0, character.utf8.data(),
                                         static_cast<int>(character.utf8.size()), &glyph, &glyphs, nullptr, nullptr,
                                         nullptr),
        "font");
  const std::unique_ptr<cairo_glyph_t, Release<cairo_glyph_free>> larger(glyph == &place ? nullptr : glyph);
  if (glyphs != 1) return;
  cairo_text_extents_t extents;
  cairo_scaled_font_glyph_extents(measured_.get(), glyph, 1, &extents);
  Check(cairo_scaled_font_status(measured_.get()), "font");
  character.glyph = glyph->index;
  character.advance = extents.x_advance / kMeasuredSize;
  character.drawn = true;
}

double Face::AverageWidth() {
  double width = Of(' ').advance * kBlankWeight;
  for (int letter = 0; letter < 26; ++letter)
    width += Of(static_cast<char>('a' + letter)).advance * kLetterWeights[letter];
  return width / 1000;
}

SizedFont& Fonts::Find(const Font& font, int height, int width) {
  const bool bold = font.weight >= kBold;
  const auto found = fonts_.find(FontKey(font.name, bold, height, width));
  if (found != fonts_.end()) return found->second;
  Face& face = FindFace(font.name, bold);
  return fonts_.try_emplace(FontKey(face.Name(), bold, height, width), Scaled(face, height, width)).first->second;
}

Face& Fonts::FindFace(std::string_view name, bool bold) {
  const auto found = faces_.find(FaceKey(name, bold));
  if (found != faces_.end()) return *found->second;
  auto face = std::make_unique<Face>(name, bold);
  const FaceKey key(face->Name(), bold);
  return *faces_.try_emplace(key, std::move(face)).first->second;
}

SizedFont Fonts::Scaled(Face& face, int height, int width) const {
  const double sizeY = height / face.CellHeight();
  const double average = width == 0 ? 0 : face.AverageWidth();
  const double sizeX = average > 0 ? width / average : sizeY;
  SizedFont sized{face, Scale(face.Handle(), sizeX, sizeY, unitsPerPixel_), sizeX, sizeY};
  Check(cairo_scaled_font_status(sized.scaled.get()), "font of " + std::to_string(height) + " pixels");
  return sized;
}

}  // namespace partnerkit::cairo

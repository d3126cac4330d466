// How long labels take to draw, through the drawing port or with bare calls of Cairo: 105 x 148 mm, 30 texts, 2 GS1-128
// symbols of 156 modules and 4 rules, in the same places and the same fonts.
//   label_drawing device|bare pdf|png|svg COUNT [FILE]
// One PDF has a page for each label; PNG and SVG are a document each, PNG at 203 dots an inch and on the bare side in
// colour. FILE gets the last document.
#include <cairo-pdf.h>
#include <cairo-svg.h>
#include <cairo.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <string>
#include <string_view>

#include "cairo/devices.h"
#include "partnerkit/platform.h"
#include "render/barcode.h"
#include "render/drawing.h"
#include "stopwatch.h"

namespace {

using namespace partnerkit;

constexpr int kTexts = 30, kRules = 4, kSymbols = 2;
constexpr int kWidth = 413, kHeight = 583;  // hundredths of an inch
constexpr int kPrinted = 300, kShown = 203;
constexpr double kBarWidth = 0.5;

std::string TextOf(int label, int text) {
  switch (text % 3) {
    case 0:
      return "PO " + std::to_string(4'500'000 + label * 7 + text);
    case 1:
      return "Store " + std::to_string(1000 + (label + text) % 9000) + " Chadstone VIC";
    default:
      return "Carton " + std::to_string(text) + " of " + std::to_string(kTexts);
  }
}

// All of them 18 digits behind the application identifier.
std::string SymbolOf(int label, int symbol) {
  return "~20100" + std::to_string(393'123'450'000'000'000 + 1000 * label + symbol);
}

render::TextPlace PlaceOf(int text) {
  if (text == 0) return {.x = 5, .y = 0, .width = 0, .height = 9};
  return {.x = 5 + text % 2 * 50, .y = 10 + text / 2 * 4, .width = 0, .height = 3 + text / 3 % 2};
}
int WeightOf(int text) { return text % 4 == 0 ? 700 : 400; }
render::LinePlace RuleOf(int rule) {
  constexpr int kTop[kRules] = {9, 72, 107, 143};
  return {.x1 = 4, .y1 = kTop[rule], .x2 = 100, .y2 = kTop[rule], .thickness = 0};
}
render::BarcodePlace BarsOf(int symbol) {
  return {.x = 10, .y = 75 + symbol * 35, .height = 28, .barWidth = kBarWidth};
}

class DeviceSide {
 public:
  DeviceSide() : drawing_(RaisingPorts()) {}

  void Draw(DrawingDevice& device, int label) {
    const render::DrawingContext context{device, device.TwipsPerPixelX(), device.TwipsPerPixelY()};
    device.StartPage(kWidth, kHeight);
    for (int text = 0; text < kTexts; ++text) {
      drawing_.PrintText(context, TextOf(label, text), PlaceOf(text), {.weight = WeightOf(text), .name = "ARIAL"}, {});
    }
    for (int rule = 0; rule < kRules; ++rule) drawing_.PrintLine(context, RuleOf(rule));
    for (int symbol = 0; symbol < kSymbols; ++symbol) {
      drawing_.EAN128Barcode(context, SymbolOf(label, symbol), BarsOf(symbol));
    }
    device.EndPage();
  }

 private:
  static Ports RaisingPorts() {
    Ports ports = platform::DefaultPorts();
    ports.errorSettings.silent = ports.errorSettings.passUpward = true;
    return ports;
  }

  render::Drawing drawing_;
};

void Check(cairo_status_t status) {
  if (status != CAIRO_STATUS_SUCCESS) throw std::runtime_error(cairo_status_to_string(status));
}

cairo_status_t Append(void* document, const unsigned char* bytes, unsigned length) {
  static_cast<std::string*>(document)->append(reinterpret_cast<const char*>(bytes), length);
  return CAIRO_STATUS_SUCCESS;
}

// In points, whatever the surface.
void DrawBare(cairo_t* page, int label) {
  constexpr double kPoints = 56 / 20.0;  // a millimetre, as drawings count it
  cairo_set_source_rgb(page, 0, 0, 0);
  for (int text = 0; text < kTexts; ++text) {
    const auto [x, y, width, height] = PlaceOf(text);
    cairo_select_font_face(page, "Liberation Sans", CAIRO_FONT_SLANT_NORMAL,
                           WeightOf(text) == 700 ? CAIRO_FONT_WEIGHT_BOLD : CAIRO_FONT_WEIGHT_NORMAL);
    const double size = height * kPoints / 1.117;  // of the font whose cell is so high
    cairo_set_font_size(page, size);
    cairo_move_to(page, x * kPoints, y * kPoints + size * 0.905);
    cairo_show_text(page, TextOf(label, text).c_str());
  }
  for (int rule = 0; rule < kRules; ++rule) {
    const auto [x1, y1, x2, y2, thickness] = RuleOf(rule);
    cairo_rectangle(page, x1 * kPoints, y1 * kPoints, (x2 - x1) * kPoints, 0.24);
    cairo_fill(page);
  }
  for (int symbol = 0; symbol < kSymbols; ++symbol) {
    const auto [x, y, height, barWidth] = BarsOf(symbol);
    const std::string pattern = render::BarPattern(SymbolOf(label, symbol));
    for (std::size_t module = pattern.find('1'); module != std::string::npos;) {
      const std::size_t end = std::min(pattern.find('0', module), pattern.size());
      cairo_rectangle(page, (x + static_cast<double>(module) * barWidth) * kPoints, y * kPoints,
                      static_cast<double>(end - module) * barWidth * kPoints, height * kPoints);
      module = pattern.find('1', end);
    }
    cairo_fill(page);
  }
}

struct Drawn {
  std::size_t bytes = 0;
  std::string last;

  void Add() { bytes += last.size(); }
};

void WithDevice(std::string_view kind, int count, Drawn& drawn) {
  DeviceSide side;
  const ByteSink sink = [&](std::string_view bytes) { drawn.last.append(bytes); };
  if (kind == "pdf") {
    const auto device = cairo::MakePdfDevice(sink, {.title = "labels", .dotsPerInch = kPrinted});
    for (int label = 0; label < count; ++label) side.Draw(*device, label);
    device->EndDoc();
    drawn.Add();
    return;
  }
  for (int label = 0; label < count; ++label) {
    drawn.last.clear();
    const auto device = kind == "png" ? cairo::MakePngDevice(sink, kShown) : cairo::MakeSvgDevice(sink, kPrinted);
    side.Draw(*device, label);
    device->EndDoc();
    drawn.Add();
  }
}

void BarePages(cairo_surface_t* surface, int first, int count) {
  cairo_t* page = cairo_create(surface);
  for (int label = first; label < first + count; ++label) {
    DrawBare(page, label);
    cairo_show_page(page);
  }
  Check(cairo_status(page));
  cairo_destroy(page);
  cairo_surface_finish(surface);
  Check(cairo_surface_status(surface));
  cairo_surface_destroy(surface);
}

void BarePicture(int label, std::string& document) {
  cairo_surface_t* picture =
      cairo_image_surface_create(CAIRO_FORMAT_RGB24, kWidth * kShown / 100, kHeight * kShown / 100);
  cairo_t* page = cairo_create(picture);
  cairo_set_source_rgb(page, 1, 1, 1);
  cairo_paint(page);
  cairo_scale(page, kShown / 72.0, kShown / 72.0);
  DrawBare(page, label);
  Check(cairo_status(page));
  cairo_destroy(page);
  Check(cairo_surface_write_to_png_stream(picture, Append, &document));
  cairo_surface_destroy(picture);
}

void WithBareCalls(std::string_view kind, int count, Drawn& drawn) {
  constexpr double kAcross = kWidth * 0.72, kDown = kHeight * 0.72;
  if (kind == "pdf") {
    BarePages(cairo_pdf_surface_create_for_stream(Append, &drawn.last, kAcross, kDown), 0, count);
    drawn.Add();
    return;
  }
  for (int label = 0; label < count; ++label) {
    drawn.last.clear();
    if (kind == "png") {
      BarePicture(label, drawn.last);
    } else {
      BarePages(cairo_svg_surface_create_for_stream(Append, &drawn.last, kAcross, kDown), label, 1);
    }
    drawn.Add();
  }
}

}  // namespace

int main(int count, char** arguments) {
  const std::string_view side = count > 2 ? arguments[1] : "", kind = count > 2 ? arguments[2] : "";
  const int labels = count > 3 ? std::atoi(arguments[3]) : 0;
  if (labels <= 0 || (side != "device" && side != "bare") || (kind != "pdf" && kind != "png" && kind != "svg")) {
    std::fputs("usage: label_drawing device|bare pdf|png|svg COUNT [FILE]\n", stderr);
    return 2;
  }
  try {
    Drawn drawn;
    const Stopwatch watch;
    side == "device" ? WithDevice(kind, labels, drawn) : WithBareCalls(kind, labels, drawn);
    const double seconds = watch.Elapsed(), busy = watch.Busy();
    std::printf("{\"labels\": %d, \"bytes\": %zu, \"seconds\": %.6f, \"busy\": %.6f}\n", labels, drawn.bytes, seconds,
                busy);
    if (count > 4) std::ofstream(arguments[4], std::ios::binary) << drawn.last;
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "label_drawing: %s\n", error.what());
    return 1;
  }
}

// The input is a label's format and its batch, with a zero byte between them. What is no label must be turned away by a
// RunTimeError; what is one must be drawn, each field once and within the numbers that a page can have.
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include "labels/cml_carton_layout.h"
#include "partnerkit/platform.h"
#include "partnerkit/run_time_error.h"
#include "render/label_drawing.h"

namespace {

using namespace partnerkit;

// In hundredths of an inch, and in dots of 300 to the inch: further out there is no page.
constexpr int kFarthest = 400'000, kFarthestDot = 400'000, kWidestPen = 5'000'000;

void Check(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "does not hold: %s\n", what);
  std::abort();
}

bool Within(double value, int limit) { return std::abs(value) <= limit; }

class SwallowingDevice : public DrawingDevice {
 public:
  std::size_t texts = 0, rectangles = 0;

  double TwipsPerPixelX() const override { return 4.8; }
  double TwipsPerPixelY() const override { return 4.8; }
  void StartPage(int, int) override {}
  void EndPage() override {}
  void EndDoc() override {}
  void Rectangle(const PixelRect& rect, int penWidth) override {
    ++rectangles;
    Check(Within(rect.top, kFarthestDot) && Within(rect.bottom, 2 * kFarthestDot), "a rectangle's height");
    Check(Within(penWidth, kWidestPen), "a pen's width");
  }
  void Text(int x, int y, std::string_view, const Font& font, const TextInks&) override {
    ++texts;
    Check(Within(x, kFarthestDot) && Within(y, kFarthestDot), "a text's place");
    Check(Within(font.width, kFarthestDot) && Within(font.height, kFarthestDot), "a text's size");
    Check(font.weight == 400 || font.weight == 700, "a text's weight");
  }
};

void CheckFields(const render::LabelPackets& label) {
  Check(Within(label.length, kFarthest) && Within(label.width, kFarthest), "a label's size");
  int lastNo = 0;
  for (const render::LabelField& field : label.fields) {
    for (const double place :
         {field.row, field.col, field.row2, field.col2, field.heightMult, field.widthMult, field.thickness}) {
      Check(Within(place, kFarthest), "a field's place");
    }
    Check(std::string_view("TCBL").find(field.recordType) != std::string_view::npos, "a field's type");
    Check(field.recordNo > lastNo, "fields in the format's order");
    Check(Within(field.Number(), std::max(kFarthest, field.recordNo)), "a field's number");
    lastNo = field.recordNo;
  }
}

void CheckDrawing(const render::LabelPackets& label, const render::LabelStyle& style) {
  static const Ports ports = platform::DefaultPorts();
  const auto count = [&](std::string_view types) {
    return static_cast<std::size_t>(std::ranges::count_if(
        label.fields, [&](const auto& field) { return types.find(field.recordType) != std::string_view::npos; }));
  };
  SwallowingDevice device;
  render::Drawing drawing(ports);
  try {
    render::DrawLabel(label, style, drawing, {device, 4.8, 4.8});
    Check(device.texts == count("TC"), "each text is drawn once");
    Check(device.rectangles >= count("L"), "each line is drawn");
  } catch (const RunTimeError& error) {
    Check(error.Number() == run_time::kOverflow, "drawing fails on large numbers only");
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view bytes(reinterpret_cast<const char*>(data), size);
  const std::size_t middle = bytes.find('\0');
  const std::string_view batch = middle == std::string_view::npos ? std::string_view() : bytes.substr(middle + 1);
  render::LabelPackets label;
  try {
    label = render::ReadPackets(bytes.substr(0, middle), batch);
  } catch (const RunTimeError& error) {
    Check(!error.Description().empty(), "an error tells its cause");
    return 0;
  }
  CheckFields(label);
  CheckDrawing(label, {});
  CheckDrawing(label, {labels::kCmlCartonFieldMoves, labels::kCmlCartonConstantMoves});
  return 0;
}

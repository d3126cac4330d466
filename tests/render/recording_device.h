// A device that writes down what it is told to draw.
#pragma once

#include <string>
#include <vector>

#include "partnerkit/drawing.h"
#include "partnerkit/run_time_error.h"

namespace partnerkit::testing {

class RecordingDevice : public DrawingDevice {
 public:
  std::vector<std::string> drawn;
  int failures = 0;  // so many operations from now on raise error 57

  double TwipsPerPixelX() const override { return 0; }
  double TwipsPerPixelY() const override { return 0; }
  void StartPage(int, int) override {}
  void EndPage() override {}
  void EndDoc() override {}

  void Rectangle(const PixelRect& rect, int penWidth) override {
    Write(Numbers({rect.left, rect.top, rect.right, rect.bottom}) + "pen " + std::to_string(penWidth));
  }
  void Text(int x, int y, std::string_view text, const Font& font, const TextInks& inks) override {
    const auto name = [](Ink ink) { return ink == Ink::kBlack ? "black" : "white"; };
    Write(Numbers({x, y, font.height, font.width, font.weight, font.characterSet}) + std::string(font.name) + ' ' +
          name(inks.text) + " on " + name(inks.ground) + ": " + std::string(text));
  }

 private:
  static std::string Numbers(const std::vector<int>& numbers) {
    std::string text;
    for (const int number : numbers) text += std::to_string(number) + ' ';
    return text;
  }

  void Write(std::string line) {
    if (failures > 0) {
      --failures;
      throw RunTimeError(run_time::kDeviceError, "Device I/O error");
    }
    drawn.push_back(std::move(line));
  }
};

}  // namespace partnerkit::testing

#include <algorithm>
#include <climits>
#include <numeric>

#include "cairo/drawn.h"

namespace partnerkit::cairo {
namespace {

constexpr TextInks kWhiteOnBlack{.text = Ink::kWhite, .ground = Ink::kBlack};

// On black, where white ink can be seen.
Picture OnBlack(std::string_view text, const Font& font, const TextInks& inks = {}) {
  return Drawn(300, 100, [&](DrawingDevice& device) {
    device.Rectangle({0, 50, 300, 51}, 300);
    device.Text(10, 20, text, font, inks);
  });
}

// The part of the picture that isn't like the paper, as "left top right bottom".
std::string Drawing(const Picture& picture, int paper) {
  PixelRect box{INT_MAX, INT_MAX, 0, 0};
  for (int y = 0; y < picture.height; ++y) {
    for (int x = 0; x < picture.width; ++x) {
      if (picture.At(x, y) == paper) continue;
      box = {std::min(box.left, x), std::min(box.top, y), std::max(box.right, x + 1), std::max(box.bottom, y + 1)};
    }
  }
  if (box.right == 0) return "";
  return std::to_string(box.left) + ' ' + std::to_string(box.top) + ' ' + std::to_string(box.right) + ' ' +
         std::to_string(box.bottom);
}

// The sum of all darkness, in black pixels.
int Darkness(const Picture& picture) {
  return std::accumulate(picture.pixels.begin(), picture.pixels.end(), 0,
                         [](int sum, int pixel) { return sum + 255 - pixel; }) /
         255;
}

TEST(CairoTextTest, LiesOnAGroundOfItsLengthAndHeight) {
  const struct {
    std::string_view text;
    Font font;
    const char* ground;
  } cases[] = {
      // An H of Arial is 0.722 of its size wide, a blank 0.278, the average letter 0.442; its cell is 1.117 high.
      {"HHHH", {.height = 40, .name = "Arial"}, "10 20 114 60"},
      {"HHHH", {.height = -40, .name = "ARIAL"}, "10 20 114 60"},
      {"HHHH", {.height = 40, .weight = 600, .name = ""}, "10 20 114 60"},
      {"HHHH", {.height = 40, .width = 20, .name = "Arial"}, "10 20 141 60"},
      {"  ", {.height = 50, .name = "Arial"}, "10 20 35 70"},
      {" ", {.name = "Arial"}, "10 20 15 37"},
      {std::string_view("\0\x01\r\n\x7F\x81\x8D\x8F\x90\x9D", 10), {.height = 40, .name = "Arial"}, ""},
  };
  for (const auto& test : cases) {
    const Picture picture =
        Drawn(300, 100, [&](DrawingDevice& device) { device.Text(10, 20, test.text, test.font, kWhiteOnBlack); });
    EXPECT_EQ(Drawing(picture, 255), test.ground) << test.text;
  }
  // The paper's own ground hides nothing.
  EXPECT_EQ(Drawing(OnBlack("  ", {.height = 50, .name = "Arial"}, {}), 0), "");
}

TEST(CairoTextTest, IsDrawnInItsInkWithinTheCell) {
  const Font font{.height = 40, .name = "Arial"};
  const Picture white = OnBlack("HIll", font, kWhiteOnBlack);
  EXPECT_EQ(Drawing(white, 0), "12 26 60 52");
  EXPECT_GT(std::ranges::count(white.pixels, 255), 250);
  const Picture black = Drawn(300, 100, [&](DrawingDevice& device) { device.Text(10, 20, "HIll", font, {}); });
  EXPECT_NEAR(Darkness(black), 450, 20);
  // A ground of ink, cut off by the page.
  EXPECT_EQ(
      Drawn(4, 4,
            [](DrawingDevice& device) { device.Text(-1, 2, " ", {.height = 14, .name = "Arial"}, kWhiteOnBlack); })
          .Art(),
      "....\n....\n###.\n###.\n");
}

TEST(CairoTextTest, IsBoldFromAWeightOf600) {
  const auto darkness = [](int weight) {
    return Darkness(Drawn(300, 100, [&](DrawingDevice& device) {
      device.Text(10, 20, "HIll", {.height = 40, .weight = weight, .name = "Arial"}, {});
    }));
  };
  EXPECT_EQ(darkness(0), darkness(599));
  EXPECT_GT(darkness(600), darkness(599) + 200);
  EXPECT_EQ(darkness(600), darkness(900));
}

TEST(CairoTextTest, SurvivesHostileTexts) {
  std::string text;
  for (int i = 0; i < 10'000; ++i) text += static_cast<char>(i % 256);
  for (const Named& kind : kDevices) {
    SCOPED_TRACE(kind.name);
    std::string document;
    const auto device = kind.make(Into(document));
    device->StartPage(200, 200);
    for (const int place : {0, -20'000, 150, INT_MIN, INT_MAX}) {
      for (const std::string_view name : {"Arial", "\xE9@cairo:\x80", "No such font, and a long name of one"}) {
        device->Text(place, 0, text, {.height = 20, .name = name}, {});
        device->Text(0, place, text, {.height = 20, .width = 300, .name = name}, kWhiteOnBlack);
      }
      device->Text(place, place, text, {.height = 1, .width = 16'384, .name = std::string_view("\0", 1)}, {});
    }
    device->Text(-8'000, -4'000, "WW", {.height = 16'384, .name = "Arial"}, {});
    EXPECT_EQ(ErrorOf([&] { device->Text(0, 0, text, {.height = INT_MIN, .name = "Arial"}, {}); }),
              "5 Invalid procedure call or argument: A font of -2147483648 x 0 pixels");
    EXPECT_EQ(ErrorOf([&] { device->Text(0, 0, text, {.height = 1, .width = 16'385, .name = "Arial"}, {}); }),
              "5 Invalid procedure call or argument: A font of 1 x 16385 pixels");
    device->EndPage();
    device->EndDoc();
    EXPECT_FALSE(document.empty());
  }
}

}  // namespace
}  // namespace partnerkit::cairo

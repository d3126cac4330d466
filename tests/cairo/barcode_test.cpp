#include "cairo/drawn.h"
#include "partnerkit/platform.h"
#include "render/drawing.h"

namespace partnerkit::cairo {
namespace {

using ::testing::StartsWith;

// What a scanner reads, a symbol a line, without the names of their kinds.
std::string Scanned(const std::string& picture) {
  return testing::Told(picture, "zbarimg --nodbus --quiet --raw \"$document\" 2>/dev/null");
}

TEST(CairoBarcodeTest, ScannersReadWhatWasDrawn) {
  const struct {
    std::string_view data;
    const char* read;  // FNC1 is silent at the front of a symbol, and a group separator behind it
  } cases[] = {
      {"~201421036"
       "3000"
       "~20190"
       "0123",
       "4210363000\x1d"
       "900123\n"},
      {"CARTON 7/40", "CARTON 7/40\n"},
  };
  render::Drawing drawing(platform::DefaultPorts());
  for (const int dotsPerInch : {300, 203}) {
    for (const auto& test : cases) {
      const Draw draw = [&](DrawingDevice& device) {
        drawing.EAN128Barcode({device, device.TwipsPerPixelX(), device.TwipsPerPixelY()}, test.data,
                              {.x = 8, .y = 20, .height = 32, .barWidth = 0.5});
      };
      EXPECT_EQ(Scanned(DrawnPng(413, 583, draw, dotsPerInch)), test.read) << dotsPerInch;
    }
  }
}

// As a printer does that blackens every dot which a shape touches.
TEST(CairoBarcodeTest, APrintedPdfHasTheDotsOfThePicture) {
  render::Drawing drawing(platform::DefaultPorts());
  const Draw draw = [&](DrawingDevice& device) {
    const render::DrawingContext context{device, 4.8, 4.8};
    drawing.EAN13Barcode(context, "5901234123457", {.x = 20, .y = 80, .height = 30, .barWidth = 0.2});
    drawing.EAN128Barcode(context, "~20100393123450000000017", {.x = 8, .y = 20, .height = 32, .barWidth = 0.5});
    drawing.PrintLine(context, {.x1 = 5, .y1 = 5, .x2 = 90, .y2 = 12, .thickness = 1});
  };
  const std::string pdf = DrawnPdf([&](DrawingDevice& device) {
    device.StartPage(413, 583);
    draw(device);
    device.EndPage();
  });
  const std::string printed = testing::Told(pdf, "pdftoppm -r 300 -gray -aaVector no \"$document\"");
  EXPECT_THAT(printed, StartsWith("P5\n1239 1749\n255\n"));
  const Picture picture = Drawn(413, 583, draw, 300);
  // Not EXPECT_EQ, which would print them.
  EXPECT_TRUE(printed.ends_with(std::string(picture.pixels.begin(), picture.pixels.end())));
  EXPECT_THAT(Scanned(printed), HasSubstr("5901234123457\n"));
  EXPECT_THAT(Scanned(printed), HasSubstr("00393123450000000017\n"));
}

}  // namespace
}  // namespace partnerkit::cairo

#include "render/drawing.h"

#include <gmock/gmock.h>

#include "partnerkit/platform.h"
#include "render/recording_device.h"

namespace partnerkit::render {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class DrawingTest : public ::testing::Test {
 protected:
  Ports AskingPorts() {
    Ports ports = platform::DefaultPorts();
    ports.errorOutlets.dialog = [this](const ErrorReport& report, const std::string&) {
      asked_.push_back(std::to_string(report.number) + " " + report.module + " " + report.procedure);
      return answer_;
    };
    return ports;
  }

  std::vector<std::string> Drawn() { return std::exchange(device_.drawn, {}); }

  testing::RecordingDevice device_;
  Drawing drawing_{AskingPorts()};
  DrawingContext context_{device_, 4.8, 7.2};
  Button answer_ = Button::kAbort;
  std::vector<std::string> asked_;
};

TEST_F(DrawingTest, DrawsADarkModuleAsALineOfThePensWidth) {
  // 10 mm across are 116.67 pixels, 27 down 210, 9 high 70; 0.5 mm is 5.83, so that a bar is six wide.
  drawing_.EAN128Barcode(context_, "12", {.x = 10, .y = 27, .height = 9, .barWidth = 0.5});
  const std::vector<std::string> bars = Drawn();
  ASSERT_EQ(bars.size(), 26u);
  EXPECT_EQ(bars[0], "115 210 116 280 pen 6");
  EXPECT_EQ(bars[1], "121 210 122 280 pen 6");
  EXPECT_EQ(bars[2], "133 210 134 280 pen 6");
  EXPECT_EQ(bars.back(), "385 210 386 280 pen 6");
}

TEST_F(DrawingTest, DrawsAnEanModuleTwoPensWide) {
  // 0.3 mm is 3.5 pixels, of which three count.
  drawing_.EAN13Barcode(context_, "5901234123457", {.x = 6, .y = 18, .height = 27, .barWidth = 0.3});
  const std::vector<std::string> bars = Drawn();
  ASSERT_EQ(bars.size(), 49u);
  EXPECT_EQ(bars[0], "69 140 73 350 pen 3");
  EXPECT_EQ(bars[1], "81 140 85 350 pen 3");
  EXPECT_EQ(bars.back(), "633 140 637 350 pen 3");
}

TEST_F(DrawingTest, RoundsABarToTheNearestPixelAndAHalfToTheEven) {
  const struct {
    double twips, barWidth;
    std::string_view pen;
  } cases[] = {{4.8, .3, "pen 4"}, {5.6, .25, "pen 2"}, {0, .5, "pen 28"}, {-1, .5, "pen 28"}, {15, .1, "pen 0"}};
  for (const auto& test : cases) {
    drawing_.EAN128Barcode({device_, test.twips, 7.2}, "12", {.x = 1, .y = 2, .height = 3, .barWidth = test.barWidth});
    EXPECT_THAT(Drawn().at(0), ::testing::EndsWith(test.pen)) << test.twips << ' ' << test.barWidth;
  }
}

TEST_F(DrawingTest, PlacesTextByItsCell) {
  drawing_.PrintText(context_, "TO:", {.x = 3, .y = 18, .width = 2, .height = 5}, {.weight = 700, .name = "ARIAL"}, {});
  drawing_.PrintText(context_, "", {.x = -3, .y = 4, .width = 0, .height = 1}, {.characterSet = 2, .name = "X"},
                     {.text = Ink::kWhite, .ground = Ink::kBlack});
  drawing_.PrintText({device_, 0, -4}, "A", {.x = 1, .y = 2, .width = 3, .height = 4}, {.name = "X"}, {});
  EXPECT_THAT(Drawn(), ElementsAre("35 140 38 23 700 0 ARIAL black on white: TO:",
                                   "-35 31 7 0 400 2 X white on black: ", "56 112 224 168 400 0 X black on white: A"));
}

TEST_F(DrawingTest, DrawsALineAsAnOutlineOneLarger) {
  drawing_.PrintLine(context_, {.x1 = 6, .y1 = 9, .x2 = 60, .y2 = 9, .thickness = 1});
  drawing_.PrintLine(context_, {.x1 = 12, .y1 = 18, .x2 = 6, .y2 = 27, .thickness = 0});
  EXPECT_THAT(Drawn(), ElementsAre("70 70 701 71 pen 11", "140 140 71 211 pen 0"));
}

TEST_F(DrawingTest, TellsErrorsUnderItsOwnNames) {
  device_.failures = 1;
  drawing_.EAN128Barcode(context_, "12", {.x = 1, .y = 2, .height = 3, .barWidth = 0.5});
  drawing_.EAN13Barcode({device_, 0, 1}, "12", {.x = 1, .y = 2, .height = 3, .barWidth = 0.5});
  drawing_.PrintLine({device_, 1, 0}, {.x1 = 1, .y1 = 2, .x2 = 3, .y2 = 4, .thickness = 5});
  drawing_.PrintText({device_, 1e-7, 1}, "A", {.x = 4, .y = 3, .width = 2, .height = 1}, {.name = "X"}, {});
  EXPECT_THAT(asked_, ElementsAre("57 mWinPrint Sub EAN128Barcode", "11 mWinPrint Sub EAN13Barcode",
                                  "11 mWinPrint Sub PrintLine", "6 mWinPrint Sub PrintText"));
  EXPECT_THAT(Drawn(), IsEmpty());
}

TEST_F(DrawingTest, DrawsABarAgainWhenAsked) {
  device_.failures = 2;
  answer_ = Button::kRetry;
  drawing_.EAN128Barcode(context_, "12", {.x = 10, .y = 27, .height = 9, .barWidth = 0.5});
  EXPECT_EQ(asked_.size(), 2u);
  EXPECT_EQ(Drawn().size(), 26u);
}

TEST_F(DrawingTest, LeavesABarcodeThatRunsOffTheNumbers) {
  drawing_.EAN128Barcode({device_, 1e-3, 1}, std::string(2000, '1'), {.x = 1, .y = 2, .height = 3, .barWidth = 9});
  EXPECT_THAT(asked_, ElementsAre("6 mWinPrint Sub EAN128Barcode"));
}

}  // namespace
}  // namespace partnerkit::render

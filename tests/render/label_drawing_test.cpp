#include "render/label_drawing.h"

#include <gmock/gmock.h>

#include "labels/cml_carton_layout.h"
#include "partnerkit/platform.h"
#include "render/recording_device.h"
#include "support/error_of.h"

namespace partnerkit::render {
namespace {

using partnerkit::testing::ErrorOf;
using partnerkit::testing::RecordingDevice;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

using Strings = std::vector<std::string>;

// At 56 twips a pixel is a millimetre. Labels are 600 high, which makes 150 mm.
Strings Drawn(std::string_view records, std::string_view values, const LabelStyle& style = {}) {
  const std::string format = "{F,10,A,R,E,600,400,\"CMLDC\"|" + std::string(records) + "}";
  RecordingDevice device;
  Drawing drawing(platform::DefaultPorts());
  DrawLabel(ReadPackets(format, "{B,10,N,1|" + std::string(values) + "}"), style, drawing, {device, 56, 56});
  return device.drawn;
}

constexpr LabelStyle kCml{.fieldMoves = labels::kCmlCartonFieldMoves, .constantMoves = labels::kCmlCartonConstantMoves};

TEST(LabelDrawingTest, TextsStandWhereTheLabelPrinterWouldPutThem) {
  const struct {
    const char *records, *values, *drawn;
  } table[] = {
      // 25 mm an inch, a half to the even: x 12.5 is 12, y 150 - 41.75 is 108.
      {"T,30,9,V,167,50,0,1,3,2,B,L|", R"(30,"a"|)", "12 108 4 4 400 0 ARIAL black on white: a"},
      {"T,30,9,V,166,54,0,2,3,2,B,L|", R"(30,"a"|)", "14 108 6 2 400 0 ARIAL black on white: a"},
      {"T,30,9,V,0,0,0,3,3,2,B,L|", R"(30,"a"|)", "0 150 12 6 700 0 ARIAL black on white: a"},
      {"T,30,9,V,0,0,0,4,3.5,2.5,B,L|", R"(30,"a"|)", "0 150 4 2 400 0 ARIAL black on white: a"},
      {"T,30,9,V,0,0,0,1,1,1,W,L|", "", "0 150 4 2 400 0 ARIAL white on black: "},
      {"T,30,9,V,0,0,0,1,1,1,w,L|", "", "0 150 4 2 400 0 ARIAL white on black: "},
      // Bold fields are fitted one by one: 12 x 6 by 1.7 is 20.4 x 10.2, by 1.2 14.4 x 7.2, the height by 0.75 is 9.
      {"T,19,9,V,0,0,0,3,3,2,B,L|", "", "0 150 20 10 700 0 ARIAL black on white: "},
      {"T,14,9,V,0,80,0,3,3,2,B,L|", "", "10 150 14 7 700 0 ARIAL black on white: "},
      {"T,9,9,V,0,80,0,3,3,2,B,L|", "", "10 150 9 6 700 0 ARIAL black on white: "},
      {"T,19,9,V,0,0,0,1,3,2,B,L|", "", "0 150 4 4 400 0 ARIAL black on white: "},
      // Three millimetres down for the fields at the top, ten to the left for the location numbers, twenty to the
      // right.
      {"T,5,9,V,560,0,0,1,1,1,O|", "", "0 13 4 2 400 0 ARIAL black on white: "},
      {"T,6,9,V,560,0,0,1,1,1,O|", "", "0 10 4 2 400 0 ARIAL black on white: "},
      {"T,7,9,V,560,0,0,1,1,1,O|", R"(7,"CON:"|)", "0 13 4 2 400 0 ARIAL black on white: CON:"},
      {"T,7,9,V,560,0,0,1,1,1,O|", R"(7,"CON"|)", "0 10 4 2 400 0 ARIAL black on white: CON"},
      {"T,9,9,V,560,80,0,1,1,1,O|", R"(9,"TO:"|)", "20 10 4 2 400 0 ARIAL black on white: TO:"},
      {"T,14,9,V,560,80,0,1,1,1,O|", R"(14,"FOR:"|)", "20 10 4 2 400 0 ARIAL black on white: FOR:"},
      {"T,18,9,V,560,80,0,1,1,1,O|", "", "40 10 4 2 400 0 ARIAL black on white: "},
      // A constant goes by the number of its record.
      {"C,560,80,0,1,1,1,O,L,0,0,\"FROM:\"|", "", "20 13 4 2 400 0 ARIAL black on white: FROM:"},
  };
  for (const auto& c : table) EXPECT_THAT(Drawn(c.records, c.values), ElementsAre(c.drawn)) << c.records;
  // The ninth record: ten to the left like the field, in its full height unlike it.
  const std::string nine = "X,|X,|X,|X,|X,|X,|X,|X,|C,0,80,0,3,3,2,O,L,0,0,";
  EXPECT_THAT(Drawn(nine + "\"WITH\"|", ""), ElementsAre("10 150 12 6 700 0 ARIAL black on white: WITH"));
  EXPECT_THAT(Drawn(nine + "\"TO:\"|", ""), ElementsAre("20 150 12 6 700 0 ARIAL black on white: TO:"));
}

TEST(LabelDrawingTest, BarcodesAndLinesStandByTheirCorners) {
  // At 5.6 twips a pixel is a tenth of a millimetre across: x 1, y 150 - (45.75 - 4) - 38 is 70.25, 38 high.
  RecordingDevice device;
  Drawing drawing(platform::DefaultPorts());
  const struct {
    const char* density;
    const char* first;
  } table[] = {
      {"4", "9 70 10 108 pen 5"}, {"6", "9 70 10 108 pen 4"}, {"8", "9 70 10 108 pen 3"}, {".7", "9 70 10 108 pen 7"}};
  for (const auto& c : table) {
    const std::string format = "{F,10,A,R,E,600,400|B,15,27,V,183,4,3," + std::string(c.density) + ",152,8,L,0|}";
    DrawLabel(ReadPackets(format, R"({B|15,"12"|})"), {}, drawing, {device, 5.6, 56});
    ASSERT_EQ(device.drawn.size(), 26U);
    EXPECT_EQ(device.drawn[0], c.first);
    device.drawn.clear();
  }
  // y 150 - (25 - 3) and 150 - (50 - 3); the thickness a quarter, a half to the even.
  EXPECT_THAT(Drawn("L,S,100,40,200,80,6,\"1\"|L,s,100,40,100,40,10,\"1\"|L,D,1,1,1,1,1|G,99,1,1,0,0|", ""),
              ElementsAre("10 128 21 104 pen 2", "10 128 11 129 pen 2"));
  EXPECT_THAT(Drawn("G,99,555,320,0,0|", ""), IsEmpty());
}

TEST(LabelDrawingTest, ACmlCartonIsCorrectedFieldByField) {
  const struct {
    const char* record;
    const char* drawn;
  } table[] = {
      {"T,1,50,V,578,57,0,1,1,1,O|", "16 4 4 2 400 0 ARIAL black on white: "},      // 65 is 16.25; 598 is 149.5, less 3
      {"T,6,50,V,520,32,0,1,2,1,O|", "10 22 4 2 400 0 ARIAL black on white: "},     // 40; 510 is 127.5
      {"T,9,50,V,514,125,0,1,3,1,O|", "21 14 9 3 700 0 ARIAL black on white: "},    // 31.25 less 10; 544 is 136
      {"T,14,50,V,505,323,0,3,3,1,O|", "71 12 14 4 700 0 ARIAL black on white: "},  // 80.75 less 10; 553 is 138.25
      {"T,19,50,V,381,36,0,3,2,1,B|", "9 44 14 5 700 0 ARIAL black on white: "},    // 426 is 106.5; 13.6 by 5.1
      {"T,28,6,V,378,270,0,1,2,2,B|", "68 56 4 4 400 0 ARIAL black on white: "},    // not corrected: 67.5; 94.5, 55.5
      {"X,|C,578,5,0,1,1,1,O,L,0,0,\"A\"|", "1 4 4 2 400 0 ARIAL black on white: A"},  // 598
      {"X,|X,|X,|X,|X,|X,|X,|X,|C,520,5,0,1,2,1,O,L,0,0,\"TO:\"|", "1 22 4 2 400 0 ARIAL black on white: TO:"},
  };
  for (const auto& c : table) EXPECT_THAT(Drawn(c.record, "", kCml), ElementsAre(c.drawn)) << c.record;
}

TEST(LabelDrawingTest, APlaceOffAnyPageIsAnError) {
  EXPECT_EQ(ErrorOf([] { Drawn("T,30,9,V,400000,0,0,1,1,1,O|", ""); }), "6 Overflow");
  EXPECT_EQ(ErrorOf([] { Drawn("L,S,1,1,-400000,1,1|", ""); }), "6 Overflow");
}

}  // namespace
}  // namespace partnerkit::render

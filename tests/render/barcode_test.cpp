#include "render/barcode.h"

#include <gtest/gtest.h>

#include <vector>

namespace partnerkit::render {
namespace {

// The values of a Code 128 pattern, start, check and stop included.
std::vector<int> ValuesOf(const std::string& pattern) {
  std::vector<int> values;
  for (std::size_t at = 0; at < pattern.size() && values.size() < 100;) {
    int value = pattern.size() - at == 13 ? 106 : 0;
    while (value < 107 && !pattern.substr(at).starts_with(ConvertPattern(Code128Widths(value)))) ++value;
    values.push_back(value);
    at += value == 106 ? 13 : 11;
  }
  return values;
}

TEST(BarPatternTest, DrawsStartDataCheckAndStop) {
  EXPECT_EQ(BarPattern("12"),
            "11010011100"
            "10110011100"
            "10011001110"
            "1100011101011");
}

TEST(BarPatternTest, ChoosesStartAndSubsets) {
  const struct {
    std::string_view data;
    std::vector<int> values;
  } cases[] = {
      {"1234", {105, 12, 34, 82, 106}},
      {"~20100393123450000012344", {105, 102, 0, 39, 31, 23, 45, 0, 0, 1, 23, 44, 11, 106}},
      {"~20190123A", {105, 102, 90, 12, 100, 19, 33, 86, 106}},
      {"~20110AB~20121", {105, 102, 10, 100, 33, 34, 102, 18, 17, 55, 106}},
      {"~20110A-~2012", {105, 102, 10, 100, 33, 101, 13, 102, 100, 18, 34, 106}},
      {"\x1d"
       "421036",
       {105, 102, 42, 10, 36, 53, 106}},
      {std::string_view("ABC\0", 4), {104, 33, 34, 35, 1, 106}},
      {"A B", {104, 33, 0, 34, 33, 106}},
      {"A1234", {104, 33, 17, 18, 19, 20, 92, 106}},
      {"~20112-B", {105, 102, 12, 101, 13, 100, 34, 54, 106}},
      {"12-B", {104, 17, 18, 13, 34, 23, 106}},
      {"1.5", {105, 100, 17, 101, 14, 100, 21, 91, 106}},
      {"12A", {104, 17, 18, 33, 50, 106}},
      {"12345-\x02", {105, 12, 34, 100, 21, 101, 13, 66, 69, 106}},
      {"A\x02\x1e\x7f\xe9"
       "B~2",
       {104, 33, 34, 94, 18, 44, 106}},
      {"", {104, 1, 106}},
  };
  for (const auto& test : cases) EXPECT_EQ(ValuesOf(BarPattern(test.data)), test.values) << test.data;
}

TEST(BarPatternTest, KnowsTheValuesOfCharactersAndFunctions) {
  const struct {
    std::string_view character;
    int a, b;
  } cases[] = {
      {"/", 15, -1},      {"A", -1, 33},      {"\x1d", 102, 102}, {"FNC1", 102, 102},
      {"FNC2", 97, 97},   {"FNC3", 96, 96},   {"FNC4", 101, 100}, {"SHIFT", 98, 98},
      {"CODEA", -1, 101}, {"CODEB", 100, -1}, {"CODEC", 99, 99},  {"", -1, -1},
  };
  for (const auto& test : cases) {
    EXPECT_EQ(Code128ValueA(test.character), test.a) << test.character;
    EXPECT_EQ(Code128ValueB(test.character), test.b) << test.character;
  }
  EXPECT_EQ(Code128Widths(107), "");
  EXPECT_EQ(Code128Widths(-1), "");
}

TEST(BuildBarcodeTest, DrawsBothHalvesBetweenGuards) {
  EXPECT_EQ(BuildBarcode("5901234123457"),
            "101"
            "000101101001110110011001001101111010011101"
            "01010"
            "110011011011001000010101110010011101000100"
            "101");
}

TEST(BuildBarcodeTest, LeavesOutWhatIsNoDigit) {
  EXPECT_EQ(BuildBarcode(""), "101101");
  EXPECT_EQ(BuildBarcode("5x0"),
            "101"
            "0100111"
            "101");
  EXPECT_EQ(BuildBarcode("x12345678"),
            "101"
            "01010"
            "1000100"
            "1001000"
            "101");
  EXPECT_EQ(GetBars('4', 'D'), "");
}

}  // namespace
}  // namespace partnerkit::render

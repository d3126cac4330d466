#include "values/numbers.h"

#include <gtest/gtest.h>

#include <cfloat>
#include <cmath>
#include <string>

#include "support/error_of.h"

namespace partnerkit {
namespace {

using testing::ErrorOf;

constexpr std::string_view kOverflow = "6 Overflow";

TEST(Numbers, ReadsTheNumberAtTheStartOfAField) {
  struct Case {
    std::string_view text;
    double number;
  };
  for (const auto& [text, number] : {
           Case{"", 0},
           Case{"N/A", 0},
           Case{"  \t7 8", 7},
           Case{"+3.25", 3.25},
           Case{"-0.5", -0.5},
           Case{"-", 0},
           Case{"+-5", 0},
           Case{".75", 0.75},
           Case{".", 0},
           Case{"1.2.3", 1.2},
           Case{"inf", 0},
           Case{"-nan", 0},
           Case{"1E+", 1},
           Case{"25E-1x", 2.5},
           Case{"1e308", 1e308},
           Case{"-0.0001e-400", 0},
           Case{"0e999", 0},
           Case{"9007199254740993", 9007199254740992},
       }) {
    EXPECT_EQ(NumberAtStart(text), number) << text;
  }
  EXPECT_EQ(NumberAtStart(std::string_view("4\0002", 3)), 4);
  EXPECT_EQ(NumberAtStart("0." + std::string(400, '0') + "1e402"), 10);
  EXPECT_EQ(NumberAtStart(std::string(400, '9') + "e-400"), 1);
  EXPECT_FALSE(std::signbit(NumberAtStart("-0")));
  for (const std::string& text : {std::string("1e309"), std::string("-2E+9999999999999"), std::string(400, '9')}) {
    EXPECT_EQ(ErrorOf([&] { NumberAtStart(text); }), kOverflow) << text;
  }
}

TEST(Numbers, NarrowsHalvesToTheEvenNeighbourAndNothingBeyondTheWidth) {
  for (const auto& [value, whole] : {std::pair(0.5, 0), std::pair(1.5, 2), std::pair(-1.5, -2), std::pair(-2.49, -2),
                                     std::pair(32767.49, 32767), std::pair(-32768.5, -32768)}) {
    EXPECT_EQ(ToLong(value), whole) << value;
    EXPECT_EQ(ToInteger(value), whole) << value;
  }
  EXPECT_EQ(ToLong(2147483647.4), 2147483647);
  EXPECT_EQ(ToLong(-2147483648.5), -2147483647 - 1);
  for (const double value : {2147483647.5, -2147483648.6, double{INFINITY}, double{NAN}}) {
    EXPECT_EQ(ErrorOf([&] { ToLong(value); }), kOverflow) << value;
  }
  for (const double value : {32767.5, -32768.51}) {
    EXPECT_EQ(ErrorOf([&] { ToInteger(value); }), kOverflow) << value;
  }
}

TEST(Numbers, RoundsTheDecimalThatAPersonReads) {
  struct Case {
    double value;
    int digits;
    double rounded;
  };
  for (const auto& [value, digits, rounded] : {
           Case{1.005, 2, 1.0},
           Case{1.015, 2, 1.02},
           Case{0.123451, 4, 0.1235},
           Case{9.99995, 4, 10.0},
           Case{-1.25, 1, -1.2},
           Case{0.00005, 4, 0.0},
           Case{0.00006, 4, 0.0001},
           Case{1250, -2, 1200.0},
           Case{49, -2, 0.0},
           Case{51, -2, 100.0},
           Case{0, 4, 0.0},
           Case{DBL_MAX, 2, DBL_MAX},
       }) {
    EXPECT_EQ(RoundHalfEven(value, digits), rounded) << value << " to " << digits;
  }
}

TEST(Numbers, ShowsUpToFifteenDigits) {
  struct Case {
    double value;
    std::string_view text;
  };
  for (const auto& [value, text] : {
           Case{-0.0, "0"},
           Case{0.1 + 0.2, "0.3"},
           Case{-0.05, "-0.05"},
           Case{1234.5678, "1234.5678"},
           Case{999999999999999, "999999999999999"},
           Case{1e15, "1E+15"},
           Case{-1.5e308, "-1.5E+308"},
           Case{1.0 / 3, "0.333333333333333"},
           Case{1e-15, "0.000000000000001"},
           Case{1e-16, "1E-16"},
           Case{1.25e-15, "1.25E-15"},
       }) {
    EXPECT_EQ(NumberText(value), text);
  }
  EXPECT_EQ(ErrorOf([] { NumberText(INFINITY); }), kOverflow);
}

TEST(Numbers, AddsUntilTheSumOverflows) {
  EXPECT_EQ(Plus(1.5, 2.25), 3.75);
  EXPECT_EQ(ErrorOf([] { Plus(-1.7e308, -1e308); }), kOverflow);
}

TEST(Numbers, TellsATextThatIsANumberAsAWhole) {
  for (const std::string_view text : {"52", " -52.50 ", "+.5", "1E+20"}) EXPECT_TRUE(DecimalOf(text)) << text;
  for (const std::string_view text : {"12E4", "1E+999", "", " ", "DC", "5 2", "1,000", "5-", "inf", "1.2.3", "-"}) {
    EXPECT_FALSE(DecimalOf(text)) << text;
  }
  EXPECT_FALSE(DecimalOf(std::string_view("52\0", 3)));
}

}  // namespace
}  // namespace partnerkit

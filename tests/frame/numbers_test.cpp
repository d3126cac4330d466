#include "frame/numbers.h"

#include <gtest/gtest.h>

#include <cfloat>
#include <cmath>
#include <string>

#include "partnerkit/run_time_error.h"

namespace partnerkit {
namespace {

template <class Work>
int ErrorOf(Work work) {
  try {
    (void)work();
  } catch (const RunTimeError& error) {
    EXPECT_EQ(error.Description(), "Overflow");
    return error.Number();
  }
  return 0;
}

TEST(Numbers, ReadsTheNumberAtTheStartOfAField) {
  struct Case {
    std::string_view text;
    double number;
  };
  for (const auto& [text, number] : {
           Case{"", 0},
           Case{" ", 0},
           Case{"N/A", 0},
           Case{"12", 12},
           Case{"12.50EA", 12.5},
           Case{"  \t7 8", 7},
           Case{"+3.25", 3.25},
           Case{"-0.5", -0.5},
           Case{"-", 0},
           Case{"+-5", 0},
           Case{"--5", 0},
           Case{"- 5", 0},
           Case{".75", 0.75},
           Case{".", 0},
           Case{"5.", 5},
           Case{"1.2.3", 1.2},
           Case{"1,234", 1},
           Case{"$9", 0},
           Case{"0x1F", 0},
           Case{"inf", 0},
           Case{"-nan", 0},
           Case{"1e", 1},
           Case{"1E+", 1},
           Case{"2e3", 2000},
           Case{"25E-1x", 2.5},
           Case{"1e308", 1e308},
           Case{"1e-999", 0},
           Case{"-0.0001e-400", 0},
           Case{"0e999", 0},
           Case{"000000012", 12},
           Case{"0.1", 0.1},
           Case{"9312345678907", 9312345678907},
           Case{"9007199254740993", 9007199254740992},
       }) {
    EXPECT_EQ(NumberAtStart(text), number) << text;
  }
  EXPECT_EQ(NumberAtStart(std::string_view("4\0002", 3)), 4);
  EXPECT_EQ(NumberAtStart("0." + std::string(400, '0') + "1e402"), 10);
  EXPECT_EQ(NumberAtStart(std::string(400, '9') + "e-400"), 1);
  EXPECT_FALSE(std::signbit(NumberAtStart("-0")));
}

TEST(Numbers, RaisesOverflowWhenAFieldIsBeyondADouble) {
  for (const std::string& text :
       {std::string("1e309"), std::string("-2E+9999999999999"), std::string(400, '9'), std::string(400, '9') + "e-1"}) {
    EXPECT_EQ(ErrorOf([&] { return NumberAtStart(text); }), 6) << text;
  }
}

TEST(Numbers, NarrowsHalvesToTheEvenNeighbour) {
  struct Case {
    double value;
    int whole;
  };
  for (const auto& [value, whole] :
       {Case{0.5, 0}, Case{1.5, 2}, Case{2.5, 2}, Case{-0.5, 0}, Case{-1.5, -2}, Case{2.51, 3}, Case{-2.49, -2},
        Case{32767.5 - 0.01, 32767}, Case{-32768.5, -32768}}) {
    EXPECT_EQ(ToLong(value), whole) << value;
    EXPECT_EQ(ToInteger(value), whole) << value;
  }
  EXPECT_EQ(ToLong(2147483647.4), 2147483647);
  EXPECT_EQ(ToLong(-2147483648.5), -2147483647 - 1);
}

TEST(Numbers, RaisesOverflowBeyondTheWidth) {
  for (const double value : {2147483647.5, -2147483648.6, 99999999999.0, 1e308, double{INFINITY}, double{NAN}}) {
    EXPECT_EQ(ErrorOf([&] { return ToLong(value); }), 6) << value;
  }
  for (const double value : {32767.5, -32768.51, 40000.0, double{NAN}}) {
    EXPECT_EQ(ErrorOf([&] { return ToInteger(value); }), 6) << value;
  }
}

TEST(Numbers, RoundsTheDecimalThatAPersonReads) {
  struct Case {
    double value;
    int digits;
    double rounded;
  };
  for (const auto& [value, digits, rounded] : {
           Case{1.005, 2, 1.0},       Case{1.015, 2, 1.02},      Case{2.675, 2, 2.68},   Case{2.665, 2, 2.66},
           Case{0.12345, 4, 0.1234},  Case{0.123451, 4, 0.1235}, Case{9.99995, 4, 10.0}, Case{-1.25, 1, -1.2},
           Case{0.1 + 0.2, 4, 0.3},   Case{0.00004, 4, 0.0},     Case{0.00005, 4, 0.0},  Case{0.00006, 4, 0.0001},
           Case{12.5, 0, 12.0},       Case{1250, -2, 1200.0},    Case{0, 4, 0.0},        Case{1e308, 4, 1e308},
           Case{DBL_MAX, 2, DBL_MAX}, Case{99.995, 2, 100.0},    Case{49, -2, 0.0},      Case{51, -2, 100.0},
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
           Case{0, "0"},
           Case{-0.0, "0"},
           Case{-3, "-3"},
           Case{10.5, "10.5"},
           Case{0.1, "0.1"},
           Case{0.1 + 0.2, "0.3"},
           Case{-0.05, "-0.05"},
           Case{1234.5678, "1234.5678"},
           Case{100, "100"},
           Case{9312345678907, "9312345678907"},
           Case{999999999999999, "999999999999999"},
           Case{1e15, "1E+15"},
           Case{1e20, "1E+20"},
           Case{-1.5e308, "-1.5E+308"},
           Case{1.0 / 3, "0.333333333333333"},
           Case{0.000001, "0.000001"},
           Case{1e-15, "0.000000000000001"},
           Case{1e-16, "1E-16"},
           Case{1.25e-15, "1.25E-15"},
           Case{99999999999.75, "99999999999.75"},
           Case{0.99999999999999999, "1"},
           Case{2.5e-300, "2.5E-300"},
       }) {
    EXPECT_EQ(NumberText(value), text);
  }
  EXPECT_EQ(ErrorOf([] { return NumberText(INFINITY); }), 6);
}

TEST(Numbers, AddsUntilTheSumOverflows) {
  EXPECT_EQ(Plus(1.5, 2.25), 3.75);
  EXPECT_EQ(ErrorOf([] { return Plus(DBL_MAX, DBL_MAX); }), 6);
  EXPECT_EQ(ErrorOf([] { return Plus(-1.7e308, -1e308); }), 6);
}

TEST(Numbers, TellsATextThatIsANumberAsAWhole) {
  struct Case {
    std::string_view text;
    bool number;
  };
  for (const auto& [text, number] :
       {Case{"52", true}, Case{" -52.50 ", true}, Case{"+.5", true}, Case{"1E+20", true}, Case{"12E4", false},
        Case{"1E+999", false}, Case{"", false}, Case{" ", false}, Case{"DC", false}, Case{"5 2", false},
        Case{"1,000", false}, Case{"5-", false}, Case{"inf", false}, Case{"1.2.3", false}, Case{"-", false}}) {
    EXPECT_EQ(DecimalOf(text).has_value(), number) << text;
  }
  EXPECT_FALSE(DecimalOf(std::string_view("52\0", 3)));
}

}  // namespace
}  // namespace partnerkit

#include "values/format.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "partnerkit/run_time_error.h"

namespace partnerkit {
namespace {

DateTime At(std::string_view iso) { return DateTime::FromIso(iso).value(); }

TEST(Format, LaysANumberOutInItsPlaces) {
  struct Case {
    double value;
    std::string_view pattern, text;
  };
  for (const auto& [value, pattern, text] : {
           // control numbers: zeros in front, no digit ever lost
           Case{7, "0000", "0007"},
           Case{123456, "0000", "123456"},
           // weights and money
           Case{1, "####0.0#", "1.0"},
           Case{0.256, "####0.0#", "0.26"},
           Case{12.5, "####0.0000", "12.5000"},
           Case{0.5, "#.0000", ".5000"},
           Case{-0.5, "#.00", "-.50"},
           Case{19.95, "$###0.00", "$19.95"},
           Case{-1234.5, "$ 0.00", "-$ 1234.50"},
           // halves of the decimal value go away from zero
           Case{1.005, "0.00", "1.01"},
           Case{2.5, "0", "3"},
           Case{0.49, "0", "0"},
           Case{9.995, "0.00", "10.00"},
           Case{-0.004, "0.00", "0.00"},
           // the rest of the grammar
           Case{5, "0.#", "5."},
           Case{0, "#", ""},
           Case{12.5, ".00", "12.50"},
           Case{1234567.891, "#,##0.00", "1,234,567.89"},
           Case{5, "0,000", "0,005"},
           Case{1234567, "0,", "1235"},
           Case{0.256, "0.0%", "25.6%"},
           Case{1234567, "000-000", "1234-567"},
           Case{12345.678, "0.00E+00 kg", "1.23E+04 kg"},
           Case{0.0099996, "0.00E-0", "1.00E-2"},
           Case{12.5, "0.0\" kg\"", "12.5 kg"},
           Case{5, "\\#0", "#5"},
           Case{5, "", "5"},
           Case{-5, "0;(0);\"nil\"", "(5)"},
           Case{0, "0;(0);\"nil\"", "nil"},
           Case{-5, "0;;", "-5"},
           Case{52, "@@@@", "  52"},
           Case{-1.5, "!@@@@@@", "-1.5  "},
           Case{20040731, "yyyymmdd", "20040731"},
       }) {
    EXPECT_EQ(Format(value, pattern), text) << value << " as " << pattern;
  }
  EXPECT_EQ(Format(1e308, "0.00"), "1" + std::string(308, '0') + ".00");
  EXPECT_THROW(Format(INFINITY, "0.00"), RunTimeError);
}

TEST(Format, WritesDatesAndTimes) {
  struct Case {
    std::string_view pattern, text;
  };
  for (const auto& [pattern, text] : {
           Case{"yyyymmdd", "20040703"},
           Case{"ddmmyyhhmm", "0307040905"},
           Case{"YYMMDDHHMM", "0407030905"},
           Case{"short date", "03/07/2004"},
           Case{"Long Date", "Saturday, 3 July 2004"},
           Case{"y", "185"},
           Case{"ddd d mmm", "Sat 3 Jul"},
           Case{"h:m:s", "9:5:8"},
           Case{"nn/mm", "05/07"},
           Case{"mmhhmmmm", "0709July"},
           Case{"yyyy-mm-dd\\Thh:nn:ss", "2004-07-03T09:05:08"},
           Case{"h:nn AM/PM", "9:05 AM"},
           Case{"@@@@@@@@@@@@@@@@@@@@@", "  03/07/2004 09:05:08"},
           Case{"0000", "03/07/2004 09:05:08"},
           Case{"", "03/07/2004 09:05:08"},
       }) {
    EXPECT_EQ(Format(At("2004-07-03T09:05:08"), pattern), text) << pattern;
  }
  EXPECT_EQ(Format(At("2004-07-31T23:59:01"), "hh:nn am/pm"), "11:59 pm");
  EXPECT_EQ(Format(At("2004-07-31T00:30:00"), "h:nn a/p"), "12:30 a");
  EXPECT_EQ(Format(At("2004-07-31"), "hhmm"), "0000");
  EXPECT_EQ(Format(At("0007-01-02"), "yyyymmdd yy"), "00070102 07");
}

TEST(Format, FillsTheCharactersOfAText) {
  struct Case {
    std::string_view value, pattern, text;
  };
  for (const auto& [value, pattern, text] : {
           Case{"ACME", "!@@@@@@", "ACME  "},
           Case{"ACME", "@@@@@@", "  ACME"},
           Case{"ACMEEDI", "!@@@@", "ACMEEDI"},
           Case{"", "!@@@", "   "},
           Case{"AB", "!&&x@@", "ABx  "},
           Case{"aB9", ">", "AB9"},
           Case{"aB9", "<@@@@", " ab9"},
           Case{"abcde", "(@@) @", "(abcd) e"},
           Case{"abcde", "!(@@) @-", "(ab) cde-"},
           Case{"", "@@;none", "none"},
           Case{"a", "@@;none", " a"},
           // a number pattern takes a text that is a number, digit for digit
           Case{" 52 ", "0000", "0052"},
           Case{"", "0000", ""},
           Case{"393123450000000017", "0", "393123450000000017"},
           Case{"12E4", "0000", "12E4"},
           Case{"1E+999999999", "0", "1E+999999999"},
           Case{"1E+03", "0.0", "1000.0"},
           // and a date pattern one that is a date
           Case{"31/07/2004", "YYMMDD", "040731"},
           Case{"31/02/2004", "YYMMDD", "31/02/2004"},
           Case{"plain", "", "plain"},
       }) {
    EXPECT_EQ(Format(value, pattern), text) << value << " as " << pattern;
  }
  EXPECT_EQ(Format(std::string_view("a\0b", 3), "@@@@"), std::string_view(" a\0b", 4));
  EXPECT_EQ(Format(std::string_view("5\0", 2), "0000"), std::string_view("5\0", 2));
}

TEST(Format, TakesACellForWhatItHoldsAndGivesNothingForNull) {
  EXPECT_EQ(Format(Text(), "@@@@"), "");
  EXPECT_EQ(Format(std::optional<double>(), "0.00"), "");
  EXPECT_EQ(Format(Cell(), "@@@@"), "");
  EXPECT_EQ(Format(Cell(2.5), "0.00"), "2.50");
  EXPECT_EQ(Format(Cell(std::string("52")), "0000"), "0052");
  EXPECT_EQ(Format(Cell(At("2004-07-31")), "Long Date"), "Saturday, 31 July 2004");
  EXPECT_EQ(Format(Cell(true), "!@@@@@"), "True ");
  EXPECT_EQ(Format(Cell(false), "0"), "False");
}

TEST(Format, SurvivesAnyPattern) {
  for (const std::string_view pattern :
       {"\"", "\\", ";", ";;;;", "0\"",  "E+",        "0E+", "E+00", ".",         "0.0.0",    ",",
        ",0", "%",  "!", "a/p",  "am/p", "0E+00E+00", "@;",  "#,",   "yyyyyyyyy", "hhhhmmmmm"}) {
    EXPECT_NO_THROW({
      Format(-1234.5, pattern);
      Format(0.0, pattern);
      Format("1234", pattern);
      Format(At("2004-07-31T10:15:00"), pattern);
    }) << pattern;
  }
}

}  // namespace
}  // namespace partnerkit

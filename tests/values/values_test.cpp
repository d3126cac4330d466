#include "partnerkit/values.h"

#include <gtest/gtest.h>

#include <array>

namespace partnerkit {
namespace {

TEST(DateTime, KnowsTheDaysOfTheCalendarAndTheTimesThatClocksShow) {
  struct Case {
    int year, month, day, hour, minute, second;
    bool exists;
  };
  for (const Case& c : {
           Case{2000, 2, 29, 23, 59, 59, true},
           Case{1900, 2, 29, 0, 0, 0, false},
           Case{2004, 4, 31, 0, 0, 0, false},
           Case{2004, 4, 30, 0, 0, 0, true},
           Case{1, 1, 1, 0, 0, 0, true},
           Case{0, 1, 1, 0, 0, 0, false},
           Case{9999, 12, 31, 0, 0, 0, true},
           Case{10000, 1, 1, 0, 0, 0, false},
           Case{2004, 13, 1, 0, 0, 0, false},
           Case{2004, 0, 1, 0, 0, 0, false},
           Case{2004, 1, 0, 0, 0, 0, false},
           Case{2004, 257, 1, 0, 0, 0, false},
           Case{2004, 1, 257, 0, 0, 0, false},
           Case{2004, 7, 31, 24, 0, 0, false},
           Case{2004, 7, 31, 10, 60, 0, false},
           Case{2004, 7, 31, 10, 15, 60, false},
           Case{2004, 7, 31, -1, 15, 0, false},
       }) {
    EXPECT_EQ(DateTime::FromYmdHms(c.year, c.month, c.day, c.hour, c.minute, c.second).has_value(), c.exists)
        << c.year << '/' << c.month << '/' << c.day << ' ' << c.hour << ':' << c.minute << ':' << c.second;
  }
}

TEST(DateTime, TellsItsParts) {
  struct Case {
    std::string_view iso;
    std::array<int, 6> parts;
    int weekday, dayOfYear;
    std::int64_t seconds;
  };
  for (const Case& c : {
           Case{"2004-07-31T10:15:42", {2004, 7, 31, 10, 15, 42}, 6, 213, 1091268942},
           Case{"1969-12-31T23:59:58", {1969, 12, 31, 23, 59, 58}, 3, 365, -2},
           Case{"1899-12-30T06:07:08", {1899, 12, 30, 6, 7, 8}, 6, 364, -2209139572},
           Case{"2000-12-31T12:34:56", {2000, 12, 31, 12, 34, 56}, 0, 366, 978266096},
       }) {
    const DateTime date = DateTime::FromIso(c.iso).value();
    EXPECT_EQ((std::array{date.Year(), date.Month(), date.Day(), date.Hour(), date.Minute(), date.Second()}), c.parts);
    EXPECT_EQ(date.Weekday(), c.weekday) << c.iso;
    EXPECT_EQ(date.DayOfYear(), c.dayOfYear) << c.iso;
    EXPECT_EQ(date.Seconds(), c.seconds) << c.iso;
    EXPECT_EQ(DateTime::FromSeconds(c.seconds), date);
    EXPECT_EQ(date.Iso(), c.iso);
    EXPECT_EQ(date.Date().Iso(), c.iso.substr(0, 10));
    EXPECT_LT(date.Date().Seconds(), date.Seconds());
  }
}

TEST(DateTime, ReadsIsoTextAndNothingElse) {
  EXPECT_EQ(DateTime::FromIso("2004-07-31 10:15:00").value().Iso(), "2004-07-31T10:15:00");
  EXPECT_EQ(DateTime::FromIso("0007-01-02").value().Iso(), "0007-01-02");
  for (const std::string_view text :
       {"", "2004-7-31", "2004-02-30", "2004/07/31", "2004-07-31T10:15", "2004-07-31x10:15:00", "2004-07-31T10:15:00Z",
        "2004-07-3 ", "-004-07-31", "2004-07-31T+1:15:00"}) {
    EXPECT_FALSE(DateTime::FromIso(text)) << text;
  }
  EXPECT_FALSE(DateTime::FromIso(std::string_view("2004-07\0-31", 10)));
}

}  // namespace
}  // namespace partnerkit

#include "partnerkit/values.h"

#include <gtest/gtest.h>

namespace partnerkit {
namespace {

TEST(DateTime, KnowsTheDaysOfTheCalendar) {
  struct Case {
    int year, month, day;
    bool exists;
  };
  for (const auto& [year, month, day, exists] : {
           Case{2004, 2, 29, true},   Case{2000, 2, 29, true},   Case{1900, 2, 29, false}, Case{2005, 2, 29, false},
           Case{2004, 2, 31, false},  Case{2004, 4, 30, true},   Case{2004, 4, 31, false}, Case{2004, 12, 31, true},
           Case{1, 1, 1, true},       Case{0, 1, 1, false},      Case{9999, 12, 31, true}, Case{10000, 1, 1, false},
           Case{2004, 13, 1, false},  Case{2004, 0, 1, false},   Case{2004, 1, 0, false},  Case{2004, -1, 1, false},
           Case{2004, 257, 1, false}, Case{2004, 1, 257, false}, Case{-2004, 1, 1, false},
       }) {
    EXPECT_EQ(DateTime::FromYmd(year, month, day).has_value(), exists) << year << '/' << month << '/' << day;
  }
}

TEST(DateTime, RefusesTimesThatNoClockShows) {
  EXPECT_TRUE(DateTime::FromYmdHms(2004, 7, 31, 23, 59, 59));
  EXPECT_FALSE(DateTime::FromYmdHms(2004, 7, 31, 24, 0, 0));
  EXPECT_FALSE(DateTime::FromYmdHms(2004, 7, 31, 10, 60, 0));
  EXPECT_FALSE(DateTime::FromYmdHms(2004, 7, 31, 10, 15, 60));
  EXPECT_FALSE(DateTime::FromYmdHms(2004, 7, 31, -1, 15, 0));
}

TEST(DateTime, TellsItsParts) {
  struct Case {
    std::string_view iso;
    int year, month, day, hour, minute, second, weekday, dayOfYear;
    std::int64_t seconds;
  };
  for (const Case& c : {
           Case{"2004-07-31T10:15:42", 2004, 7, 31, 10, 15, 42, 6, 213, 1091268942},
           Case{"1970-01-01T00:00:01", 1970, 1, 1, 0, 0, 1, 4, 1, 1},
           Case{"1969-12-31T23:59:58", 1969, 12, 31, 23, 59, 58, 3, 365, -2},
           Case{"1899-12-30T06:07:08", 1899, 12, 30, 6, 7, 8, 6, 364, -2209139572},
           Case{"2000-12-31T12:34:56", 2000, 12, 31, 12, 34, 56, 0, 366, 978266096},
       }) {
    const DateTime date = DateTime::FromIso(c.iso).value();
    EXPECT_EQ(date.Year(), c.year);
    EXPECT_EQ(date.Month(), c.month);
    EXPECT_EQ(date.Day(), c.day);
    EXPECT_EQ(date.Hour(), c.hour) << c.iso;
    EXPECT_EQ(date.Minute(), c.minute) << c.iso;
    EXPECT_EQ(date.Second(), c.second) << c.iso;
    EXPECT_EQ(date.Weekday(), c.weekday) << c.iso;
    EXPECT_EQ(date.DayOfYear(), c.dayOfYear) << c.iso;
    EXPECT_EQ(date.Seconds(), c.seconds) << c.iso;
    EXPECT_EQ(date.Iso(), c.iso);
    EXPECT_EQ(date.Date().Iso(), c.iso.substr(0, 10));
  }
}

TEST(DateTime, ReadsIsoTextAndNothingElse) {
  EXPECT_EQ(DateTime::FromIso("2004-07-31").value().Iso(), "2004-07-31");
  EXPECT_EQ(DateTime::FromIso("2004-07-31 10:15:00").value().Iso(), "2004-07-31T10:15:00");
  EXPECT_EQ(DateTime::FromIso("0007-01-02").value().Iso(), "0007-01-02");
  for (const std::string_view text : {"", "2004-7-31", "2004-02-30", "2004/07/31", "20040731", "2004-07-31T",
                                      "2004-07-31T10:15", "2004-07-31T24:00:00", "2004-07-31x10:15:00",
                                      "2004-07-31T10:15:00Z", "2004-07-3 ", "-004-07-31", "2004-07-31T+1:15:00"}) {
    EXPECT_FALSE(DateTime::FromIso(text)) << text;
  }
  EXPECT_FALSE(DateTime::FromIso(std::string_view("2004-07\0-31", 10)));
}

TEST(DateTime, ComparesAndKnowsMidnight) {
  const DateTime morning = DateTime::FromIso("2004-07-31T10:15:00").value();
  EXPECT_TRUE(morning.HasTime());
  EXPECT_FALSE(morning.Date().HasTime());
  EXPECT_LT(morning.Date(), morning);
  EXPECT_EQ(DateTime::FromSeconds(morning.Seconds()), morning);
}

TEST(Values, KeepNullApartFromEmpty) {
  EXPECT_EQ(NullIfEmpty(""), std::nullopt);
  EXPECT_EQ(NullIfEmpty("AD"), "AD");
  EXPECT_EQ(Str(std::nullopt), "");
  EXPECT_EQ(Str(Text("AD")), "AD");
}

TEST(Values, KeepEachCellOfARowTableInItsPlace) {
  RowTable rows(2, 3);
  rows.At(0, 2) = std::string("1/1/1");
  rows.At(1, 0) = 4.0;
  EXPECT_EQ(rows.Rows(), 2u);
  EXPECT_EQ(rows.Columns(), 3u);
  EXPECT_EQ(rows.At(0, 2), Cell(std::string("1/1/1")));
  EXPECT_EQ(rows.At(1, 0), Cell(4.0));
  EXPECT_EQ(rows.At(1, 2), Cell());
  EXPECT_EQ(RowTable().Rows(), 0u);
}

}  // namespace
}  // namespace partnerkit

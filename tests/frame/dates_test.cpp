#include "frame/dates.h"

#include <gtest/gtest.h>

#include <string>

namespace partnerkit {
namespace {

std::string Shown(const std::optional<DateTime>& date) { return date ? date->Iso() : "unset"; }

TEST(OrderDate, ReadsTheThreeFormsAndLeavesTheRestUnset) {
  struct Case {
    std::string_view text, date;
  };
  for (const auto& [text, date] : {
           Case{"2004/07/31", "2004-07-31"},
           Case{"04/7/31", "2004-07-31"},
           Case{" 04 / 07 / 31 ", "2004-07-31"},
           Case{"29/1/2", "2029-01-02"},
           Case{"30/1/2", "1930-01-02"},
           Case{"4/7/3", "2004-07-03"},
           Case{"040731", "2004-07-31"},
           Case{"290228", "2029-02-28"},
           Case{"300228", "1930-02-28"},
           Case{"991231", "1999-12-31"},
           Case{"20040731", "2004-07-31"},
           Case{"19290703", "1929-07-03"},
           Case{"20000229", "2000-02-29"},
           Case{"000229", "2000-02-29"},
           Case{"20040229", "2004-02-29"},
           Case{"19000229", "unset"},
           Case{"20040231", "unset"},
           Case{"2004/02/31", "unset"},
           Case{"040231", "unset"},
           Case{"20041301", "unset"},
           Case{"20040100", "unset"},
           Case{"00000101", "unset"},
           Case{"", "unset"},
           Case{"      ", "unset"},
           Case{"2004073", "unset"},
           Case{"0407311", "unset"},
           Case{"99999999999", "unset"},
           Case{"2004073x", "unset"},
           Case{"-40731", "unset"},
           Case{" 40731", "unset"},
           Case{"2004-07-31", "unset"},
           Case{"2004/07", "unset"},
           Case{"//", "unset"},
           Case{"2004//31", "unset"},
           Case{"2004/07/31/1", "unset"},
           Case{"2004/07/31 10:15", "unset"},
           Case{"2004/-7/31", "unset"},
           Case{"20040/7/31", "unset"},
           Case{"1e3/07/31", "unset"},
       }) {
    EXPECT_EQ(Shown(OrderDate(text)), date) << '"' << text << '"';
  }
  EXPECT_EQ(Shown(OrderDate(std::string_view("0407\0001", 6))), "unset");
}

TEST(DateFromParts, FollowsTheSameRule) {
  EXPECT_EQ(Shown(DateFromParts("06", "3", " 8")), "2006-03-08");
  EXPECT_EQ(Shown(DateFromParts("1906", "03", "08")), "1906-03-08");
  EXPECT_EQ(Shown(DateFromParts("30", "03", "08")), "1930-03-08");
  EXPECT_EQ(Shown(DateFromParts("2006", "", "08")), "unset");
  EXPECT_EQ(Shown(DateFromParts("2006", "02", "29")), "unset");
}

TEST(ShownDate, ReadsDayFirstUnlessTheYearStandsInFront) {
  EXPECT_EQ(Shown(ShownDate("31/07/2004")), "2004-07-31");
  EXPECT_EQ(Shown(ShownDate(" 3/7/04 ")), "2004-07-03");
  EXPECT_EQ(Shown(ShownDate("2004/07/31")), "2004-07-31");
  EXPECT_EQ(Shown(ShownDate("2004-07-31 10:15:00")), "2004-07-31T10:15:00");
  for (const std::string_view text : {"", "31/02/2004", "07/31/2004", "040731", "B1234", "1/2"}) {
    EXPECT_EQ(Shown(ShownDate(text)), "unset") << text;
  }
}

}  // namespace
}  // namespace partnerkit

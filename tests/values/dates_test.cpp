#include "values/dates.h"

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
           Case{" 04 / 7 / 31 ", "2004-07-31"},
           Case{"29/1/2", "2029-01-02"},
           Case{"30/1/2", "1930-01-02"},
           Case{"290228", "2029-02-28"},
           Case{"300228", "1930-02-28"},
           Case{"19290703", "1929-07-03"},
           Case{"20000229", "2000-02-29"},
       }) {
    EXPECT_EQ(Shown(OrderDate(text)), date) << '"' << text << '"';
  }
  for (const std::string_view text :
       {"19000229", "2004/02/31", "040231", "00000101", "", "2004073", "0407311", "2004073x", "-40731", " 40731",
        "2004-07-31", "2004/07", "2004//31", "2004/07/31/1", "2004/07/31 10:15", "20040/7/31"}) {
    EXPECT_EQ(Shown(OrderDate(text)), "unset") << '"' << text << '"';
  }
  EXPECT_EQ(Shown(OrderDate(std::string_view("0407\0001", 6))), "unset");
}

TEST(ShownDate, ReadsDayFirstUnlessTheYearStandsInFront) {
  EXPECT_EQ(Shown(ShownDate(" 3/7/04 ")), "2004-07-03");
  EXPECT_EQ(Shown(ShownDate("2004/07/31")), "2004-07-31");
  EXPECT_EQ(Shown(ShownDate("2004-07-31 10:15:00")), "2004-07-31T10:15:00");
  for (const std::string_view text : {"", "31/02/2004", "07/31/2004", "040731", "1/2"}) {
    EXPECT_EQ(Shown(ShownDate(text)), "unset") << text;
  }
}

}  // namespace
}  // namespace partnerkit

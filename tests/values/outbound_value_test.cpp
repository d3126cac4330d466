// Values on outbound lines.
#include "values/outbound_value.h"

#include <gtest/gtest.h>

namespace partnerkit::testing {
namespace {

using namespace std::string_literals;

TEST(OutboundValueTest, NeverBreaksItsLine) {
  struct Case {
    std::string value, appended, trimmed;
  };
  const Case cases[] = {
      {"CN5", "CN5", "CN5"},
      {"A\r\nB\nC\rD\0E"s, "A  B C D E", "A  B C D E"},
      {" \r\n A\tB \n\0"s, "    A\tB   ", "A\tB"},
      {"\r\n \0"s, "    ", ""},
      {"", "", ""},
  };
  for (const Case& each : cases) {
    std::string line = "1\n", trimmed = "1\n";
    AppendValue(each.value, line);
    AppendTrimmedValue(each.value, trimmed);
    EXPECT_EQ(line, "1\n" + each.appended);
    EXPECT_EQ(trimmed, "1\n" + each.trimmed);
  }
}

}  // namespace
}  // namespace partnerkit::testing

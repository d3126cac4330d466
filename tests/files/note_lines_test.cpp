#include "files/note_lines.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace partnerkit::testing {
namespace {

TEST(NoteLinesTest, KeepATextOnOneLine) {
  const std::pair<const char*, const char*> cases[] = {
      {"", ""}, {"out/asn.csv", "out/asn.csv"}, {"a\nb\rc", "a%0Ab%0Dc"}, {"5% of 100%0A", "5%25 of 100%250A"}};
  for (const auto& [text, line] : cases) {
    EXPECT_EQ(NoteLine(text), line);
    EXPECT_EQ(TextOfNoteLine(line), text);
  }
}

TEST(NoteLinesTest, TakeWholeNumbersOnly) {
  EXPECT_EQ(WholeNumber("0"), 0U);
  EXPECT_EQ(WholeNumber("18446744073709551615"), 18446744073709551615U);
  for (const char* text : {"", " 1", "1 ", "-1", "+1", "1.0", "0x1", "18446744073709551616", "one"}) {
    EXPECT_EQ(WholeNumber(text), std::nullopt) << text;
  }
}

}  // namespace
}  // namespace partnerkit::testing

#include "values/delimited.h"

#include <gtest/gtest.h>

#include <string>

namespace partnerkit {
namespace {

using namespace std::string_literals;

std::vector<std::string> Fields(const DelimitedLine& line) {
  std::vector<std::string> fields;
  for (std::size_t column = 0; column < line.Columns(); ++column) fields.emplace_back(line[column]);
  return fields;
}

TEST(DelimitedLineTest, SplitsAtEveryCommaAndCutsQuotesRoundWholeFields) {
  const struct {
    std::string line;
    std::vector<std::string> fields;
  } cases[] = {
      {R"("a,b",c)", {R"("a)", R"(b")", "c"}},
      {"a", {"a", "", ""}},
      {"a,b,c,d", {"a", "b"}},
      {R"("a","b","c")", {"a"}},
      {R"(a,")", {"a", ""}},
      {R"(",b)", {"", "b"}},
      {R"(a,"bc)", {"a", "b"}},       // the last character goes, quote or not
      {R"("ab,c)", {R"("ab)", "c"}},  // no quote before the comma: both stay
      {R"("say "hi"","x""y")", {R"(say "hi")", R"(x""y)"}},
      {R"( "a" , b )", {R"( "a" )", " b "}},
      {"a\0b,\0"s, {"a\0b"s, "\0"s}},
  };
  for (const auto& c : cases) {
    DelimitedLine line(c.fields.size());
    line.Split("an,earlier,line,of,many");
    line.Split(c.line);
    EXPECT_EQ(Fields(line), c.fields) << c.line;
  }
}

TEST(DelimitedLineTest, SplitsNoFurtherThanAsked) {
  DelimitedLine line(4);
  line.Split("a,\"b\",c,d", 2);
  EXPECT_EQ(Fields(line), (std::vector<std::string>{"a", "b", "", ""}));
  line.Split("a,b,c", 9);
  EXPECT_EQ(Fields(line), (std::vector<std::string>{"a", "b", "c", ""}));
}

}  // namespace
}  // namespace partnerkit

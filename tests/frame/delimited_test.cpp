#include "frame/delimited.h"

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
      {"a,,c", {"a", "", "c"}},
      {R"("a","b")", {"a", "b"}},
      {R"("a,b",c)", {R"("a)", R"(b")", "c"}},
      {"a,b,", {"a", "b", ""}},
      {"a", {"a", "", ""}},
      {"a,b,c,d", {"a", "b"}},
      {R"("a","b","c")", {"a"}},
      {"", {"", ""}},
      {",", {"", ""}},
      {R"(a,")", {"a", ""}},
      {R"(a,"")", {"a", ""}},
      {R"("",b)", {"", "b"}},
      {R"(",b)", {"", "b"}},
      {R"(a,"bc)", {"a", "b"}},       // the last character goes, quote or not
      {R"("ab,c)", {R"("ab)", "c"}},  // no quote before the comma: both stay
      {R"(ab",c")", {R"(ab")", R"(c")"}},
      {R"("say "hi"","x""y")", {R"(say "hi")", R"(x""y)"}},
      {R"( "a" , b )", {R"( "a" )", " b "}},
      {"a\0b,\0"s, {"a\0b"s, "\0"s}},
      {"\ta\t,b", {"\ta\t", "b"}},
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

TEST(DelimitedLineTest, TakesAHundredThousandColumns) {
  std::string text;
  for (int column = 0; column < 100'000; ++column) text += std::to_string(column) + ",";
  DelimitedLine line(100'000);
  line.Split(text);
  EXPECT_EQ(line[0], "0");
  EXPECT_EQ(line[99'999], "99999");
}

TEST(TrimBlanksTest, CutsBlanksOnly) {
  EXPECT_EQ(TrimBlanks("  a b  "), "a b");
  EXPECT_EQ(TrimBlanks(" \ta\t "), "\ta\t");
  EXPECT_EQ(TrimBlanks("   "), "");
}

}  // namespace
}  // namespace partnerkit

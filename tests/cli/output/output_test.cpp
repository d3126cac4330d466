#include <gmock/gmock.h>

#include <limits>
#include <sstream>

#include "cli/output/json_writer.h"
#include "cli/output/table.h"
#include "cli/output/text.h"

namespace partnerkit::cli {
namespace {

using namespace std::string_view_literals;

TEST(Text, IsUtf8OrElseWindows1252) {
  const std::pair<std::string_view, std::string_view> table[] = {
      {"Z\u00fcrich \u20ac \U0001F600", "Z\u00fcrich \u20ac \U0001F600"},
      {"Z\xFCrich \x80\x9F", "Z\u00fcrich \u20ac\u0178"},
      {"\xC0\xAF", "\u00c0\u00af"},            // an overlong "/"
      {"\xED\xA0\x80", "\u00ed\u00a0\u20ac"},  // half of a surrogate pair
      {"\u20ac\xE2\x82", "\u00e2\u201a\u00ac\u00e2\u201a"},
      {"\0x"sv, "\0x"sv},
  };
  for (const auto& [bytes, text] : table) EXPECT_EQ(Utf8(bytes), text);
}

TEST(Text, StandsOnOneHarmlessLine) {
  EXPECT_EQ(OneLine(" found. \r\n Add\tthis\x1b[2J\x7f \xC2\x9B 1\n"), "found. Add this?[2J? ? 1");
  EXPECT_EQ(OneLine("1\u061c2\u200e3\u200f4\u202a5\u202e6\u20667\u2069"), "1?2?3?4?5?6?7?");
  EXPECT_EQ(OneLine("\u061b\u200d\u2010\u2029\u202f\u2065\u206a"), "\u061b\u200d\u2010\u2029\u202f\u2065\u206a");
  EXPECT_EQ(Width("\u20ac\u00e9-1"), 4U);
}

TEST(Json, PutsEachRowOnALineAndClosesWhatIsOpen) {
  std::ostringstream out;
  {
    JsonWriter json(out);
    json.BeginObject();
    json.Name("none");
    json.BeginArray();
    json.EndArray();
    json.Name("rows");
    json.BeginArray();
    for (const double row : {1.0, 0.1 + 0.2}) {
      json.BeginArray();
      json.Value(Cell(row));
      json.Value(Cell("q\"\\\n\x02\x7f\u0080\u009f\u00a0"));
      json.Value(Cell(*DateTime::FromYmd(2004, 7, 31)));
      json.Value(Cell());
      json.Number(std::numeric_limits<double>::infinity());
      json.EndArray();
    }
    json.BeginObject();
    json.Name("cut short");
  }
  EXPECT_EQ(
      out.str(),
      "{\n"
      "  \"none\": [],\n"
      "  \"rows\": [\n"
      "    [1, \"q\\\"\\\\\\n\\u0002\\u007f\\u0080\\u009f\u00a0\", \"2004-07-31\", null, null],\n"
      "    [0.30000000000000004, \"q\\\"\\\\\\n\\u0002\\u007f\\u0080\\u009f\u00a0\", \"2004-07-31\", null, null],\n"
      "    {\"cut short\": null}\n"
      "  ]\n"
      "}\n");
}

TEST(Table, ShortensWhatWouldPushTheOthersAway) {
  std::ostringstream out;
  PrintTable(
      out, {{"PO Number"}, {"Result"}}, 1,
      [](std::size_t, std::size_t column) {
        return column == 0 ? "\u20ac" + std::string(70, '7') : std::string("posted");
      },
      100);
  EXPECT_THAT(out.str(), ::testing::HasSubstr("\n\u20ac" + std::string(56, '7') + "...  posted\n"));
}

TEST(Table, BreaksTheLastColumnBetweenWords) {
  std::ostringstream out;
  const std::vector<std::vector<std::string>> rows = {{"7", "eins", "a message that is much too long for it"},
                                                      {"12", "\u00e9", "averyverylongwordwithoutanyblank"}};
  PrintTable(
      out, {{"Id", true}, {"Name"}, {"Message"}}, 2, [&](std::size_t r, std::size_t c) { return rows[r][c]; }, 32,
      [](std::size_t row) { return std::vector<std::string>(row, "a note of this row, longer than a line"); });
  EXPECT_EQ(out.str(),
            "Id  Name  Message\n"
            "--  ----  ----------------------\n"
            " 7  eins  a message that is much\n"
            "          too long for it\n"
            "12  \u00e9     averyverylongwordwitho\n"
            "          utanyblank\n"
            "    a note of this row, longer\n"
            "      than a line\n");
}

}  // namespace
}  // namespace partnerkit::cli

#include "frame/free_format.h"

#include <gtest/gtest.h>

#include "platform/posix_files.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

using Records = std::vector<std::vector<std::string>>;

// The records of three columns up to the end or, as the last one, the error.
Records Read(const std::string& bytes) {
  testing::TempFolder folder;
  folder.Write("products.csv", bytes);
  platform::PosixFiles files;
  const auto file = files.OpenInput(folder / "products.csv", Share::kExclusive);
  FreeFormatReader reader(*file, "PRODUCTS.CSV", 3);
  Records records;
  try {
    for (std::vector<std::string> items; reader.Read(items);) records.push_back(items);
  } catch (const RunTimeError& error) {
    records.push_back({std::to_string(error.Number()), error.Description()});
  }
  return records;
}

TEST(FreeFormatTest, ReadsQuotedAndPlainItems) {
  const struct {
    std::string bytes;
    Records records;
  } cases[] = {
      {"a,b,c", {{"a", "b", "c"}}},
      {"a,b,c\r\nd,e,f\r\n", {{"a", "b", "c"}, {"d", "e", "f"}}},
      {"\"a,b\",c,\"d\"\n", {{"a,b", "c", "d"}}},
      {"  a  , b c ,\" d \"\n", {{"a", "b c", " d "}}},
      {" \"a\" ,\"\",\n", {{"a", "", ""}}},
      {",,\n", {{"", "", ""}}},
      {"a,5\" pipe,c\n", {{"a", "5\" pipe", "c"}}},
      {"\n   \r\na,b,c\n\n", {{"a", "b", "c"}}},
      {"", {}},
  };
  for (const auto& c : cases) EXPECT_EQ(Read(c.bytes), c.records) << c.bytes;
}

TEST(FreeFormatTest, RefusesALineOfOtherColumns) {
  const struct {
    std::string bytes;
    std::string line, columns;
  } cases[] = {
      {"a,b,c\n\nd,e\n", "3", "2"},
      {"a,b,c\nd,e,f,g\n", "2", "4"},
      {"a,b,c\n\"d,e,f\n", "2", "1"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(Read(c.bytes),
              (Records{{"a", "b", "c"},
                       {"13", "File PRODUCTS.CSV, line " + c.line + " has " + c.columns + " columns instead of 3"}}))
        << c.bytes;
  }
}

}  // namespace
}  // namespace partnerkit

#include "files/free_format.h"

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

TEST(FreeFormatTest, ReadsQuotedAndPlainItemsOfALineOfItsColumns) {
  const struct {
    std::string bytes;
    Records records;
  } cases[] = {
      {"a,b,c\r\nd,e,f", {{"a", "b", "c"}, {"d", "e", "f"}}},
      {"\"a,b\",c,\"d\"\n", {{"a,b", "c", "d"}}},
      {"  a  , b c ,\" d \"\n", {{"a", "b c", " d "}}},
      {" \"a\" ,\"\",\n", {{"a", "", ""}}},
      {"a,5\" pipe,c\n", {{"a", "5\" pipe", "c"}}},
      {"\n   \r\na,b,c\n\n", {{"a", "b", "c"}}},
      {"a,b,c\n\nd,e\n", {{"a", "b", "c"}, {"13", "File PRODUCTS.CSV, line 3 has 2 columns instead of 3"}}},
      {"\"d,e,f\n", {{"13", "File PRODUCTS.CSV, line 1 has 1 columns instead of 3"}}},
  };
  for (const auto& c : cases) EXPECT_EQ(Read(c.bytes), c.records) << c.bytes;
}

}  // namespace
}  // namespace partnerkit

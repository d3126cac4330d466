#include "frame/field_map.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/posix_files.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

using ::testing::ElementsAre;

std::int32_t NumberRaised(const std::function<void()>& call) {
  try {
    call();
  } catch (const RunTimeError& error) {
    return error.Number();
  }
  return 0;
}

TEST(MapHeaderTest, NamesAColumnALine) {
  const struct {
    std::string bytes;
    std::vector<std::string> header;
  } cases[] = {
      {"PONUMBER", {"PONUMBER"}},
      {"PONUMBER\r\nPODATE\r\n", {"PONUMBER", "PODATE"}},
      {"  PONUMBER  \n\n   \nPODATE", {"PONUMBER", "", "", "PODATE"}},
      {"PONUMBER\rPODATE\r", {"PONUMBER", "PODATE"}},
      {"PO NUMBER\n\tPODATE\n", {"PO NUMBER", "\tPODATE"}},
      {"\n", {""}},
  };
  testing::TempFolder folder;
  platform::PosixFiles files;
  for (const auto& c : cases) {
    folder.Write("orders.map", c.bytes);
    EXPECT_EQ(ReadMapHeader(*files.OpenInput(folder / "orders.map", Share::kDenyWrite)), c.header) << c.bytes;
  }
}

TEST(FieldMapTest, FindsTheFirstColumnOfExactlyTheName) {
  FieldMap map;
  MapField& number = map.Add("PONUMBER");
  EXPECT_EQ(number.FieldIndex, -1);
  EXPECT_TRUE(FindColumn({"", "ponumber", "PONUMBERS", "PONUMBER", "PONUMBER"}, number));
  EXPECT_EQ(number.FieldIndex, 3);
  MapField& date = map.Add("PODATE");
  EXPECT_FALSE(FindColumn({"", "ponumber", "podate", "DATE"}, date));
  EXPECT_EQ(date.FieldIndex, -1);
}

TEST(FieldMapTest, KeepsFieldsInTheOrderAddedAndFindsThemByName) {
  FieldMap map;
  for (const char* name : {"ZONE", "BIN", "SIZE"}) map.Add(name).FieldValue = std::string("of ") + name;
  std::vector<std::string> names;
  for (const MapField& field : map) names.push_back(field.FieldName);
  EXPECT_THAT(names, ElementsAre("ZONE", "BIN", "SIZE"));
  EXPECT_EQ(map.Item("BIN").FieldValue, "of BIN");
  map.Item("BIN").Clear();
  EXPECT_EQ(map.Item("BIN").FieldValue, "");

  EXPECT_EQ(NumberRaised([&] { map.Item("bin"); }), 5);
  EXPECT_EQ(map.Find("bin"), nullptr);
  EXPECT_EQ(NumberRaised([&] { map.Add("SIZE"); }), 457);
  EXPECT_EQ(map.Count(), 3U);

  map.Clear();
  EXPECT_EQ(map.Find("ZONE"), nullptr);
  map.Add("ZONE");
  EXPECT_EQ(map.Count(), 1U);
}

TEST(OutboundLineTest, GivesEachColumnItsTrimmedValueAndAComma) {
  FieldMap map;
  map.Add("ASNNO").FieldValue = " 12 ";
  map.Add("SCAC").FieldValue = "a,\"b\"";
  map.Add("UNUSED").FieldValue = "x";
  map.Add("EMPTY");
  const struct {
    MapHeader header;
    std::string line;
  } cases[] = {
      {{"ASNNO", "SCAC"}, "12,a,\"b\","},
      {{"SCAC", "FOO", "ASNNO", "", "EMPTY"}, "a,\"b\",,12,,,"},
      {{"ASNNO", "ASNNO"}, "12,12,"},
      {{}, ""},
  };
  for (const auto& c : cases) {
    std::string line = "kept:";
    AppendOutboundLine(c.header, map, line);
    EXPECT_EQ(line, "kept:" + c.line);
  }
}

}  // namespace
}  // namespace partnerkit

#include "files/field_map.h"

#include <gtest/gtest.h>

#include "platform/posix_files.h"
#include "support/error_of.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

using testing::ErrorOf;

TEST(MapHeaderTest, NamesAColumnALine) {
  testing::TempFolder folder;
  platform::PosixFiles files;
  folder.Write("orders.map", "  PO NUMBER  \r\n\n   \n\tPODATE\rZONE\r");
  EXPECT_EQ(ReadMapHeader(*files.OpenInput(folder / "orders.map", Share::kDenyWrite)),
            (MapHeader{"PO NUMBER", "", "", "\tPODATE", "ZONE"}));
}

TEST(FieldMapTest, FindsFieldsAndTheFirstColumnOfExactlyTheName) {
  FieldMap map;
  for (const char* name : {"SIZE", "ZONE"}) map.Add(name).FieldValue = std::string(" of ") + name;
  std::string names;
  for (const MapField& field : map) names += field.FieldName + " ";
  EXPECT_EQ(names, "SIZE ZONE ");
  EXPECT_EQ(ErrorOf([&] { map.Item("size"); }), "5 No field size in the map");
  EXPECT_EQ(ErrorOf([&] { map.Add("SIZE"); }), "457 The field SIZE is already in the map");
  EXPECT_TRUE(FindColumn({"", "size", "SIZES", "SIZE", "SIZE"}, map.Item("SIZE")));
  EXPECT_EQ(map.Item("SIZE").FieldIndex, 3);
  EXPECT_FALSE(FindColumn({"", "zone"}, map.Item("ZONE")));
  EXPECT_EQ(map.Item("ZONE").FieldIndex, -1);

  std::string line = "kept:";
  for (const MapField* field : {&map.Item("ZONE"), static_cast<MapField*>(nullptr), &map.Item("SIZE")}) {
    AppendColumn(field, line);
  }
  EXPECT_EQ(line, "kept:of ZONE,,of SIZE,");
  map.Clear();
  map.Add("ZONE");
  EXPECT_EQ(map.Count(), 1U);
}

}  // namespace
}  // namespace partnerkit

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <iterator>

#include "support/csv_siblings.h"

namespace partnerkit::testing {
namespace {

using ::testing::Contains;
using ::testing::EndsWith;
using ::testing::Not;

using Texts = std::vector<std::string>;

// The fields of each class's map: what it expects beside or without the usual ones, and what of it changes nothing.
struct MapFields {
  std::string className, added, removed, unread;
  Texts lines;  // orders that show every field that is read
};

const std::string kGtinAdded =
    "INTDATE RESPONSETYPECODE DELIVERYPARTY REQUIRED TRADEDQUANTITY DELDATE PROMODATE STATUS INNEREAN INNERQTY";
const std::string kGtinRemoved =
    "CUSTCAT DEPTNO ADDATE STOREZONE UNITMEASURECODE ORDERQUANTITY SKUPRODUCTKEYCODE RETAILUNITPRICE";
const std::string kGtinUnread = "INTDATE PROMODATE INNEREAN INNERQTY STYLE COLOUR SIZE DESCRIPTION WEIGHT VOLUME BIN";
const std::string kNextOrder = "TRNCONTROLNO=34; PONUMBER=450002";
const Texts kGtinOrders = {"INCOMINGPRODUCTNO=193001",
                           "INCOMINGPRODUCTNO=193001; POTYPECODE=231; STATUS=5; BUYINGLOCPARTNERNO=0900; " + kNextOrder,
                           "POTYPECODE=231; RESPONSETYPECODE=27; TRNCONTROLNO=35; PONUMBER=450003"};
const MapFields kMaps[] = {
    // clang-format off
    {kMyer, "", "", "ADDATE STOREZONE", {""}},
    {kGhpl, "", "SUPPLIERNO CUSTCAT STOREZONE", "ADDATE SEQUENTIALLINENO PRODUCTQUALIFIER", {""}},
    {kTarget, "CONTRACTNO HEADER1 UNITSINNERPACK PACKUOM", "SUPPLIERNO CUSTCAT DEPTNO", "CONTRACTNO", {""}},
    {kMgbbt, "", "", "", {"", "STOREZONE=; " + kNextOrder}},
    {kKmart, "POVERSIONNO CARTONSOUTER UNITSINNERPACK PACKUOM", "CUSTCAT SKUPRODUCTKEYCODE RETAILUNITPRICE", "", {""}},
    {kOfficeworks, "POVERSIONNO CARTONSOUTER UNITSINNERPACK PACKUOM",
     "CUSTCAT DEPTNO STOREZONE SKUPRODUCTKEYCODE RETAILUNITPRICE", "UNITPRICECODE PACKUOM", {"", "POPURPOSECODE=4; " +
      kNextOrder}},
    {kCml, kGtinAdded, kGtinRemoved, kGtinUnread, kGtinOrders},
    {kBulk, kGtinAdded + " UNITSINNERPACK", kGtinRemoved, kGtinUnread + " DELDATE", kGtinOrders},
    {kColes, "INTDATE RESPONSETYPECODE EQUIPMENT DELIVERYPARTY REQUIRED HEADER1 HEADER2 HEADER3 HEADER4 HEADER5 "
     "DESTDOCK DELDOCK "
     "PALLETFOOTAGE UNITPRICEINCGST UNITPRICEEXGST GSTRATE CARTONSOUTER PACKUOM UNITSINNERPACK GSTAMOUNT STATUS "
     "INNEREAN INNERQTY "
     "DETAIL4 DETAIL5", "CUSTCAT DEPTNO ADDATE STOREZONE UNITPRICE RETAILUNITPRICE",
     "GRPCONTROLNO INTDATE RESPONSETYPECODE EQUIPMENT DELIVERYPARTY REQUIRED DESTDOCK DELDOCK PALLETFOOTAGE "
     "UNITSINNERPACK STATUS "
     "INNEREAN INNERQTY DETAIL4 DETAIL5", {""}},
    // clang-format on
};

Texts Words(const std::string& text) {
  std::istringstream words(text);
  return {std::istream_iterator<std::string>(words), std::istream_iterator<std::string>()};
}

// The expected ones: the usual without the removed, then the added.
Texts Expected(const MapFields& map) {
  const Texts removed = Words(map.removed);
  Texts expected;
  for (const auto& [name, value] : Fields(kUsualFields)) {
    if (std::ranges::find(removed, name) == removed.end()) expected.push_back(name);
  }
  std::ranges::copy(Words(map.added), std::back_inserter(expected));
  return expected;
}

TEST(CsvSiblingsMapTest, ExpectsItsFieldsInTheMapAndNoOthers) {
  for (const MapFields& map : kMaps) {
    SCOPED_TRACE(map.className);
    Siblings trade(map.className);
    trade.WriteOrders(trade.Line());
    const auto importer = trade.Start();
    RowTable table;
    const Texts expected = Expected(map), added = Words(map.added);
    const auto told = [&](Texts fields) {
      trade.folder.Write("orders.map", MapText(fields));
      EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
      return trade.NewLog().back();
    };
    const auto missing = [](const std::string& field) {
      return "W OpenMapFile: Expected field " + field + " not found. \r\n Add this item to your orders.map file.";
    };
    for (const std::string& field : expected) {
      Texts others = expected;
      std::erase(others, field);
      EXPECT_EQ(told(others), missing(field));
    }
    if (!added.empty()) {
      EXPECT_EQ(told(Texts(expected.begin(), expected.end() - std::ssize(added))), missing(added.front()));
    }
    trade.folder.Write("orders.map", MapText(expected));
    EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
    EXPECT_EQ(trade.NewLog().back(), "0 Load: No orders found to match EDI addresses.");
  }
}

// All that a run leaves.
Texts Outcome(const MapFields& map, const std::string& shifted) {
  Siblings trade(map.className);
  trade.AddMasters();
  // The GTIN orders only find their product; the others make it.
  const bool byGtin = map.className == kCml || map.className == kBulk;
  if (!byGtin) trade.Sql("DELETE FROM tbProduct WHERE ProductNo = '93001'");
  Set(trade.document, kAll);
  trade.UseBackup();
  trade.WriteOrders(Lines(trade, map.lines));
  Texts columns = trade.columns;
  if (!shifted.empty()) {
    *std::ranges::find(columns, shifted) = "";
    columns.push_back(shifted);
    trade.folder.Write("orders.map", MapText(columns));
  }
  const auto run = trade.Import();
  Texts all = run.log;
  all.push_back(std::to_string(run.rows));
  std::ranges::copy(trade.StoredRecords(), std::back_inserter(all));
  std::ranges::copy(trade.Every<Product>(), std::back_inserter(all));
  std::ranges::copy(trade.Every<PartnerLocn>(), std::back_inserter(all));
  all.push_back(trade.Orders());
  all.push_back(trade.Backup());
  return all;
}

TEST(CsvSiblingsMapTest, ReadsEachFieldFromTheColumnThatTheMapNames) {
  for (const MapFields& map : kMaps) {
    SCOPED_TRACE(map.className);
    const Texts usual = Outcome(map, ""), unread = Words(map.unread);
    EXPECT_THAT(usual, Contains(EndsWith(" import completed.")));
    EXPECT_THAT(usual, Not(Contains(EndsWith(" import incomplete."))));
    for (const std::string& field : Expected(map)) {
      const bool isRead = std::ranges::find(unread, field) == unread.end();
      EXPECT_EQ(Outcome(map, field) != usual, isRead) << field;
    }
  }
}

}  // namespace
}  // namespace partnerkit::testing

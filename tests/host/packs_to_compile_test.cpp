// Which packs wait for a notice, and what is left to pack of their orders: as the bundled host answers by statements of
// its own, and as any other does from its records.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/packed_trade.h"
#include "support/record_host.h"

namespace partnerkit::testing {
namespace {

std::string Waiting(PackedTrade& trade, std::string_view vendor = "ACME", std::string_view partner = "MGB") {
  std::string all;
  for (const auto& pack : trade.system->PacksToCompile(vendor, partner)) all += pack->SSCC.value_or("null") + " ";
  std::string fromRecords;
  RecordHost other(*trade.system);
  for (const auto& pack : other.PacksToCompile(vendor, partner)) fromRecords += pack->SSCC.value_or("null") + " ";
  EXPECT_EQ(fromRecords, all);
  return all;
}

bool Complete(PackedTrade& trade, std::int32_t order) {
  const bool complete = trade.system->OrderComplete(order);
  EXPECT_EQ(RecordHost(*trade.system).OrderComplete(order), complete);
  return complete;
}

bool OpenOn(PackedTrade& trade, std::int32_t shipment, std::int32_t order) {
  const bool open = trade.system->OrderOpenOnShipment(shipment, order);
  EXPECT_EQ(RecordHost(*trade.system).OrderOpenOnShipment(shipment, order), open);
  return open;
}

TEST(PacksToCompileTest, StandByShipmentOrderShipToAndId) {
  PackedTrade trade(kMgb);
  trade.AddOrder([](Order&) {});
  trade.AddShipment([](Shipment&) {});
  const auto pack = [&](std::int32_t shipment, std::int32_t order, const std::string& shipTo) {
    trade.AddPack([&](Pack& each) {
      each.ShipmentId = shipment;
      each.OrderId = order;
      each.ShipToCode = shipTo;
    });
  };
  pack(2, 1, "0900");
  pack(1, 2, "0900");
  pack(1, 1, "0902");
  pack(1, 1, "0901");
  pack(1, 2, "0900");
  pack(1, 1, "0902");
  EXPECT_EQ(Waiting(trade), "SSCC4 SSCC3 SSCC6 SSCC2 SSCC5 SSCC1 ");
}

TEST(PacksToCompileTest, AreTheSuppliersForThePartnerBelowEightAndNoSubPacks) {
  PackedTrade trade(kMgb);
  trade.AddOrder([](Order& order) { order.PartnerId = "TOYS"; });
  for (const int status : {0, 7, 8, 9}) trade.AddPack([&](Pack& pack) { pack.Status = status; });
  trade.AddPack([](Pack& pack) { pack.LeadPackId = 1; });
  trade.AddPack([](Pack& pack) { pack.VendorId = "BETA"; });
  trade.AddPack([](Pack& pack) { pack.OrderId = 2; });
  trade.AddPack([](Pack& pack) { pack.OrderId = 99; });
  EXPECT_EQ(Waiting(trade), "SSCC1 SSCC2 ");
  EXPECT_EQ(Waiting(trade, "BETA"), "SSCC6 ");
  EXPECT_EQ(Waiting(trade, "ACME", "TOYS"), "SSCC7 ");
  EXPECT_EQ(Waiting(trade, "", ""), "");
}

// Of 24 ordered and 18 on the slip.
TEST(PacksToCompileTest, TellWhatIsLeftToPackByTheNotedQuantityOrThePackLines) {
  struct Case {
    double noted, packed;  // on both lines; in a carton
    bool complete, open;
  };
  const Case cases[] = {{17, 0, false, true},  {18, 0, false, false}, {24, 0, true, false},  {0, 17, false, true},
                        {0, 18, false, false}, {0, 24, true, false},  {12, 12, false, true}, {18, 23, false, false}};
  for (const Case& each : cases) {
    SCOPED_TRACE(std::to_string(each.noted) + " noted, " + std::to_string(each.packed) + " packed");
    PackedTrade trade(kMgb);
    trade.AddPack({}, {{"93001", each.packed / 2}, {"93001", each.packed / 2}});
    trade.Sql("UPDATE tbOrderLocnLine SET PackedQty = " + std::to_string(each.noted) +
              "; UPDATE tbPSlipLine SET PackedQty = " + std::to_string(each.noted));
    EXPECT_EQ(Complete(trade, 1), each.complete);
    EXPECT_EQ(OpenOn(trade, 1, 1), each.open);
  }
}

TEST(PacksToCompileTest, TellOfEachOrderAndShipmentByItself) {
  PackedTrade trade(kMgb);
  trade.AddPack();
  EXPECT_TRUE(OpenOn(trade, 1, 1));
  EXPECT_FALSE(OpenOn(trade, 2, 1));
  EXPECT_FALSE(OpenOn(trade, 1, 2));
  trade.CompleteOrder();
  EXPECT_TRUE(Complete(trade, 1));
  EXPECT_FALSE(Complete(trade, 2)) << "without lines";
  trade.Sql("INSERT INTO tbOrderLocnLine(OrderId, Quantity) VALUES(1, 1)");
  EXPECT_FALSE(Complete(trade, 1));
}

TEST(PacksToCompileTest, AreStampedOnce) {
  for (const bool own : {true, false}) {
    PackedTrade trade(kMgb);
    trade.AddPack();
    trade.AddPack();
    const auto stamp = [&](std::int32_t pack, std::int32_t notice) {
      return own ? trade.system->StampPack(pack, notice) : trade.system->System::StampPack(pack, notice);
    };
    EXPECT_TRUE(stamp(1, 5));
    EXPECT_FALSE(stamp(1, 6));
    EXPECT_FALSE(stamp(3, 6));
    EXPECT_EQ(trade.Stamps(), "5/8 0/4");
    trade.system->Session().Execute(
        "CREATE TRIGGER \"no\" BEFORE UPDATE ON tbPack BEGIN SELECT RAISE(ABORT, 'no'); END");
    EXPECT_THROW(stamp(2, 5), RunTimeError);
    EXPECT_EQ(trade.Stamps(), "5/8 0/4");
  }
}

}  // namespace
}  // namespace partnerkit::testing

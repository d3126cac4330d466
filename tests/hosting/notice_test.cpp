// A whole run that takes numbers, transactions and packs from its host, on a host in memory.
#include "partnerkit/memory_host.h"
#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

template <class... R>
void Copy(RecordStore& from, RecordStore& to) {
  const auto copy = [&](auto record) {
    for (const auto& each : Select(from, kEveryRecord, record)) EXPECT_TRUE(Add(to, *each));
  };
  (copy(R()), ...);
}

TEST(MemoryHostTest, CompilesANoticeOfThePacksThatWait) {
  PackedTrade trade(kMgb, "SHIPNOTENO ORDERNO CONTAINERNO QUANTITYSHIPPED");
  trade.AddPack();
  trade.AddPack({}, {{"93001", 4}});
  MemoryHost host;
  Copy<Partner, Vendor, EDIDoc, PartnerAddress, PartnerLocn, PackType, Product, Order, OrderLine, OrderLocn,
       OrderLocnLine, Job, PSlip, PSlipLine, Shipment, Pack, PackLine>(trade.system->Records(), host.Records());

  const auto notices = trade.Create(kMgb);
  ColumnTable columns;
  ErrorList told;
  ASSERT_TRUE(notices->Init(host, 1, columns));
  ASSERT_EQ(notices->Load(trade.folder / "out/asn.csv", trade.table), 1);
  EXPECT_EQ(notices->Process(0, told), 1);
  EXPECT_EQ(notices->Process(0, told), 0);
  EXPECT_TRUE(notices->Term());

  EXPECT_THAT(trade.Output(), ElementsAre("1001,450001,SSCC1,6,", "1001,450001,SSCC2,4,"));
  EXPECT_EQ(trade.Stamps(), "0/4 0/4") << "of the other host";
  std::string stamps, log;
  for (const auto& pack : Select(host.Records(), kEveryRecord, Pack())) {
    stamps += std::to_string(pack->ASNId) + "/" + std::to_string(pack->Status) + " ";
  }
  for (const auto& record : Select(host.Records(), kEveryRecord, Log())) log += *record->Message + "\n";
  EXPECT_EQ(stamps, "1/8 1/8 ");
  EXPECT_EQ(log,
            "......Pack SSCC1 added to ConNote CN5 for PONo 450001\n"
            "......Pack SSCC2 added to ConNote CN5 for PONo 450001\n"
            "ASN 1001 compile completed. 2 packs added.\n"
            "No Packs found to process.\n");
  EXPECT_EQ(Count(host.Records(), kEveryRecord, PendingNotice()), 0);
}

}  // namespace
}  // namespace partnerkit::testing

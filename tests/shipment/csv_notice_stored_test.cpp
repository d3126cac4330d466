// What follows a written notice: stamps, log, the inventory file and the components of other makers.
#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

using ::testing::EndsWith;

std::int32_t StatusOfShipment(PackedTrade& trade) {
  Shipment shipment;
  shipment.Id = 1;
  EXPECT_TRUE(Load(trade.system->Records(), shipment));
  return shipment.Status;
}

TEST(CsvNoticeStoredTest, StampsThePacksAndTheShipmentBelowEight) {
  for (const auto& [status, stamped] : {std::pair(7, 8), {9, 9}}) {
    PackedTrade trade(kMgb, "CONTAINERNO");
    trade.AddPack();
    trade.AddPack([](Pack& pack) { pack.Status = 7; }, {});
    trade.Sql("UPDATE tbShipment SET Status = " + std::to_string(status));
    EXPECT_EQ(trade.Run().front().result, 1);
    EXPECT_EQ(trade.Stamps(), "1/8 1/8");
    EXPECT_EQ(StatusOfShipment(trade), stamped);
  }
}

TEST(CsvNoticeStoredTest, LogsEachPackWithLinesThenTheNotice) {
  for (const std::string className : kNoticeClasses) {
    SCOPED_TRACE(className);
    PackedTrade trade(className, "CONTAINERNO");
    trade.AddPack();
    trade.AddPack({}, {});
    trade.AddPack({}, {{"93001", 0}});
    const auto outcome = trade.Run().front();
    const std::string order = className == kTargetNotice ? "" : " for PONo 450001";
    EXPECT_THAT(outcome.told, ElementsAre("0 Process Pack: ......Pack SSCC1 added to ConNote CN5" + order,
                                          "0 Process Pack: ......Pack SSCC3 added to ConNote CN5" + order,
                                          "0 Process: ASN 1001 compile completed. 2 packs added."));
    EXPECT_EQ(trade.NewLog(), outcome.told);
    Log log;
    log.LogId = 1;
    EXPECT_TRUE(Load(trade.system->Records(), log));
    EXPECT_EQ(log.Source, "PartnerKit." + className);
  }
}

TEST(CsvNoticeStoredTest, FindsNoPacksInARowThatIsDone) {
  PackedTrade trade(kMgb, "CONTAINERNO");
  trade.AddPack();
  const auto translator = trade.Loaded();
  EXPECT_EQ(trade.Process(*translator).result, 1);
  const auto again = trade.Process(*translator);
  EXPECT_EQ(again.result, 0);
  EXPECT_THAT(again.told, ElementsAre("R Process: No Packs found to process."));
  for (const std::int32_t row : {-1, 1}) {
    EXPECT_EQ(trade.Process(*translator, row).result, 0);
    EXPECT_THAT(trade.Process(*translator, row).told, IsEmpty());
  }
  EXPECT_THAT(trade.Output(), ElementsAre("SSCC1,"));
}

TEST(CsvNoticeStoredTest, ClearsTargetsTotals) {
  PackedTrade trade(kTargetNotice, "CONTAINERNO");
  trade.AddPack();
  trade.system->CompileTotal1 = trade.system->CompileTotal2 = 5;
  trade.Run();
  EXPECT_EQ(trade.system->CompileTotal1 + trade.system->CompileTotal2, 0);
}

// --- A store that refuses

struct Refusal {
  const char* when;   // made so behind the listing
  const char* after;  // made good again
  const char* told;
};

const Refusal kRefusals[] = {
    {"CREATE TRIGGER \"no\" BEFORE UPDATE ON tbPack WHEN old.Id = 2 BEGIN SELECT RAISE(ABORT, 'no'); END",
     "DROP TRIGGER \"no\"", "/store.db: no"},
    {"CREATE TRIGGER \"no\" BEFORE INSERT ON tbASN BEGIN SELECT RAISE(ABORT, 'no'); END", "DROP TRIGGER \"no\"",
     "again: The notice cannot be stored, database error 1811"},
    {"CREATE TRIGGER \"no\" BEFORE UPDATE ON tbShipment BEGIN SELECT RAISE(ABORT, 'no'); END", "DROP TRIGGER \"no\"",
     "again: The shipment cannot be stamped, database error 1811"},
    // Another program compiled a pack, or removed it.
    {"UPDATE tbPack SET Status = 8 WHERE Id = 2", "UPDATE tbPack SET Status = 4 WHERE Id = 2",
     "again: Pack SSCC2 no longer waits"},
    {"UPDATE tbPack SET Id = 9 WHERE Id = 2", "UPDATE tbPack SET Id = 2 WHERE Id = 9",
     "again: Pack SSCC2 no longer waits"},
};

TEST(CsvNoticeStoredTest, LeavesAllAsItWasWhenTheStoreRefuses) {
  for (const Refusal& refusal : kRefusals) {
    SCOPED_TRACE(refusal.when);
    PackedTrade trade(kMgb, "CONTAINERNO SHIPNOTENO");
    trade.folder.Write("out/asn.csv", "EARLIER\r\n");
    trade.UseInventory("out/stock");
    trade.AddPack();
    trade.AddPack();
    const auto translator = trade.Loaded();
    trade.system->Session().Execute(refusal.when);
    const std::string before = trade.Stamps();
    const auto failed = trade.Process(*translator);
    EXPECT_EQ(failed.result, 0);
    EXPECT_THAT(failed.told.back(), HasSubstr("Process: ASN 1001 was written but not stored, and is taken out of its "
                                              "files again: "));
    EXPECT_THAT(failed.told.back(), EndsWith(refusal.told));
    EXPECT_EQ(failed.told.size(), 3U);
    EXPECT_EQ(trade.NewLog(), failed.told);
    EXPECT_EQ(trade.Stamps(), before);
    EXPECT_EQ(StatusOfShipment(trade), 3);
    EXPECT_EQ(trade.Files(), "asn.csv");
    EXPECT_THAT(trade.Output(), ElementsAre("EARLIER"));
    trade.Sql(refusal.after);
    EXPECT_EQ(trade.Process(*translator).result, 1);
    EXPECT_EQ(trade.Stamps(), "1/8 1/8");
    EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1002,", "SSCC2,1002,"));
    EXPECT_EQ(trade.Output("out/stock").size(), 2U);
  }
}

// --- The inventory file

const char* const kRecord =
    "\"MGBSTORES\",\"000001001\",20060308,1015,\"CN5\",20060320,20060320,\"0512\",\"450001\",\"INV77\",\"TRAIN\","
    "\"93001\",18,6,6,\"S\",\"REF8\",\"XL\",\"PK4\",\"7\",\"LL31\",\"TOLL\"\r\n";

std::string Inventory(const char* className, const std::string& sql = {},
                      const std::vector<PackedTrade::PackedLine>& lines = {{"93001", 6}}) {
  PackedTrade trade(className, "CONTAINERNO");
  trade.UseInventory("stock");
  trade.AddPack({}, lines);
  trade.Sql(sql);
  trade.Run();
  return trade.folder.Read("stock");
}

TEST(CsvNoticeStoredTest, WritesTheInventoryRecordToTheByte) {
  EXPECT_EQ(Inventory(kMgb), kRecord);
  EXPECT_EQ(
      Inventory(kMgb,
                "UPDATE tbShipment SET Complete = 1, DeliveryDate = NULL, CarrierCode = NULL, ConNoteNo = NULL;"
                "UPDATE tbPack SET InvoiceNo = NULL; UPDATE tbProduct SET InHouseProdNo = NULL, ProductSize = NULL;"
                "UPDATE tbJob SET PackerId = NULL; UPDATE tbOrderLocn SET CustomerRef = NULL;"
                "UPDATE tbOrderLine SET LineNo = NULL; UPDATE tbOrderLocnLine SET LineRef = NULL;"
                "UPDATE tbPackLine SET Quantity = 2.5"),
      "\"MGBSTORES\",\"000001001\",20060308,1015,\"\",0,0,\"0512\",\"450001\",\"\",\"\",\"93001\",18,2.5,2.5,"
      "\"C\",\"\",\"\",\"\",\"\",\"\",\"\"\r\n");
}

TEST(CsvNoticeStoredTest, KeepsLineEndsOutOfInventoryAndHeader) {
  PackedTrade trade(kMgb, "CONTAINERNO");
  trade.UseInventory("stock");
  trade.Sql("UPDATE tbPartner SET Translator = 'GENTRAN'; UPDATE tbOrder SET PONo = '45' || char(13, 10, 0) || '6'");
  trade.document.PartnerEDIAddr = "MGB\r\nSTORES";
  trade.AddPack();
  EXPECT_THAT(trade.Compiled(), ElementsAre("HEADER,MGB  STORES", "SSCC1,"));
  EXPECT_THAT(trade.Output("stock"), ElementsAre(HasSubstr("\"0512\",\"45   6\",\"INV77\"")));
}

TEST(CsvNoticeStoredTest, WritesAnInventoryRecordForEachLineOfAPositiveQuantity) {
  for (const char* className : {kMgb, kMgbbtNotice}) {
    SCOPED_TRACE(className);
    const Texts records =
        LinesOf(Inventory(className, "", {{"93001", 1}, {"93001", 2}, {"93001", 0}, {"93001", -1}, {"93009", 3}}));
    ASSERT_EQ(records.size(), 3U);
    EXPECT_THAT(records[0], HasSubstr("\"TRAIN\",\"93001\",18,1,1,\"S\",\"REF8\",\"XL\",\"PK4\",\"7\",\"LL31\""));
    EXPECT_THAT(records[1], HasSubstr("\"TRAIN\",\"93001\",18,2,2,"));
    EXPECT_THAT(records[2], HasSubstr("\"\",\"93009\",0,3,3,\"S\",\"REF8\",\"\",\"PK4\",\"\",\"\""));
  }
}

TEST(CsvNoticeStoredTest, CutsTheReleaseFromTheInventorysOrderNumberWhereThePartnerHasReleases) {
  for (const char* className : kNoticeClasses) {
    SCOPED_TRACE(className);
    const bool cut = className == std::string(kKmartNotice) || className == std::string(kOfficeworksNotice);
    EXPECT_THAT(Inventory(className, "UPDATE tbOrder SET PONo = '45 REL# 2'"),
                HasSubstr(cut ? ",\"0512\",\"45\",\"INV77\"," : ",\"0512\",\"45 REL# 2\",\"INV77\","));
  }
}

TEST(CsvNoticeStoredTest, WritesTheInventoryFileOnlyWhereThePartnerHasSwitchedItOn) {
  const auto files = [](const std::string& extension, const std::string& path) {
    PackedTrade trade(kMgb, "CONTAINERNO");
    trade.AddPack();
    trade.Sql("UPDATE tbPartner SET ASNExtension = " + extension + ", InventoryFile = " + path);
    std::filesystem::current_path(trade.folder / "out");
    EXPECT_EQ(trade.Run().front().result, 1);
    std::filesystem::current_path("/");
    return trade.Files();
  };
  EXPECT_EQ(files("'TL2Compatible'", "'st'"), "asn.csv st");
  EXPECT_EQ(files("'TL2Compatible'", "'s'"), "asn.csv");
  EXPECT_EQ(files("'tl2compatible'", "'st'"), "asn.csv");
  EXPECT_EQ(files("NULL", "'st'"), "asn.csv");
}

// --- Components of other makers

// Notes what its components are handed.
struct Recorder {
  struct Component : CarrierComponent, NoticeExtension {
    explicit Component(Recorder& owner) : recorder(owner) {}
    void Process(System&, const Shipment& shipment, const ASN& notice, std::span<const std::shared_ptr<Pack>> packs,
                 std::vector<std::int32_t>& logIds) override {
      std::string all = "Process " + Str(shipment.ConNoteNo) + " " + std::to_string(shipment.Status) + " " +
                        Str(notice.ASNNo) + " " + std::to_string(notice.Id);
      for (const auto& pack : packs) {
        all += " " + Str(pack->SSCC) + "/" + std::to_string(pack->ASNId) + "/" + std::to_string(pack->Status);
      }
      recorder.calls.push_back(all + " after " + std::to_string(logIds.size()));
      logIds.push_back(1);
    }
    void Init(System&, const Partner& partner, const Vendor& vendor, const EDIDoc& document) override {
      recorder.calls.push_back("Init " + partner.PartnerId + " " + vendor.VendorId + " " +
                               std::to_string(document.EDIDocId));
    }
    std::int32_t Process(const ASN& notice, std::vector<std::int32_t>& logIds) override {
      recorder.calls.push_back("Process " + Str(notice.ASNNo) + " after " + std::to_string(logIds.size()));
      return recorder.result;
    }
    void Term() override { recorder.calls.push_back("Term"); }
    Recorder& recorder;
  };

  explicit Recorder(PackedTrade& trade) {
    trade.ports.components.carrier = [this](std::string_view progId) { return Created("carrier ", progId); };
    trade.ports.components.noticeExtension = [this](std::string_view progId) { return Created("partner ", progId); };
  }
  std::unique_ptr<Component> Created(const std::string& kind, std::string_view progId) {
    calls.push_back(kind + std::string(progId));
    return creates ? std::make_unique<Component>(*this) : nullptr;
  }
  static std::string Str(const Text& text) { return text.value_or("null"); }

  Texts calls;
  bool creates = true;
  std::int32_t result = 1;
};

TEST(CsvNoticeStoredTest, HandsTheNoticeToTheCarriersThenThePartnersComponent) {
  for (const char* className : {kMgb, kTargetNotice}) {
    SCOPED_TRACE(className);
    PackedTrade trade(className, "CONTAINERNO");
    Recorder recorder(trade);
    trade.Sql("UPDATE tbPartner SET ASNExtension = 'Acme.Web'");
    trade.AddPack();
    trade.AddPack({}, {});
    // Target's notice is told to be compiled behind all this, and what a component noted counts with the packs.
    const bool last = className == std::string(kTargetNotice);
    const auto outcome = trade.Run().front();
    EXPECT_EQ(outcome.result, 1);
    EXPECT_THAT(recorder.calls,
                ElementsAre("carrier Toll.Papers",
                            "Process CN5 8 1001 1 SSCC1/1/8 SSCC2/1/8 after " + std::string(last ? "1" : "2"), "Term",
                            "partner Acme.Web", "Init MGB ACME 1",
                            "Process 1001 after " + std::string(last ? "2" : "3"), "Term"));
    EXPECT_EQ(outcome.told.size(), 3U);
    EXPECT_EQ(outcome.told.back(),
              last ? "0 Process: ASN 1001 compile completed. 2 packs added." : outcome.told.front());
  }
}

// A row counts as the partner's component says; what isn't named or can't be created is gone without.
TEST(CsvNoticeStoredTest, CallsTheComponentsThatAreNamedAndCanBeCreated) {
  const std::string web = "UPDATE tbPartner SET ASNExtension = 'Acme.Web'";
  const std::string none = "UPDATE tbPartnerAddress SET ProcessProgID = NULL; UPDATE tbPartner SET ASNExtension = ";
  const struct {
    std::string sql;
    bool creates;
    std::int32_t result;
    Texts calls;
  } cases[] = {
      {web + "; UPDATE tbShipment SET CarrierId = 0",
       true,
       0,
       {"partner Acme.Web", "Init MGB ACME 1", "Process 1001 after 2", "Term"}},
      {web, false, 1, {"carrier Toll.Papers", "partner Acme.Web"}},
      {none + "'TL2Compatible'", true, 1, {}},
      {none + "''", true, 1, {}},
  };
  for (const auto& each : cases) {
    SCOPED_TRACE(each.sql);
    PackedTrade trade(kMgb, "CONTAINERNO");
    Recorder recorder(trade);
    recorder.creates = each.creates;
    recorder.result = each.result;
    trade.Sql(each.sql);
    trade.AddPack();
    EXPECT_EQ(trade.Run().front().result, each.result);
    EXPECT_EQ(recorder.calls, each.calls);
    EXPECT_EQ(trade.Stamps(), "1/8");
    EXPECT_THAT(trade.Output(), ElementsAre("SSCC1,"));
  }
}

// --- Papers that follow a notice

TEST(CsvNoticeStoredTest, TellsOfPapersThatItDoesNotMake) {
  const auto told = [](const std::string& className, const std::string& options) {
    PackedTrade trade(className, "CONTAINERNO");
    trade.document.Options = options;
    trade.AddPack();
    Texts told = trade.Run().front().told;
    std::erase_if(told, [](const std::string& line) { return line.front() != 'W'; });
    return told;
  };
  const std::string docket = "W Process: No delivery docket is made for ASN 1001: this version has none.";
  const std::string listing = "W Process: No DHL listing is made for ASN 1001: this version has none.";
  for (const std::string name : kNoticeClasses) {
    SCOPED_TRACE(name);
    const bool dockets = name == kTargetNotice || name == kCmlAdvice || name == kBulkAdvice;
    EXPECT_EQ(told(name, "x#%DeliveryDockety"), dockets ? Texts{docket} : Texts{});
    EXPECT_EQ(told(name, "#%DELIVERYDOCKET"), Texts{});
    EXPECT_EQ(told(name, "#%TARGETCHINADHL"), name == kTargetNotice ? Texts{listing} : Texts{});
    EXPECT_EQ(told(name, "#%TARGETCHINADHL "), Texts{});
  }
}

}  // namespace
}  // namespace partnerkit::testing

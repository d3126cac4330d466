// What follows a written notice: stamps, log, the inventory file and the components of other makers.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using Texts = std::vector<std::string>;

std::int32_t StatusOfShipment(PackedTrade& trade) {
  Shipment shipment;
  shipment.Id = 1;
  EXPECT_TRUE(Load(trade.system->Records(), shipment));
  return shipment.Status;
}

TEST(CsvNoticeStoredTest, StampsThePacksAndTheShipmentBelowEight) {
  for (const std::int32_t status : {0, 7, 8, 9}) {
    SCOPED_TRACE(status);
    PackedTrade trade(kMgb);
    trade.Map("CONTAINERNO");
    trade.AddPack();
    trade.AddPack([](Pack& pack) { pack.Status = 7; }, {});
    trade.Sql("UPDATE tbShipment SET Status = " + std::to_string(status));
    EXPECT_EQ(trade.Run().front().result, 1);
    EXPECT_EQ(trade.Stamps(), "1/8 1/8");
    EXPECT_EQ(StatusOfShipment(trade), status == 9 ? 9 : 8);
  }
}

TEST(CsvNoticeStoredTest, LogsEachPackWithLinesThenTheNotice) {
  const Texts usual = {"0 Process Pack: ......Pack SSCC1 added to ConNote CN5 for PONo 450001",
                       "0 Process Pack: ......Pack SSCC3 added to ConNote CN5 for PONo 450001",
                       "0 Process: ASN 1001 compile completed. 2 packs added."};
  const Texts target = {"0 Process Pack: ......Pack SSCC1 added to ConNote CN5",
                        "0 Process Pack: ......Pack SSCC3 added to ConNote CN5",
                        "0 Process: ASN 1001 compile completed. 2 packs added."};
  for (const char* className : kNoticeClasses) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    trade.Map("CONTAINERNO");
    trade.AddPack();
    trade.AddPack({}, {});
    trade.AddPack({}, {{"93001", 0}});
    const auto outcome = trade.Run().front();
    EXPECT_EQ(outcome.told, className == std::string(kTargetNotice) ? target : usual);
    EXPECT_EQ(trade.NewLog(), outcome.told);
    Log log;
    log.LogId = 1;
    EXPECT_TRUE(Load(trade.system->Records(), log));
    EXPECT_EQ(log.Source, "PartnerKit." + std::string(className));
  }
}

TEST(CsvNoticeStoredTest, FindsNoPacksInARowThatIsDone) {
  PackedTrade trade(kMgb);
  trade.Map("CONTAINERNO");
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
  for (const char* className : {kTargetNotice, kMgb}) {
    PackedTrade trade(className);
    trade.Map("CONTAINERNO");
    trade.AddPack();
    trade.system->CompileTotal1 = trade.system->CompileTotal2 = 5;
    trade.Run();
    const std::int32_t left = className == std::string(kMgb) ? 5 : 0;
    EXPECT_EQ(trade.system->CompileTotal1, left);
    EXPECT_EQ(trade.system->CompileTotal2, left);
  }
}

// --- A store that refuses

struct Refusal {
  const char* what;
  std::string when;   // made so behind the listing
  std::string after;  // made good again
  const char* told;
};

const Refusal kRefusals[] = {
    {"a pack cannot be stamped",
     "CREATE TRIGGER \"no\" BEFORE UPDATE ON tbPack WHEN old.Id = 2 BEGIN SELECT RAISE(ABORT, 'no')/END",
     "DROP TRIGGER \"no\"", "store.db: no"},
    {"the notice cannot be stored", "CREATE TRIGGER \"no\" BEFORE INSERT ON tbASN BEGIN SELECT RAISE(ABORT, 'no')/END",
     "DROP TRIGGER \"no\"", "The notice cannot be stored, database error 1811"},
    {"the shipment cannot be stamped",
     "CREATE TRIGGER \"no\" BEFORE UPDATE ON tbShipment BEGIN SELECT RAISE(ABORT, 'no')/END", "DROP TRIGGER \"no\"",
     "The shipment cannot be stamped, database error 1811"},
    {"another program compiled a pack", "UPDATE tbPack SET Status = 8 WHERE Id = 2",
     "UPDATE tbPack SET Status = 4 WHERE Id = 2", "Pack SSCC2 no longer waits"},
    {"another program removed a pack", "UPDATE tbPack SET Id = 9 WHERE Id = 2", "UPDATE tbPack SET Id = 2 WHERE Id = 9",
     "Pack SSCC2 no longer waits"},
};

TEST(CsvNoticeStoredTest, LeavesAllAsItWasWhenTheStoreRefuses) {
  for (const Refusal& refusal : kRefusals) {
    for (const char* className : {kMgb, kTargetNotice}) {
      SCOPED_TRACE(std::string(className) + ": " + refusal.what);
      PackedTrade trade(className);
      trade.Map("CONTAINERNO SHIPNOTENO");
      trade.folder.Write("out/asn.csv", "EARLIER\r\n");
      trade.Sql("UPDATE tbPartner SET ASNExtension = 'TL2Compatible', InventoryFile = '" + trade.folder / "out/stock" +
                "'");
      trade.AddPack();
      trade.AddPack();
      const auto translator = trade.Loaded();
      std::string when = refusal.when;
      // The body of a trigger has a ";" of its own.
      std::ranges::replace(when, '/', ';');
      trade.system->Session().Execute(when);
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
      const bool padded = className == std::string(kTargetNotice);
      const std::string number = padded ? "000001002," : "1002,";
      EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1," + number, "SSCC2," + number));
      EXPECT_EQ(trade.Output("out/stock").size(), 2U);
    }
  }
}

// --- The inventory file

const char* const kRecord =
    "\"MGBSTORES\",\"000001001\",20060308,1015,\"CN5\",20060320,20060320,\"0512\",\"450001\",\"INV77\",\"TRAIN\","
    "\"93001\",18,6,6,\"S\",\"REF8\",\"XL\",\"PK4\",\"7\",\"LL31\",\"TOLL\"\r\n";

std::string Inventory(const char* className, const std::string& sql = {},
                      const std::vector<PackedTrade::PackedLine>& lines = {{"93001", 6}}) {
  PackedTrade trade(className);
  trade.Map("CONTAINERNO");
  trade.Sql("UPDATE tbPartner SET ASNExtension = 'TL2Compatible', InventoryFile = '" + trade.folder / "stock" + "'");
  trade.AddPack({}, lines);
  trade.Sql(sql);
  trade.Run();
  return trade.folder.Read("stock");
}

TEST(CsvNoticeStoredTest, WritesTheInventoryRecordToTheByte) {
  for (const char* className : kNoticeClasses) {
    SCOPED_TRACE(className);
    EXPECT_EQ(Inventory(className), kRecord);
  }
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

TEST(CsvNoticeStoredTest, WritesAnInventoryRecordForEachLineOfAPositiveQuantity) {
  const auto record = [](const std::string& product, const std::string& inHouse, const std::string& ordered,
                         const std::string& size, const std::string& quantity, const std::string& references) {
    return "\"MGBSTORES\",\"000001001\",20060308,1015,\"CN5\",20060320,20060320,\"0512\",\"450001\",\"INV77\",\"" +
           inHouse + "\",\"" + product + "\"," + ordered + "," + quantity + "," + quantity + ",\"S\",\"REF8\",\"" +
           size + "\",\"PK4\"," + references + ",\"TOLL\"\r\n";
  };
  for (const char* className : kNoticeClasses) {
    SCOPED_TRACE(className);
    EXPECT_EQ(Inventory(className, "", {{"93001", 1}, {"93001", 2}, {"93001", 0}, {"93001", -1}, {"93009", 3}}),
              record("93001", "TRAIN", "18", "XL", "1", "\"7\",\"LL31\"") +
                  record("93001", "TRAIN", "18", "XL", "2", "\"7\",\"LL31\"") +
                  record("93009", "", "0", "", "3", "\"\",\"\""));
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
    PackedTrade trade(kMgb);
    trade.Map("CONTAINERNO");
    trade.AddPack();
    trade.Sql("UPDATE tbPartner SET ASNExtension = " + extension + ", InventoryFile = " + path);
    std::filesystem::current_path(trade.folder / "out");
    EXPECT_EQ(trade.Run().front().result, 1);
    std::filesystem::current_path("/");
    return trade.Files();
  };
  EXPECT_EQ(files("'TL2Compatible'", "'st'"), "asn.csv st");
  EXPECT_EQ(files("'TL2Compatible'", "'s'"), "asn.csv");
  EXPECT_EQ(files("'TL2Compatible'", "NULL"), "asn.csv");
  EXPECT_EQ(files("'tl2compatible'", "'st'"), "asn.csv");
  EXPECT_EQ(files("'Other.Component'", "'st'"), "asn.csv");
  EXPECT_EQ(files("NULL", "'st'"), "asn.csv");
}

// --- Components of other makers

// Notes what its components are handed.
struct Recorder {
  explicit Recorder(PackedTrade& trade) {
    trade.ports.components.carrier = [this](std::string_view progId) -> std::unique_ptr<CarrierComponent> {
      calls.push_back("carrier " + std::string(progId));
      return creates ? std::make_unique<Carrier>(*this) : nullptr;
    };
    trade.ports.components.noticeExtension = [this](std::string_view progId) -> std::unique_ptr<NoticeExtension> {
      calls.push_back("partner " + std::string(progId));
      return creates ? std::make_unique<Extension>(*this) : nullptr;
    };
  }

  struct Carrier : CarrierComponent {
    explicit Carrier(Recorder& owner) : recorder(owner) {}
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
    void Term() override { recorder.calls.push_back("Term"); }
    Recorder& recorder;
  };
  struct Extension : NoticeExtension {
    explicit Extension(Recorder& owner) : recorder(owner) {}
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

  static std::string Str(const Text& text) { return text.value_or("null"); }

  Texts calls;
  bool creates = true;
  std::int32_t result = 1;
};

TEST(CsvNoticeStoredTest, HandsTheNoticeToTheCarriersThenThePartnersComponent) {
  for (const char* className : kNoticeClasses) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    Recorder recorder(trade);
    trade.Map("CONTAINERNO");
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

TEST(CsvNoticeStoredTest, CountsARowAsNotDoneWhenThePartnersComponentFails) {
  PackedTrade trade(kMgb);
  Recorder recorder(trade);
  recorder.result = 0;
  trade.Map("CONTAINERNO");
  trade.Sql("UPDATE tbPartner SET ASNExtension = 'Acme.Web'; UPDATE tbShipment SET CarrierId = 0");
  trade.AddPack();
  EXPECT_EQ(trade.Run().front().result, 0);
  EXPECT_THAT(recorder.calls, ElementsAre("partner Acme.Web", "Init MGB ACME 1", "Process 1001 after 2", "Term"));
  EXPECT_EQ(trade.Stamps(), "1/8");
  EXPECT_THAT(trade.Output(), ElementsAre("SSCC1,"));
}

TEST(CsvNoticeStoredTest, GoesWithoutComponentsThatCannotBeCreatedOrAreNotNamed) {
  const auto calls = [](const std::string& sql, bool creates) {
    PackedTrade trade(kMgb);
    Recorder recorder(trade);
    recorder.creates = creates;
    trade.Map("CONTAINERNO");
    trade.Sql(sql);
    trade.AddPack();
    EXPECT_EQ(trade.Run().front().result, 1);
    return recorder.calls;
  };
  EXPECT_THAT(calls("UPDATE tbPartner SET ASNExtension = 'Acme.Web'", false),
              ElementsAre("carrier Toll.Papers", "partner Acme.Web"));
  const std::string none = "UPDATE tbPartnerAddress SET ProcessProgID = NULL; ";
  EXPECT_THAT(calls(none + "UPDATE tbPartner SET ASNExtension = 'TL2Compatible'", true), IsEmpty());
  EXPECT_THAT(calls(none + "UPDATE tbPartner SET ASNExtension = ''", true), IsEmpty());
}

// --- Papers that follow a notice

TEST(CsvNoticeStoredTest, TellsOfPapersThatItDoesNotMake) {
  const auto told = [](const char* className, const std::string& options) {
    PackedTrade trade(className);
    trade.Map("CONTAINERNO");
    trade.document.Options = options;
    trade.AddPack();
    Texts told = trade.Run().front().told;
    std::erase_if(told, [](const std::string& line) { return line.front() != 'W'; });
    return told;
  };
  const std::string docket = "W Process: No delivery docket is made for ASN 1001: this version has none.";
  const std::string listing = "W Process: No DHL listing is made for ASN 1001: this version has none.";
  for (const char* className : kNoticeClasses) {
    SCOPED_TRACE(className);
    const std::string name = className;
    const bool dockets = name == kTargetNotice || name == kCmlAdvice || name == kBulkAdvice;
    EXPECT_EQ(told(className, "x#%DeliveryDockety"), dockets ? Texts{docket} : Texts{});
    EXPECT_EQ(told(className, "#%DELIVERYDOCKET"), Texts{});
    EXPECT_EQ(told(className, "#%TARGETCHINADHL"), name == kTargetNotice ? Texts{listing} : Texts{});
    EXPECT_EQ(told(className, "#%TARGETCHINADHL "), Texts{});
  }
}

}  // namespace
}  // namespace partnerkit::testing

// What becomes of waiting packs: the rows they are listed in, the lines they give, and all that turns a row away.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Texts = std::vector<std::string>;

const char* const kRunning = "clsMGB856csv clsMYERDropShipDAcsv clsTarget856csv clsKMart856csv clsOfficeworks856csv";
const char* const kOrderly = "clsMGB856csv clsMYERDropShipDAcsv clsTarget856csv clsMGBBT856csv";
const char* const kByShipTo = "clsKMart856csv clsOfficeworks856csv clsCMLFLFDAcsv clsTargetBulkDAcsv";

TEST(CsvNoticeTest, HandsOutTheColumnsOfTheCompileScreen) {
  for (const char* className : kNoticeClasses) {
    PackedTrade trade(className);
    const auto translator = trade.Create(className);
    ColumnTable columns;
    EXPECT_TRUE(translator->Init(*trade.system, 1, columns));
    std::string all;
    for (const GridColumn& column : columns) {
      all +=
          std::string(column.caption) + "|" + std::to_string(column.kind) + "|" + std::to_string(column.width) + "; ";
    }
    EXPECT_EQ(all, "ConNote No|0|1500; Partner|2|1000; Delivery Locn|0|2000; Order No|0|2600; Result|0|3000; ");
    EXPECT_EQ(translator->ProgId(), "PartnerKit." + std::string(className));
  }
}

// Three orders on two shipments; the ids of two pairs read alike when set side by side.
void PackFiveOrders(PackedTrade& trade) {
  for (int n = 2; n <= 11; ++n) trade.AddOrder([](Order&) {});
  for (int n = 2; n <= 11; ++n) trade.AddShipment([&](Shipment& load) { load.ConNoteNo = "CN" + std::to_string(n); });
  const auto pack = [&](std::int32_t shipment, std::int32_t order, const std::string& shipTo) {
    trade.AddPack([&](Pack& each) {
      each.ShipmentId = shipment;
      each.OrderId = order;
      each.ShipToCode = shipTo;
    });
  };
  pack(11, 1, "0900");
  pack(1, 11, "0900");
  pack(1, 2, "0901");
  pack(1, 11, "0900");
  pack(1, 2, "0900");
}

TEST(CsvNoticeTest, ListsARowForEachOrderOnAShipment) {
  for (const std::string& className : Words(kOrderly)) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    trade.Map("CONSIGNMENTNOTENO ORDERNO CONTAINERNO");
    PackFiveOrders(trade);
    trade.Run();
    EXPECT_EQ(trade.rows, 3);
    EXPECT_THAT(NoticeRows(trade.table),
                ElementsAre("CN5|MGB Stores|MGB Altona|450002||", "CN5|MGB Stores|MGB Altona|4500011||",
                            "CN11|MGB Stores|MGB Altona|450001||", "-", "-"));
    EXPECT_THAT(trade.Output(), ElementsAre("CN5,450002,SSCC5,", "CN5,450002,SSCC3,", "CN5,4500011,SSCC2,",
                                            "CN5,4500011,SSCC4,", "CN11,450001,SSCC1,"));
    EXPECT_EQ(trade.Stamps(), "3/8 2/8 1/8 2/8 1/8");
  }
}

TEST(CsvNoticeTest, ListsARowForEachShipToWhereThePartnerWantsOne) {
  for (const std::string& className : Words(kByShipTo)) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    trade.Map("CONSIGNMENTNOTENO ORDERNO CONTAINERNO");
    PackFiveOrders(trade);
    trade.Sql("UPDATE tbOrder SET PONo = '45 DEL# 6 #7' WHERE OrderId = 2");
    trade.Run();
    const std::string shown = className == kCmlAdvice || className == kBulkAdvice ? "45" : "45 DEL# 6 #7";
    EXPECT_THAT(NoticeRows(trade.table),
                ElementsAre("CN5|MGB Stores|MGB Altona|" + shown + "||", "CN5|MGB Stores||" + shown + "||",
                            "CN5|MGB Stores|MGB Altona|4500011||", "CN11|MGB Stores|MGB Altona|450001||", "-"));
    EXPECT_EQ(trade.Stamps(), "4/8 3/8 2/8 3/8 1/8");
    std::string shipTos;
    for (std::int32_t id = 1; id <= 4; ++id) {
      ASN asn;
      asn.Id = id;
      EXPECT_TRUE(Load(trade.system->Records(), asn));
      shipTos += asn.ShipToCode.value_or("null") + " ";
    }
    EXPECT_EQ(shipTos, "0900 0901 0900 0900 ");
  }
}

TEST(CsvNoticeTest, StoresTheNotice) {
  const auto stored = [](const char* className) {
    PackedTrade trade(className);
    trade.Map("CONTAINERNO");
    trade.AddPack();
    EXPECT_EQ(trade.Run().front().result, 1);
    ASN asn;
    asn.Id = 1;
    EXPECT_TRUE(Load(trade.system->Records(), asn));
    return Shown(asn);
  };
  const std::string head =
      "Id=1 ASNNo=\"1001\" VendorId=\"ACME\" PartnerId=\"MGB\" ShipmentId=1 OrderId=1 OrderNo=\"450001\" "
      "PartnerName=\"MGB Stores\" PartnerLocnId=44 ";
  const std::string rest = "DeliveryLocn=\"MGB Altona\" ConNoteNo=\"CN5\" CompileDate=2006-03-08T10:15:00";
  EXPECT_EQ(stored(kMgb), head + rest);
  EXPECT_EQ(stored(kKmartNotice), head + "ShipToCode=\"0900\" " + rest);
}

TEST(CsvNoticeTest, LeavesTheGridAsItIsWithoutPacks) {
  PackedTrade trade(kMgb);
  trade.AddPack([](Pack& pack) { pack.Status = 8; });
  trade.table = RowTable(1, 1);
  trade.table.At(0, 0) = "kept";
  trade.system->PackListMode = 7;
  trade.Loaded();
  EXPECT_EQ(trade.rows, 0);
  EXPECT_THAT(NoticeRows(trade.table), ElementsAre("kept|"));
  EXPECT_THAT(trade.NewLog(), ElementsAre("0 Load: No Packs found to process."));
  EXPECT_EQ(trade.system->PackListMode, 0);
}

TEST(CsvNoticeTest, ForgetsTheRowsOfAnEarlierListing) {
  PackedTrade trade(kMgb);
  trade.Map("CONTAINERNO");
  trade.AddPack();
  const auto translator = trade.Loaded();
  trade.Sql("UPDATE tbPack SET Status = 8");
  EXPECT_EQ(translator->Load(trade.folder / "out/asn.csv", trade.table), 0);
  EXPECT_THAT(trade.Process(*translator).told, IsEmpty());
  translator->Cancel();
  EXPECT_EQ(trade.Files(), "");
}

// --- Lines

struct Lines {
  const char* what;
  std::vector<std::vector<PackedTrade::PackedLine>> packs;
  Texts summed;  // where neighbours are summed
  Texts each;    // where each line stands for itself
};

const Lines kLines[] = {
    {"neighbours of one product",
     {{{"93001", 1}, {"93001", 2}, {"93002", 4}, {"93001", 8}}},
     {"SSCC1,93001,3,", "SSCC1,93002,4,", "SSCC1,93001,8,"},
     {"SSCC1,93001,1,", "SSCC1,93001,2,", "SSCC1,93002,4,", "SSCC1,93001,8,"}},
    {"one product in two cartons",
     {{{"93001", 1}}, {{"93001", 2}}},
     {"SSCC1,93001,1,", "SSCC2,93001,2,"},
     {"SSCC1,93001,1,", "SSCC2,93001,2,"}},
    {"nothing of a product",
     {{{"93001", 1}, {"93002", 0}, {"93001", 2}, {"93002", 0}}, {{"93001", 0}}},
     {"SSCC1,93001,1,", "SSCC1,93001,2,"},
     {"SSCC1,93001,1,", "SSCC1,93001,2,"}},
    {"no lines", {{}, {{"93001", 1}}, {}}, {"SSCC2,93001,1,"}, {"SSCC2,93001,1,"}},
    {"a product without a number",
     {{{"", 1}, {"93001", 2}, {" ", 3}, {"93002", 4}}},
     {"SSCC1,93001,3,", "SSCC1,93002,7,"},
     {"SSCC1,,1,", "SSCC1,93001,2,", "SSCC1,,3,", "SSCC1,93002,4,"}},
    {"more taken back than packed",
     {{{"93001", 3}, {"93001", -3}, {"93002", -2}, {"93001", 1}}},
     {"SSCC1,93002,-2,", "SSCC1,93001,1,"},
     {"SSCC1,93001,3,", "SSCC1,93001,1,"}},
};

TEST(CsvNoticeTest, SumsTheNeighboursOfOneProductInACarton) {
  for (const Lines& lines : kLines) {
    for (const char* className : {kMgb, kMyerDrop, kTargetNotice, kKmartNotice, kOfficeworksNotice, kMgbbtNotice}) {
      SCOPED_TRACE(std::string(className) + ": " + lines.what);
      PackedTrade trade(className);
      trade.Map("CONTAINERNO APN QUANTITYSHIPPED");
      for (const auto& pack : lines.packs) trade.AddPack({}, pack);
      EXPECT_EQ(trade.Compiled(), className == std::string(kMgbbtNotice) ? lines.each : lines.summed);
      std::string stamps;
      for (std::size_t n = 0; n < lines.packs.size(); ++n) stamps += n == 0 ? "1/8" : " 1/8";
      EXPECT_EQ(trade.Stamps(), stamps);
    }
  }
}

TEST(CsvNoticeTest, WritesEachLineOfADespatchAdvice) {
  for (const char* className : {kCmlAdvice, kBulkAdvice}) {
    PackedTrade trade(className);
    trade.Map("CONTAINERNO TRADEDQUANTITY");
    trade.AddPack({}, {{"93001", 1}, {"93001", 0}, {"93001", 2.5}, {"93001", -1}});
    EXPECT_THAT(trade.Compiled(), ElementsAre("SSCC1,1,", "SSCC1,2.5,"));
  }
}

// The other columns of a sum are those of its last line.
TEST(CsvNoticeTest, ShowsTheLastLineOfASum) {
  PackedTrade trade(kMgb);
  trade.Map("QUANTITYSHIPPED LINEREF");
  const std::int32_t pack = trade.AddPack();
  trade.Sql("INSERT INTO tbPSlipLine(PSlipId, LineRef) VALUES(1, 'SL33')");
  trade.AddLine(pack, "93001", 2, [](PackLine& line) { line.PSlipLineId = 2; });
  EXPECT_THAT(trade.Compiled(), ElementsAre("8,SL33,"));
}

// A product that nobody knows shows the number of the line before it, of whatever quantity and carton.
TEST(CsvNoticeTest, KeepsTheLastProductBeforeAnUnknownOne) {
  for (const char* className : {kMgb, kMgbbtNotice}) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    trade.Map("INHOUSEPRODNO APN");
    trade.AddPack({}, {{"93009", 1}, {"93001", 1}, {"93009", 1}, {"93002", 0}, {"93009", 2}});
    trade.AddPack({}, {{"93008", 1}});
    const Texts each = {",93009,", "TRAIN,93001,", "TRAIN,93009,", "BEAR,93009,", "BEAR,93008,"};
    EXPECT_EQ(trade.Compiled(), each);
  }
}

TEST(CsvNoticeTest, TakesRunsUpTo32767UnitsAndTargetsBeyond) {
  const auto compiled = [](const std::string& className, double quantity) {
    PackedTrade trade(className);
    trade.Map("QUANTITYSHIPPED");
    trade.AddPack({}, {{"93001", 1}, {"93001", quantity}});
    const auto outcome = trade.Run().front();
    const Texts lines = trade.Output();
    EXPECT_EQ(outcome.result, lines.empty() ? 0 : 1);
    EXPECT_EQ(trade.Stamps(), lines.empty() ? "0/4" : "1/8");
    if (lines.empty()) {
      EXPECT_EQ(trade.Files(), "");
      EXPECT_EQ(trade.reports.size(), 1U);
      EXPECT_EQ(outcome.told.size(), 1U);
      EXPECT_THAT(trade.reports, Contains(::testing::HasSubstr("Overflow")));
    }
    return lines.empty() ? "" : lines.front();
  };
  for (const std::string& className : Words(kRunning)) {
    SCOPED_TRACE(className);
    const bool longer = className == kTargetNotice;
    EXPECT_EQ(compiled(className, 32766), "32767,");
    EXPECT_EQ(compiled(className, 32767), longer ? "32768," : "");
  }
  EXPECT_EQ(compiled(kTargetNotice, 2147483647), "");
}

// --- The output

TEST(CsvNoticeTest, PutsTheNumberIntoTheNameOfTheOutput) {
  PackedTrade trade(kMgb);
  trade.Map("CONTAINERNO SHIPNOTENO");
  trade.AddOrder([](Order&) {});
  trade.AddPack();
  trade.AddPack([](Pack& pack) { pack.OrderId = 2; });
  trade.folder.Write("out/asn1002-1002.csv", "EARLIER\r\n");
  trade.Run("out/asn*-*.csv");
  EXPECT_EQ(trade.Files(), "asn1001-1001.csv asn1002-1002.csv");
  EXPECT_THAT(trade.Output("out/asn1001-1001.csv"), ElementsAre("SSCC1,1001,"));
  EXPECT_THAT(trade.Output("out/asn1002-1002.csv"), ElementsAre("EARLIER", "SSCC2,1002,"));
}

TEST(CsvNoticeTest, KeepsANumberOutOfOtherFolders) {
  PackedTrade trade(kMgb);
  trade.Map("SHIPNOTENO");
  trade.Sql("UPDATE tbPartner SET ASNNoFromInvoice = 1");
  trade.AddPack([](Pack& pack) { pack.InvoiceNo = "../IN\\V"; });
  trade.Run("out/*.csv");
  EXPECT_EQ(trade.Files(), ".._IN_V.csv");
  EXPECT_THAT(trade.Output("out/.._IN_V.csv"), ElementsAre("../IN\\V,"));
}

TEST(CsvNoticeTest, AddsEveryNoticeToOneFileEachWithTheHeaderOfTheTranslator) {
  for (const char* translator : {"GENTRAN", "Gentran", "other"}) {
    SCOPED_TRACE(translator);
    PackedTrade trade(kMgb);
    trade.Map("CONTAINERNO");
    trade.Sql("UPDATE tbPartner SET Translator = '" + std::string(translator) + "'");
    trade.AddOrder([](Order&) {});
    trade.AddPack();
    trade.AddPack([](Pack& pack) { pack.OrderId = 2; });
    trade.folder.Write("out/asn.csv", "EARLIER\r\n");
    if (translator == std::string("other")) {
      EXPECT_THAT(trade.Compiled(), ElementsAre("EARLIER", "SSCC1,", "SSCC2,"));
    } else {
      EXPECT_THAT(trade.Compiled(), ElementsAre("EARLIER", "HEADER,MGBSTORES", "SSCC1,", "HEADER,MGBSTORES", "SSCC2,"));
    }
    EXPECT_EQ(trade.Files(), "asn.csv");
  }
}

TEST(CsvNoticeTest, ReadsTheMapOnceWithItsBlanksCutAndItsLastLineWithoutAnEnd) {
  PackedTrade trade(kMgb);
  trade.AddOrder([](Order&) {});
  trade.AddPack();
  trade.AddPack([](Pack& pack) { pack.OrderId = 2; });
  trade.folder.Write("asn.map", " CONTAINERNO \r\n\r\nAPN");
  const auto translator = trade.Loaded();
  trade.Process(*translator, 0);
  trade.folder.Write("asn.map", "");
  trade.Process(*translator, 1);
  EXPECT_THAT(trade.Output(), ElementsAre("SSCC1,,93001,", "SSCC2,,93001,"));
}

// --- Numbers by invoice

TEST(CsvNoticeTest, TakesTheNumberFromTheFirstPacksInvoice) {
  for (const char* className : kNoticeClasses) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    trade.Map("SHIPNOTENO CONTAINERNO");
    trade.Sql("UPDATE tbPartner SET ASNNoFromInvoice = 1");
    trade.AddOrder([](Order&) {});
    trade.AddPack([](Pack& pack) { pack.InvoiceNo = "88"; });
    trade.AddPack([](Pack& pack) { pack.InvoiceNo = "99"; });
    trade.AddPack([](Pack& pack) {
      pack.OrderId = 2;
      pack.InvoiceNo.reset();
    });
    // The counter's next number stands for a notice already, which only numbers from invoices are tested for.
    trade.Sql("INSERT INTO tbASN(PartnerId, ASNNo) VALUES('MGB', '1001'), ('TOYS', '88')");
    const bool padded = className == std::string(kTargetNotice);
    const std::string number = padded ? "000000088," : "88,", next = padded ? "000001001," : "1001,";
    EXPECT_THAT(trade.Compiled(), ElementsAre(number + "SSCC1,", number + "SSCC2,", next + "SSCC3,"));
  }
}

// --- What turns a row away. The packs then stay as they are, and so do the files.

struct Rejection {
  const char* classes;
  const char* what;
  std::function<void(PackedTrade&)> change;
  Texts told;  // "FOLDER" is that of the test
};

std::function<void(PackedTrade&)> Do(const std::string& sql) {
  return [sql](PackedTrade& trade) { trade.Sql(sql); };
}
// So many packs on the shipment of the one that waits.
std::function<void(PackedTrade&)> ShipmentOf(int packs) {
  return Do("WITH RECURSIVE n(i) AS (SELECT 2 UNION ALL SELECT i + 1 FROM n WHERE i < " + std::to_string(packs) +
            ") INSERT INTO tbPack(ShipmentId, OrderId, Status) SELECT 1, 1, 8 FROM n");
}
void UseInventory(PackedTrade& trade, const std::string& path) {
  trade.Sql("UPDATE tbPartner SET ASNExtension = 'TL2Compatible', InventoryFile = '" + trade.folder / path + "'");
}
std::function<void(PackedTrade&)> SubPacks(int count) {
  return [count](PackedTrade& trade) {
    for (int n = 0; n < count; ++n) trade.AddPack([](Pack& pack) { pack.LeadPackId = 1; }, {});
  };
}

const char* const kEvery =
    "clsMGB856csv clsMYERDropShipDAcsv clsTarget856csv clsMGBBT856csv clsKMart856csv clsOfficeworks856csv "
    "clsCMLFLFDAcsv clsTargetBulkDAcsv";

const Rejection kRejections[] = {
    {kEvery,
     "no map",
     [](PackedTrade& trade) { std::filesystem::remove(trade.folder / "asn.map"); },
     {"53 OpenMapFile: ASN map file FOLDERasn.map does not exist."}},
    {kEvery,
     "an empty map",
     [](PackedTrade& trade) { trade.Map(""); },
     {"0 OpenMapFile: ASN map file FOLDERasn.map is empty."}},
    {"clsMGB856csv clsMYERDropShipDAcsv clsMGBBT856csv clsKMart856csv clsOfficeworks856csv clsCMLFLFDAcsv "
     "clsTargetBulkDAcsv",
     "no inventory file",
     [](PackedTrade& trade) { UseInventory(trade, "none/stock.txt"); },
     {"76 Open Inventory File: Cannot open inventory file FOLDERnone/stock.txt"}},
    {kTargetNotice,
     "no inventory file",
     [](PackedTrade& trade) { UseInventory(trade, "none/stock.txt"); },
     {"76 Open Inventory File: Cannot inventory open file FOLDERnone/stock.txt"}},
    {kEvery,
     "a number in use",
     Do("UPDATE tbPartner SET ASNNoFromInvoice = 1; INSERT INTO tbASN(PartnerId, ASNNo) VALUES('MGB', 'INV77')"),
     {"R New ASN : ASN number already exists INV77"}},
    {kEvery,
     "no folder for the output",
     [](PackedTrade& trade) { std::filesystem::remove(trade.folder / "out"); },
     {"76 Open ASN File: Cannot open file FOLDERout/asn1001.csv"}},
    {kKmartNotice, "too many packs", ShipmentOf(10000), {"R New ASN : ASN pack count exceeds 9999..."}},
    {kMgbbtNotice, "too many sub packs", SubPacks(21), {"R New ASN : Only 20 Sub Packs allowed per lead pack"}},
    {kCmlAdvice,
     "no delivery date",
     Do("UPDATE tbShipment SET DeliveryDate = NULL"),
     {"R DA Error : Scheduled date Null"}},
    {kCmlAdvice,
     "no date to deliver by",
     Do("UPDATE tbOrder SET CancelAfter = NULL"),
     {"R DA Error : Scheduled date Null"}},
    {kCmlAdvice,
     "delivery a day late",
     Do("UPDATE tbShipment SET DeliveryDate = '2006-03-25'"),
     {"R DA Warning : Shipment scheduled delivery date 25/03/2006 greater then order Required date 24/03/2006"}},
    {kCmlAdvice,
     "invoices without a company number",
     Do("UPDATE tbPartner SET ABN = ' '; INSERT INTO tbEDIDoc(EDIDocId, VendorId, PartnerId, DocumentCode) "
        "VALUES(7, 'ACME', 'MGB', 'INVOIC'); UPDATE tbShipment SET DeliveryDate = NULL"),
     {"R Invalid: Vendor requires ABN..."}},
    {kCmlAdvice,
     "invoices without a company number, nor a map",
     [](PackedTrade& trade) {
       trade.Map("");
       trade.Sql(
           "UPDATE tbPartner SET ABN = NULL; INSERT INTO tbEDIDoc(EDIDocId, VendorId, PartnerId, DocumentCode) "
           "VALUES(7, 'ACME', 'MGB', '810')");
     },
     {"R Invalid: Vendor requires ABN..."}},
};

TEST(CsvNoticeTest, TurnsARowAwayWithItsReason) {
  for (const Rejection& each : kRejections) {
    for (const std::string& className : Words(each.classes)) {
      SCOPED_TRACE(className + ": " + each.what);
      PackedTrade trade(className);
      trade.Map("CONTAINERNO");
      trade.AddPack();
      each.change(trade);
      const std::string stamps = trade.Stamps();
      const auto outcome = trade.Run("out/asn*.csv").front();
      Texts told = each.told;
      const std::size_t at = told.front().find("FOLDER");
      if (at != std::string::npos) told.front().replace(at, 6, trade.folder / "");
      EXPECT_EQ(outcome.result, 0);
      EXPECT_EQ(outcome.told, told);
      EXPECT_EQ(trade.NewLog(), told);
      EXPECT_EQ(trade.Stamps(), stamps);
      EXPECT_EQ(trade.Files(), "");
      EXPECT_THAT(trade.reports, IsEmpty());
    }
  }
}

// A hair's breadth from the above.
const Rejection kAccepted[] = {
    {kKmartNotice, "as many packs as may be", ShipmentOf(9999), {}},
    {kOfficeworksNotice, "any number of packs", ShipmentOf(10000), {}},
    {kMgbbtNotice, "as many sub packs as may be", SubPacks(20), {}},
    {kMgb, "any number of sub packs", SubPacks(21), {}},
    {kCmlAdvice,
     "delivery on the last day, late",
     Do("UPDATE tbShipment SET DeliveryDate = '2006-03-24T18:00:00'"),
     {}},
    {kBulkAdvice, "delivery late", Do("UPDATE tbShipment SET DeliveryDate = '2006-03-25'"), {}},
    {kBulkAdvice,
     "no dates",
     Do("UPDATE tbShipment SET DeliveryDate = NULL; UPDATE tbOrder SET CancelAfter = NULL"),
     {}},
    {kCmlAdvice,
     "a company number, for invoices",
     Do("INSERT INTO tbEDIDoc(EDIDocId, VendorId, PartnerId, DocumentCode) VALUES(7, 'ACME', 'MGB', 'EI')"),
     {}},
    {kCmlAdvice,
     "no company number, invoices of others",
     Do("UPDATE tbPartner SET ABN = ''; INSERT INTO tbEDIDoc(EDIDocId, VendorId, PartnerId, DocumentCode) VALUES"
        "(7, 'ACME', 'TOYS', 'INVOIC'), (8, 'BETA', 'MGB', 'EI'), (9, 'ACME', 'MGB', '856')"),
     {}},
    {kBulkAdvice,
     "no company number, for invoices",
     Do("UPDATE tbPartner SET ABN = ''; INSERT INTO tbEDIDoc(EDIDocId, VendorId, PartnerId, DocumentCode) VALUES"
        "(7, 'ACME', 'MGB', 'INVOIC')"),
     {}},
};

TEST(CsvNoticeTest, CompilesWhatIsJustGoodEnough) {
  for (const Rejection& each : kAccepted) {
    SCOPED_TRACE(std::string(each.classes) + ": " + each.what);
    PackedTrade trade(each.classes);
    trade.Map("CONTAINERNO");
    trade.AddPack();
    each.change(trade);
    EXPECT_EQ(trade.Run().front().result, 1);
    EXPECT_THAT(trade.Output(), ElementsAre("SSCC1,"));
  }
}

// A late check costs no number.
TEST(CsvNoticeTest, NumbersOnlyWhatMayBeDelivered) {
  PackedTrade trade(kCmlAdvice);
  trade.Map("SHIPNOTENO");
  trade.AddPack();
  trade.Sql("UPDATE tbShipment SET DeliveryDate = NULL");
  const auto translator = trade.Loaded();
  EXPECT_EQ(trade.Process(*translator).result, 0);
  trade.Sql("UPDATE tbShipment SET DeliveryDate = '2006-03-20'");
  EXPECT_EQ(trade.Process(*translator).result, 1);
  EXPECT_THAT(trade.Output(), ElementsAre("1001,"));
}

TEST(CsvNoticeTest, ShowsNoMoreSubPacksThanALeadPackHas) {
  PackedTrade trade(kMgbbtNotice);
  trade.Map("CONTAINERNO SUBSSCC1 SUBSSCC2 SUBSSCC20");
  for (int lead = 1; lead <= 3; ++lead) trade.AddPack();
  for (const int lead : {1, 1, 3}) trade.AddPack([&](Pack& pack) { pack.LeadPackId = lead; }, {});
  EXPECT_THAT(trade.Compiled(), ElementsAre("SSCC1,SSCC4,SSCC5,,", "SSCC2,,,,", "SSCC3,SSCC6,,,"));
  EXPECT_EQ(trade.Stamps(), "1/8 1/8 1/8 0/4 0/4 0/4");
}

}  // namespace
}  // namespace partnerkit::testing

// What becomes of waiting packs: the rows they are listed in, the lines they give, and all that turns a row away.
#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

const char* const kRunning = "clsMGB856csv clsMYERDropShipDAcsv clsTarget856csv clsKMart856csv clsOfficeworks856csv";
const char* const kOrderly = "clsMGB856csv clsMYERDropShipDAcsv clsTarget856csv clsMGBBT856csv";
const char* const kByShipTo = "clsKMart856csv clsOfficeworks856csv clsCMLFLFDAcsv clsTargetBulkDAcsv";

// Another order, and a pack of each.
void PackTwoOrders(PackedTrade& trade) {
  trade.AddOrder();
  trade.AddPack();
  trade.AddPack([](Pack& pack) { pack.OrderId = 2; });
}

TEST(CsvNoticeTest, HandsOutTheColumnsOfTheCompileScreen) {
  PackedTrade trade(kMgb);
  ColumnTable columns;
  EXPECT_TRUE(trade.Create(kMgb)->Init(*trade.system, 1, columns));
  std::string all;
  for (const GridColumn& column : columns) {
    all += std::string(column.caption) + "|" + std::to_string(column.kind) + "|" + std::to_string(column.width) + "; ";
  }
  EXPECT_EQ(all, "ConNote No|0|1500; Partner|2|1000; Delivery Locn|0|2000; Order No|0|2600; Result|0|3000; ");
}

// Three orders on two shipments; the ids of two pairs read alike when set side by side.
void PackFiveOrders(PackedTrade& trade) {
  for (int n = 2; n <= 11; ++n) trade.AddOrder();
  for (int n = 2; n <= 11; ++n) trade.AddShipment([&](Shipment& load) { load.ConNoteNo = "CN" + std::to_string(n); });
  for (const auto& [shipment, order, shipTo] :
       {std::tuple(11, 1, "0900"), {1, 11, "0900"}, {1, 2, "0901"}, {1, 11, "0900"}, {1, 2, "0900"}}) {
    trade.AddPack([shipment = shipment, order = order, shipTo = shipTo](Pack& each) {
      each.ShipmentId = shipment, each.OrderId = order, each.ShipToCode = shipTo;
    });
  }
}

TEST(CsvNoticeTest, ListsARowForEachOrderOnAShipment) {
  for (const std::string& className : Words(kOrderly)) {
    SCOPED_TRACE(className);
    PackedTrade trade(className, "CONSIGNMENTNOTENO ORDERNO CONTAINERNO");
    PackFiveOrders(trade);
    EXPECT_THAT(trade.Compiled(), ElementsAre("CN5,450002,SSCC5,", "CN5,450002,SSCC3,", "CN5,4500011,SSCC2,",
                                              "CN5,4500011,SSCC4,", "CN11,450001,SSCC1,"));
    EXPECT_EQ(trade.rows, 3);
    EXPECT_THAT(NoticeRows(trade.table),
                ElementsAre("CN5|MGB Stores|MGB Altona|450002||", "CN5|MGB Stores|MGB Altona|4500011||",
                            "CN11|MGB Stores|MGB Altona|450001||", "-", "-"));
    EXPECT_EQ(trade.Stamps(), "3/8 2/8 1/8 2/8 1/8");
  }
}

TEST(CsvNoticeTest, ListsARowForEachShipToWhereThePartnerWantsOne) {
  for (const std::string& className : Words(kByShipTo)) {
    SCOPED_TRACE(className);
    PackedTrade trade(className, "CONTAINERNO");
    PackFiveOrders(trade);
    trade.Sql("UPDATE tbOrder SET PONo = '45 DEL# 6 #7' WHERE OrderId = 2");
    trade.Run();
    const std::string shown = className == kCmlAdvice || className == kBulkAdvice ? "45" : "45 DEL# 6 #7";
    EXPECT_THAT(NoticeRows(trade.table),
                ElementsAre("CN5|MGB Stores|MGB Altona|" + shown + "||", "CN5|MGB Stores||" + shown + "||",
                            "CN5|MGB Stores|MGB Altona|4500011||", "CN11|MGB Stores|MGB Altona|450001||", "-"));
    EXPECT_EQ(trade.Stamps(), "4/8 3/8 2/8 3/8 1/8");
    std::string shipTos;
    ASN asn;
    trade.system->Records().ForEach(ASN::kType, &asn, [&] { shipTos += asn.ShipToCode.value_or("null") + " "; });
    EXPECT_EQ(shipTos, "0900 0901 0900 0900 ");
  }
}

TEST(CsvNoticeTest, StoresTheNotice) {
  const std::string head =
      "Id=1 ASNNo=\"1001\" VendorId=\"ACME\" PartnerId=\"MGB\" ShipmentId=1 OrderId=1 OrderNo=\"450001\" "
      "PartnerName=\"MGB Stores\" PartnerLocnId=44 ";
  const std::string rest = "DeliveryLocn=\"MGB Altona\" ConNoteNo=\"CN5\" CompileDate=2006-03-08T10:15:00";
  const std::string byShipTo = head + "ShipToCode=\"0900\" " + rest;
  for (const auto& [className, stored] : {std::pair(kMgb, head + rest), {kKmartNotice, byShipTo}}) {
    PackedTrade trade(className, "CONTAINERNO");
    trade.AddPack();
    EXPECT_EQ(trade.Run().front().result, 1);
    ASN asn;
    asn.Id = 1;
    EXPECT_TRUE(Load(trade.system->Records(), asn));
    EXPECT_EQ(Shown(asn), stored);
  }
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
  PackedTrade trade(kMgb, "CONTAINERNO");
  trade.AddPack();
  const auto translator = trade.Loaded();
  trade.Sql("UPDATE tbPack SET Status = 8");
  EXPECT_EQ(translator->Load(trade.folder / "out/asn.csv", trade.table), 0);
  EXPECT_THAT(trade.Process(*translator).told, IsEmpty());
  EXPECT_EQ(trade.Files(), "");
}

// --- Packs that lead each other

struct Led {
  const char* what;
  std::vector<std::int32_t> leads;  // of the packs 1, 2, ...
  const char* change;
  Texts told;
};

const Led kLed[] = {
    {"sub packs of sub packs", {0, 1, 2}, "", {}},
    {"itself",
     {0, 2},
     "",
     {"W Load: Pack 2 (PackNo P2, SSCC SSCC2) leads itself, so that no notice ever holds it: set its LeadPackId to 0"}},
    {"each other, and one behind them",
     {4, 4, 1, 3},
     "",
     {"W Load: Packs 1 (PackNo P1, SSCC SSCC1), 4 (PackNo P4, SSCC SSCC4), 3 (PackNo P3, SSCC SSCC3) lead each other, "
      "so that no notice ever holds them: set the LeadPackId of the one that is to lead to 0"}},
    {"of several statuses",
     {2, 1},
     "UPDATE tbPack SET Status = Id * 7 - 7",
     {"W Load: Packs 1 (PackNo P1, SSCC SSCC1), 2 (PackNo P2, SSCC SSCC2) lead each other, so that no notice ever "
      "holds them: set the LeadPackId of the one that is to lead to 0"}},
    {"compiled", {1}, "UPDATE tbPack SET Status = 8", {}},
    {"of another company", {1}, "UPDATE tbPack SET VendorId = 'OTHER'", {}},
    {"for another partner", {1}, "UPDATE tbOrder SET PartnerId = 'TOYS'", {}},
    {"on no shipment", {1}, "UPDATE tbPack SET ShipmentId = 0", {}},
};

TEST(CsvNoticeTest, TellsOfPacksThatLeadEachOther) {
  for (const Led& led : kLed) {
    SCOPED_TRACE(led.what);
    PackedTrade trade(kMgb, "CONTAINERNO");
    for (std::size_t n = 0; n < led.leads.size(); ++n) {
      trade.AddPack([&](Pack& pack) { pack.LeadPackId = led.leads[n], pack.PackNo = "P" + std::to_string(n + 1); });
    }
    trade.Sql(led.change);
    trade.Loaded();
    Texts told = trade.NewLog();
    std::erase(told, "0 Load: No Packs found to process.");
    EXPECT_EQ(told, led.told);
  }
}

TEST(CsvNoticeTest, TellsOfTenCirclesOfPacksAndCountsTheRest) {
  PackedTrade trade(kMgb, "CONTAINERNO");
  for (int n = 1; n <= 12; ++n) trade.AddPack([&](Pack& pack) { pack.LeadPackId = n; });
  trade.Loaded();
  EXPECT_EQ(trade.NewLog().size(), 12U);
  EXPECT_EQ(trade.NewLog()[10], "W Load: So do packs in 2 more circles of leads");
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
    {"one product in two cartons, and one without lines",
     {{{"93001", 1}}, {}, {{"93001", 2}}},
     {"SSCC1,93001,1,", "SSCC3,93001,2,"},
     {"SSCC1,93001,1,", "SSCC3,93001,2,"}},
    {"nothing of a product",
     {{{"93001", 1}, {"93002", 0}, {"93001", 2}, {"93002", 0}}, {{"93001", 0}}},
     {"SSCC1,93001,1,", "SSCC1,93001,2,"},
     {"SSCC1,93001,1,", "SSCC1,93001,2,"}},
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
    for (const char* className : {kMgb, kTargetNotice, kMgbbtNotice}) {
      SCOPED_TRACE(std::string(className) + ": " + lines.what);
      PackedTrade trade(className, "CONTAINERNO APN QUANTITYSHIPPED");
      std::string stamps;
      for (const auto& pack : lines.packs) {
        trade.AddPack({}, pack);
        stamps += stamps.empty() ? "1/8" : " 1/8";
      }
      EXPECT_EQ(trade.Compiled(), className == std::string(kMgbbtNotice) ? lines.each : lines.summed);
      EXPECT_EQ(trade.Stamps(), stamps);
    }
  }
}

// The other columns of a sum are those of its last line.
TEST(CsvNoticeTest, ShowsTheLastLineOfASum) {
  PackedTrade trade(kMgb, "QUANTITYSHIPPED LINEREF");
  const std::int32_t pack = trade.AddPack();
  trade.Sql("INSERT INTO tbPSlipLine(PSlipId, LineRef) VALUES(1, 'SL33')");
  trade.AddLine(pack, "93001", 2, [](PackLine& line) { line.PSlipLineId = 2; });
  EXPECT_THAT(trade.Compiled(), ElementsAre("8,SL33,"));
}

// A product that nobody knows shows the number of the line before it, of whatever quantity and carton.
TEST(CsvNoticeTest, KeepsTheLastProductBeforeAnUnknownOne) {
  for (const char* className : {kMgb, kMgbbtNotice}) {
    SCOPED_TRACE(className);
    PackedTrade trade(className, "INHOUSEPRODNO APN");
    trade.AddPack({}, {{"93009", 1}, {"93001", 1}, {"93009", 1}, {"93002", 0}, {"93009", 2}});
    trade.AddPack({}, {{"93008", 1}});
    EXPECT_THAT(trade.Compiled(), ElementsAre(",93009,", "TRAIN,93001,", "TRAIN,93009,", "BEAR,93009,", "BEAR,93008,"));
  }
}

TEST(CsvNoticeTest, TakesRunsUpTo32767UnitsAndTargetsBeyond) {
  const auto expect = [](const std::string& className, double quantity, const Texts& lines) {
    SCOPED_TRACE(className + " " + std::to_string(quantity));
    PackedTrade trade(className, "QUANTITYSHIPPED");
    trade.AddPack({}, {{"93001", 1}, {"93001", quantity}});
    const auto outcome = trade.Run().front();
    EXPECT_EQ(trade.Output(), lines);
    EXPECT_EQ(outcome.result, lines.empty() ? 0 : 1);
    EXPECT_EQ(trade.Stamps(), lines.empty() ? "0/4" : "1/8");
    if (!lines.empty()) return;
    EXPECT_EQ(trade.Files(), "");
    EXPECT_EQ(outcome.told.size(), 1U);
    EXPECT_THAT(trade.reports, ElementsAre(HasSubstr("Overflow")));
  };
  for (const std::string& className : Words(kRunning)) {
    expect(className, 32766, {"32767,"});
    expect(className, 32767, className == kTargetNotice ? Texts{"32768,"} : Texts{});
  }
  expect(kTargetNotice, 2147483647, {});
}

// --- The output

TEST(CsvNoticeTest, PutsTheNumberIntoTheNameOfTheOutput) {
  PackedTrade trade(kMgb, "CONTAINERNO SHIPNOTENO");
  PackTwoOrders(trade);
  trade.folder.Write("out/asn1002-1002.csv", "EARLIER\r\n");
  trade.Run("out/asn*-*.csv");
  EXPECT_EQ(trade.Files(), "asn1001-1001.csv asn1002-1002.csv");
  EXPECT_THAT(trade.Output("out/asn1001-1001.csv"), ElementsAre("SSCC1,1001,"));
  EXPECT_THAT(trade.Output("out/asn1002-1002.csv"), ElementsAre("EARLIER", "SSCC2,1002,"));
}

TEST(CsvNoticeTest, KeepsANumberOutOfOtherFolders) {
  PackedTrade trade(kMgb, "SHIPNOTENO");
  trade.Sql("UPDATE tbPartner SET ASNNoFromInvoice = 1");
  trade.AddPack([](Pack& pack) { pack.InvoiceNo = "../IN\\V"; });
  trade.Run("out/*.csv");
  EXPECT_EQ(trade.Files(), ".._IN_V.csv");
  EXPECT_THAT(trade.Output("out/.._IN_V.csv"), ElementsAre("../IN\\V,"));
}

TEST(CsvNoticeTest, AddsEveryNoticeToOneFileEachWithTheHeaderOfTheTranslator) {
  const std::pair<std::string, Texts> cases[] = {
      {"Gentran", {"EARLIER", "HEADER,MGBSTORES", "SSCC1,", "HEADER,MGBSTORES", "SSCC2,"}},
      {"other", {"EARLIER", "SSCC1,", "SSCC2,"}},
  };
  for (const auto& [translator, lines] : cases) {
    PackedTrade trade(kMgb, "CONTAINERNO");
    trade.Sql("UPDATE tbPartner SET Translator = '" + translator + "'");
    PackTwoOrders(trade);
    trade.folder.Write("out/asn.csv", "EARLIER\r\n");
    EXPECT_EQ(trade.Compiled(), lines);
    EXPECT_EQ(trade.Files(), "asn.csv");
  }
}

TEST(CsvNoticeTest, ReadsTheMapOnceWithItsBlanksCutAndItsLastLineWithoutAnEnd) {
  PackedTrade trade(kMgb);
  PackTwoOrders(trade);
  trade.folder.Write("asn.map", " CONTAINERNO \r\n\r\nAPN");
  const auto translator = trade.Loaded();
  trade.Process(*translator, 0);
  trade.folder.Write("asn.map", "");
  trade.Process(*translator, 1);
  EXPECT_THAT(trade.Output(), ElementsAre("SSCC1,,93001,", "SSCC2,,93001,"));
}

// --- Numbers by invoice

TEST(CsvNoticeTest, TakesTheNumberFromTheFirstPacksInvoice) {
  PackedTrade trade(kMgb, "SHIPNOTENO CONTAINERNO");
  trade.Sql("UPDATE tbPartner SET ASNNoFromInvoice = 1");
  trade.AddOrder();
  trade.AddPack([](Pack& pack) { pack.InvoiceNo = "88"; });
  trade.AddPack([](Pack& pack) { pack.InvoiceNo = "99"; });
  trade.AddPack([](Pack& pack) { pack.OrderId = 2, pack.InvoiceNo.reset(); });
  // The counter's next number stands for a notice already, which only numbers from invoices are tested for.
  trade.Sql("INSERT INTO tbASN(PartnerId, ASNNo) VALUES('MGB', '1001'), ('TOYS', '88')");
  EXPECT_THAT(trade.Compiled(), ElementsAre("88,SSCC1,", "88,SSCC2,", "1001,SSCC3,"));
}

// --- What turns a row away. The packs then stay as they are, and so do the files.

struct Rejection {
  const char* className;
  std::string told;  // none where it is just good enough; "FOLDER" is that of the test
  std::function<void(PackedTrade&)> change;
};

std::function<void(PackedTrade&)> Do(const std::string& sql) {
  return [sql](PackedTrade& trade) { trade.Sql(sql); };
}
// So many packs on the shipment of the one that waits.
std::function<void(PackedTrade&)> ShipmentOf(int packs) {
  return Do("WITH RECURSIVE n(i) AS (SELECT 2 UNION ALL SELECT i + 1 FROM n WHERE i < " + std::to_string(packs) +
            ") INSERT INTO tbPack(ShipmentId, OrderId, Status) SELECT 1, 1, 8 FROM n");
}
std::function<void(PackedTrade&)> SubPacks(int count) {
  return [count](PackedTrade& trade) {
    for (int n = 0; n < count; ++n) trade.AddPack([](Pack& pack) { pack.LeadPackId = 1; }, {});
  };
}
std::function<void(PackedTrade&)> Delivery(const std::string& date) {
  return Do("UPDATE tbShipment SET DeliveryDate = " + date);
}
void NoInventory(PackedTrade& trade) { trade.UseInventory("no/stock"); }
// A partner with that company number, and documents of that supplier, partner and code.
std::function<void(PackedTrade&)> Invoices(const std::string& number, const std::string& documents) {
  return Do("UPDATE tbPartner SET ABN = " + number +
            "; INSERT INTO tbEDIDoc(EDIDocId, VendorId, PartnerId, DocumentCode) VALUES" + documents);
}

const Rejection kRejections[] = {
    {kMgb, "53 OpenMapFile: ASN map file FOLDERasn.map does not exist.",
     [](PackedTrade& trade) { std::filesystem::remove(trade.folder / "asn.map"); }},
    {kMgb, "0 OpenMapFile: ASN map file FOLDERasn.map is empty.", [](PackedTrade& trade) { trade.Map(""); }},
    {kMgb, "76 Open Inventory File: Cannot open inventory file FOLDERno/stock", NoInventory},
    {kTargetNotice, "76 Open Inventory File: Cannot inventory open file FOLDERno/stock", NoInventory},
    {kMgb, "R New ASN : ASN number already exists INV77",
     Do("UPDATE tbPartner SET ASNNoFromInvoice = 1; INSERT INTO tbASN(PartnerId, ASNNo) VALUES('MGB', 'INV77')")},
    {kMgb, "76 Open ASN File: Cannot open file FOLDERout/asn.csv",
     [](PackedTrade& trade) { std::filesystem::remove(trade.folder / "out"); }},
    {kKmartNotice, "R New ASN : ASN pack count exceeds 9999...", ShipmentOf(10000)},
    {kKmartNotice, "", ShipmentOf(9999)},
    {kOfficeworksNotice, "", ShipmentOf(10000)},
    {kMgbbtNotice, "R New ASN : Only 20 Sub Packs allowed per lead pack", SubPacks(21)},
    {kMgbbtNotice, "", SubPacks(20)},
    {kMgb, "", SubPacks(21)},
    {kCmlAdvice, "R DA Error : Scheduled date Null", Delivery("NULL")},
    {kCmlAdvice, "R DA Error : Scheduled date Null", Do("UPDATE tbOrder SET CancelAfter = NULL")},
    {kCmlAdvice,
     "R DA Warning : Shipment scheduled delivery date 25/03/2006 greater then order Required date 24/03/2006",
     Delivery("'2006-03-25'")},
    {kCmlAdvice, "", Delivery("'2006-03-24T18:00:00'")},
    {kBulkAdvice, "", Delivery("'2006-03-25'")},
    {kBulkAdvice, "", Delivery("NULL")},
    {kCmlAdvice, "R Invalid: Vendor requires ABN...", Invoices("' '", "(7, 'ACME', 'MGB', 'INVOIC')")},
    {kCmlAdvice, "R Invalid: Vendor requires ABN...",
     Invoices("' '", "(7, 'ACME', 'MGB', 'INVOIC'); UPDATE tbShipment SET DeliveryDate = NULL")},
    {kCmlAdvice, "R Invalid: Vendor requires ABN...", Invoices("NULL", "(7, 'ACME', 'MGB', '810')")},
    {kCmlAdvice, "R Invalid: Vendor requires ABN...", Invoices("''", "(7, 'ACME', 'MGB', 'EI')")},
    {kCmlAdvice, "", Invoices("'11 222'", "(7, 'ACME', 'MGB', 'EI')")},
    {kCmlAdvice, "",
     Invoices("''", "(7, 'ACME', 'TOYS', 'INVOIC'), (8, 'BETA', 'MGB', 'EI'), (9, 'ACME', 'MGB', '856')")},
    {kBulkAdvice, "", Invoices("''", "(7, 'ACME', 'MGB', 'INVOIC')")},
};

TEST(CsvNoticeTest, TurnsARowAwayWithItsReasonAndCompilesWhatIsJustGoodEnough) {
  for (std::size_t n = 0; n < std::size(kRejections); ++n) {
    const Rejection& each = kRejections[n];
    SCOPED_TRACE(std::string(each.className) + " " + std::to_string(n) + ": " + each.told);
    PackedTrade trade(each.className, "CONTAINERNO");
    trade.AddPack();
    each.change(trade);
    const std::string stamps = trade.Stamps();
    const auto outcome = trade.Run().front();
    if (each.told.empty()) {
      EXPECT_EQ(outcome.result, 1);
      EXPECT_THAT(trade.Output(), ElementsAre("SSCC1,"));
      continue;
    }
    std::string told = each.told;
    if (const std::size_t at = told.find("FOLDER"); at != std::string::npos) told.replace(at, 6, trade.folder / "");
    EXPECT_EQ(outcome.result, 0);
    EXPECT_EQ(outcome.told, Texts{told});
    EXPECT_EQ(trade.NewLog(), Texts{told});
    EXPECT_EQ(trade.Stamps(), stamps);
    EXPECT_EQ(trade.Files(), "");
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

// A late check costs no number.
TEST(CsvNoticeTest, NumbersOnlyWhatMayBeDelivered) {
  PackedTrade trade(kCmlAdvice, "SHIPNOTENO");
  trade.AddPack();
  trade.Sql("UPDATE tbShipment SET DeliveryDate = NULL");
  const auto translator = trade.Loaded();
  EXPECT_EQ(trade.Process(*translator).result, 0);
  trade.Sql("UPDATE tbShipment SET DeliveryDate = '2006-03-20'");
  EXPECT_EQ(trade.Process(*translator).result, 1);
  EXPECT_THAT(trade.Output(), ElementsAre("1001,"));
}

TEST(CsvNoticeTest, ShowsNoMoreSubPacksThanALeadPackHas) {
  PackedTrade trade(kMgbbtNotice, "CONTAINERNO SUBSSCC1 SUBSSCC2 SUBSSCC20");
  for (int lead = 1; lead <= 3; ++lead) trade.AddPack();
  for (const int lead : {1, 1, 3}) trade.AddPack([&](Pack& pack) { pack.LeadPackId = lead; }, {});
  EXPECT_THAT(trade.Compiled(), ElementsAre("SSCC1,SSCC4,SSCC5,,", "SSCC2,,,,", "SSCC3,SSCC6,,,"));
  EXPECT_EQ(trade.Stamps(), "1/8 1/8 1/8 0/4 0/4 0/4");
}

}  // namespace
}  // namespace partnerkit::testing

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "orders/csv/csv_classes.h"
#include "support/csv_siblings.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

using Texts = std::vector<std::string>;

// What makes a line of a GTIN order count.
const std::string kTraded = "POTYPECODE=220; TRADEDQUANTITY=48; ";

TEST(CsvSiblingsSettlingTest, TellsTransactionsApart) {
  const Texts sequences = {"", "SEQUENTIALLINENO=8"};                         // one product twice at one place
  const Texts atShipTo = {"BUYINGLOCPARTNERNO=", "BUYINGLOCPARTNERNO=0900"};  // the second time by name
  const Texts groups = {"", "GRPCONTROLNO=203; SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002"};
  const struct {
    std::string className;
    std::int32_t sequences, atShipTo, groups;  // rows that they make
  } cases[] = {
      // clang-format off
      {kMyer,        1, 1, 2},
      {kGhpl,        2, 1, 2},
      {kTarget,      1, 2, 2},
      {kMgbbt,       1, 1, 2},
      {kKmart,       1, 1, 2},
      {kOfficeworks, 1, 1, 2},
      {kCml,         1, 1, 2},
      {kBulk,        1, 1, 2},
      {kColes,       1, 2, 1},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className);
    Siblings trade(c.className);
    trade.Loaded(trade.Lines(sequences), c.sequences)->Cancel();
    trade.Loaded(trade.Lines(atShipTo), c.atShipTo)->Cancel();
    trade.Loaded(trade.Lines(groups), c.groups)->Cancel();
    trade.WriteOrders(trade.Line("POTYPECODE=RL; POVERSIONNO=2"));
    RowTable table;
    const auto importer = trade.Start();
    ASSERT_EQ(importer->Load(trade.OrdersPath(), table), 1);
    EXPECT_EQ(table.At(0, 0), Cell(std::string(c.className == kKmart ? "450001 REL# 2"
                                               : c.className == kCml ? "450001 #0900"
                                                                     : "450001")));
    EXPECT_EQ(table.At(0, 2), Cell(std::string(c.className == kColes ? "1001//33" : "1001/202/33")));
  }
}

TEST(CsvSiblingsSettlingTest, TakesTheShipToForAnEmptyBuyingLocation) {
  for (const std::string className : {kTarget, kColes}) {
    Siblings trade(className);
    EXPECT_THAT(trade.Import(trade.Line("BUYINGLOCPARTNERNO=")).log,
                ElementsAre("0 Process: PO 450001 import completed."));
    EXPECT_EQ(trade.StoredRecords().at(2),
              R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0900" ShipToLocn="0900" CustomerRef="REF8" )"
              R"(CustomerNo="CUST9")");
  }
}

TEST(CsvSiblingsSettlingTest, StoresEmptyControlNumbersAsNullWhereResponsesGoBack) {
  const std::string empty = "INTCONTROLNO=; GRPCONTROLNO=; ";
  for (const std::string className : {kCml, kBulk, kColes, kGhpl}) {
    SCOPED_TRACE(className);
    Siblings trade(className);
    trade.Import(trade.Line(empty + kTraded + "PONUMBER=450001000"));
    const auto stored = trade.StoredOrderRecords();
    ASSERT_THAT(stored, SizeIs(1));
    EXPECT_EQ(stored[0]->InterchangeCtl, className == kGhpl ? Text("") : Text());
    EXPECT_EQ(stored[0]->GroupCtl, className == kGhpl ? Text("") : Text());
    EXPECT_EQ(stored[0]->TransactionCtl, "33");
  }
}

// A line of the order file: "!" in front of a text that stands as it is, else what is changed.
Texts Written(const CsvTrade& trade, const Texts& lines) {
  Texts written;
  for (const std::string& line : lines) {
    written.push_back(line.starts_with('!') ? line.substr(1) + "\r\n" : trade.Line(line));
  }
  return written;
}

// Those lines, by number.
std::string Joined(const Texts& lines, std::string_view numbers) {
  std::string all;
  for (const char number : numbers) all += lines.at(static_cast<std::size_t>(number - '0'));
  return all;
}

TEST(CsvSiblingsSettlingTest, SettlesTheFileByItsOwnKey) {
  const std::string second = "SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002", noStore = "; BUYINGLOCPARTNERNO=0888";
  const std::string release = "POTYPECODE=RL; POVERSIONNO=2", tooLong = "PONUMBER=450001000; ";
  const struct {
    std::string what, className;
    Texts lines;
    Texts stored;
    std::string left, backedUp;
  } cases[] = {
      // clang-format off
      // The first fails, and the second is posted under its number.
      {"another transaction for the number", kMgbbt, {"BIN=1" + noStore, "TRNCONTROLNO=34", "TRNCONTROLNO=34; " +
       second},
       {"450001/0"}, "0", "12"},
      {"another transaction for the number", kMyer, {"BIN=1" + noStore, "TRNCONTROLNO=34"}, {"450001/0"}, "", "01"},
      {"a release and its blanket order", kKmart, {release, "TRNCONTROLNO=34; POTYPECODE=SA" + noStore},
       {"450001 REL# 2/0"}, "1", "0"},
      {"another release", kKmart, {release, "TRNCONTROLNO=34; POTYPECODE=RL; POVERSIONNO=3" + noStore},
       {"450001 REL# 2/0"}, "1", "0"},
      {"blank lines", kKmart, {"!", "", "!   ", second, "! ", "TRNCONTROLNO=34; PONUMBER=450002" + noStore, "!"},
       {"450001/0"}, "5", "13"},
      {"blank lines with nothing done", kKmart, {"!", noStore.substr(2), "!  "}, {}, "1", ""},
      {"blank lines elsewhere", kOfficeworks, {"!", "", "!  ", second, "!"}, {"450001/0"}, "024", "13"},
      {"a short number by ship-to", kCml, {kTraded, kTraded + "TRNCONTROLNO=34; SHIPTOLOCPARTNERNO=0999"},
       {"450001 #0900/0"}, "1", "0"},
      {"a short number of 8", kCml, {kTraded + "PONUMBER=45000100"}, {"45000100 #0900/0"}, "", "0"},
      {"a long number alone", kCml,
       {kTraded + tooLong, kTraded + tooLong + "TRNCONTROLNO=34; SHIPTOLOCPARTNERNO=0999"}, {"450001000/0"}, "", "01"},
      // A line to another company ends the order there, and stays.
      {"another company's line", kCml,
       {kTraded, kTraded + "COMPANYEDIADDR=OTHERS; " + second, kTraded + "PARTNEREDIADDR=OTHERS; TRNCONTROLNO=34"},
       {"450001 #0900/0"}, "12", "0"},
      {"another company's line", kBulk,
       {kTraded, kTraded + "COMPANYEDIADDR=OTHERS; " + second, kTraded + "PARTNEREDIADDR=OTHERS; TRNCONTROLNO=34"},
       {"450001/0"}, "12", "0"},
      {"another company's line", kColes, {"", "COMPANYEDIADDR=OTHERS; " + second}, {"450001/0"}, "", "01"},
      {"groups don't count", kColes, {"", "GRPCONTROLNO=203; " + second}, {"450001/0"}, "", "01"},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + ": " + c.what);
    Siblings trade(c.className);
    trade.UseBackup();
    const Texts lines = Written(trade, c.lines);
    trade.Import(Joined(lines, std::string_view("0123456789").substr(0, lines.size())));
    EXPECT_EQ(trade.StoredOrders(), c.stored);
    EXPECT_EQ(trade.Orders(), Joined(lines, c.left));
    EXPECT_EQ(trade.Backup(), Joined(lines, c.backedUp));
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvSiblingsSettlingTest, EndsACompanysOrderAtAnothersLine) {
  const std::string second = "SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002; COMPANYEDIADDR=OTHERS";
  for (const auto& [className, records] : {std::pair(std::string(kCml), 4U), std::pair(std::string(kBulk), 4U),
                                           std::pair(std::string(kColes), 6U), std::pair(std::string(kGhpl), 6U)}) {
    Siblings trade(className);
    trade.Import(trade.Line(kTraded) + trade.Line(kTraded + second));
    EXPECT_THAT(trade.StoredRecords(), SizeIs(records)) << className;
  }
}

TEST(CsvSiblingsSettlingTest, DeleteKeepsEnvelopeSegments) {
  const Texts segments = {"!ISA*00", "!GS*PO",    "!ST*850", "!IEA*1", "!GE*1",
                          "!SE*9",   "!UNB+UNOA", "!UNH+1",  "!UNT+9", "!UNZ+1"};
  const Texts others = {"!GSX", "!ST", "!isa*", "!UNA:+", "!BEG*00"};
  for (const std::string className : kAllClasses) {
    SCOPED_TRACE(className);
    Siblings trade(className);
    const std::string kept = Joined(Written(trade, segments), "0123456789");
    const std::string gone = Joined(Written(trade, others), "01234");
    const std::string front = "ISA*11\r\nBEG*11\r\n", last = trade.Line("TRNCONTROLNO=34; PONUMBER=450002");
    const auto importer = trade.Loaded(front + trade.Line() + kept + gone + last, 2);
    ErrorList list;
    EXPECT_TRUE(importer->Delete(0, list));
    EXPECT_EQ(trade.Orders(), front + (className == kMyer ? "" : kept) + last);
    EXPECT_THAT(trade.NewLog(), ElementsAre("0 Delete: Transaction deleted from file."));
  }
}

TEST(CsvSiblingsSettlingTest, DeletesAnEmptyFileOnItsDirective) {
  const std::string exact = "#%DELETEONEMPTY";
  for (const std::string& options : {exact, "#%X " + exact + ";", std::string("#%deleteonempty")}) {
    for (const std::string className : kAllClasses) {
      for (const bool byDelete : {false, true}) {
        SCOPED_TRACE(className + " " + options);
        Siblings trade(className);
        trade.document.Options = options;
        const auto importer = trade.Loaded(trade.Line(kTraded));
        ErrorList list;
        EXPECT_TRUE(byDelete ? importer->Delete(0, list) : importer->Process(0, list) > 0 && importer->Term());
        EXPECT_EQ(trade.Orders(), "");
        const bool deletes = options == exact || (className == kColes && options.size() > exact.size());
        EXPECT_EQ(trade.folder.Has(CsvTrade::kFile), !deletes);
      }
    }
  }
}

TEST(CsvSiblingsSettlingTest, OnlyMgbbtProtectsCommasInQuotes) {
  const struct {
    std::string line;
    Texts mgbbt, ghpl;
  } cases[] = {
      {R"("a,b",c,d)", {"a,b", "c", "d"}, {"\"a", "b\"", "c"}},
      {R"(a,"b,c,d",e)", {"a", "b,c,d", "e"}, {"a", "\"b", "c"}},
  };
  const CsvTrade trade(kMgbbt);
  const orders::clsMGBBT850csv mgbbt(trade.ports);
  const orders::clsGHPL850csv ghpl(trade.ports);
  for (const auto& c : cases) {
    Texts fields(3);
    mgbbt.SetFields(c.line, fields);
    EXPECT_EQ(fields, c.mgbbt) << c.line;
    fields.assign(3, "");
    ghpl.SetFields(c.line, fields);
    EXPECT_EQ(fields, c.ghpl) << c.line;
  }
  CsvTrade order(kMgbbt);
  order.Import(order.Line("CUSTCAT=\"GIFTS, TOYS\"; BIN=\"B,1\"; CUSTOMERREF=\"R,E,F\""));
  const auto stored = order.StoredOrderRecords();
  ASSERT_THAT(stored, SizeIs(1));
  EXPECT_EQ(stored[0]->CustCat, "GIFTS, TOYS");
  EXPECT_EQ(stored[0]->CustomerRef, "R,E,F");
}

}  // namespace
}  // namespace partnerkit::testing

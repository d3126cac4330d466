#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <iterator>

#include "orders/csv/csv_order_importer.h"
#include "support/csv_orders.h"
#include "support/other_program.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::string_literals;

TEST(CsvListingTest, ListsARowForEachOfItsTransactions) {
  CsvTrade lines(kMgb);
  const auto line = [&](std::string_view changed) { return lines.Line(changed); };
  const std::string one = line(""), second = line("SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002");
  const std::string other = line("TRNCONTROLNO=34; PONUMBER=450002");
  const std::string foreign = line("TRNCONTROLNO=35; PARTNEREDIADDR=OTHERS; PONUMBER=9");
  const std::string stranger = line("TRNCONTROLNO=36; COMPANYEDIADDR=acmetoys; PONUMBER=9");
  const std::string row = "450001 2006-03-01 1001/202/33", otherRow = "450002 2006-03-01 1001/202/34";
  std::string lone = one + other;
  std::erase(lone, '\n');
  const struct {
    std::string what, orders;
    Texts rows;
  } cases[] = {
      // clang-format off
      {"lines of one order", one + second, {row}},
      {"equal control numbers, first line again", one + second + one + second, {row, row}},
      {"an order number alone starts nothing", one + line("PONUMBER=450009"), {row}},
      {"others' orders", foreign + foreign + one + stranger + second + foreign, {row}},
      {"control numbers count as joined", one + line("INTCONTROLNO=100; GRPCONTROLNO=1202; BIN=2"),
       {row, "450001 2006-03-01 100/1202/33"}},
      {"blank lines", "\r\n" + one + "\r\n\r\n" + other, {row, otherRow}},
      {"blanks round fields", line("PONUMBER=  450001 ; PARTNEREDIADDR= MGBSTORES "), {row}},
      {"a missing quote", line("PONUMBER=\"450001"), {"\"450001 2006-03-01 1001/202/33"}},
      {"a date in parts", line("PODATE=06/3/1"), {row}},
      {"no such day", line("PODATE=20040231"), {"450001 empty 1001/202/33"}},
      {"lone CRs, the last line without end", lone.substr(0, lone.size() - 1), {row, otherRow}},
      {"a NUL byte", line("PONUMBER=45\0001"s), {"45\0001 2006-03-01 1001/202/33"s}},
      {"columns without end", one.substr(0, one.size() - 2) + std::string(100'000, ','), {row}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(kMgb);
    EXPECT_EQ(trade.Listed(c.orders), c.rows);
    EXPECT_EQ(trade.Orders(), c.orders);
    EXPECT_THAT(trade.NewLog(), IsEmpty());
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvListingTest, TellsWhyNothingWasListed) {
  const struct {
    std::string what;
    std::function<void(CsvTrade&)> arrange;
    std::string log;
    std::string held = {};  // by another program
  } cases[] = {
      // clang-format off
      {"no order file", [](CsvTrade& t) { std::filesystem::remove(t.OrdersPath()); },
       "53 SetOrderList: File {}in/orders.txt does not exist."},
      {"empty order file", [](CsvTrade& t) { t.WriteOrders(""); }, "0 SetOrderList: File {}in/orders.txt is empty."},
      {"no order of ours", [](CsvTrade& t) { t.document.PartnerEDIAddr = "MYER"; },
       "0 Load: No orders found to match EDI addresses."},
      {"no map", [](CsvTrade& t) { t.document.MapFile = "none.map"; },
       "53 OpenMapFile: PO map file {}none.map does not exist."},
      {"empty map", [](CsvTrade& t) { t.folder.Write("orders.map", ""); },
       "0 OpenMapFile: PO map file {}orders.map is empty."},
      {"a map in lower case", [](CsvTrade& t) { t.folder.Write("orders.map", "intcontrolno\n"); },
       "W OpenMapFile: Expected field INTCONTROLNO not found. \r\n Add this item to your orders.map file."},
      {"held order file", [](CsvTrade&) {}, "70 SetOrderList: Error opening file {}in/orders.txt", "in/orders.txt"},
      {"held map", [](CsvTrade&) {}, "70 OpenMapFile: Error opening file {}orders.map", "orders.map"},
      {"held backup", [](CsvTrade& t) { t.UseBackup(); t.folder.Write("backup.txt", ""); },
       "70 Init: PO import cannot proceed. Backupfile {}backup.txt could not be opened.", "backup.txt"},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(kMgb);
    trade.WriteOrders(trade.Line());
    c.arrange(trade);
    std::optional<OtherProgram> other;
    if (!c.held.empty()) other.emplace(trade.folder / c.held);
    const auto importer = trade.Start();
    EXPECT_EQ(trade.initialised, c.held != "backup.txt");
    RowTable table(7, 1);
    if (trade.initialised) {
      EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
    }
    EXPECT_EQ(table.Rows(), 7U);
    EXPECT_THAT(trade.NewLog(), ElementsAre(Replaced(c.log, "{}", trade.folder / "")));
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

// Lines of the map that name nothing expected, and names that come twice, are no fault.
TEST(CsvListingTest, ExpectsItsFieldsInTheMapAndNoOthers) {
  const std::string gtinAdded =
      "INTDATE RESPONSETYPECODE DELIVERYPARTY REQUIRED TRADEDQUANTITY DELDATE PROMODATE STATUS INNEREAN INNERQTY";
  const std::string gtinRemoved =
      "CUSTCAT DEPTNO ADDATE STOREZONE UNITMEASURECODE ORDERQUANTITY SKUPRODUCTKEYCODE RETAILUNITPRICE";
  const std::string packs = "POVERSIONNO CARTONSOUTER UNITSINNERPACK PACKUOM";
  const struct {
    std::string className, added, removed;  // beside the usual ones, and of them
  } cases[] = {
      // clang-format off
      {kMgb, "", ""},
      {kMyer, "", ""},
      {kGhpl, "", "SUPPLIERNO CUSTCAT STOREZONE"},
      {kTarget, "CONTRACTNO HEADER1 UNITSINNERPACK PACKUOM", "SUPPLIERNO CUSTCAT DEPTNO"},
      {kMgbbt, "", ""},
      {kKmart, packs, "CUSTCAT SKUPRODUCTKEYCODE RETAILUNITPRICE"},
      {kOfficeworks, packs, "CUSTCAT DEPTNO STOREZONE SKUPRODUCTKEYCODE RETAILUNITPRICE"},
      {kCml, gtinAdded, gtinRemoved},
      {kBulk, gtinAdded + " UNITSINNERPACK", gtinRemoved},
      {kColes, "INTDATE RESPONSETYPECODE EQUIPMENT DELIVERYPARTY REQUIRED HEADER1 HEADER2 HEADER3 HEADER4 HEADER5 "
       "DESTDOCK DELDOCK PALLETFOOTAGE UNITPRICEINCGST UNITPRICEEXGST GSTRATE CARTONSOUTER PACKUOM UNITSINNERPACK "
       "GSTAMOUNT STATUS INNEREAN INNERQTY DETAIL4 DETAIL5",
       "CUSTCAT DEPTNO ADDATE STOREZONE UNITPRICE RETAILUNITPRICE"},
      // clang-format on
  };
  const auto words = [](const std::string& text) {
    std::istringstream stream(text);
    return Texts{std::istream_iterator<std::string>(stream), std::istream_iterator<std::string>()};
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className);
    Siblings trade(c.className);
    trade.WriteOrders(trade.Line("PARTNEREDIADDR=OTHERS"));
    const auto importer = trade.Start();
    RowTable table;
    const auto told = [&](const Texts& fields) {
      trade.folder.Write("orders.map", MapText(fields) + "OTHER\r\nINTCONTROLNO\r\n");
      EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
      return trade.NewLog().back();
    };
    Texts expected(orders::kOrderFieldNames.begin(), orders::kOrderFieldNames.begin() + orders::kUsualOrderFields);
    for (const std::string& field : words(c.removed)) EXPECT_EQ(std::erase(expected, field), 1U) << field;
    std::ranges::copy(words(c.added), std::back_inserter(expected));
    for (std::size_t field = 1; field < expected.size(); ++field) {
      // All behind the missing one are missing, too.
      EXPECT_EQ(told(Texts(expected.begin(), expected.begin() + std::ssize(expected) - std::ptrdiff_t(field))),
                "W OpenMapFile: Expected field " + expected[expected.size() - field] +
                    " not found. \r\n Add this item to your orders.map file.");
    }
    EXPECT_EQ(told(expected), "0 Load: No orders found to match EDI addresses.");
  }
}

TEST(CsvListingTest, SignsItsLogRecords) {
  CsvTrade trade(kMgb);
  trade.system->SetSetting("UserId", "JO");
  const auto importer = trade.Start();
  EXPECT_EQ(importer->Log().LogId, 0);
  RowTable table;
  importer->Load(trade.folder / "none.txt", table);
  Log log = importer->Log();
  ASSERT_TRUE(Load(trade.system->Records(), log));
  EXPECT_EQ(Shown(log),
            "LogId=1 LogDate=2006-03-08T10:15:00 UserId=\"JO\" ComputerName=\"WAREHOUSE1\" "
            "Source=\"PartnerKit.clsMGB850csv\" Procedure=\"SetOrderList\" ErrorNumber=53 Message=\"File " +
                (trade.folder / "none.txt") + " does not exist.\"");
}

TEST(CsvListingTest, ListsNothingForADocumentThatIsNotThere) {
  CsvTrade trade(kMgb);
  const auto importer = trade.Create(kMgb);
  importer->PROCESSALL = true;
  ColumnTable columns;
  EXPECT_TRUE(importer->Init(*trade.system, 99, columns));
  EXPECT_FALSE(importer->PROCESSALL);
  RowTable table;
  EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
  EXPECT_THAT(trade.LogLines(), ElementsAre("53 OpenMapFile: PO map file  does not exist."));
}

TEST(CsvListingTest, AsksTheErrorTrailAboutAReadThatFails) {
  for (const Button answer : {Button::kRetry, Button::kAbort}) {
    CsvTrade trade(kMgb);
    FaultyFiles& files = trade.UseFaultyFiles();
    trade.answer = answer;
    trade.WriteOrders(trade.Line() + trade.Line("TRNCONTROLNO=34"));
    const auto importer = trade.Start();
    files.Fail("Read", "orders.txt", 57);
    RowTable table;
    EXPECT_EQ(importer->Load(trade.OrdersPath(), table), answer == Button::kRetry ? 2 : 0);
    EXPECT_THAT(trade.reports,
                ElementsAre("TLE error - program error #57 (It failed: orders.txt) occured in module cMGB850csv, "
                            "Function SetOrderList, line 0."));
    EXPECT_THAT(trade.NewLog(), IsEmpty());
  }
}

// A field that the line doesn't have stays, and so does one between two commas; a last field or a quoted one that is
// empty is a value. Only MGB's translator protects commas by quotes.
TEST(CsvListingTest, SplitsALineOverTheCallersFields) {
  const struct {
    std::string line;
    Texts fields, mgbbt;
  } cases[] = {
      {"a,,\"c\"", {"a", "2", "c"}, {"a", "2", "c"}},
      {"a", {"a", "2", "3"}, {"a", "2", "3"}},
      {"\"a,b\",c,d", {"\"a", "b\"", "c"}, {"a,b", "c", "d"}},
      {"a,b,", {"a", "b", ""}, {"a", "b", ""}},
      {"\"\",b,\"", {"", "b", ""}, {"", "b", ""}},
  };
  CsvTrade trade(kMgbbt);
  const auto split = [&](const char* className, const std::string& line, Texts fields) {
    const auto made = CreateTranslator("PartnerKit." + std::string(className), trade.ports);
    dynamic_cast<orders::CsvOrderImporter&>(*made).SetFields(line, fields);
    return fields;
  };
  for (const auto& c : cases) {
    EXPECT_EQ(split(kMgb, c.line, {"1", "2", "3"}), c.fields) << c.line;
    EXPECT_EQ(split(kMgbbt, c.line, {"1", "2", "3"}), c.mgbbt) << c.line;
  }
  trade.Import(trade.Line("CUSTCAT=\"GIFTS, TOYS\"; BIN=\"B,1\"; CUSTOMERREF=\"R,E,F\""));
  const auto stored = trade.StoredOrderRecords();
  ASSERT_EQ(stored.size(), 1U);
  EXPECT_EQ(stored[0]->CustCat, "GIFTS, TOYS");
  EXPECT_EQ(stored[0]->CustomerRef, "R,E,F");
}

}  // namespace
}  // namespace partnerkit::testing

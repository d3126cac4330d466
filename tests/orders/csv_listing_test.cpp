#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <iterator>

#include "orders/csv/csv_classes.h"
#include "support/csv_orders.h"
#include "support/faulty_files.h"
#include "support/other_program.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::string_literals;

constexpr const char* kMgb = "clsMGB850csv";

using Texts = std::vector<std::string>;

// A row each, its cells with a blank between: what `Load` lists of an order file.
Texts Listed(CsvTrade& trade, std::string_view orders) {
  trade.WriteOrders(orders);
  const auto importer = trade.Start();
  RowTable table;
  const std::int32_t rows = importer->Load(trade.OrdersPath(), table);
  EXPECT_EQ(static_cast<std::size_t>(rows), table.Rows());
  importer->Cancel();
  EXPECT_EQ(trade.Orders(), orders);
  return Rows(table);
}

TEST(CsvListingTest, ShowsTheGridOfTheOrderImporters) {
  CsvTrade trade(kMgb);
  const auto importer = trade.Create(kMgb);
  importer->PROCESSALL = true;
  ColumnTable table;
  EXPECT_TRUE(importer->Init(*trade.system, 1, table));
  Texts columns;
  for (const auto& [caption, kind, width] : table) {
    columns.push_back(std::string(caption) + ", " + std::to_string(kind) + ", " + std::to_string(width));
  }
  EXPECT_THAT(columns, ElementsAre("PO Number, 0, 2600", "Date, 2, 1300", "Trans Set, 0, 2000", "Result, 0, 3000"));
  EXPECT_FALSE(importer->PROCESSALL);
  EXPECT_EQ(importer->ProgId(), "PartnerKit.clsMGB850csv");
}

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
    std::string what, className, orders;
    Texts rows;
  } cases[] = {
      // clang-format off
      {"lines of one order", kMgb, one + second, {row}},
      {"two orders", kMgb, one + second + other, {row, otherRow}},
      {"equal control numbers, first line again", kMgb, one + second + one + second, {row, row}},
      {"an order number alone starts nothing", kMgb, one + line("PONUMBER=450009"), {row}},
      {"others' orders", kMgb, foreign + foreign + one + stranger + second + foreign, {row}},
      {"control numbers count as joined", kMgb, one + line("INTCONTROLNO=100; GRPCONTROLNO=1202; BIN=2"),
       {row, "450001 2006-03-01 100/1202/33"}},
      {"blank lines", kMgb, "\r\n" + one + "\r\n\r\n" + other, {row, otherRow}},
      {"blanks round fields", kMgb, line("PONUMBER=  450001 ; PARTNEREDIADDR= MGBSTORES "), {row}},
      {"quoted fields", kMgb, line("PONUMBER=\"450001\"; INTCONTROLNO=\"1001\""), {row}},
      {"a missing quote", kMgb, line("PONUMBER=\"450001"), {"\"450001 2006-03-01 1001/202/33"}},
      {"a date in parts", kMgb, line("PODATE=06/3/1"), {row}},
      {"a date of six", kMgb, line("PODATE=990301"), {"450001 1999-03-01 1001/202/33"}},
      {"no such day", kMgb, line("PODATE=20040231"), {"450001 empty 1001/202/33"}},
      {"no date", kMgb, line("PODATE=soon"), {"450001 empty 1001/202/33"}},
      {"lone CRs, the last line without end", kMgb, lone.substr(0, lone.size() - 1), {row, otherRow}},
      {"a NUL byte", kMgb, line("PONUMBER=45\0001"s), {"45\0001 2006-03-01 1001/202/33"s}},
      {"columns without end", kMgb, one.substr(0, one.size() - 2) + std::string(100'000, ','), {row}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(c.className);
    EXPECT_EQ(Listed(trade, c.orders), c.rows);
    EXPECT_THAT(trade.NewLog(), IsEmpty());
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvListingTest, TellsWhyNothingWasListed) {
  const std::string missing =
      "W OpenMapFile: Expected field INTCONTROLNO not found. \r\n Add this item to your orders.map file.";
  const std::string wide = "4\0005\0000\0000\0000\0001\000"s;
  const struct {
    std::string what, className;
    std::function<void(CsvTrade&)> arrange;
    std::string log;
  } cases[] = {
      // clang-format off
      {"no order file", kMgb, [](CsvTrade& t) { std::filesystem::remove(t.OrdersPath()); },
       "53 SetOrderList: File {}/in/orders.txt does not exist."},
      {"no folder", kMgb, [](CsvTrade& t) { std::filesystem::remove_all(t.folder / "in"); },
       "76 SetOrderList: File {}/in/orders.txt does not exist."},
      {"empty order file", kMgb, [](CsvTrade& t) { t.WriteOrders(""); },
       "0 SetOrderList: File {}/in/orders.txt is empty."},
      {"no order of ours", kMgb, [](CsvTrade& t) { t.document.PartnerEDIAddr = "MYER"; },
       "0 Load: No orders found to match EDI addresses."},
      {"UTF-16 order file", kMgb, [&](CsvTrade& t) { t.WriteOrders("\xFF\xFE" + wide + "\r\0\n\0"s); },
       "0 Load: No orders found to match EDI addresses."},
      {"no map", kMgb, [](CsvTrade& t) { t.document.MapFile = "none.map"; },
       "53 OpenMapFile: PO map file {}/none.map does not exist."},
      {"a map that is a folder", kMgb, [](CsvTrade& t) { t.document.MapFile = "in"; },
       "75 OpenMapFile: PO map file {}/in does not exist."},
      {"empty map", kMgb, [](CsvTrade& t) { t.folder.Write("orders.map", ""); },
       "0 OpenMapFile: PO map file {}/orders.map is empty."},
      {"UTF-16 map", kMgb, [&](CsvTrade& t) { t.folder.Write("orders.map", "\xFF\xFE" + wide); }, missing},
      {"a map in lower case", kMgb, [](CsvTrade& t) { t.folder.Write("orders.map", "intcontrolno\n"); }, missing},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(c.className);
    trade.WriteOrders(trade.Line());
    c.arrange(trade);
    const auto importer = trade.Start();
    RowTable table(7, 1);
    EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
    EXPECT_EQ(table.Rows(), 7U);
    std::string log = c.log;
    if (const auto at = log.find("{}"); at != std::string::npos) {
      log.replace(at, 3, trade.folder / "");
    }
    EXPECT_THAT(trade.NewLog(), ElementsAre(log));
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvListingTest, TellsWhichFileIsHeldByAnotherProgram) {
  CsvTrade trade(kMgb);
  trade.UseBackup();
  trade.WriteOrders(trade.Line());
  trade.folder.Write("backup.txt", "");
  const struct {
    std::string file;
    bool initialised;
    std::string log;
  } cases[] = {
      {"in/orders.txt", true, "70 SetOrderList: Error opening file "},
      {"orders.map", true, "70 OpenMapFile: Error opening file "},
      {"backup.txt", false, "70 Init: PO import cannot proceed. Backupfile "},
  };
  for (const auto& c : cases) {
    const OtherProgram other(trade.folder / c.file);
    const auto importer = trade.Start();
    EXPECT_EQ(trade.initialised, c.initialised);
    if (trade.initialised) {
      RowTable table;
      EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
    }
    EXPECT_THAT(trade.NewLog(),
                ElementsAre(c.log + (trade.folder / c.file) + (c.initialised ? "" : " could not be opened.")));
  }
  EXPECT_EQ(trade.Import().rows, 1);
}

// Lines of the map that name nothing expected, and names that come twice, are no fault.
TEST(CsvListingTest, ExpectsEachOfItsFieldsInTheMap) {
  const struct {
    std::string className, fields;
  } cases[] = {
      {kMgb,
       "INTCONTROLNO GRPCONTROLNO TRNCONTROLNO PARTNEREDIADDR COMPANYEDIADDR POPURPOSECODE POTYPECODE PONUMBER PODATE "
       "SUPPLIERNO CUSTCAT DEPTNO NOTBEFORE CANCAFTER ADDATE STOREZONE BUYINGLOCPARTNERNO SHIPTOLOCPARTNERNO "
       "SEQUENTIALLINENO PRODUCTQUALIFIER INCOMINGPRODUCTNO UNITMEASURECODE UNITPRICECODE UNITPRICE ORDERQUANTITY "
       "SKUPRODUCTKEYCODE RETAILUNITPRICE ALLOCATEQUANTITY CUSTOMERREF CUSTOMERNO STYLE COLOUR SIZE DESCRIPTION WEIGHT "
       "VOLUME BIN LINEREF"},
  };
  for (const auto& c : cases) {
    CsvTrade trade(c.className);
    const auto importer = trade.Start();
    trade.WriteOrders(trade.Line());
    // From the last to the first, so that each time all behind the missing one are missing, too.
    std::istringstream words(c.fields);
    const Texts expected{std::istream_iterator<std::string>(words), std::istream_iterator<std::string>()};
    Texts found = expected;
    RowTable table;
    while (!found.empty()) {
      const std::string missing = found.back();
      found.pop_back();
      trade.folder.Write("orders.map", MapText(found) + "OTHER\r\nINTCONTROLNO\r\n");
      if (missing == expected.front()) trade.folder.Write("orders.map", "OTHER");
      EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
      EXPECT_EQ(trade.NewLog().back(),
                "W OpenMapFile: Expected field " + missing + " not found. \r\n Add this item to your orders.map file.");
    }
    trade.folder.Write("orders.map", MapText(trade.columns) + "PONUMBER");
    EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 1);
    EXPECT_EQ(table.At(0, 0), Cell("450001"s));
    EXPECT_EQ(trade.NewLog().size(), expected.size());
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
  ColumnTable columns;
  EXPECT_TRUE(importer->Init(*trade.system, 99, columns));
  RowTable table;
  EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
  EXPECT_THAT(trade.LogLines(), ElementsAre("53 OpenMapFile: PO map file  does not exist."));
}

TEST(CsvListingTest, AsksTheErrorTrailAboutAReadThatFails) {
  const struct {
    Button answer;
    std::int32_t rows;
  } cases[] = {{Button::kRetry, 2}, {Button::kAbort, 0}};
  for (const auto& c : cases) {
    CsvTrade trade(kMgb);
    FaultyFiles files(*trade.ports.files);
    trade.ports.files = &files;
    trade.answer = c.answer;
    trade.WriteOrders(trade.Line() + trade.Line("TRNCONTROLNO=34"));
    const auto importer = trade.Start();
    files.Fail("Read", "orders.txt", 57);
    RowTable table;
    EXPECT_EQ(importer->Load(trade.OrdersPath(), table), c.rows);
    EXPECT_THAT(trade.reports,
                ElementsAre("TLE error - program error #57 (It failed: orders.txt) occured in module cMGB850csv, "
                            "Function SetOrderList, line 0."));
    EXPECT_THAT(trade.NewLog(), IsEmpty());
  }
}

// A field that the line doesn't have stays, and so does one between two commas; a last field or a quoted one that is
// empty is a value.
TEST(CsvListingTest, SplitsALineOverTheCallersFields) {
  const struct {
    std::string line;
    Texts fields;
  } cases[] = {
      {"a,,\"c\"", {"a", "2", "c"}}, {"a", {"a", "2", "3"}},       {"\"a,b\",c,d", {"\"a", "b\"", "c"}},
      {"a,b,", {"a", "b", ""}},      {"\"\",b,\"", {"", "b", ""}},
  };
  CsvTrade trade(kMgb);
  const orders::clsMGB850csv importer(trade.ports);
  for (const auto& c : cases) {
    Texts fields = {"1", "2", "3"};
    importer.SetFields(c.line, fields);
    EXPECT_EQ(fields, c.fields) << c.line;
  }
}

}  // namespace
}  // namespace partnerkit::testing

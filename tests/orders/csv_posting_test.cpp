#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"
#include "support/faulty_files.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

using Texts = std::vector<std::string>;

constexpr const char* kMgb = "clsMGB850csv";
const std::string kCompleted = "0 Process: PO 450001 import completed.";
const std::string kIncomplete = "0 Process: PO 450001 import incomplete.";

// A refused check of order 450001.
std::string Refused(std::string_view why) { return "R Process: ...Cannot process PO 450001, " + std::string(why); }

TEST(CsvPostingTest, StoresEveryMemberOfAnOrder) {
  const struct {
    std::string what, className;
    Texts lines;
    Texts records;
  } cases[] = {
      // clang-format off
      {"one line", kMgb, {""},
       {R"(OrderId=1 VendorId="ACME" PartnerId="MGB" PONo="450001" PurposeCode="00" TypeCode="SA" PODate=2006-03-01 )"
        R"(ImportDate=2006-03-08 NotBefore=2006-03-10 CancelAfter=2006-03-24 DeptNo="042" Header1="0401" )"
        R"(SupplierNo="77001" CustomerRef="REF8" CustCat="GIFTS" InterchangeCtl="1001" GroupCtl="202" )"
        R"(TransactionCtl="33" FilePos=4)",
        R"(LineId=1 OrderId=1 LineNo="7" ProductNo="93001" SKU="555001" Quantity=24 UOM="CT" PriceCode="LE" )"
        R"(Cost=12.5 RetailPrice=29.95)",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900" CustomerRef="REF8" )"
        R"(CustomerNo="CUST9")",
        R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0512" LineRef="31" Quantity=24 )"
        R"(AllocateQty=18)"}},
      {"fields without a value", kMgb,
       {"POPURPOSECODE=; POTYPECODE=; PODATE=; NOTBEFORE=20040231; CANCAFTER=2 May; ADDATE=; DEPTNO= ; CUSTOMERREF=; "
        "SUPPLIERNO=\"\"; CUSTCAT=; CUSTOMERNO=; SEQUENTIALLINENO=; UNITMEASURECODE=; UNITPRICECODE=; "
        "UNITPRICE=call us; ORDERQUANTITY=; SKUPRODUCTKEYCODE=; RETAILUNITPRICE=; ALLOCATEQUANTITY=; LINEREF="},
       {R"(OrderId=1 VendorId="ACME" PartnerId="MGB" PONo="450001" PurposeCode="" TypeCode="" ImportDate=2006-03-08 )"
        R"(InterchangeCtl="1001" GroupCtl="202" TransactionCtl="33" FilePos=4)",
        R"(LineId=1 OrderId=1 LineNo="" ProductNo="93001" SKU="" UOM="" PriceCode="")",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900")",
        R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0512")"}},
      // A product at several locations is one line with the first one's price; DTS ships to the store itself; an empty
      // allocation is the whole quantity, "0" nothing.
      {"products at locations", kMgb,
       {"ADDATE=soon",
        "SEQUENTIALLINENO=8; BUYINGLOCPARTNERNO=0513; ORDERQUANTITY=6.5 CT; UNITPRICE=1; ALLOCATEQUANTITY=; LINEREF=32",
        "SEQUENTIALLINENO=9; BUYINGLOCPARTNERNO=0514; SHIPTOLOCPARTNERNO=DTS; INCOMINGPRODUCTNO=93002; "
        "ORDERQUANTITY=99999999999; ALLOCATEQUANTITY=0",
        "SEQUENTIALLINENO=10; INCOMINGPRODUCTNO=93002; SHIPTOLOCPARTNERNO=0513; CUSTOMERREF=LATER; ORDERQUANTITY=1"},
       {R"(OrderId=1 VendorId="ACME" PartnerId="MGB" PONo="450001" PurposeCode="00" TypeCode="SA" PODate=2006-03-01 )"
        R"(ImportDate=2006-03-08 NotBefore=2006-03-10 CancelAfter=2006-03-24 DeptNo="042" SupplierNo="77001" )"
        R"(CustomerRef="REF8" CustCat="GIFTS" InterchangeCtl="1001" GroupCtl="202" TransactionCtl="33" FilePos=4)",
        R"(LineId=1 OrderId=1 LineNo="7" ProductNo="93001" SKU="555001" Quantity=30.5 UOM="CT" PriceCode="LE" )"
        R"(Cost=12.5 RetailPrice=29.95)",
        R"(LineId=2 OrderId=1 LineNo="9" ProductNo="93002" SKU="555001" Quantity=1e+11 UOM="CT" PriceCode="LE" )"
        R"(Cost=12.5 RetailPrice=29.95)",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900" CustomerRef="REF8" )"
        R"(CustomerNo="CUST9")",
        R"(LocnId=2 OrderId=1 VendorId="ACME" BuyingLocn="0513" ShipToLocn="0900" CustomerRef="REF8" )"
        R"(CustomerNo="CUST9")",
        R"(LocnId=3 OrderId=1 VendorId="ACME" BuyingLocn="0514" ShipToLocn="0514" CustomerRef="REF8" )"
        R"(CustomerNo="CUST9")",
        R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0512" LineRef="31" Quantity=24 )"
        R"(AllocateQty=18)",
        R"(Id=2 OrderId=1 LineId=1 LocnId=2 ProductNo="93001" BuyingLocn="0513" LineRef="32" Quantity=6.5 )"
        R"(AllocateQty=6.5)",
        R"(Id=3 OrderId=1 LineId=2 LocnId=3 ProductNo="93002" BuyingLocn="0514" LineRef="31" Quantity=1e+11)",
        R"(Id=4 OrderId=1 LineId=2 LocnId=1 ProductNo="93002" BuyingLocn="0512" LineRef="31" Quantity=1 )"
        R"(AllocateQty=18)"}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(c.className);
    const auto run = trade.Import("x\r\n" + trade.Lines(c.lines));
    ASSERT_EQ(run.rows, 1);
    EXPECT_EQ(run.outcomes[0].result, 1);
    EXPECT_THAT(run.outcomes[0].told, ElementsAre(kCompleted));
    EXPECT_EQ(trade.StoredRecords(), c.records);
    EXPECT_THAT(trade.reports, IsEmpty());
    EXPECT_EQ(trade.Orders(), "x\r\n");
  }
}

enum class Comes { kAgain, kAsNew };

TEST(CsvPostingTest, MeetsAnOrderAlreadyStoredUnderTheNumber) {
  const std::string exists = "R Process: Cannot process. PO 450001 already exists.";
  const std::string duplicate = "W Process: ... Warning Duplicate PO 450001.";
  const std::string change = "W Process: ... Warning Purchase Order Change Request 450001.";
  const std::string cancel = "W Process: ... Warning Purchase Order Cancel Request 450001.";
  const std::string hasJob = "R Process: Cannot process CANCELLATION.  Job exists already exists for PO 450001.";
  const std::string scrapped = "W Process: ... Warning incomplete/scrapped PO 450001.";
  const std::string refuse = "CREATE TRIGGER refuse BEFORE DELETE ON tbOrder BEGIN SELECT RAISE(ABORT, 'no'); END";
  const struct {
    std::string className, purpose;
    Comes comes;
    int jobs, status;
    Texts told;
    bool leavesFile;
    std::string stored;  // the interchange number of what is stored afterwards
    std::string trigger = {};
  } cases[] = {
      // clang-format off
      {kMgb, "00", Comes::kAgain, 0, 0, {exists},                true,  "100"},
      {kMgb, "07", Comes::kAgain, 0, 0, {exists},                true,  "100"},
      {kMgb, "01", Comes::kAgain, 1, 0, {exists},                true,  "100"},
      {kMgb, "07", Comes::kAsNew, 0, 0, {duplicate, kCompleted}, true,  "1001"},
      {kMgb, "05", Comes::kAsNew, 0, 0, {change, kCompleted},    true,  "1001"},
      {kMgb, "01", Comes::kAsNew, 0, 0, {cancel},                true,  ""},
      {kMgb, "1",  Comes::kAsNew, 0, 0, {cancel},                true,  ""},
      {kMgb, "01", Comes::kAsNew, 1, 0, {hasJob},                true,  "999"},
      {kMgb, "1",  Comes::kAsNew, 2, 9, {hasJob},                true,  "999"},
      {kMgb, "07", Comes::kAsNew, 1, 0, {exists},                true,  "999"},
      {kMgb, "05", Comes::kAsNew, 1, 0, {exists},                true,  "999"},
      {kMgb, "00", Comes::kAsNew, 0, 0, {exists},                true,  "999"},
      {kMgb, "",   Comes::kAsNew, 0, 1, {exists},                true,  "999"},
      {kMgb, "00", Comes::kAsNew, 0, 9, {scrapped, kCompleted},  true,  "1001"},
      {kMgb, "05", Comes::kAsNew, 1, 9, {scrapped, kCompleted},  true,  "1001"},
      {kMgb, "07", Comes::kAsNew, 0, 9, {duplicate, kCompleted}, true,  "1001"},
      // An order that died half stored is taken up again, though the file is the same.
      {kMgb, "00", Comes::kAgain, 0, 9, {scrapped, kCompleted},  true,  "1001"},
      {kMgb, "05", Comes::kAsNew, 0, 0, {change},                false, "999", refuse},
      {kMgb, "00", Comes::kAsNew, 0, 9, {scrapped},              false, "999", refuse},
      {kMgb, "01", Comes::kAsNew, 0, 0, {cancel},                true,  "999", refuse},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.purpose + (c.comes == Comes::kAgain ? " again, jobs " : " new, jobs ") + std::to_string(c.jobs) +
                 ", status " + std::to_string(c.status) + c.trigger);
    CsvTrade trade(c.className);
    const Order old = trade.Stored(With<Order>([&](Order& order) {
      order.VendorId = "ACME";
      order.PartnerId = "MGB";
      order.PONo = "450001";
      // The numbers count as joined.
      order.InterchangeCtl = c.comes == Comes::kAgain ? "100" : "999";
      order.GroupCtl = "1202";
      order.TransactionCtl = "33";
      order.Status = c.status;
    }));
    for (int job = 0; job < c.jobs; ++job) trade.Stored(With<Job>([&](Job& made) { made.OrderId = old.OrderId; }));
    if (!c.trigger.empty()) trade.Sql(c.trigger);
    const auto run = trade.Import(trade.Line("POPURPOSECODE=" + c.purpose));
    ASSERT_EQ(run.rows, 1);
    EXPECT_EQ(run.outcomes[0].told, c.told);
    EXPECT_EQ(run.log, c.told);
    EXPECT_EQ(run.outcomes[0].result > 0, c.told.back() == kCompleted);
    EXPECT_EQ(trade.Orders().empty(), c.leavesFile);
    const auto stored = trade.StoredOrderRecords();
    ASSERT_EQ(stored.size(), c.stored.empty() ? 0U : 1U);
    if (!stored.empty()) {
      EXPECT_EQ(stored[0]->InterchangeCtl, c.stored);
    }
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvPostingTest, TakesPurposesWithNothingStored) {
  const Texts nothing = {"R Process: Cannot process CANCELLATION. Original PO 450001 doesn't exists."};
  const struct {
    std::string className, purpose;
    Texts told, stored;
  } cases[] = {
      {kMgb, "01", nothing, {}},
      {kMgb, "1", nothing, {}},
      {kMgb, "05", {kCompleted}, {"450001/0"}},
      {kMgb, "07", {kCompleted}, {"450001/0"}},
      {kMgb, "01 1", {kCompleted}, {"450001/0"}},
  };
  for (const auto& c : cases) {
    CsvTrade trade(c.className);
    const auto run = trade.Import(trade.Line("POPURPOSECODE=" + c.purpose));
    EXPECT_EQ(run.log, c.told) << c.purpose;
    EXPECT_EQ(trade.StoredOrders(), c.stored) << c.purpose;
    EXPECT_EQ(trade.Orders(), "") << c.purpose;
  }
}

// Keeps a line from making its product.
const std::string kNoStyle = "; STYLE=; COLOUR=; SIZE=";

TEST(CsvPostingTest, TellsEveryFaultOfAnOrderAndKeepsIt) {
  const std::string missing = "INCOMINGPRODUCTNO=93009";
  const std::string noProduct = Refused("product 93009 does not exist.");
  const std::string noShipTo = Refused("ship to location 0999 does not exist.");
  const std::string noBuying = Refused("buying location 0888 does not exist.");
  const struct {
    std::string what, className;
    int validate;
    Texts lines;
    Texts faults;
  } cases[] = {
      // clang-format off
      {"all agrees", kMgb, kAll, {""}, {}},
      {"numbers written otherwise", kMgb, kAll, {"UNITPRICE=012.5 ; RETAILUNITPRICE=29.950"}, {}},
      {"without checks", kMgb, kCost | kRetail, {missing}, {}},
      {"no such product", kMgb, kProduct, {missing}, {noProduct}},
      {"neither product nor price", kMgb, kAll, {missing},
       {noProduct, Refused("pricing details for product 93009 does not exist."),
        Refused("product 93009 cost price 12.50 does not agree with database cost 0"),
        Refused("product 93009 retail price 29.95 does not agree with database retail 0"),
        Refused("product 93009 SKU 555001 does not agree with database SKU ")}},
      {"another partner's product", kMgb, kProduct, {"INCOMINGPRODUCTNO=93005"},
       {Refused("product 93005 does not exist for vendor MGB")}},
      {"unit and symbology", kMgb, kProduct, {"UNITMEASURECODE=EA; PRODUCTQUALIFIER=UP"},
       {Refused("product 93001 UOM EA does not agree with database UOM CT")}},
      {"symbology", kMgb, kProduct, {"PRODUCTQUALIFIER=UP"},
       {Refused("barcode 93001 symbology UP does not agree with database symbology EN")}},
      {"cost", kMgb, kProduct | kCost, {"UNITPRICE=12.51; RETAILUNITPRICE=1"},
       {Refused("product 93001 cost price 12.51 does not agree with database cost 12.5")}},
      {"retail and SKU", kMgb, kProduct | kRetail, {"UNITPRICE=1; RETAILUNITPRICE=$29; SKUPRODUCTKEYCODE=x"},
       {Refused("product 93001 retail price $29 does not agree with database retail 29.95"),
        Refused("product 93001 SKU x does not agree with database SKU 555001")}},
      {"a message a product", kMgb, kProduct,
       {"INCOMINGPRODUCTNO=93008", "INCOMINGPRODUCTNO=93008; BUYINGLOCPARTNERNO=0513",
        missing + "; BUYINGLOCPARTNERNO=0513"},
       {Refused("product 93008 does not exist."), noProduct}},
      {"ship-to", kMgb, kNothing, {"SHIPTOLOCPARTNERNO=0999"}, {noShipTo}},
      {"buying location", kMgb, kNothing, {"BUYINGLOCPARTNERNO=0888"}, {noBuying}},
      {"both", kMgb, kNothing, {"SHIPTOLOCPARTNERNO=0999; BUYINGLOCPARTNERNO=0888"}, {noShipTo, noBuying}},
      {"direct to a store", kMgb, kNothing, {"SHIPTOLOCPARTNERNO=DTS; BUYINGLOCPARTNERNO=0999"}, {noShipTo}},
      {"no location", kMgb, kNothing, {"SHIPTOLOCPARTNERNO=; BUYINGLOCPARTNERNO="},
       {Refused("ship to location  does not exist.")}},
      {"each time it changes", kMgb, kNothing,
       {"BUYINGLOCPARTNERNO=0888", "BUYINGLOCPARTNERNO=0888; INCOMINGPRODUCTNO=93002",
        "BUYINGLOCPARTNERNO=0512; SHIPTOLOCPARTNERNO=0999",
        "BUYINGLOCPARTNERNO=0888; SHIPTOLOCPARTNERNO=0999; INCOMINGPRODUCTNO=93003"},
       {noBuying, noShipTo, noBuying}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(c.className);
    Set(trade.document, c.validate);
    for (const auto& [number, partner] : {std::pair("93001", "MGB"), std::pair("93005", "MYER")}) {
      trade.Stored(With<Product>([&, number = number, partner = partner](Product& product) {
        product.ProductNo = number;
        product.PartnerId = partner;
        product.UOM = "CT";
        product.Symbology = "EN";
      }));
    }
    trade.Stored(With<ProductPrice>([](ProductPrice& price) {
      price.VendorId = "ACME";
      price.ProductNo = "93001";
      price.SKU = "555001";
      price.Cost = 12.5;
      price.Retail = 29.95;
    }));
    std::string orders;
    for (const std::string& line : c.lines) orders += trade.Line(line + kNoStyle);
    const auto run = trade.Import(orders);
    ASSERT_EQ(run.rows, 1);
    Texts told = c.faults;
    told.push_back(c.faults.empty() ? kCompleted : kIncomplete);
    EXPECT_EQ(run.outcomes[0].told, told);
    EXPECT_EQ(run.outcomes[0].result, c.faults.empty() ? 1 : 0);
    EXPECT_EQ(trade.StoredOrders().size(), c.faults.empty() ? 1U : 0U);
    EXPECT_EQ(trade.Orders(), c.faults.empty() ? "" : orders);
    EXPECT_TRUE(run.term);
  }
}

TEST(CsvPostingTest, GivesUpAtAStoresRepeatedLine) {
  CsvTrade trade(kMgb);
  const std::string orders =
      trade.Line() + trade.Line("SEQUENTIALLINENO=8") + trade.Line("SEQUENTIALLINENO=9; BUYINGLOCPARTNERNO=0888");
  const auto run = trade.Import(orders);
  EXPECT_EQ(run.outcomes[0].result, 0);
  EXPECT_THAT(run.log, ElementsAre("0 Process: Duplicate lines found for store 0512 EAN 93001"));
  EXPECT_THAT(trade.StoredRecords(), IsEmpty());
  EXPECT_EQ(trade.Orders(), orders);
}

TEST(CsvPostingTest, TellsApartNumbersThatRunIntoEachOther) {
  CsvTrade trade(kMgb);
  trade.AddLocation("05129");
  const char* second = "SEQUENTIALLINENO=8; BUYINGLOCPARTNERNO=05129; INCOMINGPRODUCTNO=3001";
  const auto run = trade.Import(trade.Line() + trade.Line(second));
  EXPECT_THAT(run.log, ElementsAre(kCompleted));
  EXPECT_EQ(trade.StoredRecords().size(), 7U);
}

// The messages name the line last read, which belongs to the next order already.
TEST(CsvPostingTest, TakesUpAgainAnOrderThatTheStoreRefusedHalfWay) {
  const std::string scrapped = "W Process: ... Warning incomplete/scrapped PO 450001.";
  const struct {
    std::string className, table, message;
    Texts stored, nextRun;
  } cases[] = {
      {kMgb, "tbOrder", "", {}, {kCompleted}},
      {kMgb, "tbOrderLine", " line sequence 99", {"450001/9"}, {scrapped, kCompleted}},
      {kMgb, "tbOrderLocn", " location 0512", {"450001/9"}, {scrapped, kCompleted}},
      {kMgb, "tbOrderLocnLine", " line sequence 99 location 0512", {"450001/9"}, {scrapped, kCompleted}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.table);
    CsvTrade trade(c.className);
    trade.UseBackup();
    const std::string first = trade.Line(), next = trade.Line("TRNCONTROLNO=34; SEQUENTIALLINENO=99");
    trade.Sql("CREATE TRIGGER refuse BEFORE INSERT ON " + c.table + " BEGIN SELECT RAISE(ABORT, 'refused'); END");
    const auto importer = trade.Loaded(first + next, 2);
    const auto outcome = trade.Process(*importer, 0);
    EXPECT_EQ(outcome.result, 0);
    EXPECT_THAT(outcome.told,
                ElementsAre("40002 Process: Error while inserting " + c.table + " for PO 450001" + c.message));
    Log log = importer->Log();
    ASSERT_TRUE(Load(trade.system->Records(), log));
    EXPECT_NE(log.NativeError, 0);
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.StoredOrders(), c.stored);
    EXPECT_EQ(trade.Orders(), first + next);

    trade.Sql("DROP TRIGGER refuse");
    const auto run = trade.Import(first);
    EXPECT_EQ(run.log, c.nextRun);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
    EXPECT_EQ(trade.StoredRecords().size(), 4U);
    EXPECT_EQ(trade.Orders(), "");
    EXPECT_EQ(trade.Backup(), first);
  }
}

TEST(CsvPostingTest, LeavesAnOverflowToTheErrorTrail) {
  const std::string large = "ORDERQUANTITY=1e308", tooLarge = "ORDERQUANTITY=1e999";
  const std::string second = "ORDERQUANTITY=1e308; BUYINGLOCPARTNERNO=0513";
  // After Ignore the members behind the one that failed are set.
  const Texts ignored = {
      R"(LineId=1 OrderId=1 LineNo="7" ProductNo="93001" SKU="555001" UOM="CT" PriceCode="LE" Cost=12.5 )"
      R"(RetailPrice=29.95)",
      R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900" CustomerRef="REF8" )"
      R"(CustomerNo="CUST9")",
      R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0512" LineRef="31" AllocateQty=18)"};
  const struct {
    std::string what, className;
    Texts lines;
    Button answer;
    std::size_t reports;
    std::optional<Texts> stored;  // but for the order itself
  } cases[] = {
      {"a sum", kMgb, {large, second}, Button::kAbort, 1, {}},
      {"one quantity", kMgb, {tooLarge}, Button::kAbort, 1, {}},
      {"one price", kMgb, {"UNITPRICE=-1e999"}, Button::kAbort, 1, {}},
      {"one quantity, ignored", kMgb, {tooLarge}, Button::kIgnore, 2, ignored},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(c.className);
    trade.answer = c.answer;
    const std::string orders = trade.Lines(c.lines);
    const auto run = trade.Import(orders);
    EXPECT_THAT(trade.reports, ::testing::SizeIs(c.reports));
    EXPECT_EQ(trade.reports.at(0),
              "TLE error - program error #6 (Overflow) occured in module cMGB850csv, "
              "Function Process, line 0.");
    Texts stored = trade.StoredRecords();
    if (!stored.empty()) stored.erase(stored.begin());
    EXPECT_EQ(stored, c.stored.value_or(Texts()));
    EXPECT_EQ(trade.Orders(), c.stored ? "" : orders);
    EXPECT_EQ(run.log, c.stored ? Texts{kCompleted} : Texts());
  }
}

// Too large for one block, so that posting reads the file again.
TEST(CsvPostingTest, NeverPostsPartOfAnOrderThatItCannotRead) {
  const struct {
    std::string className;
    Button answer;
    Texts stored;
  } cases[] = {
      {kMgb, Button::kRetry, {"450001/0"}},
      {kMgb, Button::kAbort, {}},
      {kMgb, Button::kIgnore, {}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(static_cast<int>(c.answer));
    CsvTrade trade(c.className);
    FaultyFiles files(*trade.ports.files);
    trade.ports.files = &files;
    trade.answer = c.answer;
    std::string orders;
    for (int line = 0; line < 2000; ++line) {
      orders += trade.Line("SEQUENTIALLINENO=" + std::to_string(line) +
                           "; INCOMINGPRODUCTNO=" + std::to_string(93000 + line));
    }
    const auto importer = trade.Loaded(orders);
    files.Fail("Read", "orders.txt", 57, 1, 1);
    EXPECT_EQ(trade.Process(*importer, 0).result, c.stored.empty() ? 0 : 1);
    EXPECT_THAT(trade.reports, ::testing::SizeIs(1));
    EXPECT_EQ(trade.StoredOrders(), c.stored);
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders().size(), c.stored.empty() ? orders.size() : 0U);
    EXPECT_EQ(trade.StoredRecords().size(), c.stored.empty() ? 0U : 1U + 2000U + 1U + 2000U);
  }
}

TEST(CsvPostingTest, KnowsNoRowBesideThoseListed) {
  CsvTrade trade(kMgb);
  const auto importer = trade.Loaded(trade.Line());
  for (const std::int32_t row : {-1, 1, 2147483647}) {
    ErrorList list = std::vector<std::int32_t>{7};
    EXPECT_EQ(importer->Process(row, list), 0);
    EXPECT_FALSE(importer->Delete(row, list));
    EXPECT_THAT(*list, ElementsAre(7));
  }
  EXPECT_THAT(trade.reports, ::testing::SizeIs(6));
  EXPECT_EQ(trade.Process(*importer, 0).result, 1);
}

}  // namespace
}  // namespace partnerkit::testing

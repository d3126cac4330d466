// Files that aren't what they should be, or change under the importer's hands: nothing of them is lost, nothing is
// taken for what it isn't, and the user is told.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;

const std::string kOtherOrder = "TRNCONTROLNO=34; PONUMBER=450002";
const std::string kOtherCompleted = "0 Process: PO 450002 import completed.";
// A location that isn't there.
const std::string kFails = "; BUYINGLOCPARTNERNO=0888";
const std::string kNoLocation = Refused("buying location 0888 does not exist.");

struct OddFiles : Siblings {
  explicit OddFiles(const std::string& importer = kMgb) : Siblings(importer) {
    UseBackup();
    ports.tell = [this](Told kind, const std::string& sentence) {
      told.push_back((kind == Told::kFailed ? "failed: " : "") + Replaced(sentence, folder / "", ""));
    };
  }
  Texts told;
};

TEST(CsvOddFilesTest, KeepsAStoredOrderWhoseReplacementFails) {
  const struct {
    std::string className, purpose, said;
  } cases[] = {
      {kMgb, "POPURPOSECODE=05", "W Process: ... Warning Purchase Order Change Request 450001."},
      {kMgb, "POPURPOSECODE=07", "W Process: ... Warning Duplicate PO 450001."},
      {kGhpl, "POPURPOSECODE=07", "W Process: ... Warning Duplicate PO 450001."},
      {kOfficeworks, "POPURPOSECODE=4; POVERSIONNO=", "W Process: ... Warning Purchase Order Change Request 450001."},
      {kColes, "POPURPOSECODE=00", "W Process: ... Warning Purchase Order Change 450001."},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.purpose);
    OddFiles trade(c.className);
    trade.AddOrder(0, [](Order& order) { order.TransactionCtl = "32"; });
    // Coles takes any location, but stops at a product that comes twice.
    const std::string changed = c.purpose + (c.className == kColes ? "" : kFails);
    const std::string twice =
        c.className == kColes ? "; SEQUENTIALLINENO=8" : "; SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=9";
    const std::string orders =
        trade.Line(changed + Extras(c.className)) + trade.Line(changed + twice + Extras(c.className));
    const auto run = trade.Import(orders);
    ASSERT_THAT(run.outcomes, SizeIs(1));
    EXPECT_EQ(run.outcomes[0].result, 0);
    EXPECT_EQ(run.outcomes[0].told.front(), c.said);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
    EXPECT_EQ(trade.StoredOrderRecords().front()->TransactionCtl, "32");
    EXPECT_EQ(trade.Orders(), orders);
  }
}

// The host says no once all checks are passed: the old order stays, and nothing of the new one is stored.
TEST(CsvOddFilesTest, EndsWhereTheHostRefusesAReplacement) {
  OddFiles trade;
  trade.AddOrder(0, [](Order& order) { order.TransactionCtl = "32"; });
  trade.Refuse("DELETE", "tbOrder");
  const std::string orders = trade.Line("POPURPOSECODE=05");
  const auto run = trade.Import(orders);
  EXPECT_THAT(run.log, ElementsAre("W Process: ... Warning Purchase Order Change Request 450001."));
  EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
  EXPECT_EQ(trade.Orders(), orders);
}

TEST(CsvOddFilesTest, TakesAwayOnlyWhatItListed) {
  for (const std::string className : kAllClasses) {
    SCOPED_TRACE(className);
    OddFiles trade(className);
    const std::string line = trade.Line("POTYPECODE=220; TRADEDQUANTITY=48");
    const std::string others =
        trade.Line("COMPANYEDIADDR=OTHERS") + trade.Line("PARTNEREDIADDR=OTHERS; TRNCONTROLNO=9");
    const auto importer = trade.Loaded(line + others);
    EXPECT_GT(trade.Process(*importer, 0).result, 0);
    const std::string later = trade.Line("POTYPECODE=220; TRADEDQUANTITY=48; TRNCONTROLNO=35");
    std::ofstream(trade.OrdersPath(), std::ios::app) << later;
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders(), others + later);
    EXPECT_EQ(trade.Backup(), line);
  }
}

TEST(CsvOddFilesTest, PostsNothingThatHasChangedSinceTheListing) {
  const std::string line = OddFiles().Line(), second = OddFiles().Line("SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002");
  const struct {
    std::string what, listed, meanwhile, told;
  } cases[] = {
      {"another order", line, OddFiles().Line("PONUMBER=450009"),
       "line 1: the file orders.txt has changed since it was listed"},
      {"another transaction", line, OddFiles().Line("TRNCONTROLNO=39"), "line 1: the file orders.txt has changed"},
      {"another company's", line, OddFiles().Line("COMPANYEDIADDR=OTHER123"),
       "line 1: the file orders.txt has changed"},
      {"a further line", line, line + second, "line 2: the file orders.txt has grown by this line of the order"},
      {"more of the line", line.substr(0, line.size() - 2), line, "line 1: the file orders.txt has grown by this line"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    OddFiles trade;
    const auto importer = trade.Loaded(c.listed);
    // In place, as a mailbox writes over a file.
    std::fstream(trade.OrdersPath(), std::ios::in | std::ios::out | std::ios::binary) << c.meanwhile;
    const auto outcome = trade.Process(*importer, 0);
    EXPECT_EQ(outcome.result, 0);
    ASSERT_THAT(outcome.told, SizeIs(2));
    EXPECT_THAT(Replaced(outcome.told[0], trade.folder / "in/", ""),
                HasSubstr("R Process: ...Cannot process PO 450001, " + c.told));
    EXPECT_EQ(outcome.told[1], kIncomplete);
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders(), c.meanwhile);
    EXPECT_THAT(trade.StoredOrders(), IsEmpty());
    ErrorList list;
    const auto again = trade.Loaded(c.listed);
    std::fstream(trade.OrdersPath(), std::ios::in | std::ios::out | std::ios::binary) << c.meanwhile;
    EXPECT_EQ(again->Delete(0, list), c.meanwhile.starts_with(c.listed));
  }
}

TEST(CsvOddFilesTest, ReadsFilesWithAByteOrderMarkOrCtrlZ) {
  const std::string mark = "\xEF\xBB\xBF", end = "\x1A";
  const std::string good = OddFiles().Line(), failing = OddFiles().Line(kOtherOrder + kFails);
  const struct {
    std::string what, orders;
    std::int32_t rows;
    std::string left, backup;
  } cases[] = {
      {"both", mark + good + failing + end, 2, mark + failing + end, good},
      {"the first fails", mark + failing + good + end, 2, mark + failing + end, good},
      {"nothing stays", mark + good + end, 1, "", good},
      {"no line end before it", good + failing.substr(0, failing.size() - 2) + end + end, 2,
       failing.substr(0, failing.size() - 2) + end + end, good},
      {"appended to behind it", good + end + failing, 2, end + failing, good},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    OddFiles trade;
    const auto run = trade.Import(c.orders);
    EXPECT_EQ(run.rows, c.rows);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
    EXPECT_EQ(trade.Orders(), c.left);
    EXPECT_EQ(trade.Backup(), c.backup);
  }
}

TEST(CsvOddFilesTest, WarnsOfNumbersThatArent) {
  const auto said = [](const std::string& rest) { return "W Process: PO 450001, line 2: " + rest; };
  const struct {
    std::string changed;
    Texts warnings;
    double quantity = 24, cost = 12.5;
  } cases[] = {
      {"ORDERQUANTITY=1O0", {said("ORDERQUANTITY \"1O0\" is not a number; it is read as 1.")}, 1},
      {"ORDERQUANTITY=abc", {said("ORDERQUANTITY \"abc\" is not a number; it is read as 0.")}, 0},
      {"ORDERQUANTITY=-5", {said("ORDERQUANTITY \"-5\" is a negative quantity.")}, -5},
      {"UNITPRICE=1.2.3; ORDERQUANTITY=10.50x",
       {said("ORDERQUANTITY \"10.50x\" is not a number; it is read as 10.5."),
        said("UNITPRICE \"1.2.3\" is not a number; it is read as 1.2.")},
       10.5,
       1.2},
      {"ALLOCATEQUANTITY=-1; RETAILUNITPRICE=$2",
       {said("RETAILUNITPRICE \"$2\" is not a number; it is read as 0."),
        said("ALLOCATEQUANTITY \"-1\" is a negative quantity.")}},
      {"ORDERQUANTITY=; UNITPRICE= 7 ; ALLOCATEQUANTITY=+1.5e1", {}, 0, 7},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.changed);
    OddFiles trade;
    const auto run = trade.Import("\r\n" + trade.Line(c.changed));
    ASSERT_THAT(run.outcomes, SizeIs(1));
    Texts told = c.warnings;
    told.push_back(kCompleted);
    EXPECT_EQ(run.outcomes[0].told, told);
    const auto lines = trade.Every<OrderLine>();
    ASSERT_THAT(lines, SizeIs(1));
    EXPECT_THAT(lines[0] + " ", HasSubstr(c.cost == 12.5 ? "Cost=12.5 " : c.cost == 7 ? "Cost=7 " : "Cost=1.2 "));
  }
  OddFiles trade;
  const auto run = trade.Import(trade.Line("PONUMBER="));
  EXPECT_THAT(run.log,
              ElementsAre("W Process: The order of line 1 has no number.", "0 Process: PO  import completed."));
}

TEST(CsvOddFilesTest, HoldsAnOrderWhoseLastLineIsCutShort) {
  // Columns to the quantity and behind it.
  const Texts columns = {"INTCONTROLNO",   "GRPCONTROLNO", "TRNCONTROLNO",  "PARTNEREDIADDR",
                         "COMPANYEDIADDR", "PONUMBER",     "ORDERQUANTITY", "INCOMINGPRODUCTNO"};
  const struct {
    std::string what, orders;
    Texts posted;
    std::string told;
  } cases[] = {
      {"before the quantity",
       "1,2,33,P,C,450001,5,9\r\n1,2,34,P,C,450002",
       {"450001/0"},
       "line 2: the last line of the file orders.txt stops before the end of ORDERQUANTITY"},
      {"at the quantity",
       "1,2,34,P,C,450002,",
       {},
       "line 1: the last line of the file orders.txt stops before the end of ORDERQUANTITY"},
      {"within it", "1,2,34,P,C,450002,5,9\r\n1,2,34,P,C,450002,1", {}, "line 2: the last line"},
      {"within the control numbers",
       "1,2,34,P,C,450002,5,9\r\n1,2,3",
       {},
       "line 2: the last line of the file orders.txt stops before it says which order it is of"},
      {"of another order, before the addresses", "1,2,34,P,C,450002,5,9\r\n1,2,35,", {"450002/0"}, ""},
      {"behind it, with less than the map",
       "1,2,34,P,C,450002,5",
       {},
       "line 1: the last line of the file orders.txt stops before all its columns"},
      {"behind it, as the line before it", "1,2,34,P,OTHERS,450002,5\r\n1,2,34,P,C,450002,5", {"450002/0"}, ""},
      {"behind it, with less than the line before it",
       "1,2,34,P,C,450002,5,9\r\n1,2,34,P,C,450002,5",
       {},
       "line 2: the last line of the file orders.txt stops before all its columns"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    OddFiles trade(kMgb);
    Texts map = columns;
    for (const std::string_view name : orders::kOrderFieldNames) {
      if (std::ranges::find(map, name) == map.end()) map.emplace_back(name);
    }
    trade.folder.Write("orders.map", MapText(map));
    trade.document.PartnerEDIAddr = "P";
    trade.document.CompanyEDIAddr = "C";
    trade.AddLocation("");
    const auto run = trade.Import(c.orders);
    EXPECT_EQ(trade.StoredOrders(), c.posted);
    const Texts& told = run.outcomes.back().told;
    if (c.told.empty()) {
      EXPECT_THAT(told, SizeIs(1));
    } else {
      ASSERT_THAT(told, SizeIs(2));
      EXPECT_THAT(Replaced(told[0], trade.folder / "in/", ""), HasSubstr("...Cannot process PO 450002, " + c.told));
      EXPECT_EQ(told[1], "0 Process: PO 450002 import incomplete.");
      // Nothing of the order leaves, and once the rest has come it is posted whole.
      EXPECT_TRUE(c.orders.ends_with(trade.Orders())) << trade.Orders();
      EXPECT_THAT(trade.Orders(), HasSubstr("450002"));
    }
    if (c.what.starts_with("of another")) {
      EXPECT_THAT(run.log.front(), HasSubstr("stops before its EDI addresses, at the end of the file"));
      EXPECT_EQ(trade.Orders(), "1,2,35,");
    }
  }
}

// What can't be told apart isn't posted in part.
TEST(CsvOddFilesTest, HoldsTransactionsThatContradictThemselves) {
  const std::string second = "SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002";
  const std::string first = OddFiles().Line(), rest = OddFiles().Line(second);
  const struct {
    std::string what, orders;
    std::size_t rows;
    Texts stored;
    std::string told;
  } cases[] = {
      {"another number inside",
       first + OddFiles().Line(second + "; PONUMBER=450009"),
       1,
       {},
       "line 2: it has the order number 450009, but stands in the transaction of another"},
      {"the first line twice", first + first + rest, 2, {}, "line 2: the transaction stands in the file "},
      {"cut short the second time", first + rest + first, 2, {}, "line 3: the transaction stands in the file "},
      {"lines behind another order",
       first + OddFiles().Line(kOtherOrder) + rest,
       3,
       {"450002/0"},
       "line 3: the transaction stands in the file "},
      {"the same twice", first + rest + first + rest, 2, {"450001/0"}, ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    OddFiles trade;
    const auto run = trade.Import(c.orders);
    ASSERT_THAT(run.outcomes, SizeIs(c.rows));
    EXPECT_EQ(trade.StoredOrders(), c.stored);
    if (c.told.empty()) continue;
    for (const std::size_t row : {std::size_t{0}, c.rows - 1}) {
      EXPECT_THAT(run.outcomes[row].told,
                  ElementsAre(HasSubstr("...Cannot process PO 450001, " + c.told), kIncomplete));
    }
    EXPECT_THAT(trade.Orders(), HasSubstr(first));
  }
}

TEST(CsvOddFilesTest, RefusesALineBeyondAnyLength) {
  OddFiles trade;
  trade.WriteOrders(trade.Line() + std::string(65 * 1024 * 1024, 'x') + "\r\n");
  const auto importer = trade.Start();
  RowTable rows;
  EXPECT_EQ(importer->Load(trade.OrdersPath(), rows), 0);
  EXPECT_THAT(trade.NewLog(), ElementsAre("R SetOrderList: Line 2 of " + trade.OrdersPath() +
                                          " is longer than 64 MB, as no order's line is."));
  EXPECT_THAT(trade.reports, IsEmpty());
}

// A run that posted orders and was stopped before it settled the file: the next one knows them for its own, and their
// lines reach the backup.
TEST(CsvOddFilesTest, BacksUpWhatAnEarlierRunPosted) {
  for (const std::string className : {kMgb, kCml, kKmart}) {
    SCOPED_TRACE(className);
    OddFiles trade(className);
    const std::string first = trade.Line("POTYPECODE=220; TRADEDQUANTITY=48"),
                      second = trade.Line("POTYPECODE=220; TRADEDQUANTITY=48; " + kOtherOrder);
    {
      const auto stopped = trade.Loaded(first + second, 2);
      EXPECT_GT(trade.Process(*stopped, 0).result, 0);
      stopped->Cancel();
    }
    EXPECT_THAT(trade.Every<UnsettledOrder>(), SizeIs(1));
    const auto run = trade.Import();
    ASSERT_THAT(run.outcomes, SizeIs(2));
    EXPECT_THAT(run.outcomes[0].told, ElementsAre(HasSubstr("already exists.")));
    EXPECT_EQ(run.outcomes[0].result, 0);
    EXPECT_EQ(trade.Orders(), "");
    EXPECT_EQ(trade.Backup(), first + second);
    EXPECT_THAT(trade.Every<UnsettledOrder>(), IsEmpty());
    // Sent again, it is no longer a matter of that run, and no line of it gets there twice.
    trade.Import(first);
    EXPECT_EQ(trade.Backup(), first + second);
  }
}

TEST(CsvOddFilesTest, ForgetsOrdersThatHaveLeftTheFileByOtherWays) {
  OddFiles trade;
  {
    const auto stopped = trade.Loaded(trade.Line());
    EXPECT_GT(trade.Process(*stopped, 0).result, 0);
    stopped->Cancel();
  }
  // A clerk has taken the lines out; the partner sends them again one day.
  trade.Import(trade.Line(kOtherOrder));
  EXPECT_THAT(trade.Every<UnsettledOrder>(), IsEmpty());
  trade.Import(trade.Line());
  EXPECT_EQ(trade.Backup(), trade.Line(kOtherOrder));
}

TEST(CsvOddFilesTest, TellsOfFilesThatCannotBePutInPlace) {
  const struct {
    std::string what, operation, file, temporary;
    Texts told;
  } cases[] = {
      {"a file of another's",
       "",
       "",
       "half of an upload",
       {"The file in/orders.tmp was there already and is now in/orders.tmp.1"}},
      {"replacing",
       "Rename",
       "orders.txt",
       "",
       {"failed: The file in/orders.txt cannot be replaced and keeps all its lines (It failed: orders.txt); what "
        "should "
        "be left of it is in in/orders.tmp"}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    OddFiles trade;
    FaultyFiles& files = trade.UseFaultyFiles();
    if (!c.temporary.empty()) trade.folder.Write("in/orders.tmp", c.temporary);
    const auto importer = trade.Loaded(trade.Line() + trade.Line(kOtherOrder), 2);
    trade.Process(*importer, 0);
    if (!c.operation.empty()) files.Fail(c.operation, c.file, 75);
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.told, c.told);
    EXPECT_EQ(trade.folder.Read("in/orders.tmp.1"), c.temporary);
    EXPECT_EQ(trade.folder.Read("in/orders.tmp"), c.operation.empty() ? "" : trade.Line(kOtherOrder));
    EXPECT_EQ(trade.Backup(), trade.Line());
    // The next run neither loses what was left nor backs anything up twice.
    trade.Import();
    EXPECT_EQ(trade.Backup(), trade.Line() + trade.Line(kOtherOrder));
    EXPECT_EQ(trade.Orders(), "");
  }
}

}  // namespace
}  // namespace partnerkit::testing

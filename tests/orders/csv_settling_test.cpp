#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

// Lines of a file, by number.
std::string Joined(const Texts& lines, std::string_view numbers) {
  std::string all;
  for (const char number : numbers) all += lines.at(static_cast<std::size_t>(number - '0'));
  return all;
}

// A backup, and an order file of which the tests take lines: 0 and 1 are an order, 2 is one that fails its checks, 3 is
// another's, 4 a further order.
struct Settling : CsvTrade {
  Settling() : CsvTrade(kMgb) { UseBackup(); }
  std::string Of(std::string_view numbers) const {
    return Joined(
        {Line(), Line("SEQUENTIALLINENO=8; BUYINGLOCPARTNERNO=0513"),
         Line("TRNCONTROLNO=34; PONUMBER=450002; BUYINGLOCPARTNERNO=0888"),
         Line("TRNCONTROLNO=35; PONUMBER=9; PARTNEREDIADDR=OTHERS"), Line("TRNCONTROLNO=36; PONUMBER=450003")},
        numbers);
  }
};

TEST(CsvSettlingTest, LeavesInTheFileWhatIsNotDealtWith) {
  const struct {
    std::vector<std::int32_t> rows;  // processed
    std::string left, backedUp;
    bool backup = true;
  } cases[] = {
      {{1}, "01234", ""},    {{2}, "0123", "4"},        {{2, 1, 0}, "23", "014"},
      {{0, 0}, "234", "01"}, {{0, 2}, "23", "", false},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.rows));
    Settling trade;
    if (!c.backup) trade.vendor.POBackupFile = {};
    const auto importer = trade.Loaded(trade.Of("01234"), 3);
    for (const std::int32_t row : c.rows) trade.Process(*importer, row);
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders(), trade.Of(c.left));
    EXPECT_EQ(trade.Backup(), trade.Of(c.backedUp));
    EXPECT_FALSE(trade.folder.Has("backup.txt.pending"));
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvSettlingTest, TurnsAwayWhatComesTwice) {
  Settling trade;
  // Twice in one file both copies go to the backup, for the number is a posted one.
  const auto run = trade.Import(trade.Of("0101"));
  ASSERT_THAT(run.outcomes, SizeIs(2));
  EXPECT_THAT(run.outcomes[0].told, ElementsAre(kCompleted));
  EXPECT_THAT(run.outcomes[1].told, ElementsAre(kExists));
  EXPECT_EQ(run.outcomes[1].result, 0);
  EXPECT_EQ(trade.Orders(), "");
  EXPECT_EQ(trade.Backup(), trade.Of("0101"));
  EXPECT_THAT(trade.Import(trade.Of("01")).log, ElementsAre(kExists));
  EXPECT_EQ(trade.Orders(), "");
  EXPECT_EQ(trade.Backup(), trade.Of("0101"));
  EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
}

TEST(CsvSettlingTest, ChangesNothingWhenCancelled) {
  Settling trade;
  trade.document.Options = "#%DELETEONEMPTY";
  const auto importer = trade.Loaded(trade.Of("0"));
  EXPECT_EQ(trade.Process(*importer, 0).result, 1);
  importer->Cancel();
  EXPECT_EQ(trade.Orders(), trade.Of("0"));
  EXPECT_EQ(trade.Backup(), "");
  EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
  // Both files are free again, though the class still lives.
  EXPECT_THAT(trade.Import().log, ElementsAre(kExists));
  EXPECT_FALSE(trade.folder.Has(CsvTrade::kFile));
  EXPECT_EQ(trade.Backup(), trade.Of("0"));
}

TEST(CsvSettlingTest, DeletesOneRowsLinesOnly) {
  const struct {
    std::int32_t row;
    std::string left;
  } cases[] = {{0, "32343"}, {1, "301343"}, {2, "301233"}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.row);
    Settling trade;
    const auto importer = trade.Loaded(trade.Of("3012343"), 3);
    ErrorList list;
    EXPECT_TRUE(importer->Delete(c.row, list));
    EXPECT_THAT(trade.NewLog(), ElementsAre("0 Delete: Transaction deleted from file."));
    EXPECT_THAT(*list, ElementsAre(importer->Log().LogId));
    EXPECT_EQ(trade.Orders(), trade.Of(c.left));
    EXPECT_EQ(trade.Backup(), "");
    EXPECT_FALSE(trade.folder.Has("in/orders.tmp"));
    EXPECT_THAT(trade.StoredOrders(), IsEmpty());
  }
}

TEST(CsvSettlingTest, DeletesALastLineWithoutEnd) {
  Settling trade;
  const auto importer = trade.Loaded(trade.Of("04").substr(0, trade.Of("04").size() - 2), 2);
  ErrorList list;
  EXPECT_TRUE(importer->Delete(1, list));
  EXPECT_EQ(trade.Orders(), trade.Of("0"));
}

// A disk or a share that fails while the file is settled. Whatever happens, the next run ends with every order stored
// once, and with a copy of every order in the backup.
TEST(CsvSettlingTest, LosesNothingWhenSettlingFails) {
  const struct {
    std::string what, operation, file;
    std::int32_t number;
    Button answer;
    bool term;
    std::size_t reports;
    bool fileKeepsAll;
  } cases[] = {
      {"order file stays locked", "Rename", "orders.txt", 75, Button::kAbort, true, 0, true},
      {"no room for the draft", "OpenDraft", "orders.txt", 61, Button::kAbort, false, 1, true},
      {"no room in it", "Write", "orders.txt", 61, Button::kAbort, false, 1, true},
      {"no room in it, ignored", "Write", "orders.txt", 61, Button::kIgnore, false, 1, true},
      {"no room in it, again", "Write", "orders.txt", 61, Button::kRetry, true, 1, false},
      {"it cannot be made durable", "Sync", "orders.txt", 57, Button::kAbort, false, 1, true},
      {"no room for the note", "Write", "backup.txt.pending", 61, Button::kAbort, false, 1, true},
      {"no room in the backup", "Write", "backup.txt", 61, Button::kAbort, false, 1, true},
      {"no room in the backup, ignored", "Write", "backup.txt", 61, Button::kIgnore, false, 1, true},
      {"no room in the backup, again", "Write", "backup.txt", 61, Button::kRetry, true, 1, false},
      {"order file cannot be read", "Read", "orders.txt", 57, Button::kAbort, false, 1, true},
      {"order file cannot be read, again", "Read", "orders.txt", 57, Button::kRetry, true, 1, false},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    Settling trade;
    FaultyFiles& files = trade.UseFaultyFiles();
    trade.answer = c.answer;
    {
      const auto importer = trade.Loaded(trade.Of("01234"), 3);
      trade.Process(*importer, 0);
      files.Fail(c.operation, c.file, c.number);
      EXPECT_EQ(importer->Term(), c.term);
      EXPECT_THAT(trade.reports, SizeIs(c.reports));
    }
    EXPECT_EQ(trade.Orders(), c.fileKeepsAll ? trade.Of("01234") : trade.Of("234"));
    EXPECT_EQ(trade.folder.Has("in/orders.tmp"), c.operation == "Rename");

    EXPECT_TRUE(trade.Import().term);
    EXPECT_EQ(trade.Orders(), trade.Of("23"));
    EXPECT_EQ(trade.Backup(), trade.Of("014"));
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0", "450003/0"));
    EXPECT_FALSE(trade.folder.Has("backup.txt.pending"));
    EXPECT_FALSE(trade.folder.Has("in/orders.tmp"));
  }
}

TEST(CsvSettlingTest, LeavesANewFileOfTheSameNameAlone) {
  Settling trade;
  const auto importer = trade.Loaded(trade.Of("0"));
  trade.Process(*importer, 0);
  trade.folder.Write("in/new.txt", trade.Of("4"));
  std::filesystem::rename(trade.folder / "in/new.txt", trade.OrdersPath());
  EXPECT_FALSE(importer->Term());
  EXPECT_THAT(trade.reports, SizeIs(1));
  EXPECT_EQ(trade.Orders(), trade.Of("4"));
}

TEST(CsvSettlingTest, KeepsLinesThatAMailboxAddedMeanwhile) {
  Settling trade;
  const auto importer = trade.Loaded(trade.Of("0"));
  trade.Process(*importer, 0);
  std::ofstream(trade.OrdersPath(), std::ios::app) << trade.Of("4");
  EXPECT_TRUE(importer->Term());
  EXPECT_EQ(trade.Orders(), trade.Of("4"));
}

TEST(CsvSettlingTest, PutsAPostedLastLineWithoutEndWholeIntoTheBackup) {
  Settling trade;
  const std::string order = trade.Of("0");
  trade.Import(order.substr(0, order.size() - 2));
  trade.Import(trade.Of("4"));
  EXPECT_EQ(trade.Backup(), trade.Of("04"));
}

TEST(CsvSettlingTest, AsksTheErrorTrailWhenNoFileIsOpen) {
  for (const bool afterFailedLoad : {false, true}) {
    CsvTrade trade(kMgb);
    const auto importer = trade.Start();
    RowTable table;
    if (afterFailedLoad) importer->Load(trade.folder / "none.txt", table);
    EXPECT_FALSE(importer->Term());
    EXPECT_THAT(trade.reports,
                ElementsAre("TLE error - program error #52 (The order file is not open) occured in module "
                            "cMGB850csv, Function Term, line 0."));
    importer->Cancel();
    EXPECT_THAT(trade.reports, SizeIs(1));
  }
}

// --- What the partners do otherwise

// What makes a line of a GTIN order count.
const std::string kTraded = "POTYPECODE=220; TRADEDQUANTITY=48; ";

TEST(CsvSettlingTest, TellsTransactionsApart) {
  const Texts sequences = {"", "SEQUENTIALLINENO=8"};                         // one product twice at one place
  const Texts atShipTo = {"BUYINGLOCPARTNERNO=", "BUYINGLOCPARTNERNO=0900"};  // the second time by name
  const Texts groups = {"", "GRPCONTROLNO=203; SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002"};
  for (const std::string className : kAllClasses) {
    SCOPED_TRACE(className);
    Siblings trade(className);
    trade.Loaded(trade.Lines(sequences), className == kGhpl ? 2 : 1)->Cancel();
    trade.Loaded(trade.Lines(atShipTo), className == kTarget || className == kColes ? 2 : 1)->Cancel();
    trade.Loaded(trade.Lines(groups), className == kColes ? 1 : 2)->Cancel();
    const std::string number = className == kKmart ? " REL# 2" : className == kCml ? " #0900" : "";
    EXPECT_THAT(trade.Listed(trade.Line("POTYPECODE=RL; POVERSIONNO=2")),
                ElementsAre("450001" + number + " 2006-03-01 " + (className == kColes ? "1001//33" : "1001/202/33")));
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

TEST(CsvSettlingTest, SettlesTheFileByItsOwnKey) {
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
      {"a release and its blanket order", kKmart, {release, "TRNCONTROLNO=34; POTYPECODE=SA" + noStore},
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
      {"another company's line", kColes, {"", "COMPANYEDIADDR=OTHERS; " + second}, {"450001/0"}, "1", "0"},
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

TEST(CsvSettlingTest, LeavesAnotherCompanysLineOutOfAnOrder) {
  const std::string second = "SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002";
  for (const std::string className : kAllClasses) {
    SCOPED_TRACE(className);
    Siblings trade(className);
    const std::string other = trade.Line(kTraded + second + "; COMPANYEDIADDR=OTHERS"), junk = "junk\r\n";
    const std::string last = trade.Line(kTraded + "SEQUENTIALLINENO=9; INCOMINGPRODUCTNO=93003");
    trade.Import(trade.Line(kTraded).append(other).append(junk).append(last));
    EXPECT_THAT(trade.StoredRecords(), SizeIs(6));
    EXPECT_EQ(trade.Orders(), other + junk);
  }
}

TEST(CsvSettlingTest, DeleteKeepsEnvelopeSegments) {
  const Texts segments = {"!ISA*00", "!GS*PO",    "!ST*850", "!IEA*1", "!GE*1",
                          "!SE*9",   "!UNB+UNOA", "!UNH+1",  "!UNT+9", "!UNZ+1"};
  const Texts others = {"!GSX", "!ST", "!isa*", "!UNA:+", "!BEG*00"};
  for (const std::string className : kAllClasses) {
    SCOPED_TRACE(className);
    Siblings trade(className);
    const std::string kept = Joined(Written(trade, segments), "0123456789");
    const std::string gone = Joined(Written(trade, others), "01234");
    const std::string front = "ISA*11\r\nBEG*11\r\n", last = trade.Line("TRNCONTROLNO=34; PONUMBER=450002");
    std::string orders = front;
    for (const std::string& part : {trade.Line(), kept, gone, last}) orders += part;
    const auto importer = trade.Loaded(orders, 2);
    ErrorList list;
    EXPECT_TRUE(importer->Delete(0, list));
    std::string left = front;
    if (className != kMyer && className != kMgb) left += kept;
    EXPECT_EQ(trade.Orders(), left += last);
    EXPECT_THAT(trade.NewLog(), ElementsAre("0 Delete: Transaction deleted from file."));
  }
}

TEST(CsvSettlingTest, DeletesAnEmptyFileOnItsDirective) {
  const std::string exact = "#%DELETEONEMPTY", within = "#%X " + exact + ";";
  for (const std::string& options : {exact, within, std::string("#%deleteonempty"), std::string()}) {
    for (const std::string className : kAllClasses) {
      for (const bool byDelete : {false, true}) {
        SCOPED_TRACE(className);
        SCOPED_TRACE(options);
        Siblings trade(className);
        trade.document.Options = options;
        const auto importer = trade.Loaded(trade.Line(kTraded));
        ErrorList list;
        EXPECT_TRUE(byDelete ? importer->Delete(0, list) : importer->Process(0, list) > 0 && importer->Term());
        EXPECT_EQ(trade.Orders(), "");
        EXPECT_EQ(trade.folder.Has(CsvTrade::kFile), options != exact && (className != kColes || options != within));
        EXPECT_TRUE(trade.Import(trade.Line("PARTNEREDIADDR=OTHERS")).term);
        EXPECT_NE(trade.Orders(), "");
      }
    }
  }
}

}  // namespace
}  // namespace partnerkit::testing

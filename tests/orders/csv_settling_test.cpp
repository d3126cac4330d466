#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"
#include "support/faulty_files.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

constexpr const char* kMgb = "clsMGB850csv";

using Texts = std::vector<std::string>;

// The lines of the order file in these tests: three orders of one's own, the second failing its checks, and another's.
struct Lines {
  explicit Lines(const CsvTrade& trade)
      : first(trade.Line()),
        firstToo(trade.Line("SEQUENTIALLINENO=8; BUYINGLOCPARTNERNO=0513")),
        failing(trade.Line("TRNCONTROLNO=34; PONUMBER=450002; BUYINGLOCPARTNERNO=0888")),
        foreign(trade.Line("TRNCONTROLNO=35; PONUMBER=9; PARTNEREDIADDR=OTHERS")),
        third(trade.Line("TRNCONTROLNO=36; PONUMBER=450003")) {}

  std::string All() const { return first + firstToo + failing + foreign + third; }

  std::string first, firstToo, failing, foreign, third;
};

TEST(CsvSettlingTest, LeavesInTheFileWhatIsNotDealtWith) {
  const auto none = [](const Lines&) { return ""; };
  const struct {
    std::string what, className;
    bool backup;
    std::vector<std::int32_t> rows;  // processed
    std::function<std::string(const Lines&)> left, backedUp;
  } cases[] = {
      // clang-format off
      {"nothing", kMgb, true, {}, &Lines::All, none},
      {"a failed one", kMgb, true, {1}, &Lines::All, none},
      {"the last", kMgb, true, {2}, [](const Lines& l) { return l.first + l.firstToo + l.failing + l.foreign; },
       [](const Lines& l) { return l.third; }},
      {"all, in any order", kMgb, true, {2, 1, 0}, [](const Lines& l) { return l.failing + l.foreign; },
       [](const Lines& l) { return l.first + l.firstToo + l.third; }},
      {"without a backup", kMgb, false, {0, 2}, [](const Lines& l) { return l.failing + l.foreign; }, none},
      {"one twice", kMgb, true, {0, 0}, [](const Lines& l) { return l.failing + l.foreign + l.third; },
       [](const Lines& l) { return l.first + l.firstToo; }},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(c.className);
    if (c.backup) trade.UseBackup();
    const Lines lines(trade);
    trade.folder.Write("in/orders.tmp", "of a run that died");
    const auto importer = trade.Loaded(lines.All(), 3);
    for (const std::int32_t row : c.rows) trade.Process(*importer, row);
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders(), c.left(lines));
    EXPECT_EQ(trade.Backup(), c.backedUp(lines));
    EXPECT_FALSE(trade.folder.Has("backup.txt.pending"));
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvSettlingTest, FinishesAFileOverSeveralRuns) {
  CsvTrade trade(kMgb);
  trade.UseBackup();
  const Lines lines(trade);
  trade.Import(lines.All());
  trade.AddLocation("0888");
  EXPECT_THAT(trade.Import().log, ElementsAre("0 Process: PO 450002 import completed."));
  EXPECT_EQ(trade.Orders(), lines.foreign);
  EXPECT_EQ(trade.Backup(), lines.first + lines.firstToo + lines.third + lines.failing);
  EXPECT_THAT(trade.Import().log, ElementsAre("0 Load: No orders found to match EDI addresses."));
  EXPECT_EQ(trade.Orders(), lines.foreign);
}

TEST(CsvSettlingTest, TurnsAwayWhatComesTwice) {
  const Texts once = {"0 Process: PO 450001 import completed."};
  const Texts again = {"R Process: Cannot process. PO 450001 already exists."};
  CsvTrade trade(kMgb);
  trade.UseBackup();
  const Lines lines(trade);
  const std::string order = lines.first + lines.firstToo;
  // Twice in one file both copies go to the backup, for the number is a posted one.
  const auto run = trade.Import(order + order);
  ASSERT_THAT(run.outcomes, SizeIs(2));
  EXPECT_EQ(run.outcomes[0].told, once);
  EXPECT_EQ(run.outcomes[1].told, again);
  EXPECT_EQ(run.outcomes[1].result, 0);
  EXPECT_EQ(trade.Orders(), "");
  EXPECT_EQ(trade.Backup(), order + order);
  EXPECT_EQ(trade.Import(order).log, again);
  EXPECT_EQ(trade.Orders(), "");
  EXPECT_EQ(trade.Backup(), order + order);
  EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
}

TEST(CsvSettlingTest, ChangesNothingWhenCancelled) {
  CsvTrade trade(kMgb);
  trade.UseBackup();
  trade.document.Options = "#%DELETEONEMPTY";
  const std::string order = trade.Line();
  const auto importer = trade.Loaded(order);
  EXPECT_EQ(trade.Process(*importer, 0).result, 1);
  importer->Cancel();
  EXPECT_EQ(trade.Orders(), order);
  EXPECT_EQ(trade.Backup(), "");
  EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
  // Both files are free again, though the class still lives.
  EXPECT_THAT(trade.Import().log, ElementsAre("R Process: Cannot process. PO 450001 already exists."));
  EXPECT_FALSE(trade.folder.Has(CsvTrade::kFile));
  EXPECT_EQ(trade.Backup(), "");
}

TEST(CsvSettlingTest, DeletesAnEmptyFileOnTheExactDirectiveOnly) {
  const struct {
    std::string className, options;
    bool deletes;
  } cases[] = {
      {kMgb, "#%DELETEONEMPTY", true},          {kMgb, "", false},
      {kMgb, "#%deleteonempty", false},         {kMgb, "#%DELETEONEMPTY ", false},
      {kMgb, "#%OTHER #%DELETEONEMPTY", false},
  };
  for (const auto& c : cases) {
    for (const bool byDelete : {false, true}) {
      SCOPED_TRACE(c.options + (byDelete ? " by Delete" : " by Term"));
      CsvTrade trade(c.className);
      trade.document.Options = c.options;
      const auto importer = trade.Loaded(trade.Line());
      ErrorList list;
      EXPECT_TRUE(byDelete ? importer->Delete(0, list) : importer->Process(0, list) > 0 && importer->Term());
      EXPECT_EQ(trade.folder.Has(CsvTrade::kFile), !c.deletes);
      EXPECT_EQ(trade.Orders(), "");
      EXPECT_EQ(trade.Import(trade.Line("PARTNEREDIADDR=OTHERS")).term, true);
      EXPECT_NE(trade.Orders(), "");
    }
  }
}

TEST(CsvSettlingTest, DeletesOneRowsLinesOnly) {
  const struct {
    std::string what, className;
    std::int32_t row;
    std::function<std::string(const Lines&)> left;
  } cases[] = {
      // clang-format off
      {"first", kMgb, 0, [](const Lines& l) { return l.foreign + l.failing + l.foreign + l.third + l.foreign; }},
      // What lies between a row and the next goes with it.
      {"middle", kMgb, 1, [](const Lines& l) { return l.foreign + l.first + l.firstToo + l.third + l.foreign; }},
      {"last", kMgb, 2, [](const Lines& l) { return l.foreign + l.first + l.firstToo + l.failing + l.foreign; }},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(c.className);
    trade.UseBackup();
    const Lines l(trade);
    const auto importer =
        trade.Loaded(l.foreign + l.first + l.firstToo + l.failing + l.foreign + l.third + l.foreign, 3);
    ErrorList list;
    EXPECT_TRUE(importer->Delete(c.row, list));
    EXPECT_THAT(trade.NewLog(), ElementsAre("0 Delete: Transaction deleted from file."));
    EXPECT_THAT(*list, ElementsAre(importer->Log().LogId));
    EXPECT_EQ(trade.Orders(), c.left(l));
    EXPECT_EQ(trade.Backup(), "");
    EXPECT_FALSE(trade.folder.Has("in/orders.tmp"));
    EXPECT_THAT(trade.StoredOrders(), IsEmpty());
  }
}

TEST(CsvSettlingTest, DeletesALastLineWithoutEnd) {
  CsvTrade trade(kMgb);
  const Lines lines(trade);
  const auto importer = trade.Loaded(lines.first + lines.third.substr(0, lines.third.size() - 2), 2);
  ErrorList list;
  EXPECT_TRUE(importer->Delete(1, list));
  EXPECT_EQ(trade.Orders(), lines.first);
}

// A disk or a share that fails while the file is settled. Whatever happens, the next run ends with every order stored
// once. What had not come as far as the backup by then is turned away as stored, and leaves the file without a copy.
TEST(CsvSettlingTest, LosesNothingWhenSettlingFails) {
  const struct {
    std::string what, operation, file;
    std::int32_t number;
    Button answer;
    bool term;
    std::size_t reports;
    bool fileKeepsAll, copied;
  } cases[] = {
      {"order file stays locked", "Rename", "orders.txt", 75, Button::kAbort, true, 0, true, true},
      {"no room for the temporary file", "OpenOutput", "orders.tmp", 61, Button::kAbort, false, 1, true, false},
      {"no room in it", "Write", "orders.tmp", 61, Button::kAbort, false, 1, true, false},
      {"no room in it, ignored", "Write", "orders.tmp", 61, Button::kIgnore, false, 1, true, false},
      {"no room in it, again", "Write", "orders.tmp", 61, Button::kRetry, true, 1, false, true},
      {"it cannot be made durable", "Sync", "orders.tmp", 57, Button::kAbort, false, 1, true, false},
      {"no room for the note", "Write", "backup.txt.pending.tmp", 61, Button::kAbort, false, 1, true, false},
      {"no room in the backup", "Write", "backup.txt", 61, Button::kAbort, false, 1, true, true},
      {"no room in the backup, ignored", "Write", "backup.txt", 61, Button::kIgnore, false, 1, true, true},
      {"no room in the backup, again", "Write", "backup.txt", 61, Button::kRetry, true, 1, false, true},
      {"order file cannot be read", "Read", "orders.txt", 57, Button::kAbort, false, 1, true, false},
      {"order file cannot be read, again", "Read", "orders.txt", 57, Button::kRetry, true, 1, false, true},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    CsvTrade trade(kMgb);
    FaultyFiles files(*trade.ports.files);
    trade.ports.files = &files;
    trade.answer = c.answer;
    trade.UseBackup();
    const Lines lines(trade);
    {
      const auto importer = trade.Loaded(lines.All(), 3);
      trade.Process(*importer, 0);
      files.Fail(c.operation, c.file, c.number);
      EXPECT_EQ(importer->Term(), c.term);
      EXPECT_THAT(trade.reports, SizeIs(c.reports));
    }
    EXPECT_EQ(trade.Orders(), c.fileKeepsAll ? lines.All() : lines.failing + lines.foreign + lines.third);
    EXPECT_EQ(trade.folder.Has("in/orders.tmp"), c.operation == "Rename");

    EXPECT_TRUE(trade.Import().term);
    EXPECT_EQ(trade.Orders(), lines.failing + lines.foreign);
    EXPECT_EQ(trade.Backup(), (c.copied ? lines.first + lines.firstToo : "") + lines.third);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0", "450003/0"));
    EXPECT_FALSE(trade.folder.Has("backup.txt.pending"));
    EXPECT_FALSE(trade.folder.Has("in/orders.tmp"));
  }
}

TEST(CsvSettlingTest, LeavesANewFileOfTheSameNameAlone) {
  CsvTrade trade(kMgb);
  const Lines lines(trade);
  const auto importer = trade.Loaded(lines.first);
  trade.Process(*importer, 0);
  trade.folder.Write("in/new.txt", lines.third);
  std::filesystem::rename(trade.folder / "in/new.txt", trade.OrdersPath());
  EXPECT_FALSE(importer->Term());
  EXPECT_THAT(trade.reports, SizeIs(1));
  EXPECT_EQ(trade.Orders(), lines.third);
}

TEST(CsvSettlingTest, KeepsLinesThatAMailboxAddedMeanwhile) {
  CsvTrade trade(kMgb);
  const Lines lines(trade);
  const auto importer = trade.Loaded(lines.first);
  trade.Process(*importer, 0);
  std::ofstream(trade.OrdersPath(), std::ios::app) << lines.third;
  EXPECT_TRUE(importer->Term());
  EXPECT_EQ(trade.Orders(), lines.third);
}

TEST(CsvSettlingTest, PutsAPostedLastLineWithoutEndWholeIntoTheBackup) {
  CsvTrade trade(kMgb);
  trade.UseBackup();
  const Lines lines(trade);
  trade.Import(lines.first.substr(0, lines.first.size() - 2));
  trade.Import(lines.third);
  EXPECT_EQ(trade.Backup(), lines.first + lines.third);
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

}  // namespace
}  // namespace partnerkit::testing

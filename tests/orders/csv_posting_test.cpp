#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

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
  const struct {
    std::string table, message;
    Texts stored, nextRun;
  } cases[] = {
      {"tbOrder", "", {}, {kCompleted}},
      {"tbOrderLine", " line sequence 99", {"450001/9"}, {kScrapped, kCompleted}},
      {"tbOrderLocn", " location 0512", {"450001/9"}, {kScrapped, kCompleted}},
      {"tbOrderLocnLine", " line sequence 99 location 0512", {"450001/9"}, {kScrapped, kCompleted}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.table);
    CsvTrade trade(kMgb);
    trade.UseBackup();
    const std::string first = trade.Line(), next = trade.Line("TRNCONTROLNO=34; SEQUENTIALLINENO=99");
    trade.Refuse("INSERT", c.table);
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
    EXPECT_EQ(trade.Import(first).log, c.nextRun);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
    EXPECT_EQ(trade.StoredRecords().size(), 4U);
    EXPECT_EQ(trade.Orders(), "");
    EXPECT_EQ(trade.Backup(), first);
  }
}

TEST(CsvPostingTest, TurnsAwayNumbersBeyondAll) {
  const std::string large = "ORDERQUANTITY=1e308";
  const struct {
    Texts lines;
    std::string told;
  } cases[] = {
      {{large, large + "; BUYINGLOCPARTNERNO=0513"},
       "line 2: the quantities of product 93001 add up beyond all numbers"},
      {{"ORDERQUANTITY=1e999"}, "line 1: ORDERQUANTITY \"1e999\" is beyond all numbers"},
      {{"UNITPRICE=-1e999"}, "line 1: UNITPRICE \"-1e999\" is beyond all numbers"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.lines.front());
    CsvTrade trade(kMgb);
    const std::string orders = trade.Lines(c.lines);
    EXPECT_THAT(trade.Import(orders).log, ElementsAre(Refused(c.told + ". It stays in the file."), kIncomplete));
    EXPECT_THAT(trade.reports, IsEmpty());
    EXPECT_EQ(trade.Orders(), orders);
    EXPECT_THAT(trade.Every<OrderLine>(), IsEmpty());
  }
}

// Too large for one block, so that posting reads the file again.
TEST(CsvPostingTest, NeverPostsPartOfAnOrderThatItCannotRead) {
  for (const Button answer : {Button::kRetry, Button::kAbort, Button::kIgnore}) {
    SCOPED_TRACE(static_cast<int>(answer));
    const bool posts = answer == Button::kRetry;
    CsvTrade trade(kMgb);
    FaultyFiles& files = trade.UseFaultyFiles();
    trade.answer = answer;
    std::string orders;
    for (int line = 0; line < 2000; ++line) {
      orders += trade.Line("SEQUENTIALLINENO=" + std::to_string(line) +
                           "; INCOMINGPRODUCTNO=" + std::to_string(93000 + line));
    }
    const auto importer = trade.Loaded(orders);
    files.Fail("Read", "orders.txt", 57, 1, 1);
    EXPECT_EQ(trade.Process(*importer, 0).result, posts ? 1 : 0);
    EXPECT_THAT(trade.reports, SizeIs(1));
    EXPECT_EQ(trade.StoredOrders(), posts ? Texts{"450001/0"} : Texts());
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders().size(), posts ? 0U : orders.size());
    EXPECT_EQ(trade.StoredRecords().size(), posts ? 1U + 2000U + 1U + 2000U : 0U);
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
  EXPECT_THAT(trade.reports, SizeIs(6));
  EXPECT_EQ(trade.Process(*importer, 0).result, 1);
}

}  // namespace
}  // namespace partnerkit::testing

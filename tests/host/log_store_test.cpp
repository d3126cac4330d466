#include "host/log_store.h"

#include <csignal>

#include "host/sql_host.h"
#include "host/store_fixture.h"

namespace partnerkit::host {
namespace {

class LogStoreTest : public StoreTest {
 protected:
  std::unique_ptr<SqlHost> Program() const {
    return SqlHost::Open(Path(), {.lockTimeout = std::chrono::milliseconds(200)});
  }
  // The record's id, 0 when it was refused.
  static std::int32_t Write(SqlHost& host, const std::string& message) {
    Log log;
    log.Message = message;
    return Add(host.Records(), log) ? log.LogId : 0;
  }
  static std::int32_t WriteMany(SqlHost& host, int count) {
    std::int32_t last = 0;
    for (int n = 0; n < count; ++n) last = Write(host, "one of many");
    return last;
  }
  // Opens the implicit transaction.
  static void Change(SqlHost& host) {
    Order order;
    order.PONo = "changed";
    EXPECT_TRUE(Add(host.Records(), order));
  }
  // The disk is full in the midst of a statement, which costs the whole transaction.
  void FillUp(SqlHost& host) const {
    host.Session().Execute("PRAGMA max_page_count=" + Ask(Path(), "PRAGMA page_count"));
    Order big;
    big.PONo.assign(50000, 'n');
    EXPECT_FALSE(Add(host.Records(), big));
    EXPECT_EQ(host.Records().NativeError(), 13);  // SQLITE_FULL
    host.Session().Execute("PRAGMA max_page_count=1000000");
  }
  std::string Stored() const {
    return Ask(Path(), "SELECT group_concat(LogId||' '||Message) FROM (SELECT * FROM tbLog ORDER BY LogId)");
  }
};

TEST_F(LogStoreTest, KeepsARecordWhoseTransactionIsTakenBack) {
  struct {
    const char* how;
    std::function<void(SqlHost&)> takeBack;
    std::int64_t faults;
  } const cases[] = {
      {"rolled back",
       [](SqlHost& host) {
         host.BeginTrans();
         Write(host, "inside");
         host.RollbackTrans();
       },
       0},
      {"lost and rolled back",
       [this](SqlHost& host) {
         host.BeginTrans();
         Write(host, "inside");
         FillUp(host);
         host.RollbackTrans();
       },
       1},
      {"lost while nobody had opened one",
       [this](SqlHost& host) {
         Change(host);
         Write(host, "inside");
         FillUp(host);
         EXPECT_NE(ErrorOf([&] { host.Commit(0); }), "");
         host.Recover();
       },
       1},
  };
  for (const auto& each : cases) {
    SCOPED_TRACE(each.how);
    const auto host = Program();
    Write(*host, "before");
    each.takeBack(*host);
    Write(*host, "behind");
    host->Commit(0);
    EXPECT_EQ(Stored(), "1 before,2 inside,3 behind");
    EXPECT_EQ(host->Faults(), each.faults);
    EXPECT_EQ(host->LastFault(), each.faults > 0 ? "database or disk is full" : "");
    EXPECT_EQ(Ask(Path(), "SELECT count(*) FROM tbOrder"), "0");
    host->Close();
    Ask(Path(), "DELETE FROM tbLog; DELETE FROM sqlite_sequence");
  }
}

TEST_F(LogStoreTest, CommitsWhatAFaultHasLeftWhole) {
  const auto host = Program();
  host->BeginTrans();
  FillUp(*host);
  EXPECT_NE(ErrorOf([&] { host->CommitTrans(); }), "");
  Change(*host);
  EXPECT_TRUE(host->HasChanges());
  host->Recover();
  EXPECT_FALSE(host->HasChanges());
  EXPECT_EQ(Ask(Path(), "SELECT PONo FROM tbOrder"), "changed");
}

TEST_F(LogStoreTest, GivesNoIdTwiceToProgramsSideBySide) {
  auto first = Program(), second = Program();
  EXPECT_EQ(Write(*first, "first"), 1);
  first->Commit(0);
  EXPECT_EQ(Write(*second, "second"), 65);
  second->Commit(0);
  first->BeginTrans();
  EXPECT_EQ(Write(*first, "taken back"), 2);
  first->RollbackTrans();
  first->Commit(0);
  EXPECT_EQ(Wait(Fork([&] {
              const auto killed = Program();
              if (Write(*killed, "lost") == 129) raise(SIGKILL);
            })),
            SIGKILL);
  first->Close();
  second->Close();
  EXPECT_EQ(Write(*first, "third"), 193);
  first.reset();
  EXPECT_EQ(Write(*second, "fourth"), 194) << "what nobody has used was given back";
  second.reset();
  EXPECT_EQ(Stored(), "1 first,2 taken back,65 second,193 third,194 fourth");
}

// More records than the program has ids for, in one transaction.
TEST_F(LogStoreTest, KeepsIdsThatWereGivenOnAReservationThatIsTakenBack) {
  const auto one = Program(), other = Program();
  one->BeginTrans();
  EXPECT_EQ(WriteMany(*one, 100), 100);
  one->RollbackTrans();
  EXPECT_EQ(Write(*other, "other"), 201);
  other->Commit(0);
  EXPECT_EQ(Write(*one, "the next"), 101);
  one->Commit(0);
  EXPECT_EQ(Ask(Path(), "SELECT count(*)||' '||min(LogId) FROM tbLog WHERE Message='one of many'"), "100 1");
  EXPECT_EQ(one->UnstoredLogRecords(), 0U);
}

TEST_F(LogStoreTest, LeavesARecordToTheProgramThatGotItsId) {
  const auto one = Program(), other = Program();
  WriteMany(*one, 30);
  one->Commit(0);
  Change(*one);
  WriteMany(*one, 100);
  FillUp(*one);
  const std::int32_t contested = Write(*other, "other");
  one->Recover();
  other->Commit(0);
  one->Commit(0);
  EXPECT_EQ(Ask(Path(), "SELECT Message FROM tbLog WHERE LogId=" + std::to_string(contested)), "other");
  EXPECT_EQ(one->UnstoredLogRecords(), static_cast<std::size_t>(130 - contested + 1));
  EXPECT_GT(Write(*one, "the next"), contested + 63);
}

TEST_F(LogStoreTest, LetsACommitSucceedThatItsRecordsCannotGoAlongWith) {
  const auto host = Program();
  Write(*host, "at first");
  host->Commit(0);
  Write(*host, "waits");
  host->Session().Execute("PRAGMA query_only=1");
  host->Commit(0);
  EXPECT_EQ(host->UnstoredLogRecords(), 1U);
  EXPECT_EQ(host->LastFault(), "attempt to write a readonly database");
  Log log;
  log.LogId = 2;
  EXPECT_TRUE(Load(host->Records(), log));
  EXPECT_EQ(log.Message, "waits");
  EXPECT_EQ(Stored(), "1 at first");
  host->Session().Execute("PRAGMA query_only=0");
  host->Close();
  EXPECT_EQ(host->UnstoredLogRecords(), 0U);
  EXPECT_EQ(Stored(), "1 at first,2 waits");
}

TEST_F(LogStoreTest, StoresTheRestWhenARuleForbidsARecord) {
  const auto host = Program();
  Ask(Path(), "CREATE TRIGGER rule BEFORE INSERT ON tbLog WHEN new.Message='bad' BEGIN SELECT RAISE(ABORT,'no'); END");
  Change(*host);
  Write(*host, "bad");
  Write(*host, "good");
  host->Commit(0);
  EXPECT_EQ(Stored(), "2 good");
  EXPECT_EQ(Ask(Path(), "SELECT PONo FROM tbOrder"), "changed");
  EXPECT_EQ(host->UnstoredLogRecords(), 1U);
  EXPECT_EQ(host->Faults(), 0);
}

}  // namespace
}  // namespace partnerkit::host

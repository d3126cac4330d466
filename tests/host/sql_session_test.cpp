#include "host/sql_session.h"

#include <sys/resource.h>

#include <chrono>
#include <csignal>
#include <filesystem>

#include "host/schema.h"
#include "host/sql_store.h"
#include "host/store_fixture.h"

namespace partnerkit::host {
namespace {

using std::chrono::milliseconds;

struct Connection {
  explicit Connection(const std::string& path, milliseconds timeout = milliseconds(200))
      : session(path, {timeout, true}) {
    PrepareSchema(session, kTestTypes);
  }
  bool AddOne(const std::string& code, std::size_t noteSize = 0) {
    Sample sample{.Code = code, .Note = std::string(noteSize, 'n')};
    return Add(store, sample);
  }

  SqlSession session;
  SqlStore store{session};
};

class SqlSessionTest : public StoreTest {
 protected:
  std::string Codes() {
    return Ask(Path(), "SELECT coalesce(group_concat(Code),'') FROM (SELECT Code FROM tbSample ORDER BY SampleId)");
  }
};

TEST_F(SqlSessionTest, StoresWhatWaitsWhenItIsClosedButNotWhenItIsKilled) {
  EXPECT_EQ(Wait(Fork([&] {
              Connection closed(Path());
              closed.AddOne("closed");
            })),
            0);
  EXPECT_EQ(Wait(Fork([&] {
              Connection killed(Path());
              killed.AddOne("committed");
              killed.session.Commit();
              killed.AddOne("lost");
              raise(SIGKILL);
            })),
            SIGKILL);
  EXPECT_EQ(Codes(), "closed,committed");
  EXPECT_EQ(Ask(Path(), "PRAGMA integrity_check"), "ok");
}

TEST_F(SqlSessionTest, TakesBackAnExplicitTransactionButNotWhatCameBefore) {
  Connection one(Path());
  one.AddOne("before");
  one.session.Begin();
  EXPECT_EQ(Codes(), "before");
  one.AddOne("inside");
  EXPECT_EQ(ErrorOf([&] { one.session.Begin(); }), Path() + ": a transaction is open already");
  EXPECT_EQ(ErrorOf([&] { one.session.Commit(); }), Path() + ": commit within a transaction");
  one.session.RollbackExplicit();
  one.session.Begin();
  one.AddOne("kept");
  one.session.CommitExplicit();
  EXPECT_EQ(Codes(), "before,kept");
  EXPECT_EQ(ErrorOf([&] { one.session.CommitExplicit(); }), Path() + ": no transaction is open");
  one.session.Begin();
  one.AddOne("dropped");
  one.session.Close();
  EXPECT_EQ(Codes(), "before,kept");
}

TEST_F(SqlSessionTest, ReadingKeepsNobodyWaitingAndAChangeInVainNeither) {
  Connection one(Path()), two(Path());
  one.AddOne("a");
  one.session.Commit();
  EXPECT_EQ(Count(one.store, Sample::kByCode, Sample{.Code = "a"}), 1);
  EXPECT_FALSE(one.AddOne("a"));
  EXPECT_FALSE(Update(one.store, Sample{.SampleId = 99}));
  EXPECT_TRUE(two.AddOne("b"));
  two.session.Commit();
  EXPECT_TRUE(one.AddOne("c"));
  one.session.Commit();
  EXPECT_EQ(Codes(), "a,b,c");
}

TEST_F(SqlSessionTest, GivesUpOnALockedDatabaseAfterTheTimeAndGoesOnOnceItIsFree) {
  Connection holder(Path()), waiter(Path());
  holder.AddOne("held");
  const auto start = std::chrono::steady_clock::now();
  EXPECT_FALSE(waiter.AddOne("refused"));
  const auto waited = std::chrono::steady_clock::now() - start;
  EXPECT_GE(waited, milliseconds(200));
  EXPECT_LT(waited, milliseconds(2000));
  EXPECT_EQ(waiter.store.NativeError(), 5);  // SQLITE_BUSY
  EXPECT_EQ(ErrorOf([&] { waiter.session.Begin(); }), Path() + ": database is locked");
  EXPECT_EQ(Count(waiter.store, Sample::kByCode, Sample{.Code = "held"}), 0);
  holder.session.Commit();
  EXPECT_TRUE(waiter.AddOne("let in"));
  waiter.session.Commit();
  EXPECT_EQ(Codes(), "held,let in");
}

// The importer lets go of the lock for some microseconds in 200 ms, unless it takes care to give others a turn.
TEST_F(SqlSessionTest, LetsOthersInWhileItImports) {
  { Connection make(Path()); }
  const pid_t importer = Fork([&] {
    Connection one(Path(), milliseconds(10000));
    for (int n = 0; true; ++n) {
      one.AddOne(std::to_string(n));
      usleep(200000);
      one.session.Commit();
    }
  });
  while (Codes().empty()) usleep(1000);
  Connection other(Path(), milliseconds(3000));
  for (const std::string code : {"v", "w", "x", "y", "z"}) {
    EXPECT_TRUE(other.AddOne(code)) << code;
    other.session.Commit();
  }
  kill(importer, SIGKILL);
  EXPECT_EQ(Wait(importer), SIGKILL);
  EXPECT_TRUE(other.AddOne("after the kill"));
}

// The limit on pages makes the database say "full" in the middle of a statement, and take back the transaction.
class FullDatabaseTest : public SqlSessionTest {
 protected:
  void Limit() { one_.session.Execute("PRAGMA max_page_count=" + Ask(Path(), "PRAGMA page_count")); }
  void Free() { one_.session.Execute("PRAGMA max_page_count=1000000"); }

  Connection one_{Path()};
};

TEST_F(FullDatabaseTest, SaysAtCommitThatTheChangesBeforeItAreLost) {
  Limit();
  EXPECT_TRUE(one_.AddOne("small"));
  EXPECT_FALSE(one_.AddOne("big", 50000));
  EXPECT_EQ(one_.store.NativeError(), 13);  // SQLITE_FULL
  Free();
  EXPECT_TRUE(one_.AddOne("unknowing"));
  const std::string lost = Path() + ": database or disk is full; what was stored since the last commit is taken back";
  EXPECT_EQ(ErrorOf([&] { one_.session.Commit(); }), lost);
  EXPECT_EQ(ErrorOf([&] { one_.session.Commit(); }), lost) << "a second try must not look like success";
  EXPECT_EQ(one_.store.NativeError(), 13);
  EXPECT_EQ(Codes(), "");
  EXPECT_TRUE(one_.AddOne("next"));
  one_.session.Commit();
  EXPECT_EQ(Codes(), "next");
}

TEST_F(FullDatabaseTest, RefusesTheRestOfALostTransaction) {
  one_.session.Begin();
  EXPECT_TRUE(one_.AddOne("small"));
  Limit();
  EXPECT_FALSE(one_.AddOne("big", 50000));
  Free();
  EXPECT_FALSE(one_.AddOne("refused"));
  EXPECT_EQ(one_.store.NativeError(), 13);
  EXPECT_EQ(ErrorOf([&] { one_.session.CommitExplicit(); }),
            Path() + ": database or disk is full; what was stored since the last commit is taken back");
  one_.session.Begin();
  EXPECT_TRUE(one_.AddOne("again"));
  one_.session.CommitExplicit();
  EXPECT_EQ(Codes(), "again");
}

TEST_F(SqlSessionTest, FailsACommitOntoAFullDiskAndKeepsNothingOfIt) {
  { Connection make(Path()); }
  EXPECT_EQ(Wait(Fork([&] {
              signal(SIGXFSZ, SIG_IGN);
              Connection one(Path());
              one.AddOne("before");
              one.session.Commit();
              const rlimit small = {100000, RLIM_INFINITY}, none = {RLIM_INFINITY, RLIM_INFINITY};
              setrlimit(RLIMIT_FSIZE, &small);
              const bool added = one.AddOne("big", 500000);
              const bool failed = testing::ErrorOf([&] { one.session.Commit(); }).starts_with("40002 ");
              setrlimit(RLIMIT_FSIZE, &none);
              const bool usable = one.AddOne("after");
              one.session.Commit();
              if (!added || !failed || !usable) _exit(2);
            })),
            0);
  EXPECT_EQ(Codes(), "before,after");
  EXPECT_EQ(Ask(Path(), "PRAGMA integrity_check"), "ok");
}

TEST_F(SqlSessionTest, ReadsAReadOnlyDatabaseAndRefusesToWriteIt) {
  {
    Connection make(Path());
    make.AddOne("there");
  }
  std::filesystem::permissions(Path(""), std::filesystem::perms(0777));
  std::filesystem::permissions(Path(), std::filesystem::perms(0444));
  EXPECT_EQ(Wait(Fork([&] {
              // Nothing is read-only to root.
              if (geteuid() == 0 && setuid(65534) != 0) _exit(3);
              SqlSession session(Path(), {});
              PrepareSchema(session, kTestTypes);
              SqlStore store(session);
              Sample there{.Code = "there"}, fresh{.Code = "fresh"};
              const bool found = Find(store, Sample::kByCode, there);
              const bool refused = !Add(store, fresh) && store.NativeError() == 8;  // SQLITE_READONLY
              if (!found || !refused) _exit(2);
            })),
            0);
  EXPECT_EQ(Codes(), "there");
}

}  // namespace
}  // namespace partnerkit::host

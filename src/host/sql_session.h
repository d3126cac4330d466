// One connection to the store's database: its transactions, its errors, and what differs from database to database.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "host/kept_paths.h"
#include "host/soci.h"
#include "host/sql_options.h"

namespace partnerkit::host {

// What the portable SQL of the store leaves to the database in hand.
struct Dialect {
  std::string_view idColumn;         // a number of its own for each row, rising; a removed row's may come again
  std::string_view lastingIdColumn;  // the same, but never given twice; SQLite takes a third longer to add such a row
  std::string_view intColumn;        // 32 bits
  std::string_view longColumn;       // 64 bits
  std::string_view realColumn;       // double precision
  std::string_view textColumn;
  std::string_view beginWrite;   // opens a transaction that holds the right to write from its start
  std::string_view columnNames;  // names the columns of the table given as the parameter
  bool returnsId;                // the new id comes from INSERT ... RETURNING, not from the connection
};

// A name inside a statement: "OrderId".
std::string Quoted(std::string_view identifier);

// What goes along with every commit without being part of anyone's transaction: it is written into each one that is
// about to be committed, and again into the next when that one is taken back.
class Rider {
 public:
  // There is something to write even where nobody else has changed anything.
  virtual bool Waits() const = 0;
  // Writes into the transaction that is about to be committed. Raises soci::soci_error.
  virtual void BeforeCommit() = 0;
  virtual void Committed() noexcept = 0;
  // The open transaction is gone, whether or not anything was written into it.
  virtual void TakenBack() noexcept = 0;

 protected:
  ~Rider() = default;
};

// Changes gather in an implicit transaction, which the first one opens and `Commit` makes durable; `Begin` opens an
// explicit one. Reading opens neither.
//
// A full disk or a failing device makes SQLite take back the whole transaction by itself. What was stored since the
// last commit is then lost, and every `Commit` says so until the next change or `Begin` opens a new transaction, or
// until `Recover`: a caller that commits again must not take the second call's success for the first one's.
class SqlSession {
 public:
  // `url` is a file path, with or without "sqlite3://" before it. Raises RunTimeError.
  SqlSession(std::string_view url, const SqlOptions& options);
  SqlSession(const SqlSession&) = delete;
  SqlSession& operator=(const SqlSession&) = delete;
  // Commits what the implicit transaction holds; a failure to do so passes in silence.
  ~SqlSession();

  soci::session& Soci() { return soci_; }
  const Dialect& Sql() const { return *dialect_; }
  // The database as messages name it.
  const std::string& Name() const { return name_; }
  const KeptPaths& Paths() const { return paths_; }

  // One statement without parameters or result.
  void Execute(const std::string& sql);

  // Makes sure that a transaction is open to write in. True when it had to be opened. Raises soci::soci_error, and
  // RunTimeError in an explicit transaction that was lost.
  bool EnsureWriting();
  // Gives up the implicit transaction that the change in hand has opened in vain.
  void Abandon() noexcept;
  // Null for none.
  void Carry(Rider* rider) { rider_ = rider; }
  // Opens the transaction that the next change would open: all that is read until then is read within it, which spares
  // each statement the locking. A failure is noted, and no more.
  void OpenEarly() noexcept;
  // Commits the rider's part alone, where nothing has been changed. False, with the failure noted, when the database
  // refuses; the rider then still has it, and nothing else is lost.
  bool CommitRider();
  // Ends what a failing database has left of the transactions: an explicit one is taken back, an implicit one that is
  // still whole is committed. One that was lost is from now on nobody's concern, so that the next commit succeeds: for
  // a caller that knows what of it had counted as done. That is nothing where a commit came first.
  void Recover();

  // These raise RunTimeError. `Commit` tells of a failure of its own part only: the rider's can wait.
  void Commit();
  void Begin();
  void CommitExplicit();
  // Without an explicit transaction it does nothing.
  void RollbackExplicit();
  // Commits the implicit transaction, takes back an explicit one.
  void Close();
  // As the database sees it: false, too, when it has taken the open one back.
  bool InTransaction();
  // One that Begin opened.
  bool InExplicit() const { return state_ == State::kExplicit; }
  // An implicit transaction waits for its commit.
  bool HasChanges() const { return state_ == State::kImplicit; }

  // The newest failure's number, 0 after a success.
  std::int32_t NativeError() const { return nativeError_; }
  // The newest failure was a rule of the database, not a failing one.
  bool ForbiddenByConstraint() const;
  // The newest failure was the database's (the disk, memory, a lock beyond the time-out), not its opinion of one
  // record.
  bool NewestIsFault() const;
  // How many such failures there were, and what the newest one was.
  std::int64_t Faults() const { return faults_; }
  const std::string& LastFault() const { return lastFault_; }
  void Succeeded() { nativeError_ = 0; }
  // Takes note of a failed statement: its number, and whether the transaction went with it.
  void Failed(const soci::soci_error& error);
  // The same, and raises it as a RunTimeError.
  [[noreturn]] void Raise(const soci::soci_error& error);
  [[noreturn]] void Raise(std::string_view message) const;

  // Runs `work` and raises what the database says against it as a RunTimeError.
  template <class F>
  auto Guarded(F&& work) {
    try {
      return work();
    } catch (const soci::soci_error& error) {
      Raise(error);
    }
  }

  // How many statements were prepared on this connection.
  std::int64_t Prepared() const { return prepared_; }
  void CountPrepared() { ++prepared_; }

 private:
  enum class State { kNone, kImplicit, kExplicit };

  void Open(State state);
  void Configure();
  void UseWriteAheadLog();
  static int WaitForLock(void* self, int attempt);
  void Run(std::unique_ptr<soci::statement>& statement, std::string_view sql);
  void CommitOpen();
  void WriteAndCommit();
  void RollBackOpen() noexcept;
  void NoteLoss(const std::string& cause);
  void ForgetToldLoss();
  [[noreturn]] void TellLoss();
  void GiveTurn();
  std::string MessageOf(const soci::soci_error& error) const;
  sqlite_api::sqlite3* Connection();

  std::string name_;
  SqlOptions options_;
  KeptPaths paths_;
  const Dialect* dialect_;
  soci::session soci_;
  std::unique_ptr<soci::statement> begin_, commit_, rollback_;
  State state_ = State::kNone;
  bool openedEarly_ = false;  // with kNone
  std::string loss_;          // why the transaction was lost; empty when none was
  std::int32_t lossNumber_ = 0;
  bool lossTold_ = false;
  std::int32_t nativeError_ = 0;
  std::int64_t faults_ = 0;
  std::string lastFault_;
  Rider* rider_ = nullptr;
  std::int64_t prepared_ = 0;
  std::chrono::steady_clock::time_point lockDeadline_, lastTurn_;
};

}  // namespace partnerkit::host

#include "host/sql_session.h"

#include <fcntl.h>
#include <unistd.h>

#include <filesystem>
#include <system_error>
#include <thread>

#include "partnerkit/run_time_error.h"

namespace partnerkit::host {
namespace {

using std::chrono::steady_clock;

constexpr std::chrono::microseconds kPoll{500};
constexpr std::chrono::milliseconds kTurn{1};
constexpr std::chrono::milliseconds kTurnEvery{100};

constexpr std::string_view kInMemory = ":memory:";

constexpr Dialect kSqlite = {
    .idColumn = "INTEGER PRIMARY KEY",
    .lastingIdColumn = "INTEGER PRIMARY KEY AUTOINCREMENT",
    .intColumn = "INTEGER",
    .longColumn = "BIGINT",
    .realColumn = "DOUBLE PRECISION",
    .textColumn = "TEXT",
    // A plain BEGIN would take the lock only at the first write, and fail there when another program wrote in between.
    .beginWrite = "BEGIN IMMEDIATE",
    .columnNames = "SELECT name FROM pragma_table_info(:table)",
    .returnsId = false,
};

[[noreturn]] void Refuse(std::string_view name, std::string_view why) {
  throw RunTimeError(run_time::kDatabase, std::string(name).append(": ").append(why));
}

// The file that a URL names.
std::string FileOf(std::string_view url) {
  const std::size_t colon = url.find("://");
  if (colon == std::string_view::npos) return std::string(url);
  const std::string_view scheme = url.substr(0, colon);
  if (scheme == "sqlite3" || scheme == "sqlite") return std::string(url.substr(colon + 3));
  if (scheme == "postgresql" || scheme == "postgres") Refuse(url, "PostgreSQL is not built into this program");
  Refuse(url, "unknown kind of database");
}

// An empty file, which SQLite takes for a new database. It gives the files beside it the same rights: others have none,
// for prices stand in them. What fails here fails in SQLite again.
void MakePrivate(const std::string& file) {
  const int made = ::open(file.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, S_IRUSR | S_IWUSR | S_IRGRP | S_IWGRP);
  if (made >= 0) ::close(made);
}

void CheckFile(const std::string& file, bool create) {
  if (file.empty()) Refuse("database", "no file is named");
  if (file == kInMemory) return;
  std::error_code error;
  const auto status = std::filesystem::status(file, error);
  if (std::filesystem::is_directory(status)) Refuse(file, "is a folder, not a database");
  const bool there = status.type() != std::filesystem::file_type::not_found;
  if (!create && !there) Refuse(file, "there is no such database");
  if (!create && std::filesystem::file_size(file, error) == 0) {
    Refuse(file, "is empty, and was a database: bring it back from a backup, or remove it and make a new one");
  }
  if (create && !there) MakePrivate(file);
}

std::string FolderOf(const std::string& file) {
  return std::filesystem::absolute(file).lexically_normal().parent_path().string();
}

// SOCI's connection text is a list of name=value; a path with a "=" has to be quoted, and only then may it not hold a
// quote.
std::string ConnectionText(std::string file) {
  // "file:x" is a URI to SQLite, and only a path here.
  if (file.starts_with("file:")) file.insert(0, "./");
  if (file.find('=') == std::string::npos) return file;
  if (file.find('"') != std::string::npos) Refuse(file, "a path with \"=\" and a quote can't be opened");
  return "db=\"" + file + "\"";
}

bool IsPrimary(const soci::sqlite3_soci_error& error, int code) { return (error.result() & 0xff) == code; }

}  // namespace

std::string Quoted(std::string_view identifier) {
  std::string quoted = "\"";
  for (const char c : identifier) quoted.append(c == '"' ? 2 : 1, c);
  return quoted += '"';
}

SqlSession::SqlSession(std::string_view url, const SqlOptions& options)
    : name_(FileOf(url)), options_(options), dialect_(&kSqlite), lastTurn_(steady_clock::now()) {
  CheckFile(name_, options.create);
  if (options.relativePaths && name_ != kInMemory) paths_ = KeptPaths(FolderOf(name_));
  try {
    soci_.open(soci::sqlite3, ConnectionText(name_));
  } catch (const soci::soci_error&) {
    // The connection is gone, and the database's own words with it.
    Refuse(name_, "unable to open the database file");
  }
  Guarded([this] { Configure(); });
}

SqlSession::~SqlSession() {
  try {
    Close();
  } catch (const RunTimeError&) {
    // Nobody is left to be told; what could not be committed is as if the program had been killed.
  }
}

sqlite_api::sqlite3* SqlSession::Connection() {
  return static_cast<soci::sqlite3_session_backend*>(soci_.get_backend())->conn_;
}

void SqlSession::Configure() {
  sqlite_api::sqlite3_extended_result_codes(Connection(), 1);
  sqlite_api::sqlite3_busy_handler(Connection(), &SqlSession::WaitForLock, this);
  UseWriteAheadLog();
  Execute("PRAGMA synchronous=FULL");
  // Records may name what isn't there; the callers decide, not the database.
  Execute("PRAGMA foreign_keys=OFF");
}

// Two programs that open a new file at once both want to switch it over, and SQLite doesn't ask the busy handler then.
void SqlSession::UseWriteAheadLog() {
  const auto deadline = steady_clock::now() + options_.lockTimeout;
  std::string mode;
  soci_ << "PRAGMA journal_mode", soci::into(mode);
  while (mode != "wal" && mode != "memory") {
    try {
      soci_ << "PRAGMA journal_mode=WAL", soci::into(mode);
      return;
    } catch (const soci::sqlite3_soci_error& error) {
      if (IsPrimary(error, SQLITE_READONLY)) return;
      if (!IsPrimary(error, SQLITE_BUSY) || steady_clock::now() > deadline) throw;
    }
    std::this_thread::sleep_for(kPoll);
  }
}

// SQLite's own time-out waits longer and longer between tries, up to 100 ms, and so misses the short gaps between the
// commits of an import.
int SqlSession::WaitForLock(void* self, int attempt) {
  auto& session = *static_cast<SqlSession*>(self);
  const auto now = steady_clock::now();
  if (attempt == 0) session.lockDeadline_ = now + session.options_.lockTimeout;
  if (now >= session.lockDeadline_) return 0;
  std::this_thread::sleep_for(kPoll);
  return 1;
}

void SqlSession::Execute(const std::string& sql) { soci_ << sql; }

void SqlSession::Run(std::unique_ptr<soci::statement>& statement, std::string_view sql) {
  if (!statement) {
    auto fresh = std::make_unique<soci::statement>(soci_);
    fresh->alloc();
    fresh->prepare(std::string(sql));
    fresh->define_and_bind();
    statement = std::move(fresh);
    CountPrepared();
  }
  statement->execute(true);
}

bool SqlSession::EnsureWriting() {
  if (state_ == State::kExplicit && !loss_.empty()) {
    nativeError_ = lossNumber_;
    Raise("the transaction was taken back: " + loss_);
  }
  if (state_ != State::kNone) return false;
  ForgetToldLoss();
  Open(State::kImplicit);
  return true;
}

void SqlSession::Open(State state) {
  if (!openedEarly_) Run(begin_, dialect_->beginWrite);
  openedEarly_ = state == State::kNone;
  state_ = state;
}

void SqlSession::OpenEarly() noexcept {
  if (state_ != State::kNone) return;
  try {
    Open(State::kNone);
  } catch (const soci::soci_error& error) {
    Failed(error);
  }
}

void SqlSession::Abandon() noexcept {
  if (state_ == State::kImplicit) RollBackOpen();
}

void SqlSession::Commit() {
  if (state_ == State::kExplicit) Raise("commit within a transaction");
  if (!loss_.empty()) TellLoss();
  if (state_ == State::kImplicit) CommitOpen();
  else if (rider_ != nullptr && rider_->Waits()) CommitRider();
}

bool SqlSession::CommitRider() {
  if (state_ != State::kNone || rider_ == nullptr) return false;
  try {
    Open(State::kNone);
    WriteAndCommit();
  } catch (const soci::soci_error& error) {
    Failed(error);
    RollBackOpen();
    return false;
  }
  return true;
}

void SqlSession::Recover() {
  RollbackExplicit();
  try {
    Commit();
  } catch (const RunTimeError&) {
    ForgetToldLoss();
  }
}

void SqlSession::Begin() {
  if (state_ == State::kExplicit) Raise("a transaction is open already");
  ForgetToldLoss();
  if (!loss_.empty()) TellLoss();
  if (state_ == State::kImplicit) CommitOpen();
  Guarded([this] { Open(State::kExplicit); });
}

void SqlSession::CommitExplicit() {
  if (state_ != State::kExplicit)
    Raise(loss_.empty() ? "no transaction is open" : "the transaction was taken back: " + loss_);
  if (!loss_.empty()) TellLoss();
  CommitOpen();
}

void SqlSession::RollbackExplicit() {
  if (state_ != State::kExplicit) return;
  RollBackOpen();
  loss_.clear();
}

bool SqlSession::InTransaction() { return sqlite_api::sqlite3_get_autocommit(Connection()) == 0; }

void SqlSession::Close() {
  RollbackExplicit();
  ForgetToldLoss();
  Commit();
}

void SqlSession::CommitOpen() {
  try {
    WriteAndCommit();
  } catch (const soci::soci_error& error) {
    Failed(error);
    NoteLoss(MessageOf(error));
    TellLoss();
  }
}

void SqlSession::WriteAndCommit() {
  if (rider_ != nullptr) rider_->BeforeCommit();
  Run(commit_, "COMMIT");
  state_ = State::kNone;
  openedEarly_ = false;
  if (rider_ != nullptr) rider_->Committed();
  Succeeded();
  GiveTurn();
}

void SqlSession::RollBackOpen() noexcept {
  state_ = State::kNone;
  openedEarly_ = false;
  if (rider_ != nullptr) rider_->TakenBack();
  if (!InTransaction()) return;
  try {
    Run(rollback_, "ROLLBACK");
  } catch (const soci::soci_error&) {
    // A rollback that fails leaves the transaction to the recovery of the next program that opens the file.
  }
}

void SqlSession::NoteLoss(const std::string& cause) {
  loss_ = cause;
  lossNumber_ = nativeError_;
  lossTold_ = false;
}

void SqlSession::ForgetToldLoss() {
  if (lossTold_) loss_.clear();
  lossTold_ = false;
}

void SqlSession::TellLoss() {
  RollBackOpen();
  lossTold_ = true;
  nativeError_ = lossNumber_;
  Raise(loss_ + "; what was stored since the last commit is taken back");
}

void SqlSession::Failed(const soci::soci_error& error) {
  const int code = sqlite_api::sqlite3_extended_errcode(Connection());
  nativeError_ = code == SQLITE_OK ? SQLITE_ERROR : code;
  if (NewestIsFault()) {
    ++faults_;
    lastFault_ = MessageOf(error);
  }
  if (InTransaction()) return;
  openedEarly_ = false;
  if (state_ == State::kNone) return;
  NoteLoss(MessageOf(error));
  if (state_ == State::kImplicit) state_ = State::kNone;
  if (rider_ != nullptr) rider_->TakenBack();
}

std::string SqlSession::MessageOf(const soci::soci_error& error) const {
  // SOCI puts the name of its own function in front of the database's message.
  std::string message = error.get_error_message();
  constexpr std::string_view kPrefix = "sqlite3_statement_backend::";
  if (!message.starts_with(kPrefix)) return message;
  const std::size_t colon = message.find(": ", kPrefix.size());
  return colon == std::string::npos ? message : message.substr(colon + 2);
}

void SqlSession::Raise(const soci::soci_error& error) {
  Failed(error);
  Raise(MessageOf(error));
}

void SqlSession::Raise(std::string_view message) const { Refuse(name_, message); }

// SQLite's lock has no queue: a program that begins again right after its commit keeps the others polling until they
// give up. A rest that is longer than their poll lets the next one in.
void SqlSession::GiveTurn() {
  if (steady_clock::now() - lastTurn_ < kTurnEvery) return;
  std::this_thread::sleep_for(kTurn);
  lastTurn_ = steady_clock::now();
}

bool SqlSession::ForbiddenByConstraint() const { return (nativeError_ & 0xff) == SQLITE_CONSTRAINT; }

bool SqlSession::NewestIsFault() const {
  switch (nativeError_ & 0xff) {
    case SQLITE_OK:
    case SQLITE_CONSTRAINT:
    case SQLITE_TOOBIG:
    case SQLITE_MISMATCH:
      return false;
    default:
      return true;
  }
}

}  // namespace partnerkit::host

#include "host/log_store.h"

#include <algorithm>
#include <limits>
#include <string>

namespace partnerkit::host {
namespace {

// Programs that run side by side lose what is left of a block, and ids are 32-bit numbers: a block is small until a
// program turns out to need many.
constexpr std::int64_t kSmallestBlock = 64, kLargestBlock = 1024;
constexpr std::int64_t kLastId = std::numeric_limits<std::int32_t>::max();

bool IsLog(const RecordType& type) { return type.members.data() == Log::kType.members.data(); }

}  // namespace

LogStore::LogStore(SqlSession& session) : SqlStore(session) { session.Carry(this); }

LogStore::~LogStore() { Session().Carry(nullptr); }

bool LogStore::Add(const RecordType& type, void* record) {
  if (!IsLog(type) || static_cast<Log*>(record)->LogId != 0) return SqlStore::Add(type, record);
  const auto id = NextId();
  if (!id) return false;
  Log& log = *static_cast<Log*>(record);
  log.LogId = *id;
  waiting_.push_back(log);
  Session().Succeeded();
  Session().OpenEarly();
  return true;
}

bool LogStore::Load(const RecordType& type, void* record) {
  if (IsLog(type)) {
    if (const Log* kept = Kept(static_cast<Log*>(record)->LogId)) {
      *static_cast<Log*>(record) = *kept;
      return true;
    }
  }
  return SqlStore::Load(type, record);
}

const Log* LogStore::Kept(std::int32_t id) const {
  for (const std::vector<Log>* logs : {&waiting_, &refused_}) {
    const auto found = std::ranges::find(*logs, id, &Log::LogId);
    if (found != logs->end()) return &*found;
  }
  return nullptr;
}

std::optional<std::int32_t> LogStore::NextId() {
  if (IdsLeft() == 0 && !FindIds()) return std::nullopt;
  Block& block = blocks_.empty() ? *promised_ : blocks_.front();
  const auto id = static_cast<std::int32_t>(block.next++);
  if (!blocks_.empty() && block.Left() == 0) blocks_.pop_front();
  ++given_;
  if (foreseen_ > 0) --foreseen_;
  return id;
}

// Within a transaction the reservation is only as durable as that.
bool LogStore::FindIds() {
  if (!Session().InExplicit() && !Session().HasChanges()) return Session().CommitRider() && IdsLeft() > 0;
  if (!Session().InTransaction()) return false;
  try {
    ReserveIds();
  } catch (const soci::soci_error& error) {
    Session().Failed(error);
  }
  return IdsLeft() > 0;
}

std::int64_t LogStore::IdsLeft() const {
  std::int64_t left = promised_ ? promised_->Left() : 0;
  for (const Block& block : blocks_) left += block.Left();
  return left;
}

std::int64_t LogStore::BlockSize() const {
  return std::max(std::clamp(given_, kSmallestBlock, kLargestBlock), foreseen_);
}

// SQLite's own note of the newest id; a record that is added without an id gets the next.
std::int64_t LogStore::LastReserved() {
  long long last = 0;
  Session().Soci() << "SELECT COALESCE(MAX(seq),0) FROM sqlite_sequence WHERE name='tbLog'", soci::into(last);
  return last;
}

void LogStore::SetLastReserved(std::int64_t id) {
  Session().Execute("DELETE FROM sqlite_sequence WHERE name='tbLog'");
  Session().Execute("INSERT INTO sqlite_sequence(name,seq) VALUES('tbLog'," + std::to_string(id) + ")");
}

void LogStore::ReserveIds() {
  ReserveAgain();
  const std::int64_t reserved = LastReserved();
  const std::int64_t last = std::min(reserved + BlockSize(), kLastId);
  SetLastReserved(last);
  if (promised_) promised_->last = last;
  else promised_ = {reserved + 1, reserved + 1, last};
}

// Another program may have got the ids in the moment between: its records keep them, and ours stay out of the log.
void LogStore::ReserveAgain() {
  if (!exposed_ || reservedAgain_) return;
  if (LastReserved() < exposed_->first) {
    SetLastReserved(exposed_->next - 1);
  } else {
    const auto ours = std::ranges::lower_bound(waiting_, exposed_->first, {}, &Log::LogId);
    refused_.insert(refused_.end(), ours, waiting_.end());
    waiting_.erase(ours, waiting_.end());
  }
  reservedAgain_ = true;
}

void LogStore::BeforeCommit() {
  ReserveAgain();
  while (written_ < waiting_.size()) Write(waiting_[written_]);
  if (closing_) GiveBack();
  else if (IsLowOnIds()) ReserveIds();
}

void LogStore::Write(Log& log) {
  try {
    Insert(Log::kType, &log);
    ++written_;
  } catch (const soci::soci_error& error) {
    Session().Failed(error);
    if (Session().NewestIsFault()) throw;
    refused_.push_back(std::move(log));
    waiting_.erase(waiting_.begin() + static_cast<std::ptrdiff_t>(written_));
  }
}

void LogStore::GiveBack() {
  const std::int64_t reserved = LastReserved();
  std::int64_t last = reserved;
  for (auto block = blocks_.rbegin(); block != blocks_.rend() && block->last == last; ++block) last = block->next - 1;
  if (last < reserved) SetLastReserved(last);
}

void LogStore::Committed() noexcept {
  waiting_.erase(waiting_.begin(), waiting_.begin() + static_cast<std::ptrdiff_t>(written_));
  written_ = 0;
  exposed_.reset();
  reservedAgain_ = false;
  if (promised_ && promised_->Left() > 0) blocks_.push_back(*promised_);
  promised_.reset();
  if (closing_) blocks_.clear();
}

void LogStore::TakenBack() noexcept {
  written_ = 0;
  reservedAgain_ = false;
  if (promised_ && promised_->next > promised_->first) {
    if (exposed_) exposed_->next = promised_->next;
    else exposed_ = promised_;
  }
  promised_.reset();
}

}  // namespace partnerkit::host

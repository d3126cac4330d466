// The record store of a host: log records in it outlive the transactions that they are written in.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>
#include <vector>

#include "host/sql_session.h"
#include "host/sql_store.h"
#include "partnerkit/records.h"

namespace partnerkit::host {

// A log record waits in memory for the next commit, whosever that is, and is written again with the one behind it when
// the database takes that back. Until then it is found by its id only.
//
// An id that somebody has seen is never given again, so ids are handed out from blocks that are reserved durably
// beforehand. What a program has not used of its blocks it gives back at the end, unless another has reserved ids
// behind them by then; a killed program leaves a gap.
class LogStore : public SqlStore, private Rider {
 public:
  explicit LogStore(SqlSession& session);
  ~LogStore() override;

  // False when there is no id to be had: the database refuses.
  bool Add(const RecordType& type, void* record) override;
  bool Load(const RecordType& type, void* record) override;

  // Reserves ids in the open transaction. Raises soci::soci_error.
  void ReserveIds();
  // So many records will probably be added.
  void Foresee(std::size_t records) { foreseen_ = static_cast<std::int64_t>(records); }
  // The next transaction could use up the ids.
  bool IsLowOnIds() const { return IdsLeft() < BlockSize() / 2; }
  // Ids were given on a reservation that was then taken back.
  bool HasExposedIds() const { return exposed_.has_value(); }
  // The commits from now on give ids back instead of reserving more.
  void SetClosing(bool closing) { closing_ = closing; }
  // How many records the database has not got.
  std::size_t Unstored() const { return waiting_.size() + refused_.size(); }

 private:
  // Ids, `next` being the first that isn't given yet.
  struct Block {
    std::int64_t first = 0, next = 0, last = 0;
    std::int64_t Left() const { return last - next + 1; }
  };

  bool Waits() const override { return !waiting_.empty() || (closing_ && !blocks_.empty()); }
  void BeforeCommit() override;
  void Committed() noexcept override;
  void TakenBack() noexcept override;

  std::optional<std::int32_t> NextId();
  bool FindIds();
  std::int64_t IdsLeft() const;
  std::int64_t BlockSize() const;
  std::int64_t LastReserved();
  void SetLastReserved(std::int64_t id);
  void ReserveAgain();
  void Write(Log& log);
  void GiveBack();
  const Log* Kept(std::int32_t id) const;

  std::deque<Block> blocks_;       // reserved for good, rising
  std::optional<Block> promised_;  // by the open transaction
  std::optional<Block> exposed_;
  bool reservedAgain_ = false;  // the exposed ones, by the open transaction
  bool closing_ = false;
  std::int64_t given_ = 0, foreseen_ = 0;
  std::vector<Log> waiting_;
  std::size_t written_ = 0;   // of those, into the open transaction
  std::vector<Log> refused_;  // by a rule of the database, for good
};

}  // namespace partnerkit::host

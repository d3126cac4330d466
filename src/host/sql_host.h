// The bundled host: records, settings and counters in one SQL database.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "host/sql_options.h"
#include "host/sql_store.h"
#include "partnerkit/database_host.h"
#include "partnerkit/records.h"

namespace partnerkit::host {

// SQLite guards each of its calls against other threads, which takes a twelfth of the computing of an import. A program
// none of whose SQLite connections is shared between threads may do without; to be called before it opens the first.
// False when that has happened already, and all stays as it is.
bool DropThreadGuards();

// Changes are grouped as SqlSession tells: `Commit` makes them durable, and so do `Close` and the destructor, since
// what a failed posting leaves behind is kept for the next run to find. Only a killed program loses what it did not
// commit. While changes wait for their commit, other programs on the same database wait too. Log records are nobody's
// change; see LogStore.
class SqlHost : public DatabaseHost {
 public:
  // Opens the database and makes or updates its tables. `url` is a file path, with or without "sqlite3://" before it.
  // Raises RunTimeError (run_time::kDatabase) with a text that names the database and the cause.
  static std::unique_ptr<SqlHost> Open(std::string_view url, const SqlOptions& options = {});
  ~SqlHost() override;

  SqlStore& Records() override;
  // The setting of that name; without one, the name that the user is signed on with.
  std::string UserId() override;
  // The stored jobs, packs and ship notices of the order stay.
  bool DeleteOrder(const Order& order) override;
  void Commit(std::int32_t mode) override;
  void BeginTrans() override;
  void CommitTrans() override;
  void RollbackTrans() override;
  std::vector<EDIDoc> EDIDocList() override;
  std::int32_t NextNumber(std::string_view partnerId, Counter counter) override;
  std::vector<std::shared_ptr<Pack>> PacksToCompile(std::string_view vendorId, std::string_view partnerId) override;
  // By what is packed: the quantity noted on the order's or slip's line, or the sum of its pack lines, whichever is
  // more.
  bool OrderComplete(std::int32_t orderId) override;
  bool OrderOpenOnShipment(std::int32_t shipmentId, std::int32_t orderId) override;
  bool StampPack(std::int32_t packId, std::int32_t noticeId) override;

  // Raises RunTimeError when the database cannot be written to, or is locked by another program beyond the time-out.
  // Reserves ids for the run log, which has to be done before its first record anyway.
  void CheckWritable() override;
  // Commits what waits for it, and gives the log's unused ids back. Raises RunTimeError.
  void Close() override;
  // Log records that the database has not got. What `Commit` makes durable doesn't wait for them.
  std::size_t UnstoredLogRecords() const;
  // Changes wait for their commit.
  bool HasChanges() const;
  // How often the database itself failed (the disk, memory, a lock beyond the time-out), not a record for its own
  // sake; and what it said the last time.
  std::int64_t Faults() const;
  const std::string& LastFault() const;
  // Behind a fault: see SqlSession.
  void Recover();

  // The host's settings, the members of `System` by name. They raise RunTimeError. One that was asked for is kept, so
  // that a change by another program counts from the next opening on.
  std::optional<std::string> Setting(std::string_view name) override;
  std::vector<std::pair<std::string, std::string>> Settings() override;
  void SetSetting(std::string_view name, std::string_view value) override;

  SqlSession& Session();

 private:
  struct Parts;

  explicit SqlHost(std::unique_ptr<Parts> parts);

  std::unique_ptr<Parts> parts_;
};

}  // namespace partnerkit::host

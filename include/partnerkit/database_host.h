// The bundled host: records, settings and counters in a database, as the program `partnerkit` keeps them, in SQLite. It
// is in a library of its own: partnerkit::host in CMake, partnerkit-host in pkg-config.
#pragma once

#include <chrono>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "partnerkit/store.h"

namespace partnerkit {

struct DatabaseOptions {
  // How long an operation waits for another program that holds the database.
  std::chrono::milliseconds lockTimeout{30000};
  // False: a database that isn't there is an error instead of a new, empty one.
  bool create = true;
};

// Its records are those of `records.h`, each type a table. Changes gather until `Commit`, `Close` or the destructor
// makes them durable; only a killed program loses what it did not commit. While changes wait for that, other programs
// on the same database wait too.
class DatabaseHost : public System {
 public:
  // Opens the database and makes or updates its tables. `url` is a file path, with or without "sqlite3://" before it,
  // or ":memory:". Raises RunTimeError (run_time::kDatabase) with a text that names the database and the cause: it
  // cannot be opened, is another program's, or of a newer version.
  static std::unique_ptr<DatabaseHost> Open(std::string_view url, const DatabaseOptions& options = {});

  // The host's settings by name, those that System names (`PrinterLanguage`, `UserId`, ...) and any other. They raise
  // RunTimeError. A setting that was asked for is kept, so that a change by another program counts from the next
  // opening on.
  virtual std::vector<std::pair<std::string, std::string>> Settings() = 0;
  virtual void SetSetting(std::string_view name, std::string_view value) = 0;

  // Raises RunTimeError when the database cannot be written to, or is locked by another program beyond the time-out.
  // What was stored before is made durable.
  virtual void CheckWritable() = 0;
  // Makes durable what waits for it, and takes back a transaction that is still open. Raises RunTimeError; the
  // destructor does the same and keeps silent.
  virtual void Close() = 0;
};

}  // namespace partnerkit

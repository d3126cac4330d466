// SQLite's C interface with no more round it than lets go of what was taken: what the yardsticks read and write with.
#pragma once

#include <sqlite3.h>

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

class Database {
 public:
  explicit Database(const char* path, int flags = SQLITE_OPEN_READWRITE) {
    Check(sqlite3_open_v2(path, &handle_, flags, nullptr));
  }
  ~Database() { sqlite3_close(handle_); }
  Database(const Database&) = delete;
  Database& operator=(const Database&) = delete;

  void Check(int result) const {
    if (result != SQLITE_OK) throw std::runtime_error(sqlite3_errmsg(handle_));
  }
  void Run(const char* sql) const { Check(sqlite3_exec(handle_, sql, nullptr, nullptr, nullptr)); }
  sqlite3* Handle() const { return handle_; }

 private:
  sqlite3* handle_ = nullptr;
};

class Query {
 public:
  Query(const Database& database, const std::string& sql) : database_(database) {
    database.Check(
        sqlite3_prepare_v3(database.Handle(), sql.c_str(), -1, SQLITE_PREPARE_PERSISTENT, &handle_, nullptr));
  }
  ~Query() { sqlite3_finalize(handle_); }
  Query(const Query&) = delete;
  Query& operator=(const Query&) = delete;

  template <class... Ids>
  Query& With(Ids... ids) {
    sqlite3_reset(handle_);
    int place = 0;
    (Bind(++place, ids), ...);
    return *this;
  }
  // True when there is a row.
  bool Step() {
    const int result = sqlite3_step(handle_);
    if (result != SQLITE_ROW && result != SQLITE_DONE) database_.Check(result);
    return result == SQLITE_ROW;
  }
  // For a statement without rows.
  void Execute() {
    Step();
    database_.Check(sqlite3_reset(handle_));
  }
  std::string_view Text(int column) const {
    const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(handle_, column));
    return {text == nullptr ? "" : text, static_cast<std::size_t>(sqlite3_column_bytes(handle_, column))};
  }
  std::int64_t Whole(int column) const { return sqlite3_column_int64(handle_, column); }
  double Real(int column) const { return sqlite3_column_double(handle_, column); }
  sqlite3_stmt* Handle() const { return handle_; }

 private:
  void Bind(int place, std::int64_t id) { sqlite3_bind_int64(handle_, place, id); }
  void Bind(int place, std::string_view text) {
    sqlite3_bind_text(handle_, place, text.data(), static_cast<int>(text.size()), SQLITE_TRANSIENT);
  }

  const Database& database_;
  sqlite3_stmt* handle_ = nullptr;
};

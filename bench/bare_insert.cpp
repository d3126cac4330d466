// The yardstick for storing orders: the rows that an import stored in SOURCE, inserted into TARGET through SQLite's own
// C interface, statements prepared once, one durable transaction an order. TARGET is the store as it was before that
// import, so that tables, indexes and everything else in it are the program's own. As an import does, each order is
// looked for by its number, goes in as incomplete and is then marked complete.
//   bare_insert SOURCE TARGET
// SOURCE is read before the clock starts; it runs from the opening of TARGET to its closing.
#include <sqlite3.h>

#include <array>
#include <cstdint>
#include <cstdio>
#include <stdexcept>
#include <string>
#include <vector>

#include "bare_rows.h"
#include "bare_sqlite.h"
#include "stopwatch.h"

namespace {

constexpr int kIncomplete = 9;

// One table: what the import put into it, and how its rows are found and inserted.
class Table {
 public:
  Table(const Database& source, const std::string& name, const std::string& id) : name_(name) {
    Query all(source, "SELECT * FROM " + name + " ORDER BY " + id);
    const int columns = sqlite3_column_count(all.Handle());
    std::string names, marks;
    for (int column = 1; column < columns; ++column) {
      const std::string column_name = sqlite3_column_name(all.Handle(), column);
      names += (column == 1 ? "\"" : ",\"") + column_name + '"';
      marks += column == 1 ? "?" : ",?";
      if (column_name == "OrderId") owner_ = static_cast<std::size_t>(column);
      if (column_name == "VendorId") vendor_ = static_cast<std::size_t>(column);
      if (column_name == "PartnerId") partner_ = static_cast<std::size_t>(column);
      if (column_name == "PONo") number_ = static_cast<std::size_t>(column);
      if (column_name == "Status") status_ = static_cast<std::size_t>(column);
    }
    insert_ = "INSERT INTO " + name + "(" + names + ") VALUES(" + marks + ")";
    while (all.Step()) {
      Row& row = rows_.emplace_back();
      for (int column = 0; column < columns; ++column) row.push_back(Column(all.Handle(), column));
    }
  }

  const std::string& InsertSql() const { return insert_; }
  std::vector<Row>& Rows() { return rows_; }
  // What an order is found by.
  std::array<Value, 3> Number(const Row& row) const { return {row[vendor_], row[partner_], row[number_]}; }
  Value& Status(Row& row) const { return row[status_]; }

  // Inserts the next row. Its id has to come out as in the source, for later rows name it.
  void InsertNext(const Database& target, Query& insert) {
    const Row& row = rows_[next_++];
    for (std::size_t column = 1; column < row.size(); ++column)
      Bind(insert.Handle(), static_cast<int>(column), row[column]);
    insert.Execute();
    if (sqlite3_last_insert_rowid(target.Handle()) != row[0].whole) {
      throw std::runtime_error("the target is not the store that the source's rows went into: " + name_);
    }
  }
  bool NextBelongsTo(std::int64_t order) const { return next_ < rows_.size() && rows_[next_][owner_].whole == order; }

 private:
  std::string name_, insert_;
  std::size_t owner_ = 0, vendor_ = 0, partner_ = 0, number_ = 0, status_ = 0;
  std::vector<Row> rows_;
  std::size_t next_ = 0;
};

struct Import {
  explicit Import(const Database& source)
      : order(source, "tbOrder", "OrderId"),
        parts{Table(source, "tbOrderLine", "LineId"), Table(source, "tbOrderLocn", "LocnId"),
              Table(source, "tbOrderLocnLine", "Id")},
        log(source, "tbLog", "LogId") {
    if (log.Rows().size() != order.Rows().size())
      throw std::runtime_error("the source has not one log record an order");
    for (Row& row : order.Rows()) {
      Value& status = order.Status(row);
      status.type = SQLITE_INTEGER;
      status.whole = kIncomplete;
    }
  }

  void Store(const Database& target) {
    Query begin(target, "BEGIN IMMEDIATE");
    Query commit(target, "COMMIT");
    Query find(target, "SELECT OrderId FROM tbOrder WHERE VendorId=? AND PartnerId=? AND PONo=?");
    Query finish(target, "UPDATE tbOrder SET Status=0 WHERE OrderId=?");
    Query insertOrder(target, order.InsertSql());
    Query insertLog(target, log.InsertSql());
    std::array<Query, 3> insertPart = {Query(target, parts[0].InsertSql()), Query(target, parts[1].InsertSql()),
                                       Query(target, parts[2].InsertSql())};
    for (const Row& row : order.Rows()) {
      begin.Execute();
      const auto number = order.Number(row);
      for (int place = 0; place < 3; ++place) Bind(find.Handle(), place + 1, number[static_cast<std::size_t>(place)]);
      if (find.Step()) throw std::runtime_error("the target holds the orders already");
      sqlite3_reset(find.Handle());
      order.InsertNext(target, insertOrder);
      for (std::size_t part = 0; part < parts.size(); ++part) {
        while (parts[part].NextBelongsTo(row[0].whole)) parts[part].InsertNext(target, insertPart[part]);
      }
      sqlite3_bind_int64(finish.Handle(), 1, row[0].whole);
      finish.Execute();
      log.InsertNext(target, insertLog);
      commit.Execute();
    }
  }

  Table order;
  std::array<Table, 3> parts;
  Table log;
};

void Store(Import& import, const char* path) {
  const Database target(path, SQLITE_OPEN_READWRITE);
  target.Run("PRAGMA journal_mode=WAL");
  target.Run("PRAGMA synchronous=FULL");
  import.Store(target);
}

}  // namespace

int main(int count, char** arguments) {
  if (count != 3) {
    std::fputs("usage: bare_insert SOURCE TARGET\n", stderr);
    return 2;
  }
  try {
    const Database source(arguments[1], SQLITE_OPEN_READONLY);
    Import import(source);
    const Stopwatch watch;
    Store(import, arguments[2]);
    std::printf("{\"orders\": %zu, \"seconds\": %.6f, \"busy\": %.6f}\n", import.order.Rows().size(), watch.Elapsed(),
                watch.Busy());
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "bare_insert: %s\n", error.what());
    return 1;
  }
}

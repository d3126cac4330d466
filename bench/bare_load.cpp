// The yardstick for loading records: the rows that a load stored in SOURCE, inserted into TARGET through SQLite's own C
// interface, one statement prepared once, one durable transaction. TARGET is the store as it was before that load, so
// that tables and indexes are the program's own.
//   bare_load SOURCE TARGET TABLE
// The clock runs from the opening of TARGET to its closing, but for the reading of SOURCE, some rows at a time.
#include <sqlite3.h>

#include <cstdio>
#include <stdexcept>
#include <string>
#include <vector>

#include "bare_rows.h"
#include "bare_sqlite.h"
#include "stopwatch.h"

namespace {

constexpr std::size_t kRowsAtATime = 20'000;

struct Times {
  std::size_t rows = 0;
  double elapsed = 0, busy = 0;

  void Add(const Stopwatch& watch) {
    elapsed += watch.Elapsed();
    busy += watch.Busy();
  }
};

std::string InsertSql(const Query& all, const std::string& table) {
  std::string names, marks;
  for (int column = 1; column < sqlite3_column_count(all.Handle()); ++column) {
    names += std::string(column == 1 ? "\"" : ",\"") + sqlite3_column_name(all.Handle(), column) + '"';
    marks += column == 1 ? "?" : ",?";
  }
  return "INSERT INTO " + table + "(" + names + ") VALUES(" + marks + ")";
}

// The next rows, fewer than wanted at the end.
void Read(Query& all, std::vector<Row>& rows) {
  rows.clear();
  const int columns = sqlite3_column_count(all.Handle());
  while (rows.size() < kRowsAtATime && all.Step()) {
    Row& row = rows.emplace_back();
    for (int column = 1; column < columns; ++column) row.push_back(Column(all.Handle(), column));
  }
}

void Insert(const std::vector<Row>& rows, Query& insert) {
  for (const Row& row : rows) {
    int place = 0;
    for (const Value& value : row) Bind(insert.Handle(), ++place, value);
    insert.Execute();
  }
}

Times Load(const char* sourcePath, const char* targetPath, const std::string& table) {
  const Database source(sourcePath, SQLITE_OPEN_READONLY);
  Query all(source, "SELECT * FROM " + table + " ORDER BY 1");
  Times times;
  std::vector<Row> rows;
  Stopwatch watch;
  {
    const Database target(targetPath);
    target.Run("PRAGMA journal_mode=WAL");
    target.Run("PRAGMA synchronous=FULL");
    Query insert(target, InsertSql(all, table));
    target.Run("BEGIN IMMEDIATE");
    do {
      times.Add(watch);
      Read(all, rows);
      watch = Stopwatch();
      Insert(rows, insert);
      times.rows += rows.size();
    } while (rows.size() == kRowsAtATime);
    target.Run("COMMIT");
  }
  times.Add(watch);
  return times;
}

}  // namespace

int main(int count, char** arguments) {
  if (count != 4) {
    std::fputs("usage: bare_load SOURCE TARGET TABLE\n", stderr);
    return 2;
  }
  try {
    const Times times = Load(arguments[1], arguments[2], arguments[3]);
    std::printf("{\"rows\": %zu, \"seconds\": %.6f, \"busy\": %.6f}\n", times.rows, times.elapsed, times.busy);
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "bare_load: %s\n", error.what());
    return 1;
  }
}

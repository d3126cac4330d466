// Rows of any table, held apart from the database that they were read from.
#pragma once

#include <sqlite3.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

struct Value {
  int type = SQLITE_NULL;
  std::int64_t whole = 0;
  double real = 0;
  std::string text;
};

// The columns as the table has them, its own number in front.
using Row = std::vector<Value>;

inline Value Column(sqlite3_stmt* row, int column) {
  Value value;
  value.type = sqlite3_column_type(row, column);
  if (value.type == SQLITE_INTEGER) value.whole = sqlite3_column_int64(row, column);
  if (value.type == SQLITE_FLOAT) value.real = sqlite3_column_double(row, column);
  if (value.type == SQLITE_TEXT) {
    value.text.assign(reinterpret_cast<const char*>(sqlite3_column_text(row, column)),
                      static_cast<std::size_t>(sqlite3_column_bytes(row, column)));
  }
  return value;
}

inline void Bind(sqlite3_stmt* statement, int place, const Value& value) {
  switch (value.type) {
    case SQLITE_INTEGER:
      sqlite3_bind_int64(statement, place, value.whole);
      break;
    case SQLITE_FLOAT:
      sqlite3_bind_double(statement, place, value.real);
      break;
    case SQLITE_TEXT:
      sqlite3_bind_text(statement, place, value.text.data(), static_cast<int>(value.text.size()), SQLITE_STATIC);
      break;
    default:
      sqlite3_bind_null(statement, place);
  }
}

// The SQL of a record type, built from its member table. Values are always parameters.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/record_type.h"

namespace partnerkit::host {

struct Dialect;

using Members = std::vector<const Member*>;

// A statement with the members that fill its parameters and those that its columns fill, in order.
struct TableSql {
  std::string sql;
  Members parameters;
  Members columns;
};

// Null when the type has no id.
const Member* IdOf(const RecordType& type);
Members KeysOf(const RecordType& type);
std::int64_t IdValue(const Member& id, const void* record);
void SetIdValue(const Member& id, void* record, std::int64_t value);

// The column that keeps the order added in a table without an id.
inline constexpr std::string_view kRowColumn = "RowNo";

TableSql InsertSql(const Dialect& dialect, const RecordType& type, bool withId);
TableSql LoadSql(const RecordType& type);
// By id when the type has one, else by key. A partner's counters only ever go up: a record that was read before the
// newest number was drawn must not bring that number back.
TableSql UpdateSql(const RecordType& type);
TableSql DeleteSql(const RecordType& type);
// The records that fit the look-up, in the order added; only the first with `one`.
TableSql SelectSql(const RecordType& type, const Lookup& lookup, bool one);
TableSql CountSql(const RecordType& type, const Lookup& lookup);
TableSql DeleteAllSql(const RecordType& type, const Lookup& lookup);
// Every record, by id or key.
TableSql AllSql(const RecordType& type);

}  // namespace partnerkit::host

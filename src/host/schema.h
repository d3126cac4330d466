// The tables of the store: made, checked and brought up to date when it is opened.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "partnerkit/record_type.h"

namespace partnerkit::host {

class SqlSession;
struct Dialect;

// Goes up with every change of a record type that a released program's database would not fit.
inline constexpr std::int32_t kSchemaVersion = 2;

// Settings by name, the members of `System`.
inline constexpr std::string_view kSettingsTable = "tbSystem";

// Makes an empty database into a store of these types. In an older one it adds the tables and columns that are missing,
// in one transaction. Raises RunTimeError for a newer store and for a database that is another program's; nothing is
// changed then.
void PrepareSchema(SqlSession& session, std::span<const RecordType* const> types,
                   std::int32_t version = kSchemaVersion);

// The statements that make the table and the indexes of a type.
std::string CreateTableSql(const Dialect& dialect, const RecordType& type);
std::vector<std::string> CreateIndexSql(const RecordType& type);

}  // namespace partnerkit::host

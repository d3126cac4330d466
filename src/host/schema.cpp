#include "host/schema.h"

#include <algorithm>
#include <array>
#include <optional>

#include "host/sql_session.h"
#include "host/statement.h"
#include "host/table_sql.h"

namespace partnerkit::host {
namespace {

constexpr std::string_view kVersionTable = "tbSchemaVersion";

// An import writes these row by row, and each index of theirs is paid for with every row. A look-up that names more
// than the owner filters the owner's few rows.
constexpr std::array<std::string_view, 5> kBulkTables = {"tbOrder", "tbOrderLine", "tbOrderLocn", "tbOrderLocnLine",
                                                         "tbUnsettledOrder"};

// Lines and the like go with their owner, so nothing is left to take a later one for them.
bool IsOwned(const RecordType& type) {
  return std::ranges::find(type.members, MemberRole::kOwner, &Member::role) != type.members.end();
}

std::string ColumnType(const Dialect& dialect, const RecordType& type, const Member& member) {
  const auto text = [](std::string_view name, std::string_view rest) { return std::string(name).append(rest); };
  if (member.role == MemberRole::kId) {
    // Ids are 32-bit numbers everywhere else.
    return text(IsOwned(type) ? dialect.idColumn : dialect.lastingIdColumn, " CHECK(") + Quoted(member.name) +
           " BETWEEN 1 AND 2147483647)";
  }
  switch (member.kind) {
    case MemberKind::kString:
      return text(dialect.textColumn, " NOT NULL DEFAULT ''");
    case MemberKind::kText:
    case MemberKind::kDate:
      return text(dialect.textColumn, "");
    case MemberKind::kInt:
    case MemberKind::kBool:
      return text(dialect.intColumn, " NOT NULL DEFAULT 0");
    case MemberKind::kLong:
      return text(dialect.longColumn, " NOT NULL DEFAULT 0");
    case MemberKind::kDouble:
      return text(dialect.realColumn, " NOT NULL DEFAULT 0");
    case MemberKind::kNumber:
      return text(dialect.realColumn, "");
  }
  return {};
}

using Columns = std::vector<std::string_view>;

struct Index {
  std::string name;
  Columns columns;
  bool unique;
};

bool StartsWith(const Columns& whole, const Columns& start) {
  return start.size() <= whole.size() && std::equal(start.begin(), start.end(), whole.begin());
}

std::vector<Index> IndexesOf(const RecordType& type) {
  std::vector<Index> indexes;
  const std::string prefix = "ix" + std::string(type.kind);
  Columns key;
  for (const Member* member : KeysOf(type)) key.push_back(member->name);
  if (!key.empty()) indexes.push_back({prefix + "Key", key, true});
  const bool bulk = std::ranges::find(kBulkTables, type.table) != kBulkTables.end();
  for (const bool unique : {true, false}) {
    for (const Lookup& lookup : type.lookups) {
      const Columns columns(lookup.members.begin(), lookup.members.end());
      if (lookup.unique != unique || columns.empty()) continue;
      const bool served = std::ranges::any_of(indexes, [&](const Index& index) {
        return StartsWith(index.columns, columns) || StartsWith(columns, index.columns);
      });
      if (!unique && (served || (bulk && columns.size() > 1))) continue;
      indexes.push_back({prefix + std::string(lookup.name), columns, unique});
    }
  }
  return indexes;
}

std::vector<std::string> TableNames(SqlSession& session) {
  std::vector<std::string> names;
  soci::rowset<std::string> rows = session.Soci().prepare << session.Soci().get_backend()->get_table_names_query();
  for (const std::string& name : rows) {
    if (!name.starts_with("sqlite_")) names.push_back(name);
  }
  return names;
}

std::vector<std::string> ColumnNames(SqlSession& session, std::string_view table) {
  std::vector<std::string> names;
  const std::array kinds = {MemberKind::kString};
  Statement statement(session, std::string(session.Sql().columnNames), kinds, kinds);
  statement.Parameter(0).Set(table);
  for (bool more = statement.Execute(); more; more = statement.Next()) names.push_back(statement.Column(0).text);
  return names;
}

bool Contains(const std::vector<std::string>& names, std::string_view name) {
  return std::ranges::find(names, name) != names.end();
}

// Nothing when the database is empty.
std::optional<std::int32_t> StoredVersion(SqlSession& session) {
  const std::vector<std::string> tables = TableNames(session);
  if (tables.empty()) return std::nullopt;
  if (!Contains(tables, kVersionTable)) session.Raise("is the database of another program");
  int version = 0;
  session.Soci() << "SELECT COALESCE(MAX(\"Version\"),0) FROM " + Quoted(kVersionTable), soci::into(version);
  return version;
}

// True when the store fits; raises when it never will.
bool IsUpToDate(SqlSession& session, std::int32_t version) {
  const std::optional<std::int32_t> stored = StoredVersion(session);
  if (stored.value_or(0) > version) {
    session.Raise("is of a newer version (" + std::to_string(*stored) + ") than this program (" +
                  std::to_string(version) + ") understands");
  }
  return stored == version;
}

void AddMissingColumns(SqlSession& session, const RecordType& type) {
  const std::vector<std::string> present = ColumnNames(session, type.table);
  for (const Member& member : type.members) {
    if (Contains(present, member.name)) continue;
    session.Execute("ALTER TABLE " + Quoted(type.table) + " ADD COLUMN " + Quoted(member.name) + " " +
                    ColumnType(session.Sql(), type, member));
  }
}

void BringUpToDate(SqlSession& session, std::span<const RecordType* const> types, std::int32_t version) {
  const std::vector<std::string> present = TableNames(session);
  for (const RecordType* type : types) {
    if (Contains(present, type->table)) AddMissingColumns(session, *type);
    else session.Execute(CreateTableSql(session.Sql(), *type));
    for (const std::string& index : CreateIndexSql(*type)) session.Execute(index);
  }
  const std::string text(session.Sql().textColumn);
  session.Execute("CREATE TABLE IF NOT EXISTS " + Quoted(kSettingsTable) + "(\"Name\" " + text +
                  " PRIMARY KEY,\"Value\" " + text + " NOT NULL)");
  session.Execute("CREATE TABLE IF NOT EXISTS " + Quoted(kVersionTable) + "(\"Version\" INTEGER NOT NULL)");
  session.Execute("DELETE FROM " + Quoted(kVersionTable));
  session.Execute("INSERT INTO " + Quoted(kVersionTable) + " VALUES(" + std::to_string(version) + ")");
}

}  // namespace

std::string CreateTableSql(const Dialect& dialect, const RecordType& type) {
  std::string columns;
  if (IdOf(type) == nullptr) columns = Quoted(kRowColumn) + " " + std::string(dialect.idColumn);
  for (const Member& member : type.members) {
    columns += (columns.empty() ? "" : ",") + Quoted(member.name) + " " + ColumnType(dialect, type, member);
  }
  return "CREATE TABLE " + Quoted(type.table) + "(" + columns + ")";
}

std::vector<std::string> CreateIndexSql(const RecordType& type) {
  std::vector<std::string> statements;
  for (const Index& index : IndexesOf(type)) {
    std::string columns;
    for (const std::string_view column : index.columns)
      columns.append(columns.empty() ? "" : ",").append(Quoted(column));
    statements.push_back(std::string("CREATE ") + (index.unique ? "UNIQUE " : "") + "INDEX IF NOT EXISTS " +
                         Quoted(index.name) + " ON " + Quoted(type.table) + "(" + columns + ")");
  }
  return statements;
}

void PrepareSchema(SqlSession& session, std::span<const RecordType* const> types, std::int32_t version) {
  if (session.Guarded([&] { return IsUpToDate(session, version); })) return;
  session.Begin();
  try {
    // Another program may have been here first.
    session.Guarded([&] {
      if (!IsUpToDate(session, version)) BringUpToDate(session, types, version);
    });
  } catch (...) {
    session.RollbackExplicit();
    throw;
  }
  session.CommitExplicit();
}

}  // namespace partnerkit::host

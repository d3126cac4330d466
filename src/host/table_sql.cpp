#include "host/table_sql.h"

#include <algorithm>
#include <array>

#include "host/sql_session.h"
#include "partnerkit/run_time_error.h"

namespace partnerkit::host {
namespace {

constexpr std::array<std::string_view, 3> kCounters = {"LastASNNo", "LastInterchangeNo", "LastGroupNo"};

Members AllOf(const RecordType& type) {
  Members all;
  for (const Member& member : type.members) all.push_back(&member);
  return all;
}

const Member& Named(const RecordType& type, std::string_view name) {
  const auto found = std::ranges::find(type.members, name, &Member::name);
  if (found == type.members.end()) {
    throw RunTimeError(run_time::kInternal, std::string(type.kind).append(" has no member ").append(name));
  }
  return *found;
}

Members IdentityOf(const RecordType& type) {
  const Member* id = IdOf(type);
  return id ? Members{id} : KeysOf(type);
}

bool MayBeNull(const Member& member) {
  return member.kind == MemberKind::kText || member.kind == MemberKind::kNumber || member.kind == MemberKind::kDate;
}

std::string List(const Members& members) {
  std::string list;
  for (const Member* member : members) list.append(list.empty() ? "" : ",").append(Quoted(member->name));
  return list;
}

// Gives the statement one more parameter and returns its placeholder.
std::string Take(TableSql& sql, const Member& member) {
  sql.parameters.push_back(&member);
  return ":p" + std::to_string(sql.parameters.size() - 1);
}

void Where(TableSql& sql, const Members& members) {
  std::string_view before = " WHERE ";
  for (const Member* member : members) {
    sql.sql.append(before).append(Quoted(member->name));
    sql.sql.append(MayBeNull(*member) ? " IS NOT DISTINCT FROM " : "=").append(Take(sql, *member));
    before = " AND ";
  }
}

Members Fitting(const RecordType& type, const Lookup& lookup) {
  Members members;
  for (const std::string_view name : lookup.members) members.push_back(&Named(type, name));
  return members;
}

TableSql SelectFrom(const RecordType& type, const Members& where) {
  TableSql select;
  select.columns = AllOf(type);
  select.sql = "SELECT " + List(select.columns) + " FROM " + Quoted(type.table);
  Where(select, where);
  return select;
}

void SetMember(TableSql& update, const RecordType& type, const Member& member) {
  const std::string name = Quoted(member.name);
  if (type.kind != "Partner" || std::ranges::find(kCounters, member.name) == kCounters.end()) {
    update.sql.append(name).append("=").append(Take(update, member));
    return;
  }
  update.sql.append(name).append("=CASE WHEN ").append(name).append(">").append(Take(update, member));
  update.sql.append(" THEN ").append(name).append(" ELSE ").append(Take(update, member)).append(" END");
}

}  // namespace

const Member* IdOf(const RecordType& type) {
  const auto found = std::ranges::find(type.members, MemberRole::kId, &Member::role);
  return found == type.members.end() ? nullptr : &*found;
}

Members KeysOf(const RecordType& type) {
  Members keys;
  for (const Member& member : type.members) {
    if (member.role == MemberRole::kKey) keys.push_back(&member);
  }
  return keys;
}

std::int64_t IdValue(const Member& id, const void* record) {
  const void* value = id.at(const_cast<void*>(record));
  return id.kind == MemberKind::kLong ? *static_cast<const std::int64_t*>(value)
                                      : *static_cast<const std::int32_t*>(value);
}

void SetIdValue(const Member& id, void* record, std::int64_t value) {
  if (id.kind == MemberKind::kLong) *static_cast<std::int64_t*>(id.at(record)) = value;
  else *static_cast<std::int32_t*>(id.at(record)) = static_cast<std::int32_t>(value);
}

TableSql InsertSql(const Dialect& dialect, const RecordType& type, bool withId) {
  TableSql insert;
  Members stored = AllOf(type);
  const Member* id = IdOf(type);
  if (!withId) std::erase(stored, id);
  insert.sql = "INSERT INTO " + Quoted(type.table) + "(" + List(stored) + ") VALUES(";
  for (const Member* member : stored)
    insert.sql.append(member == stored.front() ? "" : ",").append(Take(insert, *member));
  insert.sql += ')';
  if (id != nullptr && !withId && dialect.returnsId) {
    insert.sql += " RETURNING " + Quoted(id->name);
    insert.columns = {id};
  }
  return insert;
}

TableSql LoadSql(const RecordType& type) {
  const Members keys = KeysOf(type);
  return SelectFrom(type, keys.empty() ? IdentityOf(type) : keys);
}

TableSql UpdateSql(const RecordType& type) {
  TableSql update{"UPDATE " + Quoted(type.table) + " SET ", {}, {}};
  const Members identity = IdentityOf(type);
  Members set = AllOf(type);
  // The identity is written only where there is nothing else to write: the statement has to tell whether the record
  // exists.
  if (set.size() > identity.size())
    std::erase_if(set, [&](auto* m) { return std::ranges::find(identity, m) != identity.end(); });
  for (const Member* member : set) {
    if (member != set.front()) update.sql += ',';
    SetMember(update, type, *member);
  }
  Where(update, identity);
  return update;
}

TableSql DeleteSql(const RecordType& type) {
  TableSql erase{"DELETE FROM " + Quoted(type.table), {}, {}};
  Where(erase, IdentityOf(type));
  return erase;
}

TableSql SelectSql(const RecordType& type, const Lookup& lookup, bool one) {
  TableSql select = SelectFrom(type, Fitting(type, lookup));
  const Member* id = IdOf(type);
  select.sql += " ORDER BY " + Quoted(id ? id->name : kRowColumn);
  if (one) select.sql += " LIMIT 1";
  return select;
}

TableSql CountSql(const RecordType& type, const Lookup& lookup) {
  TableSql count{"SELECT COUNT(*) FROM " + Quoted(type.table), {}, {}};
  Where(count, Fitting(type, lookup));
  return count;
}

TableSql DeleteAllSql(const RecordType& type, const Lookup& lookup) {
  TableSql erase{"DELETE FROM " + Quoted(type.table), {}, {}};
  Where(erase, Fitting(type, lookup));
  return erase;
}

TableSql AllSql(const RecordType& type) {
  TableSql all = SelectFrom(type, {});
  all.sql += " ORDER BY " + List(IdentityOf(type));
  return all;
}

}  // namespace partnerkit::host

#include "host/sql_store.h"

#include <algorithm>
#include <limits>
#include <string>

#include "host/statement.h"
#include "host/table_sql.h"
#include "partnerkit/run_time_error.h"

namespace partnerkit::host {
namespace {

std::vector<MemberKind> KindsOf(const Members& members) {
  std::vector<MemberKind> kinds;
  for (const Member* member : members) kinds.push_back(member->kind);
  return kinds;
}

}  // namespace

struct SqlStore::Prepared {
  Prepared(SqlSession& session, const RecordType& type, TableSql text, const std::vector<MemberKind>& columnKinds)
      : table(type.table),
        id(IdOf(type)),
        parameters(std::move(text.parameters)),
        columns(std::move(text.columns)),
        statement(session, text.sql, KindsOf(parameters), columnKinds) {}

  void Fill(const void* record) {
    for (std::size_t n = 0; n < parameters.size(); ++n) {
      statement.Parameter(n).CopyFrom(parameters[n]->at(const_cast<void*>(record)));
    }
  }
  void Read(void* record) const {
    for (std::size_t n = 0; n < columns.size(); ++n) statement.Column(n).CopyTo(columns[n]->at(record));
  }

  std::string table;
  const Member* id;
  Members parameters;
  Members columns;
  Statement statement;
  bool taken = false;
};

// A statement in use. Letting go of it ends its walk through the rows.
class SqlStore::Lease {
 public:
  explicit Lease(Prepared& prepared) : prepared_(&prepared) { prepared.taken = true; }
  Lease(const Lease&) = delete;
  Lease& operator=(const Lease&) = delete;
  ~Lease() {
    prepared_->statement.Reset();
    prepared_->taken = false;
  }
  Prepared* operator->() { return prepared_; }

 private:
  Prepared* prepared_;
};

std::size_t SqlStore::KeyHash::operator()(const Key& key) const {
  const std::hash<const void*> hash;
  return hash(key.type) * 31 + hash(key.lookup) * 17 + static_cast<std::size_t>(key.operation);
}

SqlStore::SqlStore(SqlSession& session) : session_(session) {}

SqlStore::~SqlStore() = default;

std::unique_ptr<SqlStore::Prepared> SqlStore::Prepare(const RecordType& type, Operation operation,
                                                      const Lookup* lookup) {
  const auto text = [&]() -> TableSql {
    switch (operation) {
      case Operation::kAdd:
        return InsertSql(session_.Sql(), type, false);
      case Operation::kAddWithId:
        return InsertSql(session_.Sql(), type, true);
      case Operation::kLoad:
        return LoadSql(type);
      case Operation::kUpdate:
        return UpdateSql(type);
      case Operation::kDelete:
        return DeleteSql(type);
      case Operation::kFind:
        return SelectSql(type, *lookup, true);
      case Operation::kSelect:
        return SelectSql(type, *lookup, false);
      case Operation::kCount:
        return CountSql(type, *lookup);
      case Operation::kDeleteAll:
        return DeleteAllSql(type, *lookup);
      case Operation::kAll:
        return AllSql(type);
    }
    return {};
  };
  TableSql sql = text();
  const std::vector<MemberKind> columns =
      operation == Operation::kCount ? std::vector{MemberKind::kLong} : KindsOf(sql.columns);
  return std::make_unique<Prepared>(session_, type, std::move(sql), columns);
}

SqlStore::Lease SqlStore::Take(const RecordType& type, Operation operation, const Lookup* lookup) {
  // The tables behind them, so that a copy of a type or of a look-up finds the same statement.
  auto& kept = statements_[{type.members.data(), lookup ? lookup->members.data() : nullptr, operation}];
  for (const auto& prepared : kept) {
    if (!prepared->taken) return Lease(*prepared);
  }
  return Lease(*kept.emplace_back(Prepare(type, operation, lookup)));
}

bool SqlStore::ReadOne(Lease& lease, void* record) {
  lease->Fill(record);
  const bool found = lease->statement.Execute();
  if (found) lease->Read(record);
  session_.Succeeded();
  return found;
}

bool SqlStore::Load(const RecordType& type, void* record) {
  return session_.Guarded([&] {
    Lease lease = Take(type, Operation::kLoad);
    return ReadOne(lease, record);
  });
}

bool SqlStore::Find(const RecordType& type, const Lookup& lookup, void* record) {
  return session_.Guarded([&] {
    Lease lease = Take(type, Operation::kFind, &lookup);
    return ReadOne(lease, record);
  });
}

void SqlStore::Select(const RecordType& type, const Lookup& lookup, const void* probe,
                      const std::function<void*()>& next) {
  session_.Guarded([&] {
    Lease lease = Take(type, Operation::kSelect, &lookup);
    lease->Fill(probe);
    for (bool more = lease->statement.Execute(); more; more = lease->statement.Next()) {
      void* place = next();
      if (place == nullptr) break;
      lease->Read(place);
    }
    session_.Succeeded();
  });
}

void SqlStore::ForEach(const RecordType& type, void* record, const std::function<void()>& visit) {
  session_.Guarded([&] {
    Lease lease = Take(type, Operation::kAll);
    for (bool more = lease->statement.Execute(); more; more = lease->statement.Next()) {
      lease->Read(record);
      visit();
    }
    session_.Succeeded();
  });
}

std::int32_t SqlStore::Count(const RecordType& type, const Lookup& lookup, const void* probe) {
  return session_.Guarded([&] {
    Lease lease = Take(type, Operation::kCount, &lookup);
    lease->Fill(probe);
    lease->statement.Execute();
    session_.Succeeded();
    const long long count = lease->statement.Column(0).whole;
    return static_cast<std::int32_t>(std::min<long long>(count, std::numeric_limits<std::int32_t>::max()));
  });
}

// Runs a change within a transaction. One that changed nothing doesn't keep a transaction open, and so keeps no other
// program waiting.
template <class F>
bool SqlStore::Change(F&& change) {
  bool opened = false;
  bool done = false;
  try {
    opened = session_.EnsureWriting();
    done = change();
    session_.Succeeded();
  } catch (const soci::soci_error& error) {
    session_.Failed(error);
  } catch (const RunTimeError&) {
    // The transaction is lost; the number of the failure that cost it stands.
  }
  if (opened && !done) session_.Abandon();
  return done;
}

bool SqlStore::Insert(const RecordType& type, void* record) {
  const Member* id = IdOf(type);
  const bool hasId = id != nullptr && IdValue(*id, record) != 0;
  Lease lease = Take(type, hasId ? Operation::kAddWithId : Operation::kAdd);
  lease->Fill(record);
  const bool returned = lease->statement.Execute();
  if (id == nullptr || hasId) return true;
  long long given = returned ? lease->statement.Column(0).whole : 0;
  if (!returned) session_.Soci().get_last_insert_id(lease->table, given);
  SetIdValue(*id, record, given);
  return true;
}

bool SqlStore::Write(const RecordType& type, Operation operation, const void* record) {
  Lease lease = Take(type, operation);
  lease->Fill(record);
  lease->statement.Execute();
  return lease->statement.RowsChanged() > 0;
}

bool SqlStore::Add(const RecordType& type, void* record) {
  return Change([&] { return Insert(type, record); });
}

bool SqlStore::Update(const RecordType& type, const void* record) {
  return Change([&] { return Write(type, Operation::kUpdate, record); });
}

bool SqlStore::Delete(const RecordType& type, const void* record) {
  return Change([&] { return Write(type, Operation::kDelete, record); });
}

bool SqlStore::ReplaceOrAdd(const RecordType& type, void* record) {
  return Change([&] {
    const Member* id = IdOf(type);
    const bool isNew = id != nullptr && IdValue(*id, record) == 0;
    return (!isNew && Write(type, Operation::kUpdate, record)) || Insert(type, record);
  });
}

bool SqlStore::DeleteAll(const RecordType& type, const Lookup& lookup, const void* probe) {
  return Change([&] {
    Lease lease = Take(type, Operation::kDeleteAll, &lookup);
    lease->Fill(probe);
    lease->statement.Execute();
    return true;
  });
}

std::int32_t SqlStore::NativeError() const { return session_.NativeError(); }

}  // namespace partnerkit::host

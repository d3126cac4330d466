#include "host/sql_host.h"

#include <pwd.h>
#include <unistd.h>

#include <array>
#include <initializer_list>
#include <limits>
#include <map>

#include "host/log_store.h"
#include "host/schema.h"
#include "host/statement.h"
#include "partnerkit/run_time_error.h"

namespace partnerkit::host {
namespace {

std::string_view ColumnOf(Counter counter) {
  switch (counter) {
    case Counter::kASNNo:
      return "LastASNNo";
    case Counter::kInterchangeNo:
      return "LastInterchangeNo";
    case Counter::kGroupNo:
      return "LastGroupNo";
  }
  return {};
}

std::string LoginName() {
  const passwd* entry = getpwuid(geteuid());
  return entry != nullptr && entry->pw_name != nullptr ? entry->pw_name : "";
}

using Kinds = std::vector<MemberKind>;

}  // namespace

bool DropThreadGuards() { return sqlite_api::sqlite3_config(SQLITE_CONFIG_MULTITHREAD) == SQLITE_OK; }

struct SqlHost::Parts {
  Parts(std::string_view url, const SqlOptions& options) : session(url, options), store(session) {}

  // The statement kept under its own text.
  Statement& Prepared(const std::string& sql, const Kinds& parameters, const Kinds& columns) {
    auto& kept = statements[sql];
    if (!kept) kept = std::make_unique<Statement>(session, sql, parameters, columns);
    return *kept;
  }

  std::int64_t CountOf(const std::string& sql, std::initializer_list<std::int64_t> parameters) {
    return session.Guarded([&] {
      Statement& count = Prepared(sql, Kinds(parameters.size(), MemberKind::kLong), {MemberKind::kLong});
      std::size_t n = 0;
      for (const std::int64_t parameter : parameters) count.Parameter(n++).Set(parameter);
      count.Execute();
      const std::int64_t counted = count.Column(0).whole;
      count.Reset();
      return counted;
    });
  }

  // Within a transaction, that no other program moves the counter meanwhile.
  std::int32_t NextNumber(std::string_view partnerId, Counter counter) {
    const std::string column = Quoted(ColumnOf(counter));
    const std::string table = Quoted(Partner::kType.table);
    return session.Guarded([&] {
      Statement& last = Prepared("SELECT " + column + " FROM " + table + " WHERE \"PartnerId\"=:p0",
                                 {MemberKind::kString}, {MemberKind::kLong});
      last.Parameter(0).Set(partnerId);
      const bool found = last.Execute();
      const std::int64_t next = last.Column(0).whole + 1;
      last.Reset();
      if (!found) session.Raise("there is no partner \"" + std::string(partnerId) + "\"");
      if (next > std::numeric_limits<std::int32_t>::max()) {
        throw RunTimeError(run_time::kOverflow, session.Name() + ": partner " + std::string(partnerId) +
                                                    " has used up its " + std::string(ColumnOf(counter)));
      }
      Statement& move = Prepared("UPDATE " + table + " SET " + column + "=:p0 WHERE \"PartnerId\"=:p1",
                                 {MemberKind::kLong, MemberKind::kString}, {});
      move.Parameter(0).Set(next);
      move.Parameter(1).Set(partnerId);
      move.Execute();
      return static_cast<std::int32_t>(next);
    });
  }

  SqlSession session;
  LogStore store;
  std::map<std::string, std::unique_ptr<Statement>> statements;
  std::map<std::string, std::optional<std::string>, std::less<>> settings;
  std::optional<std::string> loginName;
};

SqlHost::SqlHost(std::unique_ptr<Parts> parts) : parts_(std::move(parts)) {}

SqlHost::~SqlHost() {
  try {
    Close();
  } catch (const RunTimeError&) {
    // Nobody is left to be told; what could not be committed is as if the program had been killed.
  }
}

std::unique_ptr<SqlHost> SqlHost::Open(std::string_view url, const SqlOptions& options) {
  auto parts = std::make_unique<Parts>(url, options);
  PrepareSchema(parts->session, AllRecordTypes());
  return std::unique_ptr<SqlHost>(new SqlHost(std::move(parts)));
}

SqlStore& SqlHost::Records() { return parts_->store; }

SqlSession& SqlHost::Session() { return parts_->session; }

std::string SqlHost::UserId() {
  if (std::optional<std::string> user = Setting("UserId")) return *std::move(user);
  if (!parts_->loginName) parts_->loginName = LoginName();
  return *parts_->loginName;
}

void SqlHost::Commit(std::int32_t) { parts_->session.Commit(); }
void SqlHost::CommitTrans() { parts_->session.CommitExplicit(); }

// What the log may need meanwhile is better reserved for good.
void SqlHost::BeginTrans() {
  if (parts_->store.IsLowOnIds()) parts_->session.CommitRider();
  parts_->session.Begin();
}

void SqlHost::RollbackTrans() {
  parts_->session.RollbackExplicit();
  if (parts_->store.HasExposedIds()) parts_->session.CommitRider();
  parts_->settings.clear();
}

void SqlHost::Close() {
  parts_->store.SetClosing(true);
  try {
    parts_->session.Close();
  } catch (...) {
    parts_->store.SetClosing(false);
    throw;
  }
  parts_->store.SetClosing(false);
}

std::size_t SqlHost::UnstoredLogRecords() const { return parts_->store.Unstored(); }

bool SqlHost::HasChanges() const { return parts_->session.HasChanges(); }

std::int64_t SqlHost::Faults() const { return parts_->session.Faults(); }

const std::string& SqlHost::LastFault() const { return parts_->session.LastFault(); }

void SqlHost::Recover() { parts_->session.Recover(); }

bool SqlHost::DeleteOrder(const Order& order) {
  SqlSession& session = parts_->session;
  SqlStore& store = parts_->store;
  OrderLine line;
  OrderLocn locn;
  OrderLocnLine locnLine;
  line.OrderId = locn.OrderId = locnLine.OrderId = order.OrderId;
  bool opened = false;
  bool done = false;
  try {
    opened = session.EnsureWriting();
    session.Execute("SAVEPOINT \"DeleteOrder\"");
    done = Delete(store, order) && store.DeleteAll(OrderLocnLine::kType, OrderLocnLine::kByOrder, &locnLine) &&
           store.DeleteAll(OrderLocn::kType, OrderLocn::kByOrder, &locn) &&
           store.DeleteAll(OrderLine::kType, OrderLine::kByOrder, &line);
    // A failure that took the whole transaction back took the savepoint along.
    if (session.InTransaction()) {
      if (!done) session.Execute("ROLLBACK TO \"DeleteOrder\"");
      session.Execute("RELEASE \"DeleteOrder\"");
    }
  } catch (const soci::soci_error& error) {
    session.Failed(error);
    done = false;
  } catch (const RunTimeError&) {
    done = false;
  }
  // A constraint that forbids it is the host's own no, not a failure of the store.
  if (!done && session.ForbiddenByConstraint()) session.Succeeded();
  if (opened && !done) session.Abandon();
  return done;
}

// Only a change shows that the file is read-only.
void SqlHost::CheckWritable() {
  parts_->session.Begin();
  try {
    parts_->session.Guarded([&] { parts_->store.ReserveIds(); });
  } catch (...) {
    parts_->session.RollbackExplicit();
    throw;
  }
  parts_->session.CommitExplicit();
}

std::vector<EDIDoc> SqlHost::EDIDocList() {
  std::vector<EDIDoc> docs;
  ForEach<EDIDoc>(parts_->store, [&](const EDIDoc& doc) { docs.push_back(doc); });
  return docs;
}

std::int32_t SqlHost::NextNumber(std::string_view partnerId, Counter counter) {
  SqlSession& session = parts_->session;
  if (session.InExplicit()) return parts_->NextNumber(partnerId, counter);
  session.Begin();
  try {
    const std::int32_t number = parts_->NextNumber(partnerId, counter);
    session.CommitExplicit();
    return number;
  } catch (...) {
    session.RollbackExplicit();
    throw;
  }
}

std::vector<std::shared_ptr<Pack>> SqlHost::PacksToCompile(std::string_view vendorId, std::string_view partnerId) {
  return parts_->session.Guarded([&] {
    std::string columns;
    Kinds kinds;
    for (const Member& member : Pack::kType.members) {
      columns.append(columns.empty() ? "" : ",").append(Quoted(member.name));
      kinds.push_back(member.kind);
    }
    Statement& waiting =
        parts_->Prepared("SELECT " + columns + " FROM " + Quoted(Pack::kType.table) +
                             " WHERE \"VendorId\"=:p0 AND \"Status\"<8 AND \"LeadPackId\"=0 AND \"ShipmentId\"<>0 AND "
                             "\"OrderId\" IN (SELECT "
                             "\"OrderId\" FROM " +
                             Quoted(Order::kType.table) +
                             " WHERE \"PartnerId\"=:p1) ORDER BY \"ShipmentId\",\"OrderId\",\"ShipToCode\",\"Id\"",
                         {MemberKind::kString, MemberKind::kString}, kinds);
    waiting.Parameter(0).Set(vendorId);
    waiting.Parameter(1).Set(partnerId);
    std::vector<std::shared_ptr<Pack>> packs;
    for (bool more = waiting.Execute(); more; more = waiting.Next()) {
      Pack& pack = *packs.emplace_back(std::make_shared<Pack>());
      for (std::size_t n = 0; n < kinds.size(); ++n) waiting.Column(n).CopyTo(Pack::kType.members[n].at(&pack));
    }
    waiting.Reset();
    // Each of them is told of in the transaction of its notice.
    parts_->store.Foresee(packs.size());
    return packs;
  });
}

bool SqlHost::OrderComplete(std::int32_t orderId) {
  const std::string lines = " FROM \"tbOrderLocnLine\" o WHERE o.\"OrderId\"=:p0";
  const std::int64_t all = parts_->CountOf("SELECT COUNT(*)" + lines, {orderId});
  const std::int64_t open = parts_->CountOf(
      "SELECT COUNT(*)" + lines +
          " AND o.\"Quantity\">o.\"PackedQty\" AND o.\"Quantity\">COALESCE((SELECT SUM(p.\"Quantity\") FROM "
          "\"tbPackLine\" "
          "p JOIN \"tbPSlipLine\" s ON s.\"LineId\"=p.\"PSlipLineId\" WHERE s.\"OrderLocnLineId\"=o.\"Id\"),0)",
      {orderId});
  return all > 0 && open == 0;
}

bool SqlHost::OrderOpenOnShipment(std::int32_t shipmentId, std::int32_t orderId) {
  return parts_->CountOf(
             "SELECT COUNT(*) FROM \"tbPSlipLine\" s WHERE s.\"PSlipId\" IN (SELECT \"PSlipId\" FROM \"tbPack\" WHERE "
             "\"ShipmentId\"=:p0 AND \"OrderId\"=:p1) AND s.\"OrderQty\">s.\"PackedQty\" AND "
             "s.\"OrderQty\">COALESCE((SELECT "
             "SUM(p.\"Quantity\") FROM \"tbPackLine\" p WHERE p.\"PSlipLineId\"=s.\"LineId\"),0)",
             {shipmentId, orderId}) > 0;
}

// Only what changes is written: a pack is in many indexes.
bool SqlHost::StampPack(std::int32_t packId, std::int32_t noticeId) {
  return parts_->session.Guarded([&] {
    parts_->session.EnsureWriting();
    Statement& stamp = parts_->Prepared(
        "UPDATE " + Quoted(Pack::kType.table) + " SET \"ASNId\"=:p0,\"Status\"=8 WHERE \"Id\"=:p1 AND \"Status\"<8",
        {MemberKind::kInt, MemberKind::kInt}, {});
    stamp.Parameter(0).Set(std::int64_t{noticeId});
    stamp.Parameter(1).Set(std::int64_t{packId});
    stamp.Execute();
    return stamp.RowsChanged() > 0;
  });
}

std::optional<std::string> SqlHost::Setting(std::string_view name) {
  // Every log record and every label asks for some.
  const auto kept = parts_->settings.find(name);
  if (kept != parts_->settings.end()) return kept->second;
  return parts_->session.Guarded([&] {
    Statement& find = parts_->Prepared("SELECT \"Value\" FROM " + Quoted(kSettingsTable) + " WHERE \"Name\"=:p0",
                                       {MemberKind::kString}, {MemberKind::kString});
    find.Parameter(0).Set(name);
    std::optional<std::string> value;
    if (find.Execute()) value = find.Column(0).Given();
    find.Reset();
    return parts_->settings.emplace(name, std::move(value)).first->second;
  });
}

std::vector<std::pair<std::string, std::string>> SqlHost::Settings() {
  return parts_->session.Guarded([&] {
    std::vector<std::pair<std::string, std::string>> settings;
    Statement& all = parts_->Prepared("SELECT \"Name\",\"Value\" FROM " + Quoted(kSettingsTable) + " ORDER BY \"Name\"",
                                      {}, {MemberKind::kString, MemberKind::kString});
    for (bool more = all.Execute(); more; more = all.Next())
      settings.emplace_back(all.Column(0).Given(), all.Column(1).Given());
    return settings;
  });
}

void SqlHost::SetSetting(std::string_view name, std::string_view value) {
  parts_->session.Guarded([&] {
    const Kinds both = {MemberKind::kString, MemberKind::kString};
    parts_->session.EnsureWriting();
    Statement& update =
        parts_->Prepared("UPDATE " + Quoted(kSettingsTable) + " SET \"Value\"=:p0 WHERE \"Name\"=:p1", both, {});
    update.Parameter(0).Set(value);
    update.Parameter(1).Set(name);
    update.Execute();
    if (update.RowsChanged() > 0) return;
    Statement& add =
        parts_->Prepared("INSERT INTO " + Quoted(kSettingsTable) + "(\"Value\",\"Name\") VALUES(:p0,:p1)", both, {});
    add.Parameter(0).Set(value);
    add.Parameter(1).Set(name);
    add.Execute();
  });
  parts_->settings.erase(std::string(name));
}

}  // namespace partnerkit::host

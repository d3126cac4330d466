#include <map>
#include <memory>
#include <string>
#include <unordered_set>
#include <utility>
#include <vector>

#include "cli/output/json_writer.h"
#include "cli/output/record_json.h"
#include "cli/output/table.h"
#include "cli/verbs/data_commands.h"
#include "cli/verbs/data_reader.h"
#include "cli/workspace/workspace.h"
#include "host/table_sql.h"

namespace partnerkit::cli {

namespace {

// What was stored: of each kind named, how many records, and the settings.
struct Loaded {
  std::map<const RecordType*, std::size_t> records;
  std::map<std::string, std::string, std::less<>> settings;
};

// Stores records as they are read, within a transaction of the caller's.
class Storer : public DataTaker {
 public:
  explicit Storer(host::SqlHost& host) : host_(host), store_(host.Records()) {}

  void TakeKind(const RecordType& type) override { loaded_.records[&type]; }

  void TakeItem(const DataItem& item) override {
    for (const Member& member : item.type->members) {
      if (member.role == MemberRole::kOwner) NoteOwner(item, member);
    }
    if (!Put(*item.type, item.record.get())) TellRefused(item);
    for (const NestedKind& nested : NestedKinds()) {
      if (nested.owner == item.type) StoreParts(nested, item);
    }
    ++loaded_.records[item.type];
  }

  void TakeSetting(std::string_view name, const std::string& text) override {
    host_.SetSetting(name, text);
    loaded_.settings.insert_or_assign(std::string(name), text);
  }

  // Once every file has been read: an owner may stand behind what it owns.
  void RequireOwners() {
    for (const Awaited& awaited : awaited_) {
      if (HasOwner(*awaited.member, awaited.owner)) continue;
      const RecordType& type = *FindRecordType(awaited.member->owner);
      RefuseAt(*awaited.item.file, awaited.item.Place() + "." + std::string(awaited.member->name),
               "no " + std::string(type.kind) + " with this " + std::string(IdOf(type)->name) +
                   ", neither in the store nor in the load");
    }
  }

  const Loaded& Done() const { return loaded_; }

 private:
  // Most loads are of new records only: until one is there already, none is looked for.
  bool Put(const RecordType& type, void* record) {
    bool& allNew = allNew_.try_emplace(&type, true).first->second;
    if (allNew && store_.Add(type, record)) return true;
    allNew = false;
    return store_.ReplaceOrAdd(type, record);
  }

  // An owner that wasn't there when the first record that names it was.
  struct Awaited {
    DataItem item;  // without the record
    const Member* member;
    std::int64_t owner;
  };

  // Whatever stands alone names its owner by an id.
  void NoteOwner(const DataItem& item, const Member& member) {
    const std::int64_t owner = host::IdValue(member, item.record.get());
    if (!owners_[member.owner].insert(owner).second || HasOwner(member, owner)) return;
    awaited_.push_back({{item.type, item.file, item.index, nullptr, {}}, &member, owner});
  }

  bool HasOwner(const Member& member, std::int64_t id) {
    const RecordType& type = *FindRecordType(member.owner);
    const std::shared_ptr<void> owner = NewRecord(type);
    host::SetIdValue(*IdOf(type), owner.get(), id);
    return store_.Load(type, owner.get());
  }

  void StoreParts(const NestedKind& nested, const DataItem& item) {
    const auto setOwner = [&](void* part) {
      for (const std::string_view name : nested.byOwner->members) {
        CopyMember(*FindMember(*nested.type, name), At(*FindMember(*nested.owner, name), item.record.get()), part);
      }
    };
    const std::shared_ptr<void> probe = NewRecord(*nested.type);
    setOwner(probe.get());
    if (!store_.DeleteAll(*nested.type, *nested.byOwner, probe.get())) Fail(item);
    for (const std::shared_ptr<void>& part : item.parts) {
      setOwner(part.get());
      if (!store_.ReplaceOrAdd(*nested.type, part.get())) Fail(item);
    }
  }

  [[noreturn]] void TellRefused(const DataItem& item) {
    const std::int32_t error = store_.NativeError();
    for (const Lookup& lookup : item.type->lookups) {
      if (lookup.unique) RequireUnique(item, lookup);
    }
    Fail(item, error);
  }

  void RequireUnique(const DataItem& item, const Lookup& lookup) {
    const RecordType& type = *item.type;
    const Member* id = IdOf(type);
    if (id == nullptr) return;
    const std::shared_ptr<void> other = NewRecord(type);
    std::string names;
    for (const std::string_view name : lookup.members) {
      const Member& member = *FindMember(type, name);
      CopyMember(member, At(member, item.record.get()), other.get());
      names += (names.empty() ? "" : ", ") + std::string(name);
    }
    const std::int64_t own = host::IdValue(*id, item.record.get());
    if (!store_.Find(type, lookup, other.get()) || host::IdValue(*id, other.get()) == own) return;
    RefuseAt(*item.file, item.Place(),
             "the " + std::string(type.kind) + " with " + std::string(id->name) + " " +
                 std::to_string(host::IdValue(*id, other.get())) + " has the same " + names);
  }

  [[noreturn]] void Fail(const DataItem& item) { Fail(item, store_.NativeError()); }
  [[noreturn]] static void Fail(const DataItem& item, std::int32_t error) {
    throw Failure(*item.file + ": " + item.Place() + ": the database turned it away (its error " +
                  std::to_string(error) + "); nothing was stored");
  }

  host::SqlHost& host_;
  host::SqlStore& store_;
  Loaded loaded_;
  std::map<const RecordType*, bool> allNew_;  // of a kind, so far
  std::vector<Awaited> awaited_;
  std::map<std::string_view, std::unordered_set<std::int64_t>> owners_;  // named so far, by their kind
};

void Report(const Command& command, const Loaded& loaded) {
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("loaded");
    json.BeginObject();
    for (const RecordType* type : AllRecordTypes()) {
      const auto items = loaded.records.find(type);
      if (items == loaded.records.end()) continue;
      json.Name(type->kind);
      json.Int(static_cast<std::int64_t>(items->second));
    }
    json.EndObject();
    json.EndObject();
    return;
  }
  std::size_t total = 0;
  std::string kinds;
  for (const RecordType* type : AllRecordTypes()) {
    const auto items = loaded.records.find(type);
    if (items == loaded.records.end() || items->second == 0) continue;
    total += items->second;
    kinds += (kinds.empty() ? ": " : ", ") + std::to_string(items->second) + " " + std::string(type->kind);
  }
  PrintWrapped(command.out, "Stored " + Counted(total, "record", "records") + kinds + ".", 2, OutputWidth());
  if (!loaded.settings.empty()) {
    command.out << "Set " << Counted(loaded.settings.size(), "system setting", "system settings") << ".\n";
  }
}

}  // namespace

int LoadData(const Command& command, const std::vector<std::string>& files) {
  Workspace workspace(command);
  host::SqlHost& host = workspace.Host();
  Storer storer(host);
  host.BeginTrans();
  try {
    for (const std::string& file : files) ReadRecords(file, workspace.Folder().string(), storer);
    storer.RequireOwners();
    host.CommitTrans();
  } catch (...) {
    host.RollbackTrans();
    throw;
  }
  Report(command, storer.Done());
  return kDone;
}

}  // namespace partnerkit::cli

#include <limits>
#include <map>
#include <memory>
#include <nlohmann/json.hpp>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "cli/data_commands.h"
#include "cli/data_file.h"
#include "cli/json_writer.h"
#include "cli/record_json.h"
#include "cli/table.h"
#include "cli/workspace.h"

namespace partnerkit::cli {

namespace {

using nlohmann::json;

// A record of a file, with what stands inside it.
struct Item {
  const std::string* file;
  std::size_t index;
  std::shared_ptr<void> record;
  std::vector<std::shared_ptr<void>> parts;
};

struct Data {
  std::map<const RecordType*, std::vector<Item>> records;
  std::map<std::string, std::string, std::less<>> settings;
};

[[noreturn]] void RefuseAt(const std::string& file, const std::string& place, const std::string& cause) {
  throw Refusal(file + ": " + place + ": " + cause);
}

std::string Indexed(std::string_view name, std::size_t index) {
  return std::string(name) + "[" + std::to_string(index) + "]";
}

// --- From JSON to structs. Nothing is stored before all files have passed.

class Reader {
 public:
  Reader(const std::string& file, std::string workspace, Data& data)
      : file_(file), workspace_(std::move(workspace)), data_(data) {}

  void Read() {
    const json all = ReadDataFile(file_);
    for (const auto& [kind, value] : all.items()) {
      if (kind == "System") {
        ReadSettings(value);
      } else {
        ReadKind(kind, value);
      }
    }
  }

 private:
  void ReadSettings(const json& value) {
    if (!value.is_object()) RefuseAt(file_, "System", "wants one object, not an array or a value");
    for (const auto& given : value.items()) {
      const std::string place = "System." + given.key();
      const Setting* setting = FindSetting(given.key());
      if (setting == nullptr) RefuseAt(file_, place, "no such setting");
      data_.settings[given.key()] = Placed(place, [&] { return SettingText(*setting, given.value(), workspace_); });
    }
  }

  void ReadKind(const std::string& kind, const json& value) {
    const RecordType* type = FindRecordType(kind);
    if (type == nullptr) RefuseAt(file_, kind, "no such kind of record");
    if (const NestedKind* nested = NestedIn(*type)) {
      RefuseAt(file_, kind,
               "stands inside " + std::string(nested->owner->kind) + " records, as " + std::string(nested->member));
    }
    if (!value.is_array()) RefuseAt(file_, kind, "wants an array of records");
    std::vector<Item>& items = data_.records[type];
    for (std::size_t i = 0; i < value.size(); ++i) items.push_back(ReadItem(*type, value[i], i));
  }

  Item ReadItem(const RecordType& type, const json& value, std::size_t index) {
    const std::string place = Indexed(type.kind, index);
    Item item = {&file_, index, nullptr, {}};
    const NestedKind* partKind = nullptr;
    for (const NestedKind& nested : NestedKinds()) {
      if (nested.owner == &type) partKind = &nested;
    }
    item.record = ReadRecord(type, value, place, partKind);
    if (partKind != nullptr && value.contains(partKind->member)) {
      const json& parts = value[std::string(partKind->member)];
      const std::string partsPlace = place + "." + std::string(partKind->member);
      if (!parts.is_array()) RefuseAt(file_, partsPlace, "wants an array of records");
      for (std::size_t i = 0; i < parts.size(); ++i) {
        item.parts.push_back(ReadRecord(*partKind->type, parts[i], Indexed(partsPlace, i), nullptr));
      }
    }
    return item;
  }

  std::shared_ptr<void> ReadRecord(const RecordType& type, const json& value, const std::string& place,
                                   const NestedKind* partKind) {
    if (!value.is_object()) RefuseAt(file_, place, "wants an object with the record's members");
    const bool inside = NestedIn(type) != nullptr;
    std::shared_ptr<void> record = NewRecord(type);
    for (const auto& given : value.items()) {
      if (partKind != nullptr && given.key() == partKind->member) continue;
      const Member* member = FindMember(type, given.key());
      const std::string memberPlace = place + "." + given.key();
      if (member == nullptr || (inside && IsGivenByOwner(*member))) RefuseAt(file_, memberPlace, "no such member");
      Placed(memberPlace, [&] { SetMember(*member, record.get(), given.value(), workspace_); });
    }
    if (!inside) RequireKeys(type, value, place);
    if (&type == &EDIDoc::kType) CheckDocument(*static_cast<const EDIDoc*>(record.get()), place);
    return record;
  }

  static bool IsGivenByOwner(const Member& member) {
    return member.role == MemberRole::kId || member.role == MemberRole::kOwner;
  }

  void RequireKeys(const RecordType& type, const json& value, const std::string& place) {
    for (const Member& member : type.members) {
      if (member.role != MemberRole::kKey && member.role != MemberRole::kOwner) continue;
      const auto given = value.find(member.name);
      const bool mayBeNull =
          member.kind == MemberKind::kText || member.kind == MemberKind::kNumber || member.kind == MemberKind::kDate;
      if (given == value.end() || (given->is_null() && !mayBeNull)) {
        RefuseAt(file_, place + "." + std::string(member.name), "is part of the key and must be given");
      }
    }
  }

  // A class is bound to its document by a number of 16 bits.
  void CheckDocument(const EDIDoc& document, const std::string& place) {
    constexpr std::int32_t kLast = std::numeric_limits<std::int16_t>::max();
    if (document.EDIDocId < 1 || document.EDIDocId > kLast) {
      RefuseAt(file_, place + ".EDIDocId",
               std::to_string(document.EDIDocId) + " is out of range (1 to " + std::to_string(kLast) + ")");
    }
  }

  template <class F>
  std::invoke_result_t<F> Placed(const std::string& place, F read) {
    try {
      return read();
    } catch (const Refusal& refusal) {
      RefuseAt(file_, place, refusal.what());
    }
  }

  const std::string& file_;
  std::string workspace_;
  Data& data_;
};

// --- From structs to the store, in one transaction.

class Storer {
 public:
  explicit Storer(host::SqlHost& host) : host_(host), store_(host.Records()) {}

  void Store(const Data& data) {
    host_.BeginTrans();
    try {
      // Owners come before what they own, so that an owner of the same load is there by then.
      for (const RecordType* type : AllRecordTypes()) {
        const auto items = data.records.find(type);
        if (items == data.records.end()) continue;
        for (const Item& item : items->second) StoreItem(*type, item);
      }
      for (const auto& [name, text] : data.settings) host_.SetSetting(name, text);
      host_.CommitTrans();
    } catch (...) {
      host_.RollbackTrans();
      throw;
    }
  }

 private:
  void StoreItem(const RecordType& type, const Item& item) {
    const std::string place = Indexed(type.kind, item.index);
    RequireOwners(type, item, place);
    RequireUnique(type, item, place);
    if (!store_.ReplaceOrAdd(type, item.record.get())) Fail(item, place);
    for (const NestedKind& nested : NestedKinds()) {
      if (nested.owner == &type) StoreParts(nested, item, place);
    }
  }

  void StoreParts(const NestedKind& nested, const Item& item, const std::string& place) {
    const auto setOwner = [&](void* part) {
      for (const std::string_view name : nested.byOwner->members) {
        CopyMember(*FindMember(*nested.type, name), At(*FindMember(*nested.owner, name), item.record.get()), part);
      }
    };
    const std::shared_ptr<void> probe = NewRecord(*nested.type);
    setOwner(probe.get());
    if (!store_.DeleteAll(*nested.type, *nested.byOwner, probe.get())) Fail(item, place);
    for (const std::shared_ptr<void>& part : item.parts) {
      setOwner(part.get());
      if (!store_.ReplaceOrAdd(*nested.type, part.get())) Fail(item, place);
    }
  }

  void RequireOwners(const RecordType& type, const Item& item, const std::string& place) {
    for (const Member& member : type.members) {
      if (member.role != MemberRole::kOwner) continue;
      const RecordType& ownerType = *FindRecordType(member.owner);
      const Member& ownerKey = OwnKey(ownerType);
      const std::shared_ptr<void> owner = NewRecord(ownerType);
      CopyMember(ownerKey, At(member, item.record.get()), owner.get());
      if (!store_.Load(ownerType, owner.get())) {
        RefuseAt(*item.file, place + "." + std::string(member.name),
                 "no " + std::string(ownerType.kind) + " with this " + std::string(ownerKey.name) +
                     ", neither in the store nor in the load");
      }
    }
  }

  // What other records name this one by.
  static const Member& OwnKey(const RecordType& type) {
    if (const Member* id = IdOf(type)) return *id;
    for (const Member& member : type.members) {
      if (member.role == MemberRole::kKey) return member;
    }
    return type.members.front();
  }

  void RequireUnique(const RecordType& type, const Item& item, const std::string& place) {
    const Member* id = IdOf(type);
    for (const Lookup& lookup : type.lookups) {
      if (!lookup.unique || id == nullptr) continue;
      const std::shared_ptr<void> other = NewRecord(type);
      std::string names;
      for (const std::string_view name : lookup.members) {
        const Member& member = *FindMember(type, name);
        CopyMember(member, At(member, item.record.get()), other.get());
        names += (names.empty() ? "" : ", ") + std::string(name);
      }
      const auto idIn = [&](const void* record) { return *static_cast<const std::int32_t*>(At(*id, record)); };
      if (store_.Find(type, lookup, other.get()) && idIn(other.get()) != idIn(item.record.get())) {
        RefuseAt(*item.file, place,
                 "the " + std::string(type.kind) + " with " + std::string(id->name) + " " +
                     std::to_string(idIn(other.get())) + " has the same " + names);
      }
    }
  }

  [[noreturn]] void Fail(const Item& item, const std::string& place) {
    throw Failure(*item.file + ": " + place + ": the database turned it away (its error " +
                  std::to_string(store_.NativeError()) + "); nothing was stored");
  }

  host::SqlHost& host_;
  host::SqlStore& store_;
};

void Report(const Command& command, const Data& data) {
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("loaded");
    json.BeginObject();
    for (const RecordType* type : AllRecordTypes()) {
      const auto items = data.records.find(type);
      if (items == data.records.end()) continue;
      json.Name(type->kind);
      json.Int(static_cast<std::int64_t>(items->second.size()));
    }
    json.EndObject();
    json.EndObject();
    return;
  }
  std::size_t total = 0;
  std::string kinds;
  for (const RecordType* type : AllRecordTypes()) {
    const auto items = data.records.find(type);
    if (items == data.records.end() || items->second.empty()) continue;
    total += items->second.size();
    kinds += (kinds.empty() ? ": " : ", ") + std::to_string(items->second.size()) + " " + std::string(type->kind);
  }
  PrintWrapped(command.out, "Stored " + Counted(total, "record", "records") + kinds + ".", 2, OutputWidth());
  if (!data.settings.empty()) {
    command.out << "Set " << Counted(data.settings.size(), "system setting", "system settings") << ".\n";
  }
}

}  // namespace

int LoadData(const Command& command, const std::vector<std::string>& files) {
  Workspace workspace(command);
  Data data;
  for (const std::string& file : files) Reader(file, workspace.Folder().string(), data).Read();
  Storer(workspace.Host()).Store(data);
  Report(command, data);
  return kDone;
}

}  // namespace partnerkit::cli

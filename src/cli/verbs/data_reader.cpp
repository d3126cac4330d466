#include "cli/verbs/data_reader.h"

#include <algorithm>
#include <bitset>
#include <limits>
#include <set>
#include <utility>

#include "cli/output/command.h"
#include "cli/verbs/data_file.h"

namespace partnerkit::cli {

namespace {

using nlohmann::json;

constexpr std::string_view kSystem = "System";
constexpr std::size_t kMostMembers = 128;

std::string Indexed(std::string_view name, std::size_t index) {
  return std::string(name) + "[" + std::to_string(index) + "]";
}

// A record being read, and which of its members were given.
struct OpenRecord {
  const RecordType* type = nullptr;
  std::shared_ptr<void> record;
  std::bitset<kMostMembers> given, null;
  const Member* member = nullptr;  // the one whose value comes next

  void Begin(const RecordType& of) {
    type = &of;
    record = NewRecord(of);
    given.reset();
    null.reset();
  }
  std::size_t Number(const Member& of) const { return static_cast<std::size_t>(&of - type->members.data()); }
};

// The parser's own name and place stand before the cause.
std::string_view Cause(std::string_view message) {
  for (const std::string_view lead : {"[json.exception.", "parse error"}) {
    if (message.starts_with(lead))
      message.remove_prefix(std::min(message.size(), message.find(lead[0] == '[' ? ']' : ':') + 2));
  }
  return message;
}

class Reader : public JsonEvents {
 public:
  Reader(const std::string& file, const std::string& workspace, DataTaker& taker)
      : file_(file), workspace_(workspace), taker_(taker) {}

  bool null() override { return Value(nullptr); }
  bool boolean(bool value) override { return Value(value); }
  bool number_integer(std::int64_t value) override { return Value(value); }
  bool number_unsigned(std::uint64_t value) override { return Value(value); }
  bool number_float(double value, const std::string&) override { return Value(value); }
  bool string(std::string& value) override { return Value(std::move(value)); }
  bool binary(json::binary_t&) override { return false; }

  bool start_object(std::size_t) override {
    if (level_ == Level::kFile) return Enter(Level::kKinds);
    if (level_ == Level::kKinds && kind_ == nullptr) return Enter(Level::kSettings);
    if (level_ == Level::kRecords) return BeginRecord();
    if (level_ == Level::kParts) return BeginPart();
    return Value(json::object());
  }

  bool start_array(std::size_t) override {
    if (level_ == Level::kKinds && kind_ != nullptr) return BeginKind();
    if (level_ == Level::kRecord && record_.member == nullptr) return Enter(Level::kParts);
    return Value(json::array());
  }

  bool end_object() override {
    if (level_ == Level::kRecord) return EndRecord();
    if (level_ == Level::kPart) return EndPart();
    return Enter(level_ == Level::kSettings ? Level::kKinds : Level::kFile);
  }

  bool end_array() override { return Enter(level_ == Level::kParts ? Level::kRecord : Level::kKinds); }

  bool key(std::string& name) override {
    switch (level_) {
      case Level::kKinds:
        NameOnce(kinds_.insert(name).second, name);
        ChooseKind(name);
        break;
      case Level::kSettings:
        NameOnce(settings_.insert(name).second, name);
        setting_ = FindSetting(name);
        if (setting_ == nullptr) RefuseAt(file_, SettingPlace(name), "no such setting");
        break;
      case Level::kRecord:
        if (partKind_ != nullptr && name == partKind_->member) {
          NameOnce(!std::exchange(partsGiven_, true), name);
          record_.member = nullptr;
          break;
        }
        ChooseMember(record_, name);
        break;
      default:
        ChooseMember(part_, name);
    }
    return true;
  }

  bool parse_error(std::size_t, const std::string&, const json::exception& error) override {
    throw SyntaxFault(std::string(Cause(error.what())));
  }

 private:
  enum class Level { kFile, kKinds, kSettings, kRecords, kRecord, kParts, kPart };

  bool Enter(Level level) {
    level_ = level;
    return true;
  }

  bool BeginKind() {
    taker_.TakeKind(*kind_);
    item_.index = 0;
    return Enter(Level::kRecords);
  }

  static void NameOnce(bool once, const std::string& name) {
    if (!once) throw SyntaxFault(json(name).dump(-1, ' ', true) + " is given twice");
  }

  void ChooseKind(const std::string& name) {
    kind_ = nullptr;
    partKind_ = nullptr;
    if (name == kSystem) return;
    kind_ = FindRecordType(name);
    if (kind_ == nullptr) RefuseAt(file_, name, "no such kind of record");
    if (const NestedKind* nested = NestedIn(*kind_)) {
      RefuseAt(file_, name,
               "stands inside " + std::string(nested->owner->kind) + " records, as " + std::string(nested->member));
    }
    for (const NestedKind& nested : NestedKinds()) {
      if (nested.owner == kind_) partKind_ = &nested;
    }
  }

  void ChooseMember(OpenRecord& record, const std::string& name) {
    record.member = FindMember(*record.type, name);
    const bool byOwner = level_ == Level::kPart && record.member != nullptr &&
                         (record.member->role == MemberRole::kId || record.member->role == MemberRole::kOwner);
    if (record.member == nullptr || byOwner) RefuseAt(file_, RecordPlace() + "." + name, "no such member");
    const std::size_t number = record.Number(*record.member);
    NameOnce(!record.given.test(number), name);
    record.given.set(number);
  }

  // A value where only one can stand; what has parts comes as an empty array or object.
  bool Value(const json& value) {
    switch (level_) {
      case Level::kFile:
        throw Refusal(file_ + ": wants one JSON object with an array of records for each kind");
      case Level::kKinds:
        if (kind_ == nullptr) RefuseAt(file_, std::string(kSystem), "wants one object, not an array or a value");
        RefuseAt(file_, std::string(kind_->kind), "wants an array of records");
      case Level::kSettings:
        taker_.TakeSetting(setting_->name, ReadSetting(value));
        return true;
      case Level::kRecord:
        if (record_.member == nullptr) RefuseAt(file_, PartsPlace(), "wants an array of records");
        return Set(record_, value);
      case Level::kPart:
        return Set(part_, value);
      default:
        RefuseAt(file_, RecordPlace(), "wants an object with the record's members");
    }
  }

  std::string ReadSetting(const json& value) {
    try {
      return SettingText(*setting_, value, workspace_);
    } catch (const Refusal& refusal) {
      RefuseAt(file_, SettingPlace(setting_->name), refusal.what());
    }
  }

  bool Set(OpenRecord& record, const json& value) {
    if (value.is_null()) record.null.set(record.Number(*record.member));
    try {
      SetMember(*record.member, record.record.get(), value, workspace_);
    } catch (const Refusal& refusal) {
      RefuseAt(file_, RecordPlace() + "." + std::string(record.member->name), refusal.what());
    }
    return true;
  }

  bool BeginRecord() {
    partsGiven_ = false;
    item_.parts.clear();
    record_.Begin(*kind_);
    return Enter(Level::kRecord);
  }

  bool EndRecord() {
    RequireKeys();
    if (kind_ == &EDIDoc::kType) CheckDocument(*static_cast<const EDIDoc*>(record_.record.get()));
    item_.type = kind_;
    item_.file = &file_;
    item_.record = record_.record;
    taker_.TakeItem(item_);
    ++item_.index;
    return Enter(Level::kRecords);
  }

  bool BeginPart() {
    part_.Begin(*partKind_->type);
    return Enter(Level::kPart);
  }

  bool EndPart() {
    item_.parts.push_back(part_.record);
    return Enter(Level::kParts);
  }

  void RequireKeys() {
    for (const Member& member : kind_->members) {
      if (member.role != MemberRole::kKey && member.role != MemberRole::kOwner) continue;
      const std::size_t number = record_.Number(member);
      const bool mayBeNull =
          member.kind == MemberKind::kText || member.kind == MemberKind::kNumber || member.kind == MemberKind::kDate;
      if (record_.given.test(number) && (mayBeNull || !record_.null.test(number))) continue;
      RefuseAt(file_, RecordPlace() + "." + std::string(member.name), "is part of the key and must be given");
    }
  }

  // A class is bound to its document by a number of 16 bits.
  void CheckDocument(const EDIDoc& document) {
    constexpr std::int32_t kLast = std::numeric_limits<std::int16_t>::max();
    if (document.EDIDocId >= 1 && document.EDIDocId <= kLast) return;
    RefuseAt(file_, RecordPlace() + ".EDIDocId",
             std::to_string(document.EDIDocId) + " is out of range (1 to " + std::to_string(kLast) + ")");
  }

  static std::string SettingPlace(std::string_view name) { return std::string(kSystem) + "." + std::string(name); }
  std::string PartsPlace() const { return Indexed(kind_->kind, item_.index) + "." + std::string(partKind_->member); }
  // Of the record, or the part of one, that is being read.
  std::string RecordPlace() const {
    const bool inParts = level_ == Level::kParts || level_ == Level::kPart;
    return inParts ? Indexed(PartsPlace(), item_.parts.size()) : Indexed(kind_->kind, item_.index);
  }

  const std::string& file_;
  const std::string& workspace_;
  DataTaker& taker_;
  Level level_ = Level::kFile;
  std::set<std::string> kinds_, settings_;
  const Setting* setting_ = nullptr;
  const RecordType* kind_ = nullptr;  // null within System
  const NestedKind* partKind_ = nullptr;
  DataItem item_;
  OpenRecord record_, part_;
  bool partsGiven_ = false;
};

}  // namespace

std::string DataItem::Place() const { return Indexed(type->kind, index); }

void RefuseAt(const std::string& file, const std::string& place, const std::string& cause) {
  throw Refusal(file + ": " + place + ": " + cause);
}

void ReadRecords(const std::string& file, const std::string& workspace, DataTaker& taker) {
  Reader reader(file, workspace, taker);
  ReadDataFile(file, reader);
}

}  // namespace partnerkit::cli

#include <string>
#include <vector>

#include "cli/output/json_writer.h"
#include "cli/output/record_json.h"
#include "cli/verbs/data_commands.h"
#include "cli/workspace/workspace.h"

namespace partnerkit::cli {

namespace {

constexpr std::string_view kSystem = "System";

class Dumper {
 public:
  Dumper(host::SqlHost& host, JsonWriter& json) : host_(host), json_(json) {}

  // With `always`, a kind without records is there as an empty array.
  void DumpKind(const RecordType& type, bool always) {
    const std::shared_ptr<void> record = NewRecord(type);
    bool begun = false;
    const auto begin = [&] {
      if (std::exchange(begun, true)) return;
      json_.Name(type.kind);
      json_.BeginArray();
    };
    if (always) begin();
    host_.Records().ForEach(type, record.get(), [&] {
      begin();
      json_.BeginObject();
      WriteMembers(json_, type, record.get());
      for (const NestedKind& nested : NestedKinds()) {
        if (nested.owner == &type) DumpParts(nested, record.get());
      }
      json_.EndObject();
    });
    if (begun) json_.EndArray();
  }

  void DumpSettings(bool always) {
    bool begun = false;
    for (const Setting& setting : Settings()) {
      const std::optional<std::string> text = host_.Setting(setting.name);
      if (!text && !always) continue;
      if (!std::exchange(begun, true)) {
        json_.Name(kSystem);
        json_.BeginObject();
      }
      if (text) WriteSetting(json_, setting, *text);
    }
    if (begun) json_.EndObject();
  }

 private:
  void DumpParts(const NestedKind& nested, const void* owner) {
    const std::shared_ptr<void> probe = NewRecord(*nested.type);
    for (const std::string_view name : nested.byOwner->members) {
      CopyMember(*FindMember(*nested.type, name), At(*FindMember(*nested.owner, name), owner), probe.get());
    }
    std::vector<std::shared_ptr<void>> parts;
    host_.Records().Select(*nested.type, *nested.byOwner, probe.get(),
                           [&] { return parts.emplace_back(NewRecord(*nested.type)).get(); });
    json_.Name(nested.member);
    json_.BeginArray();
    for (const std::shared_ptr<void>& part : parts) {
      json_.BeginObject();
      WriteMembers(json_, *nested.type, part.get());
      json_.EndObject();
    }
    json_.EndArray();
  }

  host::SqlHost& host_;
  JsonWriter& json_;
};

void CheckKind(const std::string& kind) {
  if (kind == kSystem) return;
  const RecordType* type = FindRecordType(kind);
  if (type == nullptr) throw Refusal(kind + ": no such kind of record");
  if (const NestedKind* nested = NestedIn(*type)) {
    throw Refusal(kind + ": is written inside " + std::string(nested->owner->kind) + " records, as " +
                  std::string(nested->member));
  }
}

}  // namespace

int DumpData(const Command& command, const std::vector<std::string>& kinds) {
  for (const std::string& kind : kinds) CheckKind(kind);
  Workspace workspace(command);
  JsonWriter json(command.out);
  Dumper dumper(workspace.Host(), json);
  json.BeginObject();
  for (const std::string& kind : kinds) {
    if (kind == kSystem) {
      dumper.DumpSettings(true);
    } else {
      dumper.DumpKind(*FindRecordType(kind), true);
    }
  }
  if (kinds.empty()) {
    dumper.DumpSettings(false);
    for (const RecordType* type : AllRecordTypes()) {
      if (NestedIn(*type) == nullptr) dumper.DumpKind(*type, false);
    }
  }
  json.EndObject();
  return kDone;
}

}  // namespace partnerkit::cli

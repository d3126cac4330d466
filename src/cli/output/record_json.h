// Records of any kind, between their structs and the JSON of data files.
#pragma once

#include <memory>
#include <nlohmann/json_fwd.hpp>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "cli/output/json_writer.h"
#include "partnerkit/records.h"

namespace partnerkit::cli {

// A new record of the kind, each member at its default.
std::shared_ptr<void> NewRecord(const RecordType& type);

// A kind whose records stand inside those of the kind that owns them, without their id and their owner's key.
struct NestedKind {
  const RecordType* owner;
  std::string_view member;
  const RecordType* type;
  const Lookup* byOwner;
};
std::span<const NestedKind> NestedKinds();
// How records of the kind stand inside another; null for most.
const NestedKind* NestedIn(const RecordType& type);

// A setting of the host, held as text: the members that data files give `System`.
struct Setting {
  std::string_view name;
  MemberKind kind;  // kText, kInt or kBool
};
std::span<const Setting> Settings();
const Setting* FindSetting(std::string_view name);

// The member's address in the record. The tables give it for writing only.
inline const void* At(const Member& member, const void* record) { return member.at(const_cast<void*>(record)); }

// The kind's member of that name; null when it has none.
const Member* FindMember(const RecordType& type, std::string_view name);
// The member that holds the record's own number; null for a kind without.
const Member* IdOf(const RecordType& type);
// Sets the member of a record from one of the same type in another.
void CopyMember(const Member& member, const void* value, void* record);

// Sets the member from a JSON value. `workspace` takes the place of each "${workspace}" in a text. Raises Refusal, with
// the cause only.
void SetMember(const Member& member, void* record, const nlohmann::json& value, std::string_view workspace);
// The setting's text, for a JSON value of its kind. Raises Refusal likewise.
std::string SettingText(const Setting& setting, const nlohmann::json& value, std::string_view workspace);

void WriteValue(JsonWriter& json, MemberKind kind, const void* value);
void WriteMembers(JsonWriter& json, const RecordType& type, const void* record);
void WriteSetting(JsonWriter& json, const Setting& setting, const std::string& text);

}  // namespace partnerkit::cli

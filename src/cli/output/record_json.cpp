#include "cli/output/record_json.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <nlohmann/json.hpp>

#include "cli/output/command.h"
#include "cli/output/text.h"

namespace partnerkit::cli {

namespace {

using nlohmann::json;

template <class... R>
std::shared_ptr<void> NewOneOf(const RecordType& type) {
  std::shared_ptr<void> record;
  ((&R::kType == & type ? record = std::make_shared<R>() : record), ...);
  return record;
}

// clang-format off
constexpr Setting kSettings[] = {
    {"UserId",             MemberKind::kText},
    {"CompanyName",        MemberKind::kText},
    {"PrinterLanguage",    MemberKind::kText},
    {"TicketLanguage",     MemberKind::kText},
    {"BatchControl",       MemberKind::kInt},
    {"TicketBatchControl", MemberKind::kInt},
    {"ComDirect",          MemberKind::kBool},
    {"ComPort",            MemberKind::kText},
    {"PlatformId",         MemberKind::kInt},
    {"LabelUserField",     MemberKind::kText},
    {"LabelUserFieldAlt",  MemberKind::kText},
    {"PDTType",            MemberKind::kText},
};
// clang-format on

const NestedKind kNestedKinds[] = {
    {&LabelJob::kType, "Items", &LabelJobItem::kType, &LabelJobItem::kByLabelJob},
};

// The value as a message shows it: long ones are cut, and what has parts is only named.
std::string Shown(const json& value) {
  constexpr std::size_t kLongest = 60;
  if (value.is_structured()) return value.is_array() ? "an array" : "an object";
  const std::string text = value.dump(-1, ' ', true);
  return text.size() <= kLongest ? text : text.substr(0, kLongest) + "...";
}

std::string Expanded(const json& value, std::string_view workspace) {
  constexpr std::string_view kName = "${workspace}";
  if (!value.is_string()) throw Refusal("wants a text, not " + Shown(value));
  std::string text = value.get<std::string>();
  for (std::size_t at = text.find(kName); at != std::string::npos; at = text.find(kName, at + workspace.size())) {
    text.replace(at, kName.size(), workspace);
  }
  return text;
}

double Number(const json& value) {
  if (!value.is_number()) throw Refusal("wants a number, not " + Shown(value));
  return value.get<double>();
}

template <class Int>
Int Whole(const json& value) {
  constexpr double kBeyond = static_cast<double>(std::uint64_t{1} << std::numeric_limits<Int>::digits);
  const double number = Number(value);
  if (value.is_number_float() && number != std::trunc(number))
    throw Refusal("wants a whole number, not " + Shown(value));
  const bool fits = value.is_number_unsigned()  ? std::in_range<Int>(value.get<std::uint64_t>())
                    : value.is_number_integer() ? std::in_range<Int>(value.get<std::int64_t>())
                                                : number >= -kBeyond && number < kBeyond;
  if (!fits) {
    throw Refusal(Shown(value) + " is out of range (" + std::to_string(std::numeric_limits<Int>::min()) + " to " +
                  std::to_string(std::numeric_limits<Int>::max()) + ")");
  }
  return value.get<Int>();
}

bool Truth(const json& value) {
  if (!value.is_boolean()) throw Refusal("wants true or false, not " + Shown(value));
  return value.get<bool>();
}

DateTime Date(const json& value, std::string_view workspace) {
  const auto date = DateTime::FromIso(Expanded(value, workspace));
  if (!date) throw Refusal("wants a date such as \"2004-07-31\" or \"2004-07-31T10:15:00\", not " + Shown(value));
  return *date;
}

template <class T>
T& As(void* value) {
  return *static_cast<T*>(value);
}

template <class T>
const T& As(const void* value) {
  return *static_cast<const T*>(value);
}

// `member` is a std::optional.
template <class T, class F>
void SetOrNull(void* member, const json& value, F read) {
  auto& optional = As<std::optional<T>>(member);
  if (value.is_null()) {
    optional.reset();
  } else {
    optional = read();
  }
}

template <class T>
void CopyAs(const void* from, void* to) {
  As<T>(to) = As<T>(from);
}

}  // namespace

std::shared_ptr<void> NewRecord(const RecordType& type) {
  return NewOneOf<Partner, Vendor, EDIDoc, PartnerAddress, PartnerLocn, Product, ProductPrice, ProductInner, Prepack,
                  PackType, Printer, LabelJob, LabelJobItem, Order, OrderLine, OrderLocn, OrderLocnLine, UnsettledOrder,
                  Job, PSlip, PSlipLine, Shipment, ASN, PendingNotice, Pack, PackLine, PADRecord, PADItem, PADStore,
                  Log>(type);
}

std::span<const NestedKind> NestedKinds() { return kNestedKinds; }

const NestedKind* NestedIn(const RecordType& type) {
  const auto found = std::ranges::find(kNestedKinds, &type, &NestedKind::type);
  return found == std::end(kNestedKinds) ? nullptr : found;
}

std::span<const Setting> Settings() { return kSettings; }

const Setting* FindSetting(std::string_view name) {
  const auto found = std::ranges::find(kSettings, name, &Setting::name);
  return found == std::end(kSettings) ? nullptr : found;
}

void SetMember(const Member& member, void* record, const json& value, std::string_view workspace) {
  void* at = member.at(record);
  switch (member.kind) {
    case MemberKind::kText:
      return SetOrNull<std::string>(at, value, [&] { return Expanded(value, workspace); });
    case MemberKind::kNumber:
      return SetOrNull<double>(at, value, [&] { return Number(value); });
    case MemberKind::kDate:
      return SetOrNull<DateTime>(at, value, [&] { return Date(value, workspace); });
    default:
      break;
  }
  // The others have no null: it leaves them at their default, as an absent member does.
  if (value.is_null()) return;
  switch (member.kind) {
    case MemberKind::kString:
      As<std::string>(at) = Expanded(value, workspace);
      break;
    case MemberKind::kInt:
      As<std::int32_t>(at) = Whole<std::int32_t>(value);
      break;
    case MemberKind::kLong:
      As<std::int64_t>(at) = Whole<std::int64_t>(value);
      break;
    case MemberKind::kBool:
      As<bool>(at) = Truth(value);
      break;
    case MemberKind::kDouble:
      As<double>(at) = Number(value);
      break;
    default:
      break;
  }
}

void CopyMember(const Member& member, const void* value, void* record) {
  void* at = member.at(record);
  switch (member.kind) {
    case MemberKind::kString:
      return CopyAs<std::string>(value, at);
    case MemberKind::kText:
      return CopyAs<Text>(value, at);
    case MemberKind::kInt:
      return CopyAs<std::int32_t>(value, at);
    case MemberKind::kLong:
      return CopyAs<std::int64_t>(value, at);
    case MemberKind::kBool:
      return CopyAs<bool>(value, at);
    case MemberKind::kDouble:
      return CopyAs<double>(value, at);
    case MemberKind::kNumber:
      return CopyAs<std::optional<double>>(value, at);
    case MemberKind::kDate:
      return CopyAs<std::optional<DateTime>>(value, at);
  }
}

const Member* FindMember(const RecordType& type, std::string_view name) {
  const auto found = std::ranges::find(type.members, name, &Member::name);
  return found == type.members.end() ? nullptr : &*found;
}

const Member* IdOf(const RecordType& type) {
  const auto found = std::ranges::find(type.members, MemberRole::kId, &Member::role);
  return found == type.members.end() ? nullptr : &*found;
}

std::string SettingText(const Setting& setting, const json& value, std::string_view workspace) {
  switch (setting.kind) {
    case MemberKind::kInt:
      return std::to_string(Whole<std::int32_t>(value));
    case MemberKind::kBool:
      return Truth(value) ? "true" : "false";
    default:
      return Expanded(value, workspace);
  }
}

void WriteValue(JsonWriter& json, MemberKind kind, const void* value) {
  const auto orNull = [&json](const auto& optional, const auto& write) {
    if (optional) {
      write(*optional);
    } else {
      json.Null();
    }
  };
  switch (kind) {
    case MemberKind::kString:
      json.String(As<std::string>(value));
      break;
    case MemberKind::kText:
      orNull(As<Text>(value), [&](const std::string& text) { json.String(text); });
      break;
    case MemberKind::kInt:
      json.Int(As<std::int32_t>(value));
      break;
    case MemberKind::kLong:
      json.Int(As<std::int64_t>(value));
      break;
    case MemberKind::kBool:
      json.Bool(As<bool>(value));
      break;
    case MemberKind::kDouble:
      json.Number(As<double>(value));
      break;
    case MemberKind::kNumber:
      orNull(As<std::optional<double>>(value), [&](double number) { json.Number(number); });
      break;
    case MemberKind::kDate:
      orNull(As<std::optional<DateTime>>(value), [&](const DateTime& date) { json.Date(date); });
      break;
  }
}

void WriteMembers(JsonWriter& json, const RecordType& type, const void* record) {
  const NestedKind* nested = NestedIn(type);
  for (const Member& member : type.members) {
    if (nested != nullptr && (member.role == MemberRole::kId || member.role == MemberRole::kOwner)) continue;
    json.Name(member.name);
    WriteValue(json, member.kind, At(member, record));
  }
}

void WriteSetting(JsonWriter& json, const Setting& setting, const std::string& text) {
  json.Name(setting.name);
  if (setting.kind == MemberKind::kText) {
    json.String(text);
  } else {
    json.Literal(text);
  }
}

}  // namespace partnerkit::cli

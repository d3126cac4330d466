#include "hosting/memory_table.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <type_traits>

#include "partnerkit/run_time_error.h"

namespace partnerkit::hosting {
namespace {

template <class T>
void WriteValue(const T& value, std::string& bytes) {
  static_assert(std::is_arithmetic_v<T>);
  bytes.append(reinterpret_cast<const char*>(&value), sizeof value);
}
void WriteValue(double value, std::string& bytes) {
  WriteValue<double>(value + 0.0, bytes);  // -0 becomes 0
}
void WriteValue(const std::string& value, std::string& bytes) {
  WriteValue(value.size(), bytes);
  bytes.append(value);
}
void WriteValue(const DateTime& value, std::string& bytes) { WriteValue(value.Seconds(), bytes); }
template <class T>
void WriteValue(const std::optional<T>& value, std::string& bytes) {
  bool present = value.has_value();
  if constexpr (std::is_same_v<T, double>) present = present && !std::isnan(*value);
  WriteValue(present, bytes);
  if (present) WriteValue(*value, bytes);
}

template <class T>
void ReadValue(std::string_view& bytes, T& value) {
  static_assert(std::is_arithmetic_v<T>);
  std::memcpy(&value, bytes.data(), sizeof value);
  bytes.remove_prefix(sizeof value);
}
void ReadValue(std::string_view& bytes, std::string& value) {
  std::size_t length = 0;
  ReadValue(bytes, length);
  value.assign(bytes.substr(0, length));
  bytes.remove_prefix(length);
}
void ReadValue(std::string_view& bytes, DateTime& value) {
  std::int64_t seconds = 0;
  ReadValue(bytes, seconds);
  value = DateTime::FromSeconds(seconds);
}
template <class T>
void ReadValue(std::string_view& bytes, std::optional<T>& value) {
  bool present = false;
  ReadValue(bytes, present);
  if (present) ReadValue(bytes, value.emplace());
  else value.reset();
}

// Calls `act` with the member of the record, typed as its kind says.
template <class F>
void WithMember(const Member& member, void* record, F act) {
  void* const at = member.at(record);
  switch (member.kind) {
    case MemberKind::kString:
      return act(*static_cast<std::string*>(at));
    case MemberKind::kText:
      return act(*static_cast<Text*>(at));
    case MemberKind::kInt:
      return act(*static_cast<std::int32_t*>(at));
    case MemberKind::kLong:
      return act(*static_cast<std::int64_t*>(at));
    case MemberKind::kBool:
      return act(*static_cast<bool*>(at));
    case MemberKind::kDouble:
      return act(*static_cast<double*>(at));
    case MemberKind::kNumber:
      return act(*static_cast<std::optional<double>*>(at));
    case MemberKind::kDate:
      return act(*static_cast<std::optional<DateTime>*>(at));
  }
}
// A member's place is told by a changeable record only; it is not changed here.
template <class F>
void WithMember(const Member& member, const void* record, F act) {
  WithMember(member, const_cast<void*>(record), [&](const auto& value) { act(value); });
}

bool MayBeNull(const Member& member) {
  return member.kind == MemberKind::kText || member.kind == MemberKind::kNumber || member.kind == MemberKind::kDate;
}

// How many of the bytes are the member's.
std::size_t LengthOf(const Member& member, std::string_view bytes) {
  const std::size_t all = bytes.size();
  bool present = true;
  if (MayBeNull(member)) ReadValue(bytes, present);
  std::size_t length = present ? sizeof(std::int64_t) : 0;
  if (member.kind == MemberKind::kBool) length = sizeof(bool);
  if (member.kind == MemberKind::kInt) length = sizeof(std::int32_t);
  if (present && (member.kind == MemberKind::kString || member.kind == MemberKind::kText)) ReadValue(bytes, length);
  return all - bytes.size() + length;
}

}  // namespace

MemoryTable::MemoryTable(const RecordType& type) : type_(type) {
  for (std::size_t n = 0; n < type.members.size(); ++n) all_.push_back(n);
  const MemberNumbers ids = MembersOf(MemberRole::kId), keys = MembersOf(MemberRole::kKey);
  if (!ids.empty()) id_ = &type.members[ids.front()];
  if (!keys.empty()) key_ = &AddIndex(keys, true);
  for (const Lookup& lookup : type.lookups) {
    if (lookup.unique) IndexOf(lookup);
  }
}

MemoryTable::MemberNumbers MemoryTable::MembersOf(MemberRole role) const {
  MemberNumbers numbers;
  for (const std::size_t n : all_) {
    if (type_.members[n].role == role) numbers.push_back(n);
  }
  return numbers;
}

MemoryTable::MemberNumbers MemoryTable::MembersOf(const Lookup& lookup) const {
  MemberNumbers numbers;
  for (const std::string_view name : lookup.members) {
    const auto found = std::ranges::find(type_.members, name, &Member::name);
    if (found == type_.members.end()) {
      throw RunTimeError(run_time::kInternal, std::string(type_.kind).append(" has no member ").append(name));
    }
    numbers.push_back(static_cast<std::size_t>(found - type_.members.begin()));
  }
  return numbers;
}

MemoryTable::Index& MemoryTable::AddIndex(MemberNumbers members, bool unique) {
  auto index = std::make_unique<Index>();
  index->members = std::move(members);
  index->unique = unique;
  for (const auto& [place, row] : rows_) index->places[KeyIn(*index, Split(*row))].insert(place);
  return *indexes_.emplace_back(std::move(index));
}

MemoryTable::Index& MemoryTable::IndexOf(const Lookup& lookup) {
  const auto known = byLookup_.find(lookup.members.data());
  if (known != byLookup_.end()) return *known->second;
  Index& added = AddIndex(MembersOf(lookup), lookup.unique);
  byLookup_.emplace(lookup.members.data(), &added);
  return added;
}

const Places* MemoryTable::Fitting(const Lookup& lookup, const void* probe) { return Fitting(IndexOf(lookup), probe); }

const Places* MemoryTable::Fitting(const Index& index, const void* probe) const {
  const auto found = index.places.find(BytesOf(probe, index.members));
  return found == index.places.end() ? nullptr : &found->second;
}

std::optional<Place> MemoryTable::PlaceOf(const void* record, bool byKey) const {
  if (id_ != nullptr && (key_ == nullptr || !byKey)) {
    const Place id = IdOf(record);
    return rows_.contains(id) ? std::optional(id) : std::nullopt;
  }
  const Places* const fitting = key_ == nullptr ? nullptr : Fitting(*key_, record);
  return fitting == nullptr ? std::nullopt : std::optional(*fitting->begin());
}

Row MemoryTable::At(Place place) const {
  const auto found = rows_.find(place);
  return found == rows_.end() ? nullptr : found->second;
}

void MemoryTable::Read(const Row& row, void* record) const {
  std::string_view rest = *row;
  for (const Member& member : type_.members) {
    WithMember(member, record, [&](auto& value) { ReadValue(rest, value); });
  }
}

Row MemoryTable::RowOf(const void* record) const { return std::make_shared<std::string>(BytesOf(record, all_)); }

std::optional<Place> MemoryTable::NewPlace(const void* record) const {
  constexpr Place kLastId = std::numeric_limits<std::int32_t>::max();
  const Place wanted = id_ == nullptr ? 0 : IdOf(record);
  const Place place = wanted == 0 ? last_ + 1 : wanted;
  return place < 1 || (id_ != nullptr && place > kLastId) ? std::nullopt : std::optional(place);
}

void MemoryTable::Take(Place place, void* record) {
  last_ = std::max(last_, place);
  if (id_ == nullptr) return;
  WithMember(*id_, record, [&](auto& id) {
    using Id = std::remove_cvref_t<decltype(id)>;
    if constexpr (std::is_integral_v<Id>) id = static_cast<Id>(place);
  });
}

bool MemoryTable::Clashes(const void* record, Place place) const {
  return std::ranges::any_of(indexes_, [&](const std::unique_ptr<Index>& index) {
    const Places* const fitting = index->unique ? Fitting(*index, record) : nullptr;
    return fitting != nullptr && *fitting->begin() != place;
  });
}

bool MemoryTable::AllNumbers(const void* record) const {
  return std::ranges::all_of(type_.members, [&](const Member& member) {
    return member.kind != MemberKind::kDouble ||
           !std::isnan(*static_cast<const double*>(member.at(const_cast<void*>(record))));
  });
}

Row MemoryTable::Replace(Place place, Row row) {
  Row before = At(place);
  const Slices old = before ? Split(*before) : Slices(), fresh = row ? Split(*row) : Slices();
  for (const auto& index : indexes_) {
    const std::string from = before ? KeyIn(*index, old) : "", to = row ? KeyIn(*index, fresh) : "";
    if (before && row && from == to) continue;
    if (before) {
      const auto fitting = index->places.find(from);
      fitting->second.erase(place);
      if (fitting->second.empty()) index->places.erase(fitting);
    }
    if (row) index->places[to].insert(place);
  }
  if (row) rows_[place] = std::move(row);
  else rows_.erase(place);
  return before;
}

Place MemoryTable::IdOf(const void* record) const {
  Place id = 0;
  WithMember(*id_, record, [&](const auto& value) {
    if constexpr (std::is_integral_v<std::remove_cvref_t<decltype(value)>>) id = value;
  });
  return id;
}

std::string MemoryTable::BytesOf(const void* record, const MemberNumbers& members) const {
  std::string bytes;
  for (const std::size_t member : members) {
    WithMember(type_.members[member], record, [&](const auto& value) { WriteValue(value, bytes); });
  }
  return bytes;
}

MemoryTable::Slices MemoryTable::Split(std::string_view row) const {
  Slices slices;
  for (const Member& member : type_.members) {
    slices.push_back(row.substr(0, LengthOf(member, row)));
    row.remove_prefix(slices.back().size());
  }
  return slices;
}

std::string MemoryTable::KeyIn(const Index& index, const Slices& slices) {
  std::string key;
  for (const std::size_t member : index.members) key += slices[member];
  return key;
}

}  // namespace partnerkit::hosting

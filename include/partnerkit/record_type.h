// How a record type describes itself: one table of members, with keys and defaults, that serves the SQL store, the JSON
// of the command line and any other binding.
#pragma once

#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>

#include "partnerkit/values.h"

namespace partnerkit {

enum class MemberKind : std::uint8_t {
  kString,  // std::string, never null
  kText,    // Text, may be null
  kInt,     // std::int32_t
  kLong,    // std::int64_t
  kBool,    // bool
  kDouble,  // double
  kNumber,  // std::optional<double>, may be null
  kDate,    // std::optional<DateTime>, may be null
};

enum class MemberRole : std::uint8_t {
  kPlain,
  kId,     // the record's own number, given by the store when the record is added with 0
  kKey,    // part of the key that `Load`, `Update` and `Delete` go by
  kOwner,  // names the record that this one belongs to: `Member::owner` is that record's kind
};

struct Member {
  std::string_view name;
  MemberKind kind;
  MemberRole role;
  void* (*at)(void* record);  // the member inside a record of the type that holds this table
  std::string_view owner;     // kind of the record named, empty when the member names none
};

// A way to find records other than by key: the members whose values a probe record carries.
struct Lookup {
  std::string_view name;
  std::span<const std::string_view> members;
  bool unique = false;  // at most one record fits; the store keeps it so
};

struct RecordType {
  std::string_view kind;   // "OrderLine": the name in JSON and in messages
  std::string_view table;  // "tbOrderLine": the name in the store
  std::span<const Member> members;
  std::span<const Lookup> lookups;
  std::string_view about;  // a line of the data documentation
};

namespace internal {

template <class>
struct MemberOf;
template <class R, class T>
struct MemberOf<T R::*> {
  using Record = R;
  using Type = T;
};

template <class T>
constexpr MemberKind KindOf() {
  if constexpr (std::is_same_v<T, std::string>) return MemberKind::kString;
  else if constexpr (std::is_same_v<T, Text>) return MemberKind::kText;
  else if constexpr (std::is_same_v<T, std::int32_t>) return MemberKind::kInt;
  else if constexpr (std::is_same_v<T, std::int64_t>) return MemberKind::kLong;
  else if constexpr (std::is_same_v<T, bool>) return MemberKind::kBool;
  else if constexpr (std::is_same_v<T, double>) return MemberKind::kDouble;
  else if constexpr (std::is_same_v<T, std::optional<double>>) return MemberKind::kNumber;
  else {
    static_assert(std::is_same_v<T, std::optional<DateTime>>, "no such member kind");
    return MemberKind::kDate;
  }
}

template <auto M>
constexpr Member Describe(std::string_view name, MemberRole role, std::string_view owner) {
  using Of = MemberOf<decltype(M)>;
  return {name, KindOf<typename Of::Type>(), role,
          [](void* record) -> void* { return &(static_cast<typename Of::Record*>(record)->*M); }, owner};
}

}  // namespace internal

// One row of a member table: Field<&Order::DeptNo>("DeptNo").
template <auto M>
constexpr Member Id(std::string_view name) {
  return internal::Describe<M>(name, MemberRole::kId, {});
}
template <auto M>
constexpr Member Key(std::string_view name) {
  return internal::Describe<M>(name, MemberRole::kKey, {});
}
template <auto M>
constexpr Member Owner(std::string_view name, std::string_view kind) {
  return internal::Describe<M>(name, MemberRole::kOwner, kind);
}
template <auto M>
constexpr Member Field(std::string_view name) {
  return internal::Describe<M>(name, MemberRole::kPlain, {});
}
// A plain member that holds another record's id without needing it to exist ("may be null", "may dangle").
template <auto M>
constexpr Member Link(std::string_view name, std::string_view kind) {
  return internal::Describe<M>(name, MemberRole::kPlain, kind);
}

}  // namespace partnerkit

#include "partnerkit/records.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <string>

namespace partnerkit {
namespace {

// The names are held against docs/data.md by another test, the look-ups by every database that is made.
TEST(RecordTypes, HaveOneWayToBeNamedAndOwnersThatComeEarlier) {
  std::set<std::string_view> earlier;
  for (const RecordType* type : AllRecordTypes()) {
    EXPECT_EQ(FindRecordType(type->kind), type);
    EXPECT_EQ(type->table, "tb" + std::string(type->kind));
    EXPECT_TRUE(type->about.ends_with("."));
    const auto ids = std::ranges::count(type->members, MemberRole::kId, &Member::role);
    const auto keys = std::ranges::count(type->members, MemberRole::kKey, &Member::role);
    EXPECT_TRUE(ids == 1 ? keys == 0 : ids == 0 && keys > 0) << ids << " ids, " << keys << " keys";
    for (const Member& member : type->members) {
      SCOPED_TRACE(std::string(type->kind) + "." + std::string(member.name));
      EXPECT_TRUE(member.role != MemberRole::kId || member.kind == MemberKind::kInt);
      EXPECT_FALSE(member.role == MemberRole::kOwner && member.owner.empty());
      if (member.owner.empty()) continue;
      const RecordType* owner = FindRecordType(member.owner);
      ASSERT_NE(owner, nullptr);
      if (member.role == MemberRole::kOwner) {
        EXPECT_TRUE(earlier.contains(member.owner));
        // What names an owner is of the type that the owner is named by.
        const Member& named = owner->members.front();
        EXPECT_NE(named.role, MemberRole::kPlain);
        EXPECT_EQ(member.kind, named.kind);
      }
    }
    EXPECT_TRUE(earlier.insert(type->kind).second);
  }
  EXPECT_EQ(FindRecordType("orderline"), nullptr);
}

struct Layout {
  std::size_t size;
  std::size_t alignment;
  bool isDefault;
};

template <class T>
Layout LayoutOf(const void* at) {
  const T& value = *static_cast<const T*>(at);
  if constexpr (requires { value.has_value(); }) return {sizeof(T), alignof(T), !value.has_value()};
  else return {sizeof(T), alignof(T), value == T()};
}

const std::map<MemberKind, Layout (*)(const void*)> kLayouts = {
    {MemberKind::kString, LayoutOf<std::string>},
    {MemberKind::kText, LayoutOf<Text>},
    {MemberKind::kInt, LayoutOf<std::int32_t>},
    {MemberKind::kLong, LayoutOf<std::int64_t>},
    {MemberKind::kBool, LayoutOf<bool>},
    {MemberKind::kDouble, LayoutOf<double>},
    {MemberKind::kNumber, LayoutOf<std::optional<double>>},
    {MemberKind::kDate, LayoutOf<std::optional<DateTime>>},
};

// The rows of a table, laid end to end, must fill the record: a member that no row reaches leaves a hole, and one that
// two rows reach overlaps.
template <class R>
void CheckMembers() {
  R record;
  std::size_t end = 0;
  for (const Member& member : R::kType.members) {
    SCOPED_TRACE(std::string(R::kType.kind) + "." + std::string(member.name));
    const void* at = member.at(&record);
    const Layout layout = kLayouts.at(member.kind)(at);
    const auto offset = static_cast<std::size_t>(static_cast<const char*>(at) - reinterpret_cast<const char*>(&record));
    EXPECT_EQ(offset, (end + layout.alignment - 1) / layout.alignment * layout.alignment);
    EXPECT_TRUE(layout.isDefault);
    end = offset + layout.size;
  }
  EXPECT_EQ((end + alignof(R) - 1) / alignof(R) * alignof(R), sizeof(R)) << R::kType.kind;
}

template <class... R>
void CheckAll() {
  EXPECT_EQ(sizeof...(R), AllRecordTypes().size());
  (CheckMembers<R>(), ...);
}

TEST(RecordTypes, ReachEveryMemberOfARecordOnce) {
  CheckAll<Partner, Vendor, EDIDoc, PartnerAddress, PartnerLocn, Product, ProductPrice, ProductInner, Prepack, PackType,
           Printer, LabelJob, LabelJobItem, Order, OrderLine, OrderLocn, OrderLocnLine, UnsettledOrder, Job, PSlip,
           PSlipLine, Shipment, ASN, PendingNotice, Pack, PackLine, PADRecord, PADItem, PADStore, Log>();
}

}  // namespace
}  // namespace partnerkit

#include "partnerkit/records.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <string>
#include <vector>

#include "frame/keyed_list.h"

namespace partnerkit {
namespace {

std::shared_ptr<Pack> MakePack(std::int32_t id) {
  auto pack = std::make_shared<Pack>();
  pack->Id = id;
  return pack;
}

PackList MakeList(const std::vector<std::pair<std::int32_t, std::string>>& items) {
  PackList list;
  for (const auto& [id, key] : items) list.Add(MakePack(id), key);
  return list;
}

std::vector<std::int32_t> Walk(const PackList& list) {
  std::vector<std::int32_t> ids;
  for (const auto& pack : list) ids.push_back(pack->Id);
  return ids;
}

using Ids = std::vector<std::int32_t>;

TEST(KeyedList, FindsByPositionByKeyedTextAndByKey) {
  const PackList list = MakeList({{11, "S2"}, {12, ""}, {13, "ID=S2"}});

  ASSERT_EQ(list.Count(), 3u);
  EXPECT_EQ(list.Item(1)->Id, 11);
  EXPECT_EQ(list.Item(3)->Id, 13);
  EXPECT_EQ(list.Item("ID=S2")->Id, 11);
  EXPECT_EQ(list.Item("ID=")->Id, 12);
  EXPECT_EQ(list.Item("ID=ID=S2")->Id, 13);
  EXPECT_EQ(list.Find("S2")->Id, 11);
  EXPECT_EQ(Walk(list), Ids({11, 12, 13}));
}

TEST(KeyedList, GivesNothingForWhatIsAbsent) {
  const PackList list = MakeList({{11, "S1"}});

  EXPECT_FALSE(list.Item(std::size_t{0}));
  EXPECT_FALSE(list.Item(2));
  EXPECT_FALSE(list.Item("ID=S2"));
  EXPECT_FALSE(list.Item("S1"));
  EXPECT_FALSE(list.Item(""));
  EXPECT_FALSE(list.Find("s1"));
  EXPECT_FALSE(PackList().Item(1));
}

TEST(KeyedList, RefusesAKeyInUseAndStaysAsItWas) {
  PackList list = MakeList({{11, "S1"}, {12, "S2"}});
  try {
    list.Add(MakePack(13), "S1");
    FAIL() << "no error raised";
  } catch (const RunTimeError& error) {
    EXPECT_EQ(error.Number(), 457);
  }
  EXPECT_EQ(list.Count(), 2u);
  EXPECT_EQ(list.Find("S1")->Id, 11);
  EXPECT_EQ(Walk(list), Ids({11, 12}));
}

TEST(KeyedList, RemovesWithoutDisturbingTheOrder) {
  PackList list = MakeList({{11, "A"}, {12, "B"}, {13, "C"}, {14, "D"}});

  EXPECT_TRUE(list.Remove("A"));
  EXPECT_TRUE(list.Remove("C"));
  EXPECT_FALSE(list.Remove("C"));
  EXPECT_EQ(list.Count(), 2u);
  EXPECT_EQ(Walk(list), Ids({12, 14}));
  EXPECT_FALSE(list.Find("C"));

  list.Add(MakePack(15), "C");
  EXPECT_EQ(list.Item(1)->Id, 12);
  EXPECT_EQ(list.Item(3)->Id, 15);
  EXPECT_FALSE(list.Item(4));
  EXPECT_EQ(list.Find("D")->Id, 14);
  EXPECT_TRUE(list.Remove("D"));
  EXPECT_EQ(Walk(list), Ids({12, 15}));
}

TEST(KeyedList, IsWalkedWhileItsItemsGoAndCome) {
  PackList list = MakeList({{11, "A"}, {12, "B"}, {13, "C"}});
  Ids seen;
  for (const auto& pack : list) {
    if (pack->Id == 11) {
      list.Remove("A");
      list.Remove("B");
      for (std::int32_t id = 20; id < 24; ++id) list.Add(MakePack(id), std::to_string(id));
    }
    seen.push_back(pack->Id);
  }
  EXPECT_EQ(seen, Ids({11, 13, 20, 21, 22, 23}));
}

TEST(KeyedList, KeepsItsItemsWhenMoved) {
  PackList from = MakeList({{11, "A"}, {12, "B"}, {13, "C"}});
  from.Remove("A");
  PackList list = std::move(from);

  EXPECT_EQ(list.Item(2)->Id, 13);
  EXPECT_TRUE(list.Remove("B"));
  EXPECT_EQ(list.Item(1)->Id, 13);
}

bool HasMember(const RecordType& type, std::string_view name) {
  return std::ranges::find(type.members, name, &Member::name) != type.members.end();
}

TEST(RecordTypes, AreFoundByKind) {
  EXPECT_EQ(FindRecordType("OrderLine"), &OrderLine::kType);
  EXPECT_EQ(FindRecordType("Log"), &Log::kType);
  EXPECT_EQ(FindRecordType("orderline"), nullptr);
  EXPECT_EQ(FindRecordType(""), nullptr);
}

TEST(RecordTypes, HaveUniqueNamesAndOneWayToBeLoaded) {
  std::set<std::string_view> kinds;
  std::set<std::string_view> tables;
  for (const RecordType* type : AllRecordTypes()) {
    SCOPED_TRACE(std::string(type->kind));
    EXPECT_TRUE(kinds.insert(type->kind).second);
    EXPECT_TRUE(tables.insert(type->table).second);
    EXPECT_EQ(type->table, "tb" + std::string(type->kind));
    EXPECT_TRUE(type->about.ends_with("."));

    const auto ids = std::ranges::count(type->members, MemberRole::kId, &Member::role);
    const auto keys = std::ranges::count(type->members, MemberRole::kKey, &Member::role);
    EXPECT_TRUE(ids == 1 ? keys == 0 : ids == 0 && keys > 0) << ids << " ids, " << keys << " keys";
    std::set<std::string_view> names;
    for (const Member& member : type->members) {
      EXPECT_TRUE(names.insert(member.name).second) << member.name;
      if (member.role == MemberRole::kId) {
        EXPECT_EQ(member.kind, MemberKind::kInt);
      }
    }
  }
}

TEST(RecordTypes, LookUpByMembersOfTheirOwn) {
  for (const RecordType* type : AllRecordTypes()) {
    std::set<std::string_view> names;
    for (const Lookup& lookup : type->lookups) {
      SCOPED_TRACE(std::string(type->kind) + "." + std::string(lookup.name));
      EXPECT_TRUE(names.insert(lookup.name).second);
      EXPECT_FALSE(lookup.members.empty());
      for (const std::string_view member : lookup.members) EXPECT_TRUE(HasMember(*type, member)) << member;
    }
  }
}

TEST(RecordTypes, AreOwnedByKindsThatComeEarlier) {
  std::set<std::string_view> earlier;
  for (const RecordType* type : AllRecordTypes()) {
    for (const Member& member : type->members) {
      SCOPED_TRACE(std::string(type->kind) + "." + std::string(member.name));
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
    earlier.insert(type->kind);
  }
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

Layout LayoutOf(MemberKind kind, const void* at) {
  switch (kind) {
    case MemberKind::kString:
      return LayoutOf<std::string>(at);
    case MemberKind::kText:
      return LayoutOf<Text>(at);
    case MemberKind::kInt:
      return LayoutOf<std::int32_t>(at);
    case MemberKind::kLong:
      return LayoutOf<std::int64_t>(at);
    case MemberKind::kBool:
      return LayoutOf<bool>(at);
    case MemberKind::kDouble:
      return LayoutOf<double>(at);
    case MemberKind::kNumber:
      return LayoutOf<std::optional<double>>(at);
    case MemberKind::kDate:
      return LayoutOf<std::optional<DateTime>>(at);
  }
  return {};
}

// The rows of a table, laid end to end, must fill the record: a member that no row reaches leaves a hole, and one that
// two rows reach overlaps.
template <class R>
void CheckMembers() {
  R record;
  std::size_t end = 0;
  for (const Member& member : R::kType.members) {
    SCOPED_TRACE(std::string(R::kType.kind) + "." + std::string(member.name));
    const void* at = member.at(&record);
    const Layout layout = LayoutOf(member.kind, at);
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
           Printer, LabelJob, LabelJobItem, Order, OrderLine, OrderLocn, OrderLocnLine, Job, PSlip, PSlipLine, Shipment,
           ASN, PendingNotice, Pack, PackLine, PADRecord, PADItem, PADStore, Log>();
}

TEST(RecordTypes, CallMembersByTheirNames) {
  struct Row {
    const RecordType& type;
    std::string_view name;
    const void* at;
    void* record;
  };
  Pack pack;
  OrderLocnLine line;
  Partner partner;
  const Row rows[] = {{Pack::kType, "ShipToCode", &pack.ShipToCode, &pack},
                      {Pack::kType, "LeadPackId", &pack.LeadPackId, &pack},
                      {OrderLocnLine::kType, "LineId", &line.LineId, &line},
                      {OrderLocnLine::kType, "InvoicedQty", &line.InvoicedQty, &line},
                      {Partner::kType, "LastGroupNo", &partner.LastGroupNo, &partner}};
  for (const Row& row : rows) {
    const auto member = std::ranges::find(row.type.members, row.name, &Member::name);
    ASSERT_NE(member, row.type.members.end()) << row.name;
    EXPECT_EQ(member->at(row.record), row.at) << row.name;
  }
}

}  // namespace
}  // namespace partnerkit

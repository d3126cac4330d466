// A host whose records lie in memory: quick to make and to throw away.
#pragma once

#include <algorithm>
#include <functional>
#include <map>
#include <memory>
#include <string_view>
#include <variant>
#include <vector>

#include "partnerkit/records.h"
#include "partnerkit/store.h"

namespace partnerkit::fuzz {

using Value = std::variant<std::string, Text, std::int32_t, std::int64_t, bool, double, std::optional<double>,
                           std::optional<DateTime>>;
using Row = std::vector<Value>;

// Calls `act` with the member, typed as its kind says.
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

class MemoryStore : public RecordStore {
 public:
  bool Load(const RecordType& type, void* record) override { return ReadFirst(type, record, Key(type)); }
  bool Find(const RecordType& type, const Lookup& lookup, void* record) override {
    return ReadFirst(type, record, Columns(type, lookup));
  }
  bool Add(const RecordType& type, void* record) override {
    const std::vector<std::size_t> key = Key(type);
    if (type.members[key.front()].role != MemberRole::kId) {
      if (Search(type, record, key) != nullptr) return false;
    } else {
      WithMember(type.members[key.front()], record, [&](auto& id) {
        if constexpr (std::is_same_v<decltype(id), std::int32_t&>) id = ++lastIds_[&type];
      });
    }
    for (const Lookup& lookup : type.lookups) {
      if (lookup.unique && Search(type, record, Columns(type, lookup)) != nullptr) return false;
    }
    rows_[&type].push_back(RowOf(type, record));
    return true;
  }
  bool Update(const RecordType& type, const void* record) override {
    Row* const row = Search(type, record, Key(type));
    if (row != nullptr) *row = RowOf(type, record);
    return row != nullptr;
  }
  bool Delete(const RecordType& type, const void* record) override { return DeleteAll(type, record, Key(type)) != 0; }
  void Select(const RecordType& type, const Lookup& lookup, const void* probe,
              const std::function<void*()>& next) override {
    const auto columns = Columns(type, lookup);
    const Row wanted = RowOf(type, probe);
    for (const Row& row : rows_[&type]) {
      if (!Fits(row, wanted, columns)) continue;
      void* const into = next();
      if (into == nullptr) return;
      Read(type, row, into);
    }
  }
  std::int32_t Count(const RecordType& type, const Lookup& lookup, const void* probe) override {
    const Row wanted = RowOf(type, probe);
    const auto columns = Columns(type, lookup);
    return static_cast<std::int32_t>(std::count_if(rows_[&type].begin(), rows_[&type].end(),
                                                   [&](const Row& row) { return Fits(row, wanted, columns); }));
  }
  std::int32_t NativeError() const override { return 0; }

  // Every record of the type.
  template <class R, class F>
  void ForEach(F visit) {
    for (const Row& row : rows_[&R::kType]) {
      R record;
      Read(R::kType, row, &record);
      visit(record);
    }
  }
  template <class R>
  void DeleteOf(const Lookup& lookup, const R& probe) {
    DeleteAll(R::kType, &probe, Columns(R::kType, lookup));
  }

 private:
  // The record's own number, or else its key members.
  static std::vector<std::size_t> Key(const RecordType& type) {
    std::vector<std::size_t> key;
    for (std::size_t at = 0; at < type.members.size(); ++at) {
      if (type.members[at].role == MemberRole::kId) return {at};
      if (type.members[at].role == MemberRole::kKey) key.push_back(at);
    }
    return key;
  }
  static std::vector<std::size_t> Columns(const RecordType& type, const Lookup& lookup) {
    std::vector<std::size_t> columns;
    for (const std::string_view name : lookup.members) {
      const auto found = std::find_if(type.members.begin(), type.members.end(),
                                      [&](const Member& member) { return member.name == name; });
      columns.push_back(static_cast<std::size_t>(found - type.members.begin()));
    }
    return columns;
  }
  static Row RowOf(const RecordType& type, const void* record) {
    Row row;
    for (const Member& member : type.members) {
      // A member's place is told by a changeable record only; it is not changed here.
      WithMember(member, const_cast<void*>(record), [&](auto& value) { row.emplace_back(value); });
    }
    return row;
  }
  static void Read(const RecordType& type, const Row& row, void* record) {
    for (std::size_t at = 0; at < row.size(); ++at) {
      WithMember(type.members[at], record,
                 [&](auto& value) { value = std::get<std::remove_reference_t<decltype(value)>>(row[at]); });
    }
  }
  static bool Fits(const Row& row, const Row& wanted, const std::vector<std::size_t>& columns) {
    return std::all_of(columns.begin(), columns.end(), [&](std::size_t at) { return row[at] == wanted[at]; });
  }
  Row* Search(const RecordType& type, const void* record, const std::vector<std::size_t>& columns) {
    const Row wanted = RowOf(type, record);
    const auto found = std::find_if(rows_[&type].begin(), rows_[&type].end(),
                                    [&](const Row& row) { return Fits(row, wanted, columns); });
    return found == rows_[&type].end() ? nullptr : &*found;
  }
  bool ReadFirst(const RecordType& type, void* record, const std::vector<std::size_t>& columns) {
    const Row* const row = Search(type, record, columns);
    if (row != nullptr) Read(type, *row, record);
    return row != nullptr;
  }
  std::size_t DeleteAll(const RecordType& type, const void* record, const std::vector<std::size_t>& columns) {
    const Row wanted = RowOf(type, record);
    return std::erase_if(rows_[&type], [&](const Row& row) { return Fits(row, wanted, columns); });
  }

  std::map<const RecordType*, std::vector<Row>> rows_;
  std::map<const RecordType*, std::int32_t> lastIds_;
};

class MemoryHost : public System {
 public:
  MemoryStore& Records() override { return store_; }
  std::string UserId() override { return "fuzz"; }
  bool DeleteOrder(const Order& order) override {
    OrderLine line;
    OrderLocn location;
    OrderLocnLine locnLine;
    line.OrderId = location.OrderId = locnLine.OrderId = order.OrderId;
    store_.DeleteOf(OrderLine::kByOrder, line);
    store_.DeleteOf(OrderLocn::kByOrder, location);
    store_.DeleteOf(OrderLocnLine::kByOrder, locnLine);
    return Delete(store_, order);
  }
  void Commit(std::int32_t) override {}
  void BeginTrans() override {}
  void CommitTrans() override {}
  void RollbackTrans() override {}
  std::vector<EDIDoc> EDIDocList() override {
    std::vector<EDIDoc> documents;
    store_.ForEach<EDIDoc>([&](const EDIDoc& document) { documents.push_back(document); });
    return documents;
  }
  std::int32_t NextNumber(std::string_view, Counter) override { return ++lastNumber_; }

 private:
  MemoryStore store_;
  std::int32_t lastNumber_ = 0;
};

}  // namespace partnerkit::fuzz

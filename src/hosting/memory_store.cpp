#include <algorithm>
#include <unordered_map>
#include <vector>

#include "hosting/memory_table.h"
#include "partnerkit/memory_host.h"

namespace partnerkit {

using hosting::MemoryTable;
using hosting::Place;
using hosting::Places;
using hosting::Row;

struct MemoryStore::Parts {
  struct Change {
    MemoryTable* table;
    Place place;
    Row before;
  };

  // A type's member table tells it from any other, also in a copy.
  MemoryTable& TableOf(const RecordType& type) { return tables.try_emplace(type.members.data(), type).first->second; }

  void Replace(MemoryTable& table, Place place, Row row) {
    Row before = table.Replace(place, std::move(row));
    // The run log is no part of a transaction.
    if (noting && &table != &TableOf(Log::kType)) changes.push_back({&table, place, std::move(before)});
  }

  std::unordered_map<const Member*, MemoryTable> tables;
  bool noting = false;
  std::vector<Change> changes;
};

namespace {

bool IsPartner(const RecordType& type) { return type.members.data() == Partner::kType.members.data(); }

// The record with each counter as far as the stored one's at least.
Partner WithCountersOf(const Partner& stored, Partner partner) {
  for (const auto counter : {&Partner::LastASNNo, &Partner::LastInterchangeNo, &Partner::LastGroupNo}) {
    partner.*counter = std::max(partner.*counter, stored.*counter);
  }
  return partner;
}

}  // namespace

MemoryStore::MemoryStore() : parts_(std::make_unique<Parts>()) {}
MemoryStore::~MemoryStore() = default;

bool MemoryStore::Done(Refusal refusal) {
  refusal_ = refusal;
  return refusal == kNotRefused;
}

bool MemoryStore::Load(const RecordType& type, void* record) {
  Done();
  const MemoryTable& table = parts_->TableOf(type);
  const std::optional<Place> place = table.PlaceOf(record, true);
  if (place) table.Read(table.At(*place), record);
  return place.has_value();
}

bool MemoryStore::Find(const RecordType& type, const Lookup& lookup, void* record) {
  Done();
  MemoryTable& table = parts_->TableOf(type);
  const Places* const fitting = table.Fitting(lookup, record);
  if (fitting != nullptr) table.Read(table.At(*fitting->begin()), record);
  return fitting != nullptr;
}

void MemoryStore::Select(const RecordType& type, const Lookup& lookup, const void* probe,
                         const std::function<void*()>& next) {
  Done();
  MemoryTable& table = parts_->TableOf(type);
  const Places* const fitting = table.Fitting(lookup, probe);
  if (fitting == nullptr) return;
  for (const Place place : std::vector(fitting->begin(), fitting->end())) {
    const Row row = table.At(place);
    if (!row) continue;
    void* const into = next();
    if (into == nullptr) return;
    table.Read(row, into);
  }
}

std::int32_t MemoryStore::Count(const RecordType& type, const Lookup& lookup, const void* probe) {
  Done();
  const Places* const fitting = parts_->TableOf(type).Fitting(lookup, probe);
  return fitting == nullptr ? 0 : static_cast<std::int32_t>(fitting->size());
}

bool MemoryStore::Add(const RecordType& type, void* record) {
  MemoryTable& table = parts_->TableOf(type);
  const std::optional<Place> place = table.NewPlace(record);
  if (!place) return Done(kNoId);
  if (!table.AllNumbers(record)) return Done(kNotANumber);
  if (table.At(*place) || table.Clashes(record, *place)) return Done(kDuplicate);
  table.Take(*place, record);
  parts_->Replace(table, *place, table.RowOf(record));
  return Done();
}

bool MemoryStore::Update(const RecordType& type, const void* record) {
  Done();
  MemoryTable& table = parts_->TableOf(type);
  const std::optional<Place> place = table.PlaceOf(record, false);
  if (!place) return false;
  if (!table.AllNumbers(record)) return Done(kNotANumber);
  if (table.Clashes(record, *place)) return Done(kDuplicate);
  if (IsPartner(type)) {
    Partner stored;
    table.Read(table.At(*place), &stored);
    const Partner partner = WithCountersOf(stored, *static_cast<const Partner*>(record));
    parts_->Replace(table, *place, table.RowOf(&partner));
  } else {
    parts_->Replace(table, *place, table.RowOf(record));
  }
  return Done();
}

bool MemoryStore::Delete(const RecordType& type, const void* record) {
  Done();
  MemoryTable& table = parts_->TableOf(type);
  const std::optional<Place> place = table.PlaceOf(record, false);
  if (place) parts_->Replace(table, *place, nullptr);
  return place.has_value();
}

void MemoryStore::BeginTrans() { parts_->noting = true; }

void MemoryStore::CommitTrans() {
  parts_->noting = false;
  parts_->changes.clear();
}

void MemoryStore::RollbackTrans() {
  for (auto change = parts_->changes.rbegin(); change != parts_->changes.rend(); ++change) {
    change->table->Replace(change->place, change->before);
  }
  CommitTrans();
}

}  // namespace partnerkit

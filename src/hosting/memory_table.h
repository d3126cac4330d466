// The records of one type in memory, found by place, key or look-up.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "partnerkit/record_type.h"

namespace partnerkit::hosting {

// A record as the bytes of its members, one after the other. Equal values, and only they, have equal bytes, so that the
// bytes of some members are the key of a hash table too.
using Row = std::shared_ptr<const std::string>;

// Where a record stands: its id, or a running number. Places rise in the order added.
using Place = std::int64_t;
using Places = std::set<Place>;

class MemoryTable {
 public:
  explicit MemoryTable(const RecordType& type);
  MemoryTable(const MemoryTable&) = delete;
  MemoryTable& operator=(const MemoryTable&) = delete;

  // The records that fit the probe in the members of the look-up; null when none does.
  const Places* Fitting(const Lookup& lookup, const void* probe);
  // The record's own place, by its key where `byKey` asks for that and the type has one, else as it is known by: by id,
  // or by key without one. Nothing when there is no such record.
  std::optional<Place> PlaceOf(const void* record, bool byKey) const;
  // Null when there is no record at the place.
  Row At(Place place) const;
  void Read(const Row& row, void* record) const;
  Row RowOf(const void* record) const;

  // Where a new record goes; nothing when it has an id that can't be, or none is left to give.
  std::optional<Place> NewPlace(const void* record) const;
  // Uses the place up, and sets the record's id if it has one.
  void Take(Place place, void* record);
  // Whether another record than the one at `place` has this one's key or the members of a unique look-up.
  bool Clashes(const void* record, Place place) const;
  // Whether every member of kind `kDouble` is a number.
  bool AllNumbers(const void* record) const;
  // Puts the row at the place, or with null takes away what is there. Gives what was there before.
  Row Replace(Place place, Row row);

 private:
  using MemberNumbers = std::vector<std::size_t>;
  using Slices = std::vector<std::string_view>;

  struct Index {
    MemberNumbers members;
    bool unique = false;
    std::unordered_map<std::string, Places> places;  // by the bytes of the members
  };

  MemberNumbers MembersOf(MemberRole role) const;
  MemberNumbers MembersOf(const Lookup& lookup) const;
  Index& AddIndex(MemberNumbers members, bool unique);
  Index& IndexOf(const Lookup& lookup);
  const Places* Fitting(const Index& index, const void* probe) const;
  Place IdOf(const void* record) const;
  std::string BytesOf(const void* record, const MemberNumbers& members) const;
  Slices Split(std::string_view row) const;
  static std::string KeyIn(const Index& index, const Slices& slices);

  const RecordType type_;
  MemberNumbers all_;
  const Member* id_ = nullptr;
  const Index* key_ = nullptr;
  std::unordered_map<Place, Row> rows_;
  Place last_ = 0;
  std::vector<std::unique_ptr<Index>> indexes_;
  std::unordered_map<const void*, Index*> byLookup_;
};

}  // namespace partnerkit::hosting

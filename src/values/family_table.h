// A family's table of rows, and a class's own as it departs from it: rows removed, replaced and added by name, all
// while compiling. A departure that doesn't fit the family's table (a row that isn't there, one that is there already)
// does not compile.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <initializer_list>
#include <span>

namespace partnerkit {

// What tells the rows of a table apart: a row's `Key()`, or a plain row itself.
template <class Row>
constexpr auto KeyOf(const Row& row) {
  if constexpr (requires { row.Key(); }) return row.Key();
  else return row;
}

// Held by value: spans of it last as long as it does. `kMost` is the room for rows.
template <class Row, std::size_t kMost = 24>
class FamilyTable {
 public:
  using value_type = Row;
  using const_iterator = const Row*;

  constexpr FamilyTable() = default;
  consteval FamilyTable(std::initializer_list<Row> rows) {
    for (const Row& row : rows) Insert(count_, row);
  }

  // Without the rows of these keys.
  template <class... Keys>
  consteval FamilyTable Without(const Keys&... keys) const {
    FamilyTable table = *this;
    (table.Erase(keys), ...);
    return table;
  }

  // With rows added at the end, in their order.
  template <class... Rows>
  consteval FamilyTable With(const Rows&... rows) const {
    FamilyTable table = *this;
    (table.Insert(table.count_, rows), ...);
    return table;
  }

  // With rows added right before the one of that key, in their order.
  template <class Key, class... Rows>
  consteval FamilyTable Before(const Key& key, const Rows&... rows) const {
    FamilyTable table = *this;
    (table.Insert(table.Need(key), rows), ...);
    return table;
  }

  // With each row in the place of the one with its key.
  template <class... Rows>
  consteval FamilyTable Replacing(const Rows&... rows) const {
    FamilyTable table = *this;
    ((table.rows_[table.Need(KeyOf(Row(rows)))] = rows), ...);
    return table;
  }

  constexpr const Row* begin() const { return rows_.data(); }
  constexpr const Row* end() const { return rows_.data() + count_; }
  constexpr std::size_t size() const { return count_; }
  constexpr bool empty() const { return count_ == 0; }
  constexpr operator std::span<const Row>() const { return {begin(), end()}; }

  // Null when there is none of that key.
  template <class Key>
  constexpr const Row* Find(const Key& key) const {
    const Row* const found = std::find_if(begin(), end(), [&](const Row& row) { return KeyOf(row) == key; });
    return found == end() ? nullptr : found;
  }

 private:
  template <class Key>
  constexpr std::size_t Need(const Key& key) const {
    const Row* const row = Find(key);
    if (row == nullptr) throw "the family's table has no row of this key";
    return static_cast<std::size_t>(row - begin());
  }

  constexpr void Insert(std::size_t at, const Row& row) {
    if (Find(KeyOf(row)) != nullptr) throw "the table has a row of this key already";
    if (count_ == kMost) throw "the table has no room for another row";
    for (std::size_t n = count_; n > at; --n) rows_[n] = rows_[n - 1];
    rows_[at] = row;
    ++count_;
  }

  template <class Key>
  constexpr void Erase(const Key& key) {
    for (std::size_t n = Need(key) + 1; n < count_; ++n) rows_[n - 1] = rows_[n];
    rows_[--count_] = Row{};
  }

  std::array<Row, kMost> rows_{};
  std::size_t count_ = 0;
};

}  // namespace partnerkit

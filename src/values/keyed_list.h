// Records in the order added, each found again by its key.
#pragma once

#include <cstddef>
#include <functional>
#include <iterator>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "partnerkit/run_time_error.h"

namespace partnerkit {

// A list of shared records. Finding, adding and removing by key take constant time.
//
// Items may be removed and added while the list is walked; the walk reaches what was added. `Item` by position is for
// the time before or after a walk: it may close the gaps that removals left, and so move what the walk has yet to
// reach. The reference that `Item` or `Find` gives holds until the list is next changed.
template <class R>
class KeyedList {
  struct Slot;

 public:
  using Pointer = std::shared_ptr<R>;

  class Iterator {
   public:
    using value_type = Pointer;
    using difference_type = std::ptrdiff_t;

    // By value: the item outlives its removal in the body of the walk.
    Pointer operator*() const { return (*slots_)[at_].item; }
    Iterator& operator++() {
      ++at_;
      SkipGaps();
      return *this;
    }
    void operator++(int) { ++*this; }
    friend bool operator==(const Iterator& it, std::default_sentinel_t) { return it.at_ >= it.slots_->size(); }

   private:
    friend class KeyedList;
    explicit Iterator(const std::vector<Slot>& slots) : slots_(&slots) { SkipGaps(); }
    void SkipGaps() {
      while (at_ < slots_->size() && (*slots_)[at_].entry == nullptr) ++at_;
    }

    const std::vector<Slot>* slots_;
    std::size_t at_ = 0;
  };

  KeyedList() = default;
  KeyedList(KeyedList&&) noexcept = default;
  KeyedList& operator=(KeyedList&&) noexcept = default;

  // Stores the item under the text "ID=" + key. A key that is in the list already raises RunTimeError 457, and the list
  // stays as it was.
  void Add(Pointer item, std::string_view key) {
    slots_.emplace_back();
    const auto [entry, added] = index_.try_emplace(std::string(key), slots_.size() - 1);
    if (!added) {
      slots_.pop_back();
      throw RunTimeError(run_time::kKeyInUse, "This key is already associated with an element of this collection");
    }
    slots_.back() = {std::move(item), &*entry};
  }

  // The item at a position from 1; nothing beyond the ends. Constant time, but for the first call after a removal.
  const Pointer& Item(std::size_t position) const {
    if (slots_.size() != index_.size()) CloseGaps();
    return position - 1 < slots_.size() ? slots_[position - 1].item : kNothing;
  }
  // The item under a whole keyed text, "ID=" + key; nothing when absent.
  const Pointer& Item(std::string_view keyedText) const {
    return keyedText.starts_with(kPrefix) ? Find(keyedText.substr(kPrefix.size())) : kNothing;
  }
  // The same by the key alone.
  const Pointer& Find(std::string_view key) const {
    const auto entry = index_.find(key);
    return entry == index_.end() ? kNothing : slots_[entry->second].item;
  }

  std::size_t Count() const { return index_.size(); }

  // Takes the item under the key out; the others keep their order. False when there is none.
  bool Remove(std::string_view key) {
    const auto entry = index_.find(key);
    if (entry == index_.end()) return false;
    slots_[entry->second] = {};
    index_.erase(entry);
    return true;
  }

  Iterator begin() const { return Iterator(slots_); }
  std::default_sentinel_t end() const { return {}; }

 private:
  struct Hash {
    using is_transparent = void;
    std::size_t operator()(std::string_view key) const { return std::hash<std::string_view>()(key); }
  };
  using Index = std::unordered_map<std::string, std::size_t, Hash, std::equal_to<>>;
  struct Slot {
    Pointer item;
    typename Index::value_type* entry = nullptr;  // null in a gap
  };

  void CloseGaps() const {
    std::erase_if(slots_, [](const Slot& slot) { return slot.entry == nullptr; });
    for (std::size_t at = 0; at < slots_.size(); ++at) slots_[at].entry->second = at;
  }

  static constexpr std::string_view kPrefix = "ID=";
  static inline const Pointer kNothing;

  mutable std::vector<Slot> slots_;
  Index index_;
};

struct ASN;
struct Order;
struct OrderLine;
struct OrderLocn;
struct OrderLocnLine;
struct Pack;
struct PackLine;
struct ProductInner;

using ASNList = KeyedList<ASN>;
using OrderList = KeyedList<Order>;
using OrderLineList = KeyedList<OrderLine>;
using OrderLocnList = KeyedList<OrderLocn>;
using OrderLocnLineList = KeyedList<OrderLocnLine>;
using PackItemList = KeyedList<PackLine>;
using PackList = KeyedList<Pack>;
using ProductInnerList = KeyedList<ProductInner>;

}  // namespace partnerkit

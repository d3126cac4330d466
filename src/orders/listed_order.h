// The rows of an inbound order file between `Load` and `Term`: what was listed, and what is dealt with.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>

#include "partnerkit/records.h"
#include "partnerkit/values.h"

namespace partnerkit::orders {

// One transaction of the file, before it is an order. Small on purpose: a file may list hundreds of thousands.
struct ListedOrder {
  std::string PONo;
  std::string InterchangeCtl;
  std::string GroupCtl;
  std::string TransactionCtl;
  std::optional<DateTime> PODate;
  std::int64_t FilePos = 0;  // of the first line, from 1
  std::int64_t line = 0;     // number of that line, from 1; 0 in files that aren't read by lines
  std::string fault;         // why the transaction cannot be read; empty when it can
  std::int32_t OrderId = 0;  // of the stored order; 0 when it isn't stored or was turned away
  bool waits = false;        // for an earlier order of its number, which it cancels or changes
  bool done = false;         // nothing is left to do about it: its transaction leaves the file

  // The control numbers joined, as transactions are told apart.
  std::string Controls() const { return InterchangeCtl + GroupCtl + TransactionCtl; }
};

// The same of a stored order.
inline std::string ControlsOf(const Order& order) {
  return std::string(Str(order.InterchangeCtl)).append(Str(order.GroupCtl)).append(Str(order.TransactionCtl));
}

struct TextHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view text) const { return std::hash<std::string_view>{}(text); }
};

// The orders that need no further work, posted or turned away for good, by the key that their lines are known by.
class ProcessedOrders {
 public:
  // Of two orders with one key, a posted one stands: its lines belong into the backup, and a second look at the same
  // number doesn't change that.
  void Add(std::string_view key, std::int32_t orderId) {
    std::int32_t& id = orders_.try_emplace(std::string(key), 0).first->second;
    if (orderId > 0) id = orderId;
  }
  // The order stored under the key is there no longer: its lines stay in the file unless they are dealt with anew.
  void Forget(std::string_view key) {
    if (const auto found = orders_.find(key); found != orders_.end()) orders_.erase(found);
  }
  // The order's id, 0 when it was turned away, nothing when it isn't dealt with.
  std::optional<std::int32_t> Find(std::string_view key) const {
    const auto found = orders_.find(key);
    return found == orders_.end() ? std::nullopt : std::optional(found->second);
  }
  bool Empty() const { return orders_.empty(); }
  void Clear() { orders_.clear(); }

 private:
  std::unordered_map<std::string, std::int32_t, TextHash, std::equal_to<>> orders_;
};

}  // namespace partnerkit::orders

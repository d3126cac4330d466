// What becomes of an order that is already stored under the number of the one in hand: a table of rules, the first
// fitting one decides.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

#include "orders/order_messages.h"

namespace partnerkit::orders {

enum class Jobs {
  kAny,
  kNone,  // packing hasn't begun
  kSome,  // packing jobs were made from the stored order
};

enum class Fate {
  kReplace,   // the stored order is deleted and the new one posted
  kCancel,    // the stored order is deleted and the new one done with
  kTurnAway,  // the stored order stands and the new one is done with
};

struct StoredOrderRule {
  std::string_view purpose = {};  // the purpose codes that fit, a blank between them; empty: any
  Jobs jobs = Jobs::kAny;
  bool incomplete = false;  // fits only an order that an earlier run left at Status 9
  std::int32_t number = 0;  // of the log record
  Words message = {};
  Fate fate = Fate::kTurnAway;
};

// What the rules look at.
struct StoredOrderFacts {
  std::string_view purpose;
  bool hasJobs = false;
  bool incomplete = false;
};

// The first rule that fits; nothing when none does.
const StoredOrderRule* FirstFitting(std::span<const StoredOrderRule> rules, const StoredOrderFacts& facts);

// Whether `code` is one of the blank-separated `codes`.
bool IsOneOf(std::string_view code, std::string_view codes);

}  // namespace partnerkit::orders

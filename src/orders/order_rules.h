// What becomes of an order, told by a table of rules of which the first fitting one decides: one table for an order
// whose number is already stored, one for a number that isn't, or no longer.
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

enum class Version {
  kAny,
  kNone,  // the order carries no version number
  kGiven,
};

enum class Fate {
  kTurnAway,     // the order is done with and leaves the file
  kLeaveInFile,  // the call ends, the order stays in the file
  kReplace,      // the new order is posted, and only when it has passed all checks the stored one deleted for it; a
                 // refused deletion leaves the order in the file
  kCancel,  // the stored order is deleted, if the host agrees, and the new one leaves the file; of a new order: one
            // that was to be replaced by it is deleted
  kCancelIfDeleted,  // the same, but a refused deletion leaves the order in the file
  kCancelInFile,     // the stored order is deleted, if the host agrees, and the new one stays in the file
  kCancelThenSay,    // the stored order is deleted, and only then the message noted; the call gives the order's id, and
                     // the new one stays in the file. After a refused deletion it leaves the file.
  kChangeStored,     // the stored order is changed as the importer knows how
  kGoOn,             // of a new order: it is posted, unless a later rule has it otherwise
};

// Every condition left at its default fits anything.
struct OrderRule {
  std::string_view purpose = {};     // purpose codes that fit, a blank between them
  std::string_view type = {};        // order types, likewise
  std::string_view otherType = {};   // fits every type but this one
  std::string_view storedType = {};  // type of the stored order
  std::string_view storedChangeFlag = {};
  std::string_view response = {};  // response type
  Version version = Version::kAny;
  Jobs jobs = Jobs::kAny;
  bool incomplete = false;     // only an order that an earlier run left at Status 9
  bool directToStore = false;  // only an order whose ship-to is its buying location

  std::int32_t number = 0;  // of the log record
  Words message = {};
  Words refused = {};       // noted when the host refuses the deletion
  bool fileNumber = false;  // the message shows the number as the file has it, without what the order key adds
  Fate fate = Fate::kTurnAway;
};

// What the rules look at.
struct OrderFacts {
  std::string_view purpose;
  std::string_view type;
  std::string_view response;
  std::string_view version;
  bool directToStore = false;
  std::string_view storedType;
  std::string_view storedChangeFlag;
  std::string_view fileNumber;  // the order number as the file has it
  bool hasJobs = false;
  bool incomplete = false;
};

// The first rule that fits; nothing when none does.
const OrderRule* FirstFitting(std::span<const OrderRule> rules, const OrderFacts& facts);

// Whether `code` is one of the blank-separated `codes`.
bool IsOneOf(std::string_view code, std::string_view codes);

}  // namespace partnerkit::orders

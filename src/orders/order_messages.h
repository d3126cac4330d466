// The words of the order import, one place for every syntax and partner.
#pragma once

#include <string>
#include <string_view>

namespace partnerkit::orders {

// Two texts round an order number.
struct Words {
  std::string_view before = {};
  std::string_view after = ".";

  bool Empty() const { return before.empty(); }
  std::string With(std::string_view PONo) const { return std::string(before).append(PONo).append(after); }
};

namespace words {

// An order is already stored under the number.
inline constexpr Words kAlreadyExists{"Cannot process. PO ", " already exists."};
inline constexpr Words kDuplicateProcessed{"Duplicate PO ", " processed."};
inline constexpr Words kDuplicate{"... Warning Duplicate PO "};
inline constexpr Words kChange{"... Warning Purchase Order Change Request "};
inline constexpr Words kChangeProcessed{"... Warning Purchase Order Change Request ", "processed."};
inline constexpr Words kChangeShort{"... Warning Purchase Order Change "};
inline constexpr Words kChangePacking{"... Warning Purchase Order Change Request. Packing in Process. "};
inline constexpr Words kChangeAllocated{"Cannot process change. Job for PO ", " already allocated."};
inline constexpr Words kCancelBalance{"... Warning Purchase Order Change Request Cancel Balance Of "};
inline constexpr Words kCancelBalancePacking{
    "... Warning Purchase Order Change Request Cancel Balance. Packing in Process. "};
inline constexpr Words kCancel{"... Warning Purchase Order Cancel Request "};
inline constexpr Words kCancelProcessed{"... Warning Purchase Order CANCEL Request ", " processed."};
inline constexpr Words kCancelFailed{"... Warning Purchase Order Cancel Request FAILED"};
inline constexpr Words kCancelRefused{"... Warning Purchase Order CANCEL Request FAILED "};
inline constexpr Words kCancelBegun{"... Cannot process Purchase Order Cancel Request ", " processing begun."};
inline constexpr Words kChangeBegun{"... Cannot process Purchase Order Change Request ", " processing begun."};
inline constexpr Words kChangeFailed{"... Warning Purchase Order Change Request FAILED"};
inline constexpr Words kCancelPacking{"... Warning Purchase Order Cancel Request. Packing in Process. "};
inline constexpr Words kCancelWithJob{"Cannot process CANCELLATION.  Job exists already exists for PO "};
inline constexpr Words kResponseDeleted{"... Warning Purchase Order Response. ", " deleted."};
inline constexpr Words kIncomplete{"... Warning incomplete/scrapped PO "};
// None is stored.
inline constexpr Words kCancelOfNothing{"Cannot process CANCELLATION. Original PO ", " doesn't exists."};
inline constexpr Words kCancelOfNone{"Cannot process. Original PO ", " doesn't exist."};
inline constexpr Words kChangeCancelsNothing{"Cannot process POC Cancellation - PO ", ""};
inline constexpr Words kRejectionOfNothing{"Cannot process. Original PO ", " for rejection doesn't exists."};
inline constexpr Words kOrderCancelled{"... Warning Purchase Order Change Request ", ". Order cancelled."};
// Kinds of order that are not taken.
inline constexpr Words kBlanketComma{"Cannot process Blanket Order, PO ", ""};
inline constexpr Words kBlanketDash{"Cannot process Blanket Order - PO ", ""};
inline constexpr Words kBlanketNoted{"Warning. Blanket Order, PO ", ""};
inline constexpr Words kBlanketNotedDash{"Warning Blanket Order - PO ", ""};
inline constexpr Words kDirectToStore{"Cannot process DTS Order - PO ", ""};
inline constexpr Words kNoPallet{"... Cannot process order ", ", PALLET Package Type not found."};

// Outcome of a posting.
inline constexpr Words kImportIncomplete{"PO ", " import incomplete."};
inline constexpr Words kImportCompleted{"PO ", " import completed."};
inline constexpr Words kExportFailed{"PO ", " error exporting file."};
inline constexpr Words kImportWithErrors{"PO ", " import completed with errors. Data maintenance or POA required."};

}  // namespace words

}  // namespace partnerkit::orders

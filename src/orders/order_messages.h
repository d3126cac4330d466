// The words of the order import, one place for every syntax and partner.
#pragma once

#include <string>
#include <string_view>

namespace partnerkit::orders {

// Two texts round an order number.
struct Words {
  std::string_view before;
  std::string_view after = ".";

  std::string With(std::string_view PONo) const { return std::string(before).append(PONo).append(after); }
};

namespace words {

// An order already stored under the number.
inline constexpr Words kAlreadyExists{"Cannot process. PO ", " already exists."};
inline constexpr Words kDuplicate{"... Warning Duplicate PO "};
inline constexpr Words kChange{"... Warning Purchase Order Change Request "};
inline constexpr Words kCancel{"... Warning Purchase Order Cancel Request "};
inline constexpr Words kCancelWithJob{"Cannot process CANCELLATION.  Job exists already exists for PO "};
inline constexpr Words kIncomplete{"... Warning incomplete/scrapped PO "};
// None is stored.
inline constexpr Words kCancelOfNothing{"Cannot process CANCELLATION. Original PO ", " doesn't exists."};

// Outcome of a posting.
inline constexpr Words kImportIncomplete{"PO ", " import incomplete."};
inline constexpr Words kImportCompleted{"PO ", " import completed."};

}  // namespace words

}  // namespace partnerkit::orders

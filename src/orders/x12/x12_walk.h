// Where a segment stands among the interchanges, groups and transactions of an inbound file. Listing and rewriting walk
// a file alike, so that what was passed over when the file was listed is known when it is rewritten.
#pragma once

#include <string>
#include <string_view>

#include "orders/x12/x12_order_values.h"
#include "orders/x12/x12_segment.h"

namespace partnerkit::orders {

class X12Walk {
 public:
  enum class Place {
    kOutside,      // of every interchange
    kForeign,      // an interchange of another trading pair, up to the next ISA
    kInterchange,  // ours, outside the groups
    kOtherGroup,   // a group of ours that holds no orders
    kOrders,       // a group of orders
  };

  enum class Event {
    kNone,
    kGroupBegins,        // an orders group
    kGroupEnds,          // at its GE, or at the ISA of an interchange that begins although this one hasn't ended
    kTransactionBegins,  // an ST of the wanted set
    kOrderBegins,        // the first beginning segment behind it
  };

  // The texts must outlive the walk.
  X12Walk(const X12OrderValues& values, std::string_view partnerAddress, std::string_view companyAddress)
      : values_(values), partnerAddress_(partnerAddress), companyAddress_(companyAddress) {}

  // Takes the next segment of the file.
  Event Take(const X12Segment& segment);

  // Of the segment taken last; the envelope's segments stand in what they open and close.
  Place At() const { return at_; }
  // The segment opens an interchange of ours.
  bool OpensInterchange() const { return opensInterchange_; }
  // The file ends here: whether an orders group was left open.
  bool InOrders() const { return next_ == Place::kOrders; }
  // The same of an interchange of ours.
  bool InInterchange() const { return next_ != Place::kOutside && next_ != Place::kForeign; }

 private:
  bool IsOurs(const X12Segment& isa) const;
  bool SameAddress(const X12Segment& isa, int element, std::string_view address) const;
  Event Enter(const X12Segment& isa);
  Event TakeInOrders(const X12Segment& segment);

  const X12OrderValues& values_;
  std::string_view partnerAddress_;
  std::string_view companyAddress_;
  Place at_ = Place::kOutside;
  Place next_ = Place::kOutside;  // of the next segment, as far as this one tells
  bool opensInterchange_ = false;
  bool awaitsBeginning_ = false;
};

}  // namespace partnerkit::orders

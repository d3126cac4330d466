#include "orders/x12/x12_walk.h"

#include <cstdint>
#include <limits>

#include "values/delimited.h"

namespace partnerkit::orders {

X12Walk::Event X12Walk::Take(const X12Segment& segment) {
  at_ = next_;
  opensInterchange_ = false;
  // An interchange may be cut short, and another follow it: what follows must not pass for a part of the first.
  if (segment.Begins("ISA")) return Enter(segment);
  switch (at_) {
    case Place::kOutside:
    case Place::kForeign:
      return Event::kNone;
    case Place::kOtherGroup:
      if (segment.Begins("GE")) next_ = Place::kInterchange;
      [[fallthrough]];
    case Place::kInterchange:
      if (segment.Begins("IEA")) {
        at_ = Place::kInterchange;
        next_ = Place::kOutside;
      } else if (segment.Begins("GS")) {
        at_ = next_ = IsOneOf(segment.Fixed(4, 2), values_.groups) ? Place::kOrders : Place::kOtherGroup;
      }
      return at_ == Place::kOrders ? Event::kGroupBegins : Event::kNone;
    case Place::kOrders:
      return TakeInOrders(segment);
  }
  return Event::kNone;
}

X12Walk::Event X12Walk::Enter(const X12Segment& isa) {
  const bool cutsGroup = at_ == Place::kOrders;
  opensInterchange_ = IsOurs(isa);
  at_ = next_ = opensInterchange_ ? Place::kInterchange : Place::kForeign;
  awaitsBeginning_ = false;
  return cutsGroup ? Event::kGroupEnds : Event::kNone;
}

X12Walk::Event X12Walk::TakeInOrders(const X12Segment& segment) {
  if (segment.Begins("GE")) {
    next_ = Place::kInterchange;
    awaitsBeginning_ = false;
    return Event::kGroupEnds;
  }
  if (segment.Begins("ST") && IsOneOf(segment.Fixed(4, 3), values_.sets)) {
    awaitsBeginning_ = true;
    return Event::kTransactionBegins;
  }
  // A beginning behind it is no part of the transaction before it.
  if (segment.Begins("ST*")) awaitsBeginning_ = false;
  if (!awaitsBeginning_ || !IsOneOf(segment.Text().substr(0, 3), values_.beginnings)) return Event::kNone;
  awaitsBeginning_ = false;
  return Event::kOrderBegins;
}

bool X12Walk::IsOurs(const X12Segment& isa) const {
  // Beyond that its elements have no positions, and it is rubbish.
  if (isa.Length() > std::numeric_limits<std::int16_t>::max() || isa.SplatCount() < 8) return false;
  return SameAddress(isa, 6, partnerAddress_) && SameAddress(isa, 8, companyAddress_);
}

bool X12Walk::SameAddress(const X12Segment& isa, int element, std::string_view address) const {
  if (!values_.addressesOf13) return TrimBlanks(isa.Inner(element)) == address;
  return isa.Fixed(static_cast<std::size_t>(isa.PosBegSplat(element)), 13) == address;
}

}  // namespace partnerkit::orders

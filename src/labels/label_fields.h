// Reads a pack and all that hangs from it, and fills the values of its label. No layout reads the records again.
#pragma once

#include <cstddef>
#include <string_view>

#include "frame/hosted_class.h"
#include "labels/label_values.h"

namespace partnerkit::labels {

// How many characters of a text go on the label.
struct FieldCuts {
  std::size_t FromSuburb = 15;
  std::size_t CarrierName = 15;
  std::size_t ConNoteNo = 15;
  std::size_t BillOfLadingNo = 11;
  std::size_t ToName = 10;
  std::size_t ForName = 12;  // of a store
  std::size_t ForLocnName = 20;
  std::size_t ForAddress = 22;
  std::size_t ForSuburb = 18;
};

// Null members, and records that aren't there, give empty texts; a location that isn't there still gives the number
// that it was looked for by. What the host has set (free lines, zone, component) stays, cut to its length. A failure
// ends the filling; what was not filled by then is empty, never another carton's.
void FillValues(HostedClass& label, const Pack& pack, const FieldCuts& cuts, LabelValues& values);

// The first n characters.
inline std::string_view Cut(std::string_view text, std::size_t n) { return text.substr(0, n); }

}  // namespace partnerkit::labels

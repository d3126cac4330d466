// Functional acknowledgements: telling the sender that what he sent arrived. Written while a file is listed, before
// anything of it is posted, and never withdrawn.
#pragma once

#include <string_view>

#include "edi/envelopes.h"
#include "frame/translator_base.h"

namespace partnerkit::orders {

// Writes a 997 that accepts a whole group, as an interchange of its own behind what the file
// AckFolder + prefix + reference + "_" + yymmddhhmm + ".TXT" holds: "FA_PO_4711_0603081015.TXT". True with an empty
// `EDIDoc.AckFolder` too: that partner wants no acknowledgement, and nothing is written, no number drawn.
//
// `acknowledged` is the group's kind, "PO" or "RA"; `reference` its GS06, `transactions` the sets counted in it.
// False when the file cannot be opened, which is logged, or when the acknowledgement was not written in full: then
// nothing of it stays in the file, but the control numbers that were drawn are spent.
bool WriteFunctionalAck(TranslatorBase& translator, const X12Envelope& row, std::string_view acknowledged,
                        std::string_view prefix, std::string_view reference, int transactions);

}  // namespace partnerkit::orders

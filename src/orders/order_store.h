// Storing a checked order: the one place where an import writes orders, whatever the syntax.
#pragma once

#include <optional>
#include <string_view>

#include "frame/translator_base.h"
#include "orders/order_draft.h"

namespace partnerkit::orders {

inline constexpr std::int32_t kBeingStored = 9;  // Order.Status of an order that isn't complete

// Stores the four kinds of record in their order, the header at Status 9, so that a store that fails half way leaves an
// order that the next run recognises and replaces. False when a record was refused: the failure is noted, the header's
// `OrderId` is 0, and what was stored stays. `lineSequence` is what the messages call the line: the sequence of the
// line last read, or each record's own when it is left out.
bool StoreDraft(TranslatorBase& translator, CallLog& log, OrderDraft& draft,
                std::optional<std::string_view> lineSequence = {});

// Makes the stored order durable, marked complete unless its faults are still to be settled, and the note that its file
// still holds it. False, with the failure reported, when it could not be.
bool MakeDurable(TranslatorBase& translator, OrderDraft& draft, bool complete, UnsettledOrder& note);

}  // namespace partnerkit::orders

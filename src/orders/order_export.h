// Handing a posted order on to a component that the document definition names.
#pragma once

#include "frame/translator_base.h"

namespace partnerkit::orders {

// Runs the component named in the options as XOLE="ProgID", when a document definition of the same partner and supplier
// has that ProgID and the class can be created. Only a component that says no leaves a word on the log.
void ExportOrder(TranslatorBase& translator, CallLog& log, const Order& order);

}  // namespace partnerkit::orders

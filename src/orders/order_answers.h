// What the importers ask of the host's other records.
#pragma once

#include <string>

#include "frame/translator_base.h"

namespace partnerkit::orders {

// How a document code is compared.
enum class CodeForm {
  kPartlyAnyCase,  // "POA" and "SO" in either case
  kTrimmedAnyCase,
};

// Whether a document definition of the same partner and supplier answers orders by acknowledgement ("855", "ORDRSP",
// "POA", "SO"), so that an order may be stored with its faults.
bool HasOrderAcknowledgement(TranslatorBase& translator, CodeForm form = CodeForm::kPartlyAnyCase);

// Whether the product is packed by that quantity, as an inner or as a prepack.
bool IsPackedBy(TranslatorBase& translator, const std::string& productNo, double quantity);

}  // namespace partnerkit::orders

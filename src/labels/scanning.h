// What the packers' hand terminals need of the partner's packing rules.
#pragma once

#include <string>

#include "frame/hosted_class.h"
#include "partnerkit/label.h"

namespace partnerkit::labels {

inline constexpr std::string_view kPDTFieldLength = "7,6,10,22,20,13,20,13,20,20,10,6,6,1,16,6";

// Empty for a model that has no record.
std::string LookupLine(HostedClass& label, const std::string& model, const Job& job, const PSlipLine& line);

LabelClass::LineFound CheckScan(HostedClass& label, LabelClass::PSlipArgument slip, LabelClass::PackArgument pack,
                                std::string_view number, double quantity, std::int32_t lineId);

}  // namespace partnerkit::labels

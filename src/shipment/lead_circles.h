// Packs that lead each other, or themselves: sub packs all of them, and of no pack that is ever compiled.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/records.h"
#include "partnerkit/store.h"

namespace partnerkit::shipment {

// Each the lead of the one before it, and the first that of the last.
using LeadCircle = std::vector<std::shared_ptr<Pack>>;

// The circles among the packs below that status of a company, in the order of their lowest ids, that hold a pack on a
// shipment of an order of that partner. Packs are read one by one, those of the company below the status, and kept only
// when they are led. Raises RunTimeError.
std::vector<LeadCircle> LeadCircles(RecordStore& store, std::string_view vendorId, std::string_view partnerId,
                                    std::int32_t belowStatus);

// Names the packs and tells what to mend.
std::string Told(const LeadCircle& circle);

}  // namespace partnerkit::shipment

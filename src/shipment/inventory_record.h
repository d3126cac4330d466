// A line of the inventory file: what one pack line took from stock, for the supplier's own system.
#pragma once

#include <string>
#include <string_view>

#include "shipment/notice_records.h"

namespace partnerkit::shipment {

// Appends 22 fields and CR LF: texts in double quotes, numbers bare, nothing escaped. `orderNo` is the ninth.
void AppendInventoryRecord(NoticeRecords& records, std::string_view orderNo, std::string& text);

}  // namespace partnerkit::shipment

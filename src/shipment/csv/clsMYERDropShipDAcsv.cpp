// Despatch advices of Myer drop shipments: as the notices to the MGB stores.
#include "shipment/csv/csv_notice_classes.h"

namespace partnerkit::shipment {

namespace {

constexpr CsvNoticeValues kValues{.compile = {.className = "clsMYERDropShipDAcsv"}};

}  // namespace

clsMYERDropShipDAcsv::clsMYERDropShipDAcsv(const Ports& ports) : CsvNotice(kValues, ports) {}

}  // namespace partnerkit::shipment

// Despatch advices of Myer drop shipments: as the notices to the MGB stores.
#include "shipment/csv/csv_notice.h"

namespace partnerkit::shipment {

namespace {

constexpr CsvNoticeValues kValues{.compile = {.className = "clsMYERDropShipDAcsv"}};

}  // namespace

std::unique_ptr<Translator> MakeMYERDropShipDAcsv(const Ports& ports) {
  return std::make_unique<CsvNotice>(kValues, ports);
}

}  // namespace partnerkit::shipment

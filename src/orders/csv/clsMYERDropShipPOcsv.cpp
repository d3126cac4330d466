// Purchase orders of Myer for drop shipment.
#include "orders/csv/csv_classes.h"

namespace partnerkit::orders {

namespace {

constexpr CsvOrderValues kValues{
    .className = "clsMYERDropShipPOcsv",
    .importsProducts = true,
    .posting = {.directToStore = "DTS"},
    .deletesEnvelopes = true,
};

}  // namespace

clsMYERDropShipPOcsv::clsMYERDropShipPOcsv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

}  // namespace partnerkit::orders

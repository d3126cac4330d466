// Purchase orders of Myer for drop shipment.
#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

namespace {

constexpr CsvOrderValues kValues{
    .className = "clsMYERDropShipPOcsv",
    .importsProducts = true,
    .posting = {.directToStore = "DTS"},
    .deletesEnvelopes = true,
};

}  // namespace

std::unique_ptr<Translator> MakeMYERDropShipPOcsv(const Ports& ports) {
  return std::make_unique<CsvOrderImporter>(kValues, ports);
}

}  // namespace partnerkit::orders

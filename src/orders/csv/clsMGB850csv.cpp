// Purchase orders of the MGB stores.
#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

namespace {

constexpr CsvOrderValues kValues{
    .className = "clsMGB850csv",
    .importsProducts = true,
    .posting = {.advertisedDate = true, .directToStore = "DTS"},
    .deletesEnvelopes = true,
};

}  // namespace

std::unique_ptr<Translator> MakeMGB850csv(const Ports& ports) {
  return std::make_unique<CsvOrderImporter>(kValues, ports);
}

}  // namespace partnerkit::orders

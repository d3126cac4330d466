// Purchase orders of the MGB stores.
#include "orders/csv/csv_classes.h"

namespace partnerkit::orders {

namespace {

constexpr CsvOrderValues kValues{
    .className = "clsMGB850csv",
    .importsProducts = true,
    .posting = {.advertisedDate = true, .directToStore = "DTS"},
    .deletesEnvelopes = true,
};

}  // namespace

clsMGB850csv::clsMGB850csv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

}  // namespace partnerkit::orders

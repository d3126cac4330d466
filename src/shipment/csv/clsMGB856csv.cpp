// Ship notices to the MGB stores: the norm.
#include "shipment/csv/csv_notice_classes.h"

namespace partnerkit::shipment {

namespace {

constexpr CsvNoticeValues kValues{.compile = {.className = "clsMGB856csv"}};

}  // namespace

clsMGB856csv::clsMGB856csv(const Ports& ports) : CsvNotice(kValues, ports) {}

}  // namespace partnerkit::shipment

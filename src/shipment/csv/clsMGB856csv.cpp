// Ship notices to the MGB stores: the norm.
#include "shipment/csv/csv_notice.h"

namespace partnerkit::shipment {

namespace {

constexpr CsvNoticeValues kValues{.compile = {.className = "clsMGB856csv"}};

}  // namespace

std::unique_ptr<Translator> MakeMGB856csv(const Ports& ports) { return std::make_unique<CsvNotice>(kValues, ports); }

}  // namespace partnerkit::shipment

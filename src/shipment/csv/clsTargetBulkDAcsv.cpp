// Despatch advices of Target bulk orders.
#include "shipment/csv/csv_notice.h"
#include "shipment/csv/despatch_advice_fields.h"

namespace partnerkit::shipment {

namespace {

constexpr std::string_view kAdded[] = {"SCHEDULEDATE"};

constexpr NoticeField kOwn[] = {
    {"PALLETTYPECODE", Level::kPack, [](NoticeRecords&, std::string& v) { v = "09"; }},
    {"COST", Level::kLine, nullptr},
};

constexpr CsvNoticeValues kValues{
    .compile = {.className = "clsTargetBulkDAcsv", .byShipTo = true, .ordersLessLocation = true},
    .fields = kDespatchAdviceNames,
    .added = kAdded,
    .own = kOwn,
    .family = kDespatchAdviceFields,
    .lines = NoticeLines::kEach,
    .deliveryDocket = true,
};

}  // namespace

std::unique_ptr<Translator> MakeTargetBulkDAcsv(const Ports& ports) {
  return std::make_unique<CsvNotice>(kValues, ports);
}

}  // namespace partnerkit::shipment

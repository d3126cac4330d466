// Ship notices to Officeworks.
#include "shipment/csv/csv_notice.h"

namespace partnerkit::shipment {

namespace {

// clang-format off
constexpr std::string_view kFields[] = {
    "SUPPLIERNO", "CUSTOMERCODE", "SHIPNOTENO", "SHIPNOTEDATE", "SHIPNOTETIME", "SHIPNOTETYPECODE",
    "CONSIGNMENTNOTENO", "SCHEDULEDATE", "DELIVERYDATE", "DATESHIPPED", "SHIPTOCODE", "SHIPMENTVOLUME", "ORDERNO",
    "ORDERDATE", "PARTNERSUPPLIERNO", "ORDERSTATUSCODE", "POVERSIONNO", "BUYSTORECODE", "INVOICENO", "PACKERID",
    "PALLETNO", "PALLETMARKTYPE", "PALLETTYPECODE", "CONTAINERNO", "PACKMARKTYPE", "PACKTYPECODE", "PACKWEIGHT",
    "INHOUSEPRODNO", "APN", "QUANTITYSHIPPED", "COST", "LINEREF",
};

constexpr NoticeField kOwn[] = {
    {"SHIPNOTENO",       Level::kNotice, fill::AsnNo2},
    {"SHIPNOTETYPECODE", Level::kNotice, [](NoticeRecords&, std::string& v) { v = "9"; }},
    {"DELIVERYDATE",     Level::kNotice, fill::DeliveryDateLong},
    {"DATESHIPPED",      Level::kNotice, fill::ScheduleDateLong},
    {"ORDERNO",          Level::kNotice, fill::OrderNoLessRelease},
    {"ORDERDATE",        Level::kNotice, fill::OrderDateLong},
    {"ORDERSTATUSCODE",  Level::kNotice,
     [](NoticeRecords& r, std::string& v) { v = r.OrderComplete() ? "164" : "165"; }},
    {"POVERSIONNO",      Level::kNotice, fill::OrderHeader2},
    {"PALLETNO",         Level::kPack,   fill::PalletNo},
    {"PACKMARKTYPE",     Level::kPack,   [](NoticeRecords&, std::string& v) { v = "GM"; }},
    {"PACKTYPECODE",     Level::kPack,   fill::ShipPackCode},
};
// clang-format on

constexpr CsvNoticeValues kValues{
    .compile = {.className = "clsOfficeworks856csv", .byShipTo = true},
    .fields = kFields,
    .own = kOwn,
    .inventoryLessRelease = true,
};

}  // namespace

std::unique_ptr<Translator> MakeOfficeworks856csv(const Ports& ports) {
  return std::make_unique<CsvNotice>(kValues, ports);
}

}  // namespace partnerkit::shipment

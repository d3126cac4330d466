// Ship notices to Kmart.
#include "shipment/csv/csv_notice.h"

namespace partnerkit::shipment {

namespace {

// clang-format off
constexpr std::string_view kFields[] = {
    "SUPPLIERNO", "CUSTOMERCODE", "SHIPNOTENO", "SHIPNOTEDATE", "SHIPNOTETIME", "SHIPNOTETYPECODE",
    "CONSIGNMENTNOTENO", "SHIPMENTWEIGHT", "SCHEDULEDATE", "DELIVERYDATE", "SHIPTOCODE", "SHIPMENTVOLUME", "ORDERNO",
    "ORDERDATE", "ORDERSTATUSCODE", "POVERSIONNO", "BUYSTORECODE", "INVOICENO", "PACKERID", "PALLETNO",
    "PALLETMARKTYPE", "PALLETTYPECODE", "CONTAINERNO", "PACKMARKTYPE", "PACKAGETYPECODE", "PACKWEIGHT",
    "INHOUSEPRODNO", "APN", "QUANTITYSHIPPED", "COST", "LINEREF",
};

void OrderNo(NoticeRecords& records, std::string& value) {
  if (Str(records.Order().TypeCode) != "AP") return fill::OrderNoLessRelease(records, value);
  value = records.Order().PONo + records.Pack().ShipToCode;
}

void OrderStatus(NoticeRecords& records, std::string& value) {
  value = !records.Shipment().Complete ? "SS" : records.OrderComplete() ? "CC" : "PR";
}

constexpr NoticeField kOwn[] = {
    {"SHIPNOTENO",      Level::kNotice, fill::AsnNo2},
    {"ORDERNO",         Level::kPack,   OrderNo},
    {"ORDERSTATUSCODE", Level::kNotice, OrderStatus},
    {"POVERSIONNO",     Level::kNotice, fill::OrderHeader2},
    {"INVOICENO",       Level::kNotice, fill::FirstInvoiceNo},
    {"PALLETNO",        Level::kPack,   fill::PalletNo},
    {"PACKMARKTYPE",    Level::kPack,   [](NoticeRecords&, std::string& v) { v = "GM"; }},
    {"PACKAGETYPECODE", Level::kPack,   fill::ShipPackCode},
};
// clang-format on

constexpr CsvNoticeValues kValues{
    .compile = {.className = "clsKMart856csv", .byShipTo = true},
    .fields = kFields,
    .own = kOwn,
    .mostPacks = 9999,
    .inventoryLessRelease = true,
};

}  // namespace

std::unique_ptr<Translator> MakeKMart856csv(const Ports& ports) { return std::make_unique<CsvNotice>(kValues, ports); }

}  // namespace partnerkit::shipment

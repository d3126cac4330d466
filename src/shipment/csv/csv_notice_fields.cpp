#include "shipment/csv/csv_notice_fields.h"

#include "shipment/compile_frame.h"
#include "values/delimited.h"
#include "values/format.h"
#include "values/numbers.h"

namespace partnerkit::shipment {

namespace {

using Records = NoticeRecords;

constexpr std::string_view kShortDate = "yymmdd", kLongDate = "yyyymmdd";
constexpr std::string_view kWeight = "####0.0#";

std::string Measure(double length) { return length == 0 ? "1" : NumberText(length); }

void OrderStatus(Records& records, std::string& value) {
  value = records.OrderComplete() && !records.OrderOpenOnShipment() ? "CC" : "PR";
}

void ProductNo(Records& records, std::string& value) {
  // A line whose product isn't there shows the one before it.
  if (const Product* product = records.LineProduct()) value = Str(product->InHouseProdNo);
}

void LineRef(Records& records, std::string& value) {
  value = Str(records.SlipLine().LineRef);
  if (value.empty()) value = Str(records.LocnLine().LineRef);
}

void Length(Records& records, std::string& value) {
  value = Measure(records.Type() != nullptr ? records.Type()->Length : 0);
}
void Width(Records& records, std::string& value) {
  value = Measure(records.Type() != nullptr ? records.Type()->Width : 0);
}
void Height(Records& records, std::string& value) {
  value = Measure(records.Type() != nullptr ? records.Type()->Height : 0);
}

// clang-format off
constexpr NoticeField kUsual[] = {
    {"SUPPLIERNO",        Level::kNotice, [](Records& r, std::string& v) { v = r.Document().CompanyEDIAddr; }},
    {"CUSTOMERCODE",      Level::kNotice, [](Records& r, std::string& v) { v = r.Document().PartnerEDIAddr; }},
    {"SHIPNOTENO",        Level::kNotice, [](Records& r, std::string& v) { v = Str(r.Asn().ASNNo); }},
    {"SHIPNOTEDATE",      Level::kNotice,
     [](Records& r, std::string& v) { v = Format(r.Asn().CompileDate, kShortDate); }},
    {"SHIPNOTETIME",      Level::kNotice, [](Records& r, std::string& v) { v = Format(r.Asn().CompileDate, "hhmm"); }},
    {"SHIPNOTETYPECODE",  Level::kNotice, [](Records&, std::string& v) { v = "00"; }},
    {"SHIPNOTESTATUS",    Level::kNotice, OrderStatus},
    {"COMPANYCODE",       Level::kNotice, [](Records& r, std::string& v) { v = Str(r.Order().CompanyCode); }},
    {"PARTNERSUPPLIERNO", Level::kNotice, [](Records& r, std::string& v) { v = Str(r.Order().PartnerSupplierNo); }},
    {"CONSIGNMENTNOTENO", Level::kNotice, [](Records& r, std::string& v) { v = Str(r.Shipment().ConNoteNo); }},
    {"BOOKINGNO",         Level::kNotice, [](Records& r, std::string& v) { v = Str(r.Shipment().BookingNo); }},
    {"SCHEDULEDATE",      Level::kNotice, fill::ScheduleDate},
    {"DELIVERYDATE",      Level::kNotice,
     [](Records& r, std::string& v) { v = Format(r.Shipment().DeliveryDate, kShortDate); }},
    {"SHIPTOCODE",        Level::kPack,   [](Records& r, std::string& v) { v = r.Pack().ShipToCode; }},
    {"SHIPPACKCODE",      Level::kPack,   fill::ShipPackCode},
    {"SHIPMENTWEIGHT",    Level::kNotice, [](Records& r, std::string& v) { v = Format(r.Shipment().Weight, kWeight); }},
    {"SHIPMENTVOLUME",    Level::kNotice,
     [](Records& r, std::string& v) { v = r.Shipment().Volume ? NumberText(*r.Shipment().Volume) : ""; }},
    {"ORDERNO",           Level::kNotice, [](Records& r, std::string& v) { v = r.Order().PONo; }},
    {"ORDERDATE",         Level::kNotice, [](Records& r, std::string& v) { v = Format(r.Order().PODate, kShortDate); }},
    {"PACKERID",          Level::kPack,   [](Records& r, std::string& v) { v = Str(r.PackJob().PackerId); }},
    {"ORDERSTATUSCODE",   Level::kPack,   nullptr},
    {"BUYSTORECODE",      Level::kPack,   [](Records& r, std::string& v) { v = r.Pack().BuyStoreCode; }},
    {"DELREFERENCE",      Level::kPack,   [](Records& r, std::string& v) { v = Str(r.Pack().InvoiceNo); }},
    {"ORDERPACKCODE",     Level::kPack,   nullptr},
    {"INVOICENO",         Level::kPack,   [](Records& r, std::string& v) { v = Str(r.Pack().InvoiceNo); }},
    {"CONTAINERNO",       Level::kPack,   [](Records& r, std::string& v) { v = Str(r.Pack().SSCC); }},
    {"PACKAGETYPECODE",   Level::kPack,   fill::PackageTypeCode},
    {"PACKWEIGHT",        Level::kPack,   fill::PackWeight},
    {"PACKLENGTH",        Level::kPack,   Length},
    {"PACKWIDTH",         Level::kPack,   Width},
    {"PACKHEIGHT",        Level::kPack,   Height},
    {"INHOUSEPRODNO",     Level::kLine,   ProductNo},
    {"APN",               Level::kLine,   [](Records& r, std::string& v) { v = r.Line().APN; }},
    {"INNERSPERPACK",     Level::kLine,   nullptr},
    {"UNITSPERPACK",      Level::kLine,   nullptr},
    {"QUANTITYSHIPPED",   Level::kLine,   fill::LineQuantity},
    {"COST",              Level::kLine,   [](Records& r, std::string& v) { v = NumberText(r.OrderedLine().Cost); }},
    {"LINEREF",           Level::kLine,   LineRef},
};
// clang-format on

}  // namespace

std::span<const NoticeField> UsualNoticeFields() { return kUsual; }

std::string_view LessRelease(std::string_view PONo) {
  const std::size_t release = PONo.find(" REL# ");
  return release == 0 ? PONo : PONo.substr(0, release);
}

namespace fill {

void AsnNo2(Records& records, std::string& value) {
  value = Str(records.Asn().ASNNo);
  if (value.size() < 2) value = Format(value, "00");
}

void CompileDateLong(Records& records, std::string& value) { value = Format(records.Asn().CompileDate, kLongDate); }
void DeliveryDateLong(Records& records, std::string& value) {
  value = Format(records.Shipment().DeliveryDate, kLongDate);
}
void ScheduleDateLong(Records& records, std::string& value) {
  value = Format(records.Shipment().ScheduleDate, kLongDate);
}
void OrderDateLong(Records& records, std::string& value) { value = Format(records.Order().PODate, kLongDate); }
void ScheduleDate(Records& records, std::string& value) { value = Format(records.Shipment().ScheduleDate, kShortDate); }

void FirstInvoiceNo(Records& records, std::string& value) { value = Str(records.FirstInvoiceNo()); }
void OrderHeader2(Records& records, std::string& value) { value = Str(records.Order().Header2); }
void OrderNoLessRelease(Records& records, std::string& value) { value = LessRelease(records.Order().PONo); }
void OrderNoLessLocation(Records& records, std::string& value) { value = PONoLessDelLocn(records.Order().PONo); }
void PalletNo(Records& records, std::string& value) { value = Str(records.Pack().PalletNo); }

void ShipPackCode(Records& records, std::string& value) {
  value = records.Type() != nullptr ? std::string_view(records.Type()->ShipPackCode) : "CTN25";
}
void PackageTypeCode(Records& records, std::string& value) {
  value = records.Type() != nullptr ? Str(records.Type()->PackageTypeCode) : "P01";
}

void PackWeight(Records& records, std::string& value) {
  const double weight = records.Pack().Weight.value_or(0);
  value = Format(weight == 0 ? 1 : weight, kWeight);
}
void ShipmentWeight(Records& records, std::string& value) {
  value = records.Shipment().Weight ? NumberText(*records.Shipment().Weight) : "";
}

void WaitingCartons(Records& records, std::string& value) { value = NumberText(records.waitingCartons); }
void WaitingPacks(Records& records, std::string& value) { value = std::to_string(records.waitingPacks); }

void OrderedProductNo(Records& records, std::string& value) {
  if (const Product* product = records.OrderedProduct()) value = Str(product->InHouseProdNo);
}
void LineGTIN(Records& records, std::string& value) { value = Str(records.Line().GTIN); }
void LineQuantity(Records& records, std::string& value) { value = NumberText(records.Line().Quantity); }
void LineBatchNo(Records& records, std::string& value) { value = Str(records.Line().BatchNo); }
void LineBestBefore(Records& records, std::string& value) { value = Format(records.Line().BestBeforeDate, kLongDate); }
void LineUseBy(Records& records, std::string& value) { value = Format(records.Line().UseByDate, kLongDate); }
void LineCount(Records& records, std::string& value) { value = std::to_string(records.linesWritten + 1); }

void ShipmentStatusCode(Records& records, std::string& value) { value = records.Shipment().Complete ? "164" : "165"; }

}  // namespace fill

}  // namespace partnerkit::shipment

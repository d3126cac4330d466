// Ship notices to Target.
#include "shipment/csv/csv_notice.h"
#include "values/format.h"

namespace partnerkit::shipment {

namespace {

// clang-format off
constexpr std::string_view kFields[] = {
    "SUPPLIERNO", "CUSTOMERCODE", "SHIPNOTENO", "SHIPNOTEDATE", "SHIPNOTETIME", "SHIPNOTETYPECODE", "BILLOFLADINGNO",
    "SHIPMENTWEIGHT", "CONSIGNMENTNOTENO", "BOOKINGNO", "SCHEDULEDATE", "DELIVERYDATE", "DATESHIPPED", "SHIPTOCODE",
    "SHIPPACKCODE", "ORDERNO", "ORDERSTATUSCODE", "BUYSTORECODE", "DELREFERENCE", "INVOICENO", "PACKERID", "PALLETNO",
    "PALLETMARKTYPE", "PALLETTYPECODE", "CONTAINERNO", "PACKMARKTYPE", "PACKTYPECODE", "INNERSPERPACK", "PACKLENGTH",
    "PACKWIDTH", "PACKHEIGHT", "PACKWEIGHT", "INHOUSEPRODNO", "APN", "QUANTITYSHIPPED", "COST", "LINEREF",
};

constexpr NoticeField kOwn[] = {
    {"SHIPNOTENO",      Level::kNotice,
     [](NoticeRecords& r, std::string& v) { v = Format(r.Asn().ASNNo, "000000000"); }},
    {"BILLOFLADINGNO",  Level::kNotice, [](NoticeRecords& r, std::string& v) { v = Str(r.Shipment().BillOfLadingNo); }},
    {"DATESHIPPED",     Level::kNotice, fill::ScheduleDate},
    {"ORDERSTATUSCODE", Level::kNotice,
     [](NoticeRecords& r, std::string& v) { v = r.Shipment().Complete ? "CC" : "SS"; }},
    {"PALLETNO",        Level::kPack,   fill::PalletNo},
    {"PACKMARKTYPE",    Level::kPack,   [](NoticeRecords&, std::string& v) { v = "GM"; }},
    {"PACKTYPECODE",    Level::kPack,   fill::PackageTypeCode},
};
// clang-format on

constexpr CsvNoticeValues kValues{
    .compile = {.className = "clsTarget856csv", .inventoryFailed = "Cannot inventory open file ", .tellsLast = true},
    .fields = kFields,
    .own = kOwn,
    .logsOrder = false,
    .lines = NoticeLines::kLongRuns,
    .deliveryDocket = true,
};

class clsTarget856csv final : public CsvNotice {
 public:
  explicit clsTarget856csv(const Ports& ports) : CsvNotice(kValues, ports) {}

 private:
  bool WriteNotice(Notice& notice) override;
  bool FollowOn(Notice& notice) override;
};

bool clsTarget856csv::WriteNotice(Notice& notice) {
  Host().CompileTotal1 = Host().CompileTotal2 = 0;
  return CsvNotice::WriteNotice(notice);
}

bool clsTarget856csv::FollowOn(Notice& notice) {
  CsvNotice::FollowOn(notice);
  if (Str(Document().Options) == "#%TARGETCHINADHL") ProcessChinaDHL(notice);
  return true;
}

}  // namespace

std::unique_ptr<Translator> MakeTarget856csv(const Ports& ports) { return std::make_unique<clsTarget856csv>(ports); }

}  // namespace partnerkit::shipment

// Despatch advices to CML by way of the freight forwarder.
#include "shipment/csv/csv_notice.h"
#include "shipment/csv/despatch_advice_fields.h"
#include "values/delimited.h"
#include "values/format.h"

namespace partnerkit::shipment {

namespace {

// clang-format off
void TypeCode(NoticeRecords& records, std::string& value) {
  value = Str(records.Vendor().LabelClass) == "PartnerKit.clsCMLFGPTL" ? "345" : "351";
}

void PalletType(NoticeRecords& records, std::string& value) {
  value = Format(records.Pack().PackTypeId, ">") == "ROLLCAGE" ? "CW" : "09";
}

constexpr NoticeField kOwn[] = {
    {"SHIPNOTETYPECODE",     Level::kNotice, TypeCode},
    {"SHIPNOTEFUNCTIONCODE", Level::kNotice, [](NoticeRecords&, std::string& v) { v = "9"; }},
    {"PALLETTYPECODE",       Level::kPack,   PalletType},
};
// clang-format on

constexpr CsvNoticeValues kValues{
    .compile = {.className = "clsCMLFLFDAcsv", .byShipTo = true, .ordersLessLocation = true},
    .fields = kDespatchAdviceNames,
    .own = kOwn,
    .family = kDespatchAdviceFields,
    .lines = NoticeLines::kEach,
    .deliveryDocket = true,
};

class clsCMLFLFDAcsv final : public CsvNotice {
 public:
  explicit clsCMLFLFDAcsv(const Ports& ports) : CsvNotice(kValues, ports) {}

 private:
  bool Prepare(Notice& notice) override;
  bool CheckNotice(Notice& notice) override;
};

bool clsCMLFLFDAcsv::Prepare(Notice& notice) {
  if (TrimBlanks(Str(TradingPartner().ABN)).empty() && HasInvoiceDocument()) {
    notice.log.Note(kRejection, "Invalid", "Vendor requires ABN...");
    return false;
  }
  return CsvNotice::Prepare(notice);
}

bool clsCMLFLFDAcsv::CheckNotice(Notice& notice) {
  const std::optional<DateTime>& delivery = Values().Shipment().DeliveryDate;
  const std::optional<DateTime>& cancel = Values().Order().CancelAfter;
  if (!delivery || !cancel) {
    notice.log.Note(kRejection, "DA Error ", "Scheduled date Null");
    return false;
  }
  if (delivery->Date().Seconds() <= cancel->Date().Seconds()) return true;
  notice.log.Note(kRejection, "DA Warning ",
                  "Shipment scheduled delivery date " + Format(*delivery, "Short Date") +
                      " greater then order Required date " + Format(*cancel, "Short Date"));
  return false;
}

}  // namespace

std::unique_ptr<Translator> MakeCMLFLFDAcsv(const Ports& ports) { return std::make_unique<clsCMLFLFDAcsv>(ports); }

}  // namespace partnerkit::shipment

// Ship notices to MGB by the business-to-business translator.
#include "shipment/csv/csv_notice.h"

namespace partnerkit::shipment {

namespace {

// clang-format off
constexpr std::string_view kRemoved[] = {"BOOKINGNO", "SCHEDULEDATE", "COST"};
constexpr std::string_view kAdded[] = {
    "DATESHIPPED",
    "SUBSSCC1",  "SUBSSCC2",  "SUBSSCC3",  "SUBSSCC4",  "SUBSSCC5",  "SUBSSCC6",  "SUBSSCC7",
    "SUBSSCC8",  "SUBSSCC9",  "SUBSSCC10", "SUBSSCC11", "SUBSSCC12", "SUBSSCC13", "SUBSSCC14",
    "SUBSSCC15", "SUBSSCC16", "SUBSSCC17", "SUBSSCC18", "SUBSSCC19", "SUBSSCC20",
};

constexpr NoticeField kOwn[] = {
    {"DATESHIPPED",  Level::kNotice, fill::ScheduleDate},
    {"DELREFERENCE", Level::kNotice, fill::FirstInvoiceNo},
    {"INVOICENO",    Level::kNotice, fill::FirstInvoiceNo},
};
// clang-format on

constexpr CsvNoticeValues kValues{
    .compile = {.className = "clsMGBBT856csv"},
    .removed = kRemoved,
    .added = kAdded,
    .own = kOwn,
    .lines = NoticeLines::kEach,
};

constexpr std::size_t kMostSubPacks = 20;

class clsMGBBT856csv final : public CsvNotice {
 public:
  explicit clsMGBBT856csv(const Ports& ports) : CsvNotice(kValues, ports) {}

 private:
  bool FillPack(Notice& notice, const Pack& pack) override;
};

// Sub packs are named with their lead pack. One with fewer of them than the last shows no more than its own.
bool clsMGBBT856csv::FillPack(Notice& notice, const Pack& pack) {
  if (!CsvNotice::FillPack(notice, pack)) return false;
  const auto subPacks = Values().SubPacks();
  if (subPacks.size() > kMostSubPacks) {
    notice.log.Note(kRejection, "New ASN ", "Only 20 Sub Packs allowed per lead pack");
    return false;
  }
  for (std::size_t n = 0; n < kMostSubPacks; ++n) {
    MapField* const field = Field("SUBSSCC" + std::to_string(n + 1));
    if (field != nullptr) field->FieldValue = n < subPacks.size() ? Str(subPacks[n]->SSCC) : std::string_view();
  }
  return true;
}

}  // namespace

std::unique_ptr<Translator> MakeMGBBT856csv(const Ports& ports) { return std::make_unique<clsMGBBT856csv>(ports); }

}  // namespace partnerkit::shipment

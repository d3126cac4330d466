// Purchase orders of Target for bulk deliveries.
#include "orders/csv/gtin_order_importer.h"
#include "values/numbers.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr OrderField kAdded[] = {INTDATE,   RESPONSETYPECODE, DELIVERYPARTY, REQUIRED, TRADEDQUANTITY, DELDATE,
                                 PROMODATE, STATUS,           INNEREAN,      INNERQTY, UNITSINNERPACK};

// clang-format off
constexpr FieldNumber<std::optional<double>> kPackNumbers[] = {
    {&OrderLine::PackSize, UNITSINNERPACK},
};
// clang-format on

constexpr PostingValues BulkPosting() {
  PostingValues values = kGtinPosting;
  values.lineNumbersOrNull = kPackNumbers;
  return values;
}

constexpr CsvOrderValues kValues{
    .className = "clsTargetBulkPOcsv",
    .added = kAdded,
    .removed = kGtinRemoved,
    .nullControls = true,
    .posting = BulkPosting(),
    .keepsTurnedAway = true,
};

class clsTargetBulkPOcsv final : public GtinOrderImporter {
 public:
  explicit clsTargetBulkPOcsv(const Ports& ports) : GtinOrderImporter(kValues, ports) {}

 private:
  void CheckInner(Posting& posting, const ProductInner& inner) override;
  void FillLine(Posting& posting, OrderLine& line) override;
};

void clsTargetBulkPOcsv::CheckInner(Posting& posting, const ProductInner& inner) {
  const std::string_view ordered = (*this)[UNITSINNERPACK];
  if (ordered.empty() || NumberOf(UNITSINNERPACK) == inner.InnerQty) return;
  posting.checks.RejectProduct("GTIN " + inner.InnerEAN + " inner pack quantity " + NumberText(inner.InnerQty) +
                               " does not match order " + std::string(ordered));
}

void clsTargetBulkPOcsv::FillLine(Posting& posting, OrderLine& line) {
  CsvOrderImporter::FillLine(posting, line);
  line.UOM = "CT";
}

}  // namespace

std::unique_ptr<Translator> MakeTargetBulkPOcsv(const Ports& ports) {
  return std::make_unique<clsTargetBulkPOcsv>(ports);
}

}  // namespace partnerkit::orders

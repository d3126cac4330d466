// Purchase orders of CML by way of the freight forwarder.
#include "orders/csv/gtin_order_importer.h"
#include "values/dates.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr OrderField kOptional[] = {UNITMEASURECODE};
constexpr OrderField kNumberFields[] = {PONUMBER, SHIPTOLOCPARTNERNO};

constexpr std::size_t kShortNumber = 8;  // a longer order number is unique without its ship-to

constexpr CsvOrderValues kValues{
    .className = "clsCMLFLFPOcsv",
    .added = kGtinAdded,
    .removed = kGtinRemoved,
    .optional = kOptional,
    .orderKey = kNumberFields,
    .nullControls = true,
    .posting = kGtinPosting,
    .keepsTurnedAway = true,
};

class clsCMLFLFPOcsv final : public GtinOrderImporter {
 public:
  explicit clsCMLFLFPOcsv(const Ports& ports) : GtinOrderImporter(kValues, ports) {}

 private:
  std::string_view OrderNumber(std::string& number) const override;
  bool BeginPosting(Posting& posting) override;
  void FillLine(Posting& posting, OrderLine& line) override;
};

std::string_view clsCMLFLFPOcsv::OrderNumber(std::string& number) const {
  if ((*this)[PONUMBER].size() > kShortNumber) return (*this)[PONUMBER];
  return number.assign((*this)[PONUMBER]).append(" #").append((*this)[SHIPTOLOCPARTNERNO]);
}

// What is ordered in cartons leaves on pallets.
bool clsCMLFLFPOcsv::BeginPosting(Posting& posting) {
  PackType pallet;
  pallet.ShipPackCode = "PALLET";
  if (Try([&] { return Find(Records(), PackType::kByShipPackCode, pallet); })) return true;
  posting.log.Note(kWarning, words::kNoPallet.With(posting.entry.PONo));
  return false;
}

void clsCMLFLFPOcsv::FillLine(Posting& posting, OrderLine& line) {
  CsvOrderImporter::FillLine(posting, line);
  const std::string_view uom = (*this)[UNITMEASURECODE];
  line.UOM = std::string(uom.empty() ? "CT" : uom);
  line.DeliveryDate = OrderDate((*this)[DELDATE]);
}

}  // namespace

std::unique_ptr<Translator> MakeCMLFLFPOcsv(const Ports& ports) { return std::make_unique<clsCMLFLFPOcsv>(ports); }

}  // namespace partnerkit::orders

// Purchase orders of Target.
#include <cmath>

#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr OrderField kAdded[] = {CONTRACTNO, HEADER1, UNITSINNERPACK, PACKUOM};
constexpr OrderField kRemoved[] = {SUPPLIERNO, CUSTCAT, DEPTNO};

constexpr std::string_view kBulkVendor = "TARGETBULK";  // orders by GTIN

// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.purpose = "07",                  .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,  .fate = Fate::kReplace},
    // A release takes the place of its blanket order.
    {.type = "RL", .storedType = "BL", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,  .fate = Fate::kReplace},
    {.incomplete = true,                                    .number = kWarning,   .message = words::kIncomplete, .fate = Fate::kReplace},
    {                                                       .number = kRejection, .message = words::kAlreadyExists},
};
constexpr OrderRule kNewOrder[] = {
    {.type = "BL", .number = kRejection, .message = words::kBlanketComma},
};
constexpr FieldText<Order> kHeader[] = {
    {&Order::Header1, ADDATE},
    {&Order::Header2, STOREZONE},
    {&Order::Header3, HEADER1},
};
// clang-format on

constexpr CsvOrderValues kValues{
    .className = "clsTarget850csv",
    .added = kAdded,
    .removed = kRemoved,
    .shipToForBuyingLocn = true,
    .posting = {.announceStored = words::kDuplicateProcessed,
                .storedOrder = kStoredOrder,
                .newOrder = kNewOrder,
                .headerTexts = kHeader,
                .checks = {.sameABN = true}},
};

class clsTarget850csv final : public CsvOrderImporter {
 public:
  explicit clsTarget850csv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

 private:
  LineProduct CheckLineProduct(Posting& posting) override;
  void FillLine(Posting& posting, OrderLine& line) override;
};

CsvOrderImporter::LineProduct clsTarget850csv::CheckLineProduct(Posting& posting) {
  LineProduct product = CsvOrderImporter::CheckLineProduct(posting);
  if (OwnCompany().VendorId == kBulkVendor) product.GTIN = product.ordered;
  return product;
}

void clsTarget850csv::FillLine(Posting& posting, OrderLine& line) {
  CsvOrderImporter::FillLine(posting, line);
  if ((*this)[UNITSINNERPACK].empty()) return;
  line.PackSize = std::trunc(NumberOf(UNITSINNERPACK));
  line.PackUOM = std::string((*this)[PACKUOM]);
}

}  // namespace

std::unique_ptr<Translator> MakeTarget850csv(const Ports& ports) { return std::make_unique<clsTarget850csv>(ports); }

}  // namespace partnerkit::orders

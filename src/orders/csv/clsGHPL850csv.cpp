// Purchase orders of GHPL.
#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

// GHPL numbers a product anew at each location, so the sequence doesn't tell a line.
constexpr OrderField kGhplLineKey[] = {PONUMBER, BUYINGLOCPARTNERNO, INCOMINGPRODUCTNO};
constexpr OrderField kRemoved[] = {SUPPLIERNO, CUSTCAT, STOREZONE};

// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.purpose = "07", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,  .fate = Fate::kReplace},
    {.incomplete = true,                   .number = kWarning,   .message = words::kIncomplete, .fate = Fate::kReplace},
    {                                      .number = kRejection, .message = words::kAlreadyExists},
};
// clang-format on

constexpr FieldText<Order> kHeader[] = {{&Order::DeptNo, DEPTNO}};

constexpr CsvOrderValues kValues{
    .className = "clsGHPL850csv",
    .removed = kRemoved,
    .lineKey = kGhplLineKey,
    .importsProducts = true,
    .posting = {.storedOrder = kStoredOrder,
                .newOrder = {},
                .headerTexts = kHeader,
                .checks = {.uom = false, .symbology = Symbology::kSkip, .retail = false}},
};

class clsGHPL850csv final : public CsvOrderImporter {
 public:
  explicit clsGHPL850csv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

 private:
  void FillLine(Posting& posting, OrderLine& line) override;
};

// The order's products are counted, from 1.
void clsGHPL850csv::FillLine(Posting& posting, OrderLine& line) {
  CsvOrderImporter::FillLine(posting, line);
  line.LineNo = std::to_string(posting.draft.lines.Count() + 1);
}

}  // namespace

std::unique_ptr<Translator> MakeGHPL850csv(const Ports& ports) { return std::make_unique<clsGHPL850csv>(ports); }

}  // namespace partnerkit::orders

// Purchase orders of Officeworks: changes and cancellations by its own codes, and packs within packs.
#include "orders/csv/csv_order_importer.h"
#include "orders/order_answers.h"
#include "values/numbers.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr OrderField kAdded[] = {POVERSIONNO, CARTONSOUTER, UNITSINNERPACK, PACKUOM};
constexpr OrderField kRemoved[] = {CUSTCAT, DEPTNO, STOREZONE, SKUPRODUCTKEYCODE, RETAILUNITPRICE};

// "4" changes an order, or cancels its balance when a version is given; "1" cancels it.
// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.incomplete = true,                                             .number = kWarning,   .message = words::kIncomplete,           .fate = Fate::kReplace},
    {.purpose = "4", .version = Version::kNone,  .jobs = Jobs::kNone, .number = kWarning,  .message = words::kChange,               .fate = Fate::kReplace},
    {.purpose = "4", .version = Version::kGiven, .jobs = Jobs::kNone, .number = kWarning,  .message = words::kCancelBalance,        .fate = Fate::kReplace},
    {.purpose = "1",                             .jobs = Jobs::kNone, .number = kWarning,  .message = words::kCancel,               .fate = Fate::kCancel},
    {.purpose = "4", .version = Version::kNone,  .jobs = Jobs::kSome, .number = kWarning,  .message = words::kChangePacking},
    {.purpose = "4", .version = Version::kGiven, .jobs = Jobs::kSome, .number = kWarning,  .message = words::kCancelBalancePacking},
    {.purpose = "1",                             .jobs = Jobs::kSome, .number = kWarning,  .message = words::kCancelPacking},
    {                                                                .number = kRejection, .message = words::kAlreadyExists},
};
constexpr OrderRule kNewOrder[] = {
    {.purpose = "4", .version = Version::kGiven, .number = kWarning,   .message = words::kCancelBalance, .fate = Fate::kCancel},
    {.purpose = "1",                             .number = kWarning,   .message = words::kCancel,        .fate = Fate::kCancel},
    {.type = "BK",                               .number = kRejection, .message = words::kBlanketDash},
    {.directToStore = true,                      .number = kRejection, .message = words::kDirectToStore},
};
constexpr FieldText<Order> kHeader[] = {
    {&Order::SupplierNo, SUPPLIERNO, false},
    {&Order::Header2,    SUPPLIERNO, false},
};
constexpr FieldText<OrderLine> kLine[] = {
    {&OrderLine::LineNo, SEQUENTIALLINENO, false},
};
constexpr FieldNumber<double> kLineNumbers[] = {
    {&OrderLine::Cost, UNITPRICE},
};
// clang-format on

constexpr CsvOrderValues kValues{
    .className = "clsOfficeworks850csv",
    .added = kAdded,
    .removed = kRemoved,
    .posting = {.storedOrder = kStoredOrder,
                .newOrder = kNewOrder,
                .acceptDirectToStore = "#%ACCEPTOFFICEWORKSDTSORDERS",
                .headerTexts = kHeader,
                .lineTexts = kLine,
                .lineNumbers = kLineNumbers,
                .checks = {.uom = false, .symbology = Symbology::kWarn, .retail = false}},
};

class clsOfficeworks850csv final : public CsvOrderImporter {
 public:
  explicit clsOfficeworks850csv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

 private:
  void FillHeader(Posting& posting) override;
  void CheckFoundProduct(Posting& posting, const Product& product) override;
  void FillLine(Posting& posting, OrderLine& line) override;

  double PackQuantity(OrderField field);
  void CheckPack(Posting& posting, const std::string& number, std::string_view what, double quantity, double units);
};

void clsOfficeworks850csv::FillHeader(Posting& posting) {
  CsvOrderImporter::FillHeader(posting);
  Order& header = posting.draft.header;
  header.Header1 = AdvertisedText((*this)[ADDATE]);
  if ((*this)[CANCAFTER].empty()) header.CancelAfter = header.NotBefore;
}

// A quantity in a pack; one that isn't told is 1.
double clsOfficeworks850csv::PackQuantity(OrderField field) {
  const std::string_view text = (*this)[field];
  return text.empty() || text == "0" ? 1 : NumberOf(field);
}

// A product must be on file in the inner and the outer that the partner counts in.
void clsOfficeworks850csv::CheckFoundProduct(Posting& posting, const Product& product) {
  if (!product.InHouseProdNo) return;
  const double inner = PackQuantity(UNITSINNERPACK);
  const double outer = PackQuantity(CARTONSOUTER);
  CheckPack(posting, product.ProductNo, " inner for ", inner, inner);
  CheckPack(posting, product.ProductNo, " outer for ", outer, outer * inner);
}

// A pack of more than one must be there as an inner or a prepack. `units` are the products in it.
void clsOfficeworks850csv::CheckPack(Posting& posting, const std::string& number, std::string_view what,
                                     double quantity, double units) {
  if (quantity <= 1 || IsPackedBy(*this, number, units)) return;
  posting.checks.RejectProduct(number + std::string(what) + NumberText(quantity) + " does not exist.");
}

void clsOfficeworks850csv::FillLine(Posting& posting, OrderLine& line) {
  CsvOrderImporter::FillLine(posting, line);
  line.PackSize = PackQuantity(UNITSINNERPACK);
  line.PackCount = PackQuantity(CARTONSOUTER);
}

}  // namespace

std::unique_ptr<Translator> MakeOfficeworks850csv(const Ports& ports) {
  return std::make_unique<clsOfficeworks850csv>(ports);
}

}  // namespace partnerkit::orders

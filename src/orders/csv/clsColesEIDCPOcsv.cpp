// Purchase orders of Coles into its distribution centres: cartons and prepacks by GTIN, prices with and without tax,
// and the ship-to's address in the order.
#include <algorithm>

#include "orders/csv/gtin_order_importer.h"
#include "values/numbers.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr OrderField kAdded[] = {INTDATE,  RESPONSETYPECODE, EQUIPMENT,     DELIVERYPARTY,   REQUIRED,
                                 HEADER1,  HEADER2,          HEADER3,       HEADER4,         HEADER5,
                                 DESTDOCK, DELDOCK,          PALLETFOOTAGE, UNITPRICEINCGST, UNITPRICEEXGST,
                                 GSTRATE,  CARTONSOUTER,     PACKUOM,       UNITSINNERPACK,  GSTAMOUNT,
                                 STATUS,   INNEREAN,         INNERQTY,      DETAIL4,         DETAIL5};
constexpr OrderField kRemoved[] = {CUSTCAT, DEPTNO, ADDATE, STOREZONE, UNITPRICE, RETAILUNITPRICE};
// Coles counts no groups.
constexpr OrderField kColesTransactionKey[] = {INTCONTROLNO, TRNCONTROLNO};

constexpr std::string_view kCarton = "CT";

// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.jobs = Jobs::kNone, .number = kWarning,   .message = words::kChangeShort,     .fate = Fate::kReplace},
    {                     .number = kRejection, .message = words::kChangeAllocated},
};
constexpr FieldText<Order> kHeader[] = {
    {&Order::SupplierNo, SUPPLIERNO},
};
constexpr FieldText<OrderLine> kLine[] = {
    {&OrderLine::LineNo,           SEQUENTIALLINENO,  false},
    {&OrderLine::PriceCode,        UNITPRICECODE,     false},
    {&OrderLine::ProductQualifier, PRODUCTQUALIFIER},
    {&OrderLine::UOM,              UNITMEASURECODE},
    {&OrderLine::SKU,              SKUPRODUCTKEYCODE},
    {&OrderLine::PackUOM,          PACKUOM},
};
constexpr FieldNumber<double> kLineNumbers[] = {
    {&OrderLine::Cost, UNITPRICEINCGST},
};
constexpr FieldNumber<std::optional<double>> kLineNumbersOrNull[] = {
    {&OrderLine::CostExGST, UNITPRICEEXGST},
    {&OrderLine::PackCount, CARTONSOUTER},
    {&OrderLine::GSTRate,   GSTRATE},
    {&OrderLine::GSTAmount, GSTAMOUNT},
};
// clang-format on

constexpr CsvOrderValues kValues{
    .className = "clsColesEIDCPOcsv",
    .added = kAdded,
    .removed = kRemoved,
    .transactionKey = kColesTransactionKey,
    .shipToForBuyingLocn = true,
    .nullControls = true,
    .posting = {.storedOrder = kStoredOrder,
                .headerTexts = kHeader,
                .lineTexts = kLine,
                .lineNumbers = kLineNumbers,
                .lineNumbersOrNull = kLineNumbersOrNull,
                .checks = {.vendor = false, .sameABN = true, .retail = false},
                .checksBuyingLocn = false},
    .deleteOnEmptyAnywhere = true,
};

class clsColesEIDCPOcsv final : public CsvOrderImporter {
 public:
  explicit clsColesEIDCPOcsv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

 private:
  LineProduct CheckLineProduct(Posting& posting) override;
  double LineQuantity(const Posting& posting) override;
  void CheckLineLocations(Posting& posting) override;

  Text PrepackProduct(const std::string& number);
  std::shared_ptr<ProductInner> CartonInner(Posting& posting, const std::string& number);
  void CheckGstPrices(Posting& posting, std::string_view productNo);
  void AddAddress();
};

// A carton's number is that of a prepack or a GTIN; any other is a product's.
CsvOrderImporter::LineProduct clsColesEIDCPOcsv::CheckLineProduct(Posting& posting) {
  const std::string number((*this)[INCOMINGPRODUCTNO]);
  LineProduct product{number, number};
  if (!Document().ValidateProduct) return product;
  if ((*this)[PACKUOM] != kCarton) {
    FitProductMaster();
    posting.checks.CheckProduct(Claims(number));
  } else if (const auto prepack = Try([&] { return PrepackProduct(number); })) {
    product.productNo = *prepack;
    product.GTIN = number;
  } else if (const auto inner = CartonInner(posting, number)) {
    product.productNo = inner->ProductNo;
    product.GTIN = number;
  }
  if (AsksForPrices()) CheckGstPrices(posting, product.productNo);
  return product;
}

// The product of a prepack of that number: a prepack job of one item, packed by the cartons ordered.
Text clsColesEIDCPOcsv::PrepackProduct(const std::string& number) {
  LabelJobItem probe;
  probe.PackNo = number;
  const auto items = Select(Records(), LabelJobItem::kByLabelJob, probe);
  if (items.size() != 1 || items.front()->PackQty != NumberOf(CARTONSOUTER)) return std::nullopt;
  return items.front()->ProductNo.value_or(number);
}

// The inner of that number that holds the cartons ordered. Null, with the fault noted, when there is none.
std::shared_ptr<ProductInner> clsColesEIDCPOcsv::CartonInner(Posting& posting, const std::string& number) {
  const auto inners = InnersOfGtin(*this, number);
  const std::string gtin = "GTIN " + number;
  if (inners.empty()) {
    posting.checks.RejectProduct(gtin + " does not exist.");
    return nullptr;
  }
  if (!InnerIsPartners(*this, posting.checks, *inners.front())) {
    posting.checks.RejectProduct(gtin + " does not exist for vendor " + TradingPartner().PartnerId);
    return nullptr;
  }
  const double cartons = NumberOf(CARTONSOUTER);
  const auto fits = std::ranges::find_if(inners, [&](const auto& inner) { return inner->InnerQty == cartons; });
  if (fits != inners.end()) return *fits;
  posting.checks.RejectProduct(gtin + " does not exist with inner quantity " + std::string((*this)[CARTONSOUTER]));
  return nullptr;
}

// Prices without and with tax, and the tax rate. The words for the two prices are the partner's.
void clsColesEIDCPOcsv::CheckGstPrices(Posting& posting, std::string_view productNo) {
  const ProductPrice price = posting.checks.ReadPrice(productNo);
  if (!Document().ValidateCost) return;
  const double rate = Try([&] { return NumberAtStart(Str(price.TaxRate)); });
  const double tax = price.GSTAmount != 0 ? price.GSTAmount : price.Cost * rate / 100;
  const auto compare = [&](OrderField field, double stored, std::string_view what, std::string_view name) {
    if (NumberOf(field) == stored) return;
    posting.checks.RejectProduct(Disagreement(productNo, what, (*this)[field], name, NumberText(stored)));
  };
  compare(UNITPRICEEXGST, price.Cost, " GST Inc price ", "gross ");
  compare(UNITPRICEINCGST, RoundHalfEven(price.Cost + tax, 4), " GST Ex price ", "net ");
  if (!(*this)[GSTRATE].empty()) compare(GSTRATE, rate, " GST rate ", "rate ");
}

double clsColesEIDCPOcsv::LineQuantity(const Posting& posting) {
  const double quantity = CsvOrderImporter::LineQuantity(posting);
  const double cartons = (*this)[PACKUOM] == kCarton ? NumberOf(CARTONSOUTER) : 0;
  return cartons > 0 ? Try([&] { return Times(cartons, quantity); }) : quantity;
}

// The order brings its ship-to's address, so the location is written instead of being looked for.
void clsColesEIDCPOcsv::CheckLineLocations(Posting& posting) {
  const std::string_view shipTo = (*this)[SHIPTOLOCPARTNERNO];
  if (posting.shipTo.empty() || posting.shipTo != shipTo) {
    posting.shipTo = shipTo;
    AddAddress();
  }
  CheckBuyingLocn(posting);
}

void clsColesEIDCPOcsv::AddAddress() {
  Procedure("Sub AddAddress", false, [&](bool&) {
    PartnerLocn location;
    location.VendorId = OwnCompany().VendorId;
    location.PartnerLocnNo = (*this)[SHIPTOLOCPARTNERNO];
    const bool known = Try([&] { return partnerkit::Load(Records(), location); });
    location.Name = std::string((*this)[HEADER1]);
    location.ShortName = OwnCompany().Name;
    location.Address1 = std::string((*this)[HEADER2]);
    location.Suburb = std::string((*this)[HEADER3]);
    location.State = std::string((*this)[HEADER4].substr(0, 3));
    location.Postcode = std::string((*this)[HEADER5]);
    Try([&] { return known ? Update(Records(), location) : Add(Records(), location); });
  });
}

}  // namespace

std::unique_ptr<Translator> MakeColesEIDCPOcsv(const Ports& ports) {
  return std::make_unique<clsColesEIDCPOcsv>(ports);
}

}  // namespace partnerkit::orders

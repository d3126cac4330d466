// Purchase orders of Target for bulk deliveries.
#include "frame/numbers.h"
#include "orders/csv/csv_classes.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr OrderField kAdded[] = {INTDATE,   RESPONSETYPECODE, DELIVERYPARTY, REQUIRED, TRADEDQUANTITY, DELDATE,
                                 PROMODATE, STATUS,           INNEREAN,      INNERQTY, UNITSINNERPACK};
constexpr OrderField kRemoved[] = {CUSTCAT,           DEPTNO,         ADDATE, STOREZONE, UNITMEASURECODE, ORDERQUANTITY,
                                   SKUPRODUCTKEYCODE, RETAILUNITPRICE};

// clang-format off
constexpr FieldText<Order> kHeader[] = {
    {&Order::SupplierNo, SUPPLIERNO},
    {&Order::Header2,    DELIVERYPARTY, false},
};
constexpr FieldText<OrderLine> kLine[] = {
    {&OrderLine::LineNo,           SEQUENTIALLINENO, false},
    {&OrderLine::ProductQualifier, PRODUCTQUALIFIER, false},
    {&OrderLine::PriceCode,        UNITPRICECODE,    false},
};
constexpr FieldNumber<double> kLineNumbers[] = {
    {&OrderLine::Cost, UNITPRICE},
};
constexpr FieldNumber<std::optional<double>> kPackNumbers[] = {
    {&OrderLine::PackSize, UNITSINNERPACK},
};
// clang-format on

constexpr CsvOrderValues kValues{
    .className = "clsTargetBulkPOcsv",
    .added = kAdded,
    .removed = kRemoved,
    .nullControls = true,
    .endsAtOtherCompany = true,
    .posting = {.storedOrder = kGtinStoredOrder,
                .newOrder = kGtinNewOrder,
                .headerTexts = kHeader,
                .quantity = TRADEDQUANTITY,
                .lineTexts = kLine,
                .lineNumbers = kLineNumbers,
                .lineNumbersOrNull = kPackNumbers,
                .checks = {.sameABN = true, .retail = false},
                .checksBuyingLocn = false},
    .keepsForeignLines = true,
    .keepsTurnedAway = true,
};

}  // namespace

clsTargetBulkPOcsv::clsTargetBulkPOcsv(const Ports& ports) : GtinOrderImporter(kValues, ports) {}

void clsTargetBulkPOcsv::CheckInner(Posting& posting, const ProductInner& inner) {
  const std::string_view ordered = (*this)[UNITSINNERPACK];
  if (ordered.empty() || Try([&] { return NumberAtStart(ordered) == inner.InnerQty; })) return;
  posting.checks.RejectProduct("GTIN " + inner.InnerEAN + " inner pack quantity " + NumberText(inner.InnerQty) +
                               " does not match order " + std::string(ordered));
}

void clsTargetBulkPOcsv::FillLine(Posting& posting, OrderLine& line) {
  CsvOrderImporter::FillLine(posting, line);
  line.UOM = "CT";
}

}  // namespace partnerkit::orders

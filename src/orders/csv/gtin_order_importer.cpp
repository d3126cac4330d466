#include "orders/csv/gtin_order_importer.h"

#include "values/dates.h"

namespace partnerkit::orders {

using enum OrderField;

namespace {

constexpr std::int32_t kResponseDue = 4;  // Order.ResponseStatus of a fresh order

}  // namespace

std::vector<std::shared_ptr<ProductInner>> InnersOfGtin(TranslatorBase& translator, std::string_view gtin) {
  ProductInner probe;
  probe.InnerEAN = gtin;
  return translator.Try([&] { return Select(translator.Records(), ProductInner::kByEAN, probe); });
}

bool InnerIsPartners(TranslatorBase& translator, OrderChecks& checks, const ProductInner& inner) {
  Product product;
  product.ProductNo = inner.ProductNo;
  return translator.Try([&] { return Load(translator.Records(), product); }) && checks.IsPartners(product.PartnerId);
}

void GtinOrderImporter::FillHeader(Posting& posting) {
  CsvOrderImporter::FillHeader(posting);
  Order& header = posting.draft.header;
  header.ResponseStatus = kResponseDue;
  if ((*this)[POTYPECODE] == kChangeType) header.POADate = header.PODate;
  // An order straight to its ship-to has one date only. A date that isn't given is today's.
  const bool direct = (*this)[BUYINGLOCPARTNERNO] == (*this)[SHIPTOLOCPARTNERNO];
  const auto date = [&](OrderField field) {
    const std::string_view text = (*this)[direct ? REQUIRED : field];
    return text.empty() ? std::optional(Now().Date()) : OrderDate(text);
  };
  header.NotBefore = date(NOTBEFORE);
  header.CancelAfter = date(CANCAFTER);
}

// What is traded, and of a change the lines that it accepts or alters.
bool GtinOrderImporter::LineCounts() {
  if (NumberOf(TRADEDQUANTITY) <= 0) return false;
  const std::string_view type = (*this)[POTYPECODE];
  return type == kOrderType || (type == kChangeType && IsOneOf((*this)[STATUS], "3 5"));
}

CsvOrderImporter::LineProduct GtinOrderImporter::CheckLineProduct(Posting& posting) {
  const std::string number((*this)[INCOMINGPRODUCTNO]);
  LineProduct product{number, number, number};
  if (!Document().ValidateProduct) return product;
  const auto inners = InnersOfGtin(*this, number);
  if (inners.empty()) {
    posting.checks.RejectProduct("GTIN " + number + " does not exist.");
  } else if (!InnerIsPartners(*this, posting.checks, *inners.front())) {
    posting.checks.RejectProduct("GTIN " + number + " does not exist for vendor " + TradingPartner().PartnerId);
  } else {
    product.productNo = inners.front()->ProductNo;
    CheckInner(posting, *inners.front());
  }
  if (AsksForPrices()) posting.checks.CheckPrice(Claims(product.productNo));
  return product;
}

}  // namespace partnerkit::orders

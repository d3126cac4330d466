#include "orders/order_checks.h"

#include "values/numbers.h"

namespace partnerkit::orders {

std::string Disagreement(std::string_view productNo, std::string_view what, std::string_view claimed,
                         std::string_view name, std::string_view stored) {
  return std::string("product ")
      .append(productNo)
      .append(what)
      .append(claimed)
      .append(" does not agree with database ")
      .append(name)
      .append(stored);
}

namespace {

// A text beyond all numbers says none; what reads it for the order tells.
bool Says(std::string_view text, double number) {
  try {
    return NumberAtStart(text) == number;
  } catch (const RunTimeError&) {
    return false;
  }
}

}  // namespace

void OrderChecks::Reject(std::string_view message) {
  constexpr CheckRules kUsual;
  ok_ = false;
  log_.Note(kRejection, Opening(kUsual.before, kUsual.after).append(message));
}

void OrderChecks::RejectProduct(std::string_view message) {
  if (faultsPass_) {
    errors_ = true;
  } else {
    ok_ = false;
  }
  log_.Note(kRejection, Opening(rules_.before, rules_.after).append(message));
}

bool OrderChecks::IsPartners(const std::string& partnerId) {
  const Partner& partner = translator_.TradingPartner();
  if (partnerId == partner.PartnerId) return true;
  if (!rules_.sameABN || Str(partner.ABN).empty()) return false;
  Partner other;
  other.PartnerId = partnerId;
  return translator_.Try([&] { return Load(translator_.Records(), other); }) && Str(other.ABN) == Str(partner.ABN);
}

std::optional<Product> OrderChecks::CheckProduct(const LineClaims& line) {
  const std::string number(line.productNo);
  Product product;
  product.ProductNo = number;
  if (!translator_.Try([&] { return Load(translator_.Records(), product); })) {
    RejectProduct("product " + number + " does not exist.");
    return std::nullopt;
  }
  if (rules_.vendor && !IsPartners(product.PartnerId)) {
    RejectProduct("product " + number + " does not exist for vendor " + translator_.TradingPartner().PartnerId);
    return std::nullopt;
  }
  if (rules_.uom && Str(product.UOM) != line.uom) {
    RejectProduct(Disagreement(number, " UOM ", line.uom, "UOM ", Str(product.UOM)));
    return std::nullopt;
  }
  if (rules_.symbology == Symbology::kSkip || Str(product.Symbology) == line.qualifier) return product;
  const std::string difference = std::string(rules_.symbologyOf) + number + std::string(rules_.symbologyClaim) +
                                 std::string(line.qualifier) + " does not agree with database symbology " +
                                 std::string(Str(product.Symbology));
  if (rules_.symbology == Symbology::kWarn) {
    log_.Note(kRejection, Opening("...Warning PO ", ", ") + difference);
    return product;
  }
  RejectProduct(difference);
  return std::nullopt;
}

ProductPrice OrderChecks::ReadPrice(std::string_view productNo, bool needed) {
  ProductPrice price;
  price.VendorId = translator_.OwnCompany().VendorId;
  price.ProductNo = productNo;
  if (!translator_.Try([&] { return Load(translator_.Records(), price); })) {
    RejectProduct("pricing details for product " + price.ProductNo + " does not exist.");
    if (needed) ok_ = false;
  }
  return price;
}

ProductPrice OrderChecks::CheckPrice(const LineClaims& line) {
  const EDIDoc& document = translator_.Document();
  ProductPrice price = ReadPrice(line.productNo, line.needsPrice);
  if (document.ValidateCost && !Says(line.cost, price.Cost)) {
    RejectProduct(Disagreement(line.productNo, " cost price ", line.cost, "cost ", NumberText(price.Cost)));
  }
  if (!document.ValidateRetail || !rules_.retail) return price;
  CheckRetail(price, line.retail);
  if (Str(price.SKU) != line.sku) {
    RejectProduct(Disagreement(line.productNo, " SKU ", line.sku, "SKU ", Str(price.SKU)));
  }
  return price;
}

void OrderChecks::CheckRetail(const ProductPrice& price, std::string_view claimed) {
  const double retail = price.Retail.value_or(0);
  if (Says(claimed, retail)) return;
  RejectProduct(Disagreement(price.ProductNo, " retail price ", claimed, "retail ", NumberText(retail)));
}

const PartnerLocn* OrderChecks::FindLocation(std::string_view locationNo) {
  auto known = locations_.find(locationNo);
  if (known == locations_.end()) {
    PartnerLocn location;
    location.VendorId = translator_.OwnCompany().VendorId;
    location.PartnerLocnNo = locationNo;
    const bool exists = translator_.Try([&] { return Load(translator_.Records(), location); });
    known = locations_.emplace(locationNo, exists ? std::optional(std::move(location)) : std::nullopt).first;
  }
  return known->second ? &*known->second : nullptr;
}

void OrderChecks::CheckLocation(std::string_view what, std::string_view locationNo) {
  if (FindLocation(locationNo) == nullptr) {
    Reject(std::string(what).append(" location ").append(locationNo).append(" does not exist."));
  }
}

}  // namespace partnerkit::orders

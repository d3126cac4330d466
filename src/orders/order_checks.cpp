#include "orders/order_checks.h"

#include "frame/numbers.h"

namespace partnerkit::orders {

void OrderChecks::Reject(std::string_view message) {
  ok_ = false;
  log_.Note(kRejection, opening_ + std::string(message));
}

void OrderChecks::CheckProduct(const LineClaims& line) {
  const std::string number(line.productNo);
  Product product;
  product.ProductNo = number;
  if (!translator_.Try([&] { return Load(translator_.Records(), product); })) {
    return Reject("product " + number + " does not exist.");
  }
  const std::string& partnerId = translator_.TradingPartner().PartnerId;
  if (product.PartnerId != partnerId) {
    return Reject("product " + number + " does not exist for vendor " + partnerId);
  }
  if (Str(product.UOM) != line.uom) {
    return Reject("product " + number + " UOM " + std::string(line.uom) + " does not agree with database UOM " +
                  std::string(Str(product.UOM)));
  }
  if (Str(product.Symbology) != line.qualifier) {
    Reject("barcode " + number + " symbology " + std::string(line.qualifier) +
           " does not agree with database symbology " + std::string(Str(product.Symbology)));
  }
}

void OrderChecks::CheckPrice(const LineClaims& line) {
  const EDIDoc& document = translator_.Document();
  const std::string number(line.productNo);
  ProductPrice price;
  price.VendorId = translator_.OwnCompany().VendorId;
  price.ProductNo = number;
  if (!translator_.Try([&] { return Load(translator_.Records(), price); })) {
    Reject("pricing details for product " + number + " does not exist.");
  }
  const auto differs = [&](std::string_view what, std::string_view claimed, std::string_view name,
                           std::string_view stored) {
    Reject("product " + number + std::string(what) + std::string(claimed) + " does not agree with database " +
           std::string(name) + std::string(stored));
  };
  if (document.ValidateCost && translator_.Try([&] { return price.Cost != NumberAtStart(line.cost); })) {
    differs(" cost price ", line.cost, "cost ", NumberText(price.Cost));
  }
  if (!document.ValidateRetail) return;
  if (translator_.Try([&] { return price.Retail.value_or(0) != NumberAtStart(line.retail); })) {
    differs(" retail price ", line.retail, "retail ", NumberText(price.Retail.value_or(0)));
  }
  if (Str(price.SKU) != line.sku) differs(" SKU ", line.sku, "SKU ", Str(price.SKU));
}

bool OrderChecks::LocationExists(std::string_view locationNo) {
  if (const auto known = locations_.find(locationNo); known != locations_.end()) return known->second;
  PartnerLocn location;
  location.VendorId = translator_.OwnCompany().VendorId;
  location.PartnerLocnNo = std::string(locationNo);
  const bool exists = translator_.Try([&] { return Load(translator_.Records(), location); });
  return locations_[location.PartnerLocnNo] = exists;
}

void OrderChecks::CheckLocation(std::string_view what, std::string_view locationNo) {
  if (!LocationExists(locationNo)) {
    Reject(std::string(what) + " location " + std::string(locationNo) + " does not exist.");
  }
}

}  // namespace partnerkit::orders

#include "orders/order_answers.h"

#include <algorithm>
#include <cctype>
#include <string_view>

#include "values/delimited.h"

namespace partnerkit::orders {

namespace {

bool IsAcknowledgement(std::string_view documentCode, CodeForm form) {
  const bool anyCase = form == CodeForm::kTrimmedAnyCase;
  if (documentCode == "855" || documentCode == "ORDRSP") return true;
  std::string upper(anyCase ? TrimBlanks(documentCode) : documentCode);
  std::ranges::transform(upper, upper.begin(), [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
  return upper == "POA" || upper == "SO" || (anyCase && (upper == "855" || upper == "ORDRSP"));
}

}  // namespace

bool HasOrderAcknowledgement(TranslatorBase& translator, CodeForm form) {
  const EDIDoc& own = translator.Document();
  const auto documents = translator.Try([&] { return translator.Host().EDIDocList(); });
  return std::ranges::any_of(documents, [&](const EDIDoc& other) {
    return other.PartnerId == own.PartnerId && other.VendorId == own.VendorId &&
           IsAcknowledgement(other.DocumentCode, form);
  });
}

bool IsPackedBy(TranslatorBase& translator, const std::string& productNo, double quantity) {
  RecordStore& store = translator.Records();
  ProductInner inner;
  inner.ProductNo = productNo;
  inner.InnerQty = quantity;
  if (translator.Try([&] { return Count(store, ProductInner::kByQuantity, inner); }) > 0) return true;
  Prepack prepack;
  prepack.ProductNo = productNo;
  prepack.PrepackQty = quantity;
  return translator.Try([&] { return Load(store, prepack); });
}

}  // namespace partnerkit::orders

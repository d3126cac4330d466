// Checks of an order line against products, prices and locations. Every fault is noted and clears `ok`; reading goes
// on, so that one run tells all that is wrong with an order.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>

#include "frame/translator_base.h"
#include "orders/listed_order.h"

namespace partnerkit::orders {

// How the messages of a partner's importer begin, round the order number.
struct CheckWords {
  std::string_view before = "...Cannot process PO ";
  std::string_view after = ", ";
};

// What a line says of its product. Texts as they stand in the line: the messages show them.
struct LineClaims {
  std::string_view productNo;
  std::string_view uom;
  std::string_view qualifier;
  std::string_view cost;
  std::string_view retail;
  std::string_view sku;
};

class OrderChecks {
 public:
  OrderChecks(TranslatorBase& translator, CallLog& log, std::string_view PONo, const CheckWords& words = {})
      : translator_(translator), log_(log), opening_(std::string(words.before).append(PONo).append(words.after)) {}

  bool Ok() const { return ok_; }

  // Notes a rejection that begins with the partner's words and the order number.
  void Reject(std::string_view message);

  // The product is there, is the partner's, and agrees in unit and symbology; the first fault ends the checks.
  void CheckProduct(const LineClaims& line);
  // The price is there, and as far as the document definition asks agrees in cost, retail and SKU.
  void CheckPrice(const LineClaims& line);
  // Whether the location is there; each is read once.
  bool LocationExists(std::string_view locationNo);
  void CheckLocation(std::string_view what, std::string_view locationNo);

 private:
  TranslatorBase& translator_;
  CallLog& log_;
  std::string opening_;
  bool ok_ = true;
  std::unordered_map<std::string, bool, TextHash, std::equal_to<>> locations_;
};

}  // namespace partnerkit::orders

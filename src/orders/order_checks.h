// Checks of an order line against products, prices and locations. Every fault is noted and clears `Ok`; reading goes
// on, so that one run tells all that is wrong with an order.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "frame/translator_base.h"
#include "orders/listed_order.h"

namespace partnerkit::orders {

enum class Symbology {
  kReject,
  kWarn,  // a difference is noted and the order posted all the same
  kSkip,
};

// How far a partner's lines are checked, and how the messages on products and prices begin, round the order number.
struct CheckRules {
  std::string_view before = "...Cannot process PO ";
  std::string_view after = ", ";
  std::string_view symbologyOf = "barcode ";  // how the message on a symbology calls the number and the claim
  std::string_view symbologyClaim = " symbology ";
  bool vendor = true;    // the product must be the partner's
  bool sameABN = false;  // a product of another partner will do when both have one Australian business number
  bool uom = true;
  Symbology symbology = Symbology::kReject;
  bool retail = true;  // retail price and SKU, when the document definition asks for them
};

// What a line says of its product. Texts as they stand in the line: the messages show them.
struct LineClaims {
  std::string_view productNo;
  std::string_view uom;
  std::string_view qualifier;
  std::string_view cost;
  std::string_view retail;
  std::string_view sku;
  bool needsPrice = false;  // a missing price record stops the order whatever other faults may pass
};

class OrderChecks {
 public:
  OrderChecks(TranslatorBase& translator, CallLog& log, std::string_view PONo)
      : translator_(translator), log_(log), PONo_(PONo) {}

  void SetRules(const CheckRules& rules) { rules_ = rules; }
  // From here on a fault of a product or price lets the order be stored, incomplete, for data maintenance or an order
  // acknowledgement to settle.
  void LetFaultsPass() { faultsPass_ = true; }
  bool FaultsPass() const { return faultsPass_; }

  bool Ok() const { return ok_; }
  bool PassedWithErrors() const { return errors_; }

  // Notes a rejection of the order: the usual opening, the order number and the message.
  void Reject(std::string_view message);
  // The same for a fault of a product or price, in the partner's own opening words.
  void RejectProduct(std::string_view message);

  // The product is there, is the partner's, and agrees in unit and symbology; the first fault ends the checks. The
  // product, when every check was passed.
  std::optional<Product> CheckProduct(const LineClaims& line);
  // Whether a product of this partner id may be on the order.
  bool IsPartners(const std::string& partnerId);
  // The price is there, and as far as the document definition asks agrees in cost, retail and SKU.
  ProductPrice CheckPrice(const LineClaims& line);
  void CheckRetail(const ProductPrice& price, std::string_view claimed);
  // The price record of the product; its absence is noted, and a price of 0 then stands in for it.
  ProductPrice ReadPrice(std::string_view productNo, bool needed = false);

  // The location, read once a call; null when there is none.
  const PartnerLocn* FindLocation(std::string_view locationNo);
  // Notes a missing location; `what` is "ship to" or "buying".
  void CheckLocation(std::string_view what, std::string_view locationNo);

 private:
  std::string Opening(std::string_view before, std::string_view after) const {
    return std::string(before).append(PONo_).append(after);
  }

  TranslatorBase& translator_;
  CallLog& log_;
  std::string PONo_;
  CheckRules rules_;
  bool faultsPass_ = false;
  bool ok_ = true;
  bool errors_ = false;
  std::unordered_map<std::string, std::optional<PartnerLocn>, TextHash, std::equal_to<>> locations_;
};

// "product 9312345678907 cost price 10.5 does not agree with database cost 11".
std::string Disagreement(std::string_view productNo, std::string_view what, std::string_view claimed,
                         std::string_view name, std::string_view stored);

}  // namespace partnerkit::orders

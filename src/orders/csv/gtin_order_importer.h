// The CSV importers of orders by trade item number (GTIN), whose partners also send responses and changes.
#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

// The packs of products that have the number on them.
std::vector<std::shared_ptr<ProductInner>> InnersOfGtin(TranslatorBase& translator, std::string_view gtin);
// Whether the inner's product may be on an order of this partner.
bool InnerIsPartners(TranslatorBase& translator, OrderChecks& checks, const ProductInner& inner);

// Order types and the response that takes an order away.
inline constexpr std::string_view kOrderType = "220";
inline constexpr std::string_view kChangeType = "231";
inline constexpr std::string_view kRejectionResponse = "27";

// clang-format off
// Only a change may touch a stored order.
inline constexpr OrderRule kGtinStoredOrder[] = {
    {.otherType = kChangeType,                               .number = kRejection, .message = words::kAlreadyExists},
    {.response = kRejectionResponse, .jobs = Jobs::kNone, .number = kWarning,   .message = words::kResponseDeleted, .fate = Fate::kCancelIfDeleted},
    {.jobs = Jobs::kNone,                                    .number = kWarning,   .message = words::kChangeShort,     .fate = Fate::kReplace},
    {.jobs = Jobs::kSome,                                    .number = kRejection, .message = words::kChangeAllocated},
};
inline constexpr OrderRule kGtinNewOrder[] = {
    {.response = kRejectionResponse, .number = kRejection, .message = words::kRejectionOfNothing, .fileNumber = true},
};
// clang-format on

// What their files have besides, and haven't.
inline constexpr OrderField kGtinAdded[] = {
    OrderField::INTDATE,        OrderField::RESPONSETYPECODE, OrderField::DELIVERYPARTY, OrderField::REQUIRED,
    OrderField::TRADEDQUANTITY, OrderField::DELDATE,          OrderField::PROMODATE,     OrderField::STATUS,
    OrderField::INNEREAN,       OrderField::INNERQTY};
inline constexpr OrderField kGtinRemoved[] = {
    OrderField::CUSTCAT,           OrderField::DEPTNO,          OrderField::ADDATE,
    OrderField::STOREZONE,         OrderField::UNITMEASURECODE, OrderField::ORDERQUANTITY,
    OrderField::SKUPRODUCTKEYCODE, OrderField::RETAILUNITPRICE};

// clang-format off
inline constexpr FieldText<Order> kGtinHeaderTexts[] = {
    {&Order::SupplierNo, OrderField::SUPPLIERNO},
    {&Order::Header2,    OrderField::DELIVERYPARTY, false},
};
inline constexpr FieldText<OrderLine> kGtinLineTexts[] = {
    {&OrderLine::LineNo,           OrderField::SEQUENTIALLINENO, false},
    {&OrderLine::ProductQualifier, OrderField::PRODUCTQUALIFIER, false},
    {&OrderLine::PriceCode,        OrderField::UNITPRICECODE,    false},
};
inline constexpr FieldNumber<double> kGtinLineNumbers[] = {
    {&OrderLine::Cost, OrderField::UNITPRICE},
};
// clang-format on

inline constexpr PostingValues kGtinPosting{
    .storedOrder = kGtinStoredOrder,
    .newOrder = kGtinNewOrder,
    .headerTexts = kGtinHeaderTexts,
    .quantity = OrderField::TRADEDQUANTITY,
    .lineTexts = kGtinLineTexts,
    .lineNumbers = kGtinLineNumbers,
    .checks = {.sameABN = true, .retail = false},
    .checksBuyingLocn = false,
};

class GtinOrderImporter : public CsvOrderImporter {
 protected:
  using CsvOrderImporter::CsvOrderImporter;

  // A further check of the inner that the line's number leads to.
  virtual void CheckInner(Posting&, const ProductInner&) {}

  void FillHeader(Posting& posting) override;
  bool LineCounts() override;
  LineProduct CheckLineProduct(Posting& posting) override;
};

}  // namespace partnerkit::orders

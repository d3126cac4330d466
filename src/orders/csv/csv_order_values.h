// What the CSV importers of the partners do differently, as values: a partner's class names its departures only.
#pragma once

#include <span>
#include <string_view>

#include "frame/translator_base.h"
#include "orders/csv/order_fields.h"
#include "orders/order_checks.h"
#include "orders/order_rules.h"

namespace partnerkit::orders {

inline constexpr OrderField kTransactionKey[] = {OrderField::INTCONTROLNO, OrderField::GRPCONTROLNO,
                                                 OrderField::TRNCONTROLNO};
inline constexpr OrderField kLineKey[] = {OrderField::PONUMBER, OrderField::SEQUENTIALLINENO,
                                          OrderField::BUYINGLOCPARTNERNO, OrderField::INCOMINGPRODUCTNO};
inline constexpr OrderField kOrderKey[] = {OrderField::PONUMBER};

inline constexpr OrderField kAddresses[] = {OrderField::PARTNEREDIADDR, OrderField::COMPANYEDIADDR};

// A text of a record that is one field of the line: as it stands, or null when empty.
template <class R>
struct FieldText {
  Text R::*member;
  OrderField field;
  bool nullWhenEmpty = true;
};

// A number of an order line that is one field, read from its start.
template <class T>
struct FieldNumber {
  T OrderLine::*member;
  OrderField field;
};

// clang-format off
inline constexpr FieldText<Order> kHeaderTexts[] = {
    {&Order::DeptNo,     OrderField::DEPTNO},
    {&Order::SupplierNo, OrderField::SUPPLIERNO},
    {&Order::CustCat,    OrderField::CUSTCAT},
};
inline constexpr FieldText<OrderLine> kLineTexts[] = {
    {&OrderLine::LineNo,    OrderField::SEQUENTIALLINENO,  false},
    {&OrderLine::UOM,       OrderField::UNITMEASURECODE,   false},
    {&OrderLine::PriceCode, OrderField::UNITPRICECODE,     false},
    {&OrderLine::SKU,       OrderField::SKUPRODUCTKEYCODE, false},
};
inline constexpr FieldNumber<double> kLineNumbers[] = {
    {&OrderLine::Cost,        OrderField::UNITPRICE},
    {&OrderLine::RetailPrice, OrderField::RETAILUNITPRICE},
};
inline constexpr OrderRule kUsualStoredOrder[] = {
    {.purpose = "07",   .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,     .fate = Fate::kReplace},
    {.purpose = "05",   .jobs = Jobs::kNone, .number = kWarning,   .message = words::kChange,        .fate = Fate::kReplace},
    {.purpose = "01 1", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kCancel,        .fate = Fate::kCancel},
    {.purpose = "01 1", .jobs = Jobs::kSome, .number = kRejection, .message = words::kCancelWithJob},
    {.incomplete = true,                     .number = kWarning,   .message = words::kIncomplete,    .fate = Fate::kReplace},
    {                                        .number = kRejection, .message = words::kAlreadyExists},
};
inline constexpr OrderRule kRefuseCancellation[] = {
    {.purpose = "01 1", .number = kRejection, .message = words::kCancelOfNothing, .fate = Fate::kCancel},
};
// clang-format on

// How one order is posted.
struct PostingValues {
  std::string_view procedure = "Process";  // what the log calls the operation

  // An order already stored under the number; none of the rules is asked about one with the same control numbers.
  Words announceStored = {};  // noted beforehand, off the caller's error list
  std::span<const OrderRule> storedOrder = kUsualStoredOrder;
  // A number that isn't stored, or no longer.
  std::span<const OrderRule> newOrder = kRefuseCancellation;
  std::string_view acceptDirectToStore = {};  // a read option with which no order counts as direct to store

  // The header, beside what every partner sends. An advertised date is kept as month and day.
  std::span<const FieldText<Order>> headerTexts = kHeaderTexts;
  bool advertisedDate = false;

  // The lines.
  OrderField quantity = OrderField::ORDERQUANTITY;
  std::span<const FieldText<OrderLine>> lineTexts = kLineTexts;
  std::span<const FieldNumber<double>> lineNumbers = kLineNumbers;
  std::span<const FieldNumber<std::optional<double>>> lineNumbersOrNull = {};
  bool repeatsAddUp = false;  // a product repeated at a location adds to the line there instead of stopping the order

  CheckRules checks = {};

  // The locations.
  std::string_view directToStore = {};  // a ship-to of this name stands for the buying location
  bool checksBuyingLocn = true;
};

struct CsvOrderValues {
  std::string_view className;

  // The map file: fields that must be in it beside the usual ones, usual ones that needn't, and fields that are read
  // when it names them.
  std::span<const OrderField> added = {};
  std::span<const OrderField> removed = {};
  std::span<const OrderField> optional = {};
  bool quotesProtectCommas = false;

  // Listing.
  std::span<const OrderField> orderKey = kOrderKey;  // what `OrderNumber` looks at
  std::span<const OrderField> lineKey = kLineKey;
  std::span<const OrderField> transactionKey = kTransactionKey;
  bool shipToForBuyingLocn = false;  // an empty buying location is the ship-to
  bool skipsBlankLines = false;      // they leave the file, too
  bool nullControls = false;         // empty control numbers are stored as null
  bool importsProducts = false;      // a product file of the supplier is read at the end of listing

  PostingValues posting = {};

  // Settling.
  bool keepsTurnedAway = false;        // an order turned away stays in the file
  bool settlesByControls = false;      // a line leaves with its own transaction, not with its order number
  bool deletesEnvelopes = false;       // `Delete` takes envelope segments inside the transaction along
  bool deleteOnEmptyAnywhere = false;  // the option counts anywhere in the option text, not only as the whole of it
};

}  // namespace partnerkit::orders

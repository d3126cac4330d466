// What the X12 order importers of the partners do differently, as values: a partner's class names its departures only.
#pragma once

#include <optional>
#include <span>
#include <string_view>

#include "orders/order_checks.h"
#include "orders/order_rules.h"
#include "orders/x12/x12_segment.h"

namespace partnerkit::orders {

// The mark in the header of a group that was acknowledged.
inline constexpr std::string_view kAcknowledged = "*FA DONE*";

// A date of the header, by the qualifier of its DTM.
struct DateOfOrder {
  std::string_view qualifier;
  std::optional<DateTime> Order::*member;
};

// A number of the PO4, null when it is empty.
struct PackNumber {
  std::optional<double> OrderLine::*member;
  int element;
};

// Where a line segment has what every partner sends.
struct LineElements {
  std::string_view tag = "PO1";
  int lineNo = 1;
  int quantity = 2;
  int uom = 3;
  int cost = 4;
  int priceCode = 5;
  int qualifier = 6;
  int productNo = 7;
  bool needsPrice = false;  // without a price record the order is not posted, whatever other faults may pass
};

// A qualifier, and the SKU behind it.
struct SkuElements {
  std::string_view qualifiers = {};  // that count; none when the partner sends no SKU
  bool byFront = false;              // the qualifier's first two characters tell
  ElementForm atEnd = {};            // of an SKU that ends the segment
};

// clang-format off
inline constexpr OrderRule kUsualX12StoredOrder[] = {
    {.purpose = "07", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,  .fate = Fate::kReplace},
    {.incomplete = true,                   .number = kWarning,   .message = words::kIncomplete, .fate = Fate::kReplace},
    {                                      .number = kRejection, .message = words::kAlreadyExists},
};
inline constexpr DateOfOrder kUsualDates[] = {
    {"063", &Order::CancelAfter},
    {"064", &Order::NotBefore},
};
inline constexpr LineElements kUsualLine[] = {{}};
// clang-format on

struct X12OrderValues {
  std::string_view className;

  // Segments.
  char otherEnd = '\0';           // ends a segment, beside "~" and line ends
  bool wholeLines = false;        // a line is a segment, without "~", and apostrophes are no part of it
  bool cutsApostrophe = false;    // one apostrophe at a segment's end is no part of it
  bool keepsBareSegments = true;  // a bare "~" is a segment that a rewrite keeps

  // Listing.
  bool archives = true;            // each file is copied to the archive folder when it is listed
  bool addressesOf13 = false;      // addresses are compared as 13 characters, blanks and all
  std::string_view groups = "PO";  // functional codes of the groups of orders, a blank between them
  std::string_view sets = "850";
  std::string_view beginnings = "BEG";
  std::size_t longestControl = std::string_view::npos;  // characters of a transaction's control number
  bool keepsSourceFile = false;                         // an order knows the file it came in

  // Posting.
  std::span<const OrderRule> storedOrder = kUsualX12StoredOrder;
  std::span<const OrderRule> newOrder = {};
  std::span<const DateOfOrder> dates = kUsualDates;
  bool datesDefaultToToday = false;
  ElementForm n1Form = {ElementForm::kLast};
  bool showsWholeN1 = false;              // a missing location is told with all of its number, not with a part
  std::string_view directToStore = {};    // an N1 of this name stands for each store
  std::string_view storeWord = "buying";  // what the messages call the location of an SDQ
  bool rechecksStores = false;            // an SDQ's location is looked up also when it was the last one looked up
  std::span<const LineElements> lines = kUsualLine;
  ElementForm productForm = {};
  bool countsLines = false;  // lines are numbered as they come
  SkuElements sku = {};
  std::optional<ElementForm> retail = {};  // of the CTP's price; nothing when the partner sends none
  std::span<const PackNumber> packNumbers = {};
  std::optional<ElementForm> packUOM = {};
  CheckRules checks = {.retail = false};
  int looseNumberLength = 0;                            // product numbers of this length are not checked for symbology
  ElementForm quantityForm = {ElementForm::kSpan, 15};  // of a quantity that ends the SDQ
  bool exports = false;                                 // a posted order goes on to the component that the options name

  // Settling.
  bool cancelSettles = true;     // Cancel settles the file when anything was listed
  bool deletesTemporary = true;  // also when nothing is left and it has served no purpose
};

}  // namespace partnerkit::orders

// An order in memory: the four kinds of record of one transaction, complete before any of them is stored.
#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "partnerkit/records.h"
#include "values/keyed_list.h"

namespace partnerkit::orders {

struct OrderDraft {
  Order header;
  OrderLineList lines;          // by the product number as ordered
  OrderLocnList locations;      // by buying location
  OrderLocnLineList locnLines;  // by LocnLineKey

  // The number that a location line's product was ordered by: its GTIN, when the product was found through one.
  static std::string_view LineKey(const OrderLocnLine& locnLine) {
    return locnLine.GTIN ? std::string_view(*locnLine.GTIN) : std::string_view(locnLine.ProductNo);
  }
  // A location's number and a product's may run into each other ("1" and "23", "12" and "3"), so the key keeps them
  // apart.
  static std::string LocnLineKey(std::string_view buyingLocn, std::string_view productNo) {
    return std::string(buyingLocn).append(1, '\0').append(productNo);
  }
};

}  // namespace partnerkit::orders

// The columns that partners' CSV order files carry, by the names that map files give them.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace partnerkit::orders {

// The order is that in which a missing one is reported.
enum class OrderField : std::uint8_t {
  INTCONTROLNO,
  GRPCONTROLNO,
  TRNCONTROLNO,
  PARTNEREDIADDR,
  COMPANYEDIADDR,
  POPURPOSECODE,
  POTYPECODE,
  PONUMBER,
  PODATE,
  SUPPLIERNO,
  CUSTCAT,
  DEPTNO,
  NOTBEFORE,
  CANCAFTER,
  ADDATE,
  STOREZONE,
  BUYINGLOCPARTNERNO,
  SHIPTOLOCPARTNERNO,
  SEQUENTIALLINENO,
  PRODUCTQUALIFIER,
  INCOMINGPRODUCTNO,
  UNITMEASURECODE,
  UNITPRICECODE,
  UNITPRICE,
  ORDERQUANTITY,
  SKUPRODUCTKEYCODE,
  RETAILUNITPRICE,
  ALLOCATEQUANTITY,
  CUSTOMERREF,
  CUSTOMERNO,
  STYLE,
  COLOUR,
  SIZE,
  DESCRIPTION,
  WEIGHT,
  VOLUME,
  BIN,
  LINEREF,
};

inline constexpr std::array<std::string_view, 38> kOrderFieldNames = {
    "INTCONTROLNO",
    "GRPCONTROLNO",
    "TRNCONTROLNO",
    "PARTNEREDIADDR",
    "COMPANYEDIADDR",
    "POPURPOSECODE",
    "POTYPECODE",
    "PONUMBER",
    "PODATE",
    "SUPPLIERNO",
    "CUSTCAT",
    "DEPTNO",
    "NOTBEFORE",
    "CANCAFTER",
    "ADDATE",
    "STOREZONE",
    "BUYINGLOCPARTNERNO",
    "SHIPTOLOCPARTNERNO",
    "SEQUENTIALLINENO",
    "PRODUCTQUALIFIER",
    "INCOMINGPRODUCTNO",
    "UNITMEASURECODE",
    "UNITPRICECODE",
    "UNITPRICE",
    "ORDERQUANTITY",
    "SKUPRODUCTKEYCODE",
    "RETAILUNITPRICE",
    "ALLOCATEQUANTITY",
    "CUSTOMERREF",
    "CUSTOMERNO",
    "STYLE",
    "COLOUR",
    "SIZE",
    "DESCRIPTION",
    "WEIGHT",
    "VOLUME",
    "BIN",
    "LINEREF",
};

inline constexpr std::size_t kOrderFields = kOrderFieldNames.size();

constexpr std::string_view Name(OrderField field) { return kOrderFieldNames[static_cast<std::size_t>(field)]; }

}  // namespace partnerkit::orders

// The demo's packing: what a warehouse does between the import of an order and its ship notice.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "host/sql_host.h"

namespace partnerkit::cli {

struct PackedCarton {
  std::int32_t id;
  std::string sscc;
  std::vector<std::string> contents;  // "16 x 9312347000133"
};

struct PackedOrder {
  std::string PONo;
  std::vector<PackedCarton> cartons;
};

// Serial shipping container code: an extension digit, the demo company's GS1 prefix, a serial number, and GS1's check
// digit.
std::string Sscc(std::int32_t serial);

// Packs the newest order of the partner whole: a slip for each of its locations, cartons of a fixed size, and one
// shipment that arrives on the first day that the order allows. Nothing is packed where there is no order.
PackedOrder PackNewestOrder(host::SqlHost& host, const std::string& partnerId);

}  // namespace partnerkit::cli

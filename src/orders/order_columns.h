// The grid of the order importers.
#pragma once

#include "partnerkit/values.h"

namespace partnerkit::orders {

inline ColumnTable OrderColumns() {
  return {{"PO Number", 0, 2600}, {"Date", 2, 1300}, {"Trans Set", 0, 2000}, {"Result", 0, 3000}};
}

}  // namespace partnerkit::orders

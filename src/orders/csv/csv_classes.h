// The CSV order importers, one per partner and document.
#pragma once

#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

// MGB stores: the family's model.
class clsMGB850csv final : public CsvOrderImporter {
 public:
  explicit clsMGB850csv(const Ports& ports);
};

}  // namespace partnerkit::orders

// The importer of MGB's orders by the business-to-business translator, for the operation that only it has.
#pragma once

#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

class clsMGBBT850csv final : public CsvOrderImporter {
 public:
  explicit clsMGBBT850csv(const Ports& ports);

  // Posts a row as a merchandise order, whatever its store zone says.
  std::int32_t MerchPOProcess(std::int32_t a_lRowNum, ErrorList& vtErrorLog);

 private:
  const PostingValues& ValuesOf() const override;
  void FillHeader(Posting& posting) override;
  Next LookAtLine(Posting& posting) override;
};

}  // namespace partnerkit::orders

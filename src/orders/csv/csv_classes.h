// The CSV order importers, one per partner and document.
#pragma once

#include "orders/csv/csv_order_importer.h"
#include "orders/csv/gtin_order_importer.h"

namespace partnerkit::orders {

// --- Orders by store, checked against products

// MGB stores: the family's norm.
class clsMGB850csv final : public CsvOrderImporter {
 public:
  explicit clsMGB850csv(const Ports& ports);
};

// Myer drop shipments.
class clsMYERDropShipPOcsv final : public CsvOrderImporter {
 public:
  explicit clsMYERDropShipPOcsv(const Ports& ports);
};

class clsGHPL850csv final : public CsvOrderImporter {
 public:
  explicit clsGHPL850csv(const Ports& ports);

 private:
  void FillLine(Posting& posting, OrderLine& line) override;
};

class clsTarget850csv final : public CsvOrderImporter {
 public:
  explicit clsTarget850csv(const Ports& ports);

 private:
  LineProduct CheckLineProduct(Posting& posting) override;
  void FillLine(Posting& posting, OrderLine& line) override;
};

// MGB by the business-to-business translator: merchandise orders and, with a store zone, customers' orders.
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

// --- Orders with versions, releases and pack sizes

class clsKMart850csv final : public CsvOrderImporter {
 public:
  explicit clsKMart850csv(const Ports& ports);
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;

 private:
  std::string_view OrderNumber(std::string& number) const override;
  bool BeginPosting(Posting& posting) override;
  void FillHeader(Posting& posting) override;
  bool LineCounts() override;
  void CheckLineLocations(Posting& posting) override;

  bool answersOrders_ = false;  // an order acknowledgement goes back to the partner
};

class clsOfficeworks850csv final : public CsvOrderImporter {
 public:
  explicit clsOfficeworks850csv(const Ports& ports);

 private:
  void FillHeader(Posting& posting) override;
  void CheckFoundProduct(Posting& posting, const Product& product) override;
  void FillLine(Posting& posting, OrderLine& line) override;

  double PackQuantity(OrderField field);
  void CheckPack(Posting& posting, const std::string& number, std::string_view what, double quantity, double units);
};

// --- Orders by GTIN, with responses

// CML by way of the freight forwarder.
class clsCMLFLFPOcsv final : public GtinOrderImporter {
 public:
  explicit clsCMLFLFPOcsv(const Ports& ports);

 private:
  std::string_view OrderNumber(std::string& number) const override;
  bool BeginPosting(Posting& posting) override;
  void FillLine(Posting& posting, OrderLine& line) override;
};

class clsTargetBulkPOcsv final : public GtinOrderImporter {
 public:
  explicit clsTargetBulkPOcsv(const Ports& ports);

 private:
  void CheckInner(Posting& posting, const ProductInner& inner) override;
  void FillLine(Posting& posting, OrderLine& line) override;
};

// Coles, into its distribution centres.
class clsColesEIDCPOcsv final : public CsvOrderImporter {
 public:
  explicit clsColesEIDCPOcsv(const Ports& ports);

 private:
  LineProduct CheckLineProduct(Posting& posting) override;
  double LineQuantity(const Posting& posting) override;
  void CheckLineLocations(Posting& posting) override;

  Text PrepackProduct(const std::string& number);
  std::shared_ptr<ProductInner> CartonInner(Posting& posting, const std::string& number);
  void CheckGstPrices(Posting& posting, std::string_view productNo);
  void AddAddress();
};

}  // namespace partnerkit::orders

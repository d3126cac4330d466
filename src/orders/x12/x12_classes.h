// The X12 order importers, one per partner and document.
#pragma once

#include "orders/x12/x12_order_importer.h"

namespace partnerkit::orders {

// MGB stores: the family's norm.
class clsMGB850ansix12 final : public X12OrderImporter {
 public:
  explicit clsMGB850ansix12(const Ports& ports);

 private:
  void ReadOther(Posting& posting) override;
  void TakeDate(Order& order) override;
};

class clsTarget850ansix12 final : public X12OrderImporter {
 public:
  explicit clsTarget850ansix12(const Ports& ports);

 private:
  void ReadOther(Posting& posting) override;
};

class clsGHPL850ansix12 final : public X12OrderImporter {
 public:
  explicit clsGHPL850ansix12(const Ports& ports);

 private:
  void ReadOther(Posting& posting) override;
};

// Kmart: purchase orders and changes to them, releases of blanket orders, and orders that are stored with their faults.
class clsKMart850ansix12 final : public X12OrderImporter {
 public:
  explicit clsKMart850ansix12(const Ports& ports);
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;

 private:
  std::string OrderNumber() override;
  void BeginPosting(Posting& posting) override;
  void FillHeader(Posting& posting) override;
  void ReadOther(Posting& posting) override;
  std::string ReleaseNo();

  bool answersOrders_ = false;  // an order acknowledgement goes back to the partner
};

}  // namespace partnerkit::orders

// The CSV ship notices, one per partner and document.
#pragma once

#include "shipment/csv/csv_notice.h"

namespace partnerkit::shipment {

// --- A notice for each order on a shipment

// MGB stores: the family's norm.
class clsMGB856csv final : public CsvNotice {
 public:
  explicit clsMGB856csv(const Ports& ports);
};

// Myer drop shipments.
class clsMYERDropShipDAcsv final : public CsvNotice {
 public:
  explicit clsMYERDropShipDAcsv(const Ports& ports);
};

class clsTarget856csv final : public CsvNotice {
 public:
  explicit clsTarget856csv(const Ports& ports);

 private:
  bool WriteNotice(Notice& notice) override;
  bool FollowOn(Notice& notice) override;
};

// MGB by the business-to-business translator, with sub packs.
class clsMGBBT856csv final : public CsvNotice {
 public:
  explicit clsMGBBT856csv(const Ports& ports);

 private:
  bool FillPack(Notice& notice, const Pack& pack) override;
};

// --- A notice for each ship-to of an order on a shipment

class clsKMart856csv final : public CsvNotice {
 public:
  explicit clsKMart856csv(const Ports& ports);
};

class clsOfficeworks856csv final : public CsvNotice {
 public:
  explicit clsOfficeworks856csv(const Ports& ports);
};

// CML by way of the freight forwarder.
class clsCMLFLFDAcsv final : public CsvNotice {
 public:
  explicit clsCMLFLFDAcsv(const Ports& ports);

 private:
  bool Prepare(Notice& notice) override;
  bool CheckNotice(Notice& notice) override;
};

class clsTargetBulkDAcsv final : public CsvNotice {
 public:
  explicit clsTargetBulkDAcsv(const Ports& ports);
};

}  // namespace partnerkit::shipment

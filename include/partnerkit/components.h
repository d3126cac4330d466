// Classes of other makers that a host's data names by ProgID, and that the classes of this library hand their results
// to. An embedding program brings the factories; without one, no such class can be created.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <span>
#include <string_view>
#include <vector>

namespace partnerkit {

struct ASN;
struct EDIDoc;
struct Order;
struct Pack;
struct Partner;
struct Shipment;
struct Vendor;
class System;

// Hands a posted order on, to a file or another program. Named in `EDIDoc.Options` as XOLE="ProgID", and bound to the
// document definition that has this ProgID for the same partner and supplier.
class OrderExport {
 public:
  virtual ~OrderExport() = default;
  virtual void Init(const EDIDoc& document, System& system, const Partner& partner, const Vendor& vendor) = 0;
  // False when the order could not be handed on; it stays posted. May add to the ids of the log records that the host
  // is shown for the order.
  virtual bool Process(const Order& order, std::vector<std::int32_t>& logIds) = 0;
  virtual void Term() = 0;
};

// A carrier's own papers for a compiled notice. Named in `PartnerAddress.ProcessProgID` of the shipment's carrier.
class CarrierComponent {
 public:
  virtual ~CarrierComponent() = default;
  // `packs` are those of the notice. May add to the ids of the log records that the host is shown for it.
  virtual void Process(System& system, const Shipment& shipment, const ASN& notice,
                       std::span<const std::shared_ptr<Pack>> packs, std::vector<std::int32_t>& logIds) = 0;
  virtual void Term() = 0;
};

// Hands a compiled notice on. Named in `Partner.ASNExtension`.
class NoticeExtension {
 public:
  virtual ~NoticeExtension() = default;
  virtual void Init(System& system, const Partner& partner, const Vendor& vendor, const EDIDoc& document) = 0;
  // 0 when the notice could not be handed on; it stays compiled, but its row counts as not done.
  virtual std::int32_t Process(const ASN& notice, std::vector<std::int32_t>& logIds) = 0;
  virtual void Term() = 0;
};

struct ComponentFactory {
  // A new object of the class; null when it can't be created.
  std::function<std::unique_ptr<OrderExport>(std::string_view progId)> orderExport;
  std::function<std::unique_ptr<CarrierComponent>(std::string_view progId)> carrier;
  std::function<std::unique_ptr<NoticeExtension>(std::string_view progId)> noticeExtension;
};

}  // namespace partnerkit

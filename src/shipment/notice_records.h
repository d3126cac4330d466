// The records that a notice's values come from, read when they are asked for and kept while they hold.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <vector>

#include "frame/translator_base.h"

namespace partnerkit::shipment {

// A pack and a line of it at a time. A record that isn't there reads as an empty one.
class NoticeRecords {
 public:
  explicit NoticeRecords(TranslatorBase& translator) : translator_(translator) {}

  // A new notice, whose packs share its shipment and order. What the host may have changed since the last is read anew.
  void SetNotice(const ASN& asn, Text firstInvoiceNo);
  // The pack must outlive the next one's setting, as must the line.
  void SetPack(const partnerkit::Pack& pack);
  void SetLine(const PackLine& line);

  // Of all notices that still wait, this one's included; and the lines of this one so far.
  std::size_t waitingPacks = 0;
  double waitingCartons = 0;
  std::size_t linesWritten = 0;

  const EDIDoc& Document() const { return translator_.Document(); }
  const partnerkit::Vendor& Vendor() const { return translator_.OwnCompany(); }

  const ASN& Asn() const { return *asn_; }
  // Of the notice's first pack.
  const Text& FirstInvoiceNo() const { return firstInvoiceNo_; }
  const partnerkit::Shipment& Shipment() const { return shipment_; }
  const partnerkit::Order& Order() const { return order_; }
  bool OrderComplete();
  bool OrderOpenOnShipment();

  const partnerkit::Pack& Pack() const { return *pack_; }
  // Null when the pack has no type.
  const PackType* Type();
  std::vector<std::shared_ptr<PackLine>> Lines();
  std::vector<std::shared_ptr<partnerkit::Pack>> SubPacks();
  const Job& PackJob();
  const OrderLocn& SlipLocn();

  const PackLine& Line() const { return *line_; }
  // Null when there is no such product.
  const Product* LineProduct();
  const PSlipLine& SlipLine();
  const OrderLocnLine& LocnLine();
  const OrderLine& OrderedLine();
  const Product* OrderedProduct();

 private:
  // Lines of the order by their ids, and how many had to be asked for.
  template <class R>
  struct Ordered {
    std::unordered_map<std::int32_t, R> kept;
    int asked = 0;
  };

  template <class R>
  bool Read(R& record);
  template <class R, class K>
  const R& Kept(std::unordered_map<K, R>& kept, const K& key, K R::*member);
  template <class R>
  void Fetch(std::unordered_map<std::int32_t, R>& into, const Lookup& lookup, const R& probe, std::int32_t R::*id);
  template <class R>
  const R& OfOrder(Ordered<R>& lines, std::int32_t id, std::int32_t R::*member);
  const PSlip& Slip();
  const Product* FindProduct(const std::string& number);

  TranslatorBase& translator_;
  const ASN* asn_ = nullptr;
  Text firstInvoiceNo_;
  partnerkit::Shipment shipment_;
  partnerkit::Order order_;
  std::optional<bool> complete_, open_;
  const partnerkit::Pack* pack_ = nullptr;
  const PackLine* line_ = nullptr;
  std::unordered_map<std::int32_t, PSlip> slips_;
  std::unordered_map<std::int32_t, Job> jobs_;
  std::unordered_map<std::int32_t, OrderLocn> locns_;
  std::unordered_map<std::string, PackType> types_;
  std::unordered_map<std::string, std::optional<Product>> products_;
  std::unordered_map<std::int32_t, PSlipLine> slipLines_;
  Ordered<OrderLine> orderLines_;
  Ordered<OrderLocnLine> locnLines_;
  std::unordered_set<std::int32_t> slipsFetched_;
  const PSlipLine* slipLine_ = nullptr;
  const OrderLocnLine* locnLine_ = nullptr;
};

}  // namespace partnerkit::shipment

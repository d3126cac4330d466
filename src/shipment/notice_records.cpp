#include "shipment/notice_records.h"

#include <utility>

namespace partnerkit::shipment {

template <class R>
bool NoticeRecords::Read(R& record) {
  return translator_.Try([&] { return Load(translator_.Records(), record); });
}

template <class R, class K>
const R& NoticeRecords::Kept(std::unordered_map<K, R>& kept, const K& key, K R::*member) {
  const auto [entry, isNew] = kept.try_emplace(key);
  if (isNew && key != K()) {
    entry->second.*member = key;
    Read(entry->second);
  }
  return entry->second;
}

// What is asked for one by one costs several times as much.
template <class R>
void NoticeRecords::Fetch(std::unordered_map<std::int32_t, R>& into, const Lookup& lookup, const R& probe,
                          std::int32_t R::*id) {
  translator_.Try([&] {
    R record;
    const auto next = [&, first = true]() mutable -> void* {
      if (!first) into.try_emplace(record.*id, std::move(record));
      first = false;
      record = {};
      return &record;
    };
    translator_.Records().Select(R::kType, lookup, &probe, next);
    if (record.*id != 0) into.try_emplace(record.*id, std::move(record));
  });
}

void NoticeRecords::SetNotice(const ASN& asn, Text firstInvoiceNo) {
  asn_ = &asn;
  firstInvoiceNo_ = std::move(firstInvoiceNo);
  shipment_ = {};
  shipment_.Id = asn.ShipmentId;
  Read(shipment_);
  order_ = {};
  order_.OrderId = asn.OrderId;
  Read(order_);
  complete_.reset();
  open_.reset();
  slips_.clear();
  jobs_.clear();
  locns_.clear();
  orderLines_ = {};
  slipLines_.clear();
  locnLines_ = {};
  slipsFetched_.clear();
  types_.clear();
  products_.clear();
}

void NoticeRecords::SetPack(const partnerkit::Pack& pack) { pack_ = &pack; }

void NoticeRecords::SetLine(const PackLine& line) {
  line_ = &line;
  slipLine_ = nullptr;
  locnLine_ = nullptr;
}

bool NoticeRecords::OrderComplete() {
  if (!complete_) complete_ = translator_.Try([&] { return translator_.Host().OrderComplete(order_.OrderId); });
  return *complete_;
}

bool NoticeRecords::OrderOpenOnShipment() {
  if (!open_) {
    open_ = translator_.Try([&] { return translator_.Host().OrderOpenOnShipment(shipment_.Id, order_.OrderId); });
  }
  return *open_;
}

const PackType* NoticeRecords::Type() {
  return pack_->PackTypeId ? &Kept(types_, *pack_->PackTypeId, &PackType::PackTypeId) : nullptr;
}

std::vector<std::shared_ptr<PackLine>> NoticeRecords::Lines() {
  PackLine probe;
  probe.PackId = pack_->Id;
  return translator_.Try([&] { return Select(translator_.Records(), PackLine::kByPack, probe); });
}

std::vector<std::shared_ptr<partnerkit::Pack>> NoticeRecords::SubPacks() {
  partnerkit::Pack probe;
  probe.LeadPackId = pack_->Id;
  return translator_.Try([&] { return Select(translator_.Records(), partnerkit::Pack::kByLeadPack, probe); });
}

const PSlip& NoticeRecords::Slip() { return Kept(slips_, pack_->PSlipId, &PSlip::Id); }
const Job& NoticeRecords::PackJob() { return Kept(jobs_, Slip().JobId, &Job::JobId); }
const OrderLocn& NoticeRecords::SlipLocn() { return Kept(locns_, Slip().OrderLocnId, &OrderLocn::LocnId); }

const Product* NoticeRecords::FindProduct(const std::string& number) {
  const auto [entry, isNew] = products_.try_emplace(number);
  if (isNew) {
    Product product;
    product.ProductNo = number;
    if (Read(product)) entry->second = std::move(product);
  }
  return entry->second ? &*entry->second : nullptr;
}

const Product* NoticeRecords::LineProduct() { return FindProduct(line_->APN); }
const Product* NoticeRecords::OrderedProduct() { return FindProduct(OrderedLine().ProductNo); }

// A slip's cartons hold its lines, by and by all of them.
const PSlipLine& NoticeRecords::SlipLine() {
  if (slipLine_ == nullptr) {
    if (!slipLines_.contains(line_->PSlipLineId) && pack_->PSlipId != 0 &&
        slipsFetched_.insert(pack_->PSlipId).second) {
      PSlipLine probe;
      probe.PSlipId = pack_->PSlipId;
      Fetch(slipLines_, PSlipLine::kByPSlip, probe, &PSlipLine::LineId);
    }
    slipLine_ = &Kept(slipLines_, line_->PSlipLineId, &PSlipLine::LineId);
  }
  return *slipLine_;
}

// A notice of a few cartons of a long order does without most of the order's lines.
template <class R>
const R& NoticeRecords::OfOrder(Ordered<R>& lines, std::int32_t id, std::int32_t R::*member) {
  constexpr int kFew = 8;
  if (!lines.kept.contains(id) && ++lines.asked == kFew) {
    R probe;
    probe.OrderId = order_.OrderId;
    Fetch(lines.kept, R::kByOrder, probe, member);
  }
  return Kept(lines.kept, id, member);
}

const OrderLocnLine& NoticeRecords::LocnLine() {
  if (locnLine_ == nullptr) locnLine_ = &OfOrder(locnLines_, SlipLine().OrderLocnLineId, &OrderLocnLine::Id);
  return *locnLine_;
}

const OrderLine& NoticeRecords::OrderedLine() { return OfOrder(orderLines_, LocnLine().LineId, &OrderLine::LineId); }

}  // namespace partnerkit::shipment

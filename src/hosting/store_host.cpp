#include "partnerkit/store_host.h"

#include <algorithm>
#include <limits>
#include <map>
#include <set>
#include <tuple>

#include "partnerkit/run_time_error.h"

namespace partnerkit {
namespace {

constexpr std::int32_t kCompiled = 8;

std::int32_t& CounterOf(Partner& partner, Counter counter) {
  switch (counter) {
    case Counter::kInterchangeNo:
      return partner.LastInterchangeNo;
    case Counter::kGroupNo:
      return partner.LastGroupNo;
    case Counter::kASNNo:
      break;
  }
  return partner.LastASNNo;
}

[[noreturn]] void Fail(std::int32_t number, std::string_view before, std::string_view name, std::string_view behind) {
  throw RunTimeError(number, std::string(before).append(name).append(behind));
}

std::int32_t Draw(RecordStore& store, std::string_view partnerId, Counter counter) {
  Partner partner;
  partner.PartnerId = partnerId;
  if (!Load(store, partner)) Fail(run_time::kDatabase, "There is no partner \"", partnerId, "\"");
  std::int32_t& last = CounterOf(partner, counter);
  if (last == std::numeric_limits<std::int32_t>::max()) {
    Fail(run_time::kOverflow, "Partner ", partnerId, " has used up a counter");
  }
  ++last;
  if (!Update(store, partner)) {
    Fail(run_time::kDatabase, "The counters of partner ", partnerId,
         " cannot be stored, database error " + std::to_string(store.NativeError()));
  }
  return last;
}

// Every record that belongs to the order. False when the store keeps one.
template <class R>
bool DeleteOfOrder(RecordStore& store, std::int32_t orderId) {
  R probe;
  probe.OrderId = orderId;
  return std::ranges::all_of(Select(store, R::kByOrder, probe),
                             [&](const std::shared_ptr<R>& record) { return Delete(store, *record); });
}

}  // namespace

std::string StoreHost::UserId() { return Setting("UserId").value_or(std::string()); }

void StoreHost::Commit(std::int32_t) {}

void StoreHost::BeginTrans() {
  if (inTransaction_) throw RunTimeError(run_time::kDatabase, "A transaction is open already");
  OpenTransaction();
  inTransaction_ = true;
}

void StoreHost::CommitTrans() {
  if (!inTransaction_) throw RunTimeError(run_time::kDatabase, "No transaction is open");
  inTransaction_ = false;
  CloseTransaction(true);
}

void StoreHost::RollbackTrans() {
  if (!inTransaction_) return;
  inTransaction_ = false;
  CloseTransaction(false);
}

bool StoreHost::DeleteWithLines(const Order& order) {
  RecordStore& store = Records();
  return Delete(store, order) && DeleteOfOrder<OrderLocnLine>(store, order.OrderId) &&
         DeleteOfOrder<OrderLocn>(store, order.OrderId) && DeleteOfOrder<OrderLine>(store, order.OrderId);
}

bool StoreHost::DeleteOrder(const Order& order) {
  const bool own = !inTransaction_;
  bool done = false;
  try {
    if (own) BeginTrans();
    done = DeleteWithLines(order);
    if (own && done) CommitTrans();
  } catch (const RunTimeError&) {
    done = false;
  }
  if (own && !done) RollbackTrans();
  return done;
}

std::vector<EDIDoc> StoreHost::EDIDocList() {
  std::vector<EDIDoc> documents;
  for (const auto& document : Select(Records(), kEveryRecord, EDIDoc())) documents.push_back(*document);
  std::ranges::sort(documents, {}, &EDIDoc::EDIDocId);
  return documents;
}

std::int32_t StoreHost::NextNumber(std::string_view partnerId, Counter counter) {
  if (inTransaction_) return Draw(Records(), partnerId, counter);
  BeginTrans();
  try {
    const std::int32_t number = Draw(Records(), partnerId, counter);
    CommitTrans();
    return number;
  } catch (...) {
    RollbackTrans();
    throw;
  }
}

std::vector<std::shared_ptr<Pack>> StoreHost::PacksToCompile(std::string_view vendorId, std::string_view partnerId) {
  std::map<std::int32_t, bool> ordersOfPartner;
  const auto ofPartner = [&](std::int32_t orderId) {
    const auto [known, isNew] = ordersOfPartner.try_emplace(orderId);
    Order order;
    order.OrderId = orderId;
    if (isNew) known->second = Load(Records(), order) && order.PartnerId == partnerId;
    return known->second;
  };
  std::vector<std::shared_ptr<Pack>> waiting;
  Pack probe;
  probe.VendorId = vendorId;
  for (probe.Status = 0; probe.Status < kCompiled; ++probe.Status) {
    for (auto& pack : Select(Records(), Pack::kByVendorAndStatus, probe)) {
      if (pack->LeadPackId == 0 && pack->ShipmentId != 0 && ofPartner(pack->OrderId)) waiting.push_back(pack);
    }
  }
  std::ranges::sort(waiting, {}, [](const std::shared_ptr<Pack>& pack) {
    return std::tie(pack->ShipmentId, pack->OrderId, pack->ShipToCode, pack->Id);
  });
  return waiting;
}

double StoreHost::PackedOfSlipLine(std::int32_t slipLineId) {
  PackLine probe;
  probe.PSlipLineId = slipLineId;
  double packed = 0;
  for (const auto& line : Select(Records(), PackLine::kByPSlipLine, probe)) packed += line->Quantity;
  return packed;
}

bool StoreHost::OrderComplete(std::int32_t orderId) {
  OrderLocnLine probe;
  probe.OrderId = orderId;
  const auto lines = Select(Records(), OrderLocnLine::kByOrder, probe);
  const auto packed = [&](const std::shared_ptr<OrderLocnLine>& line) {
    if (line->Quantity <= line->PackedQty) return true;
    PSlipLine ofLine;
    ofLine.OrderLocnLineId = line->Id;
    double quantity = 0;
    for (const auto& slipLine : Select(Records(), PSlipLine::kByOrderLocnLine, ofLine)) {
      quantity += PackedOfSlipLine(slipLine->LineId);
    }
    return line->Quantity <= quantity;
  };
  return !lines.empty() && std::ranges::all_of(lines, packed);
}

bool StoreHost::OrderOpenOnShipment(std::int32_t shipmentId, std::int32_t orderId) {
  Pack probe;
  probe.ShipmentId = shipmentId;
  std::set<std::int32_t> slips;
  for (const auto& pack : Select(Records(), Pack::kByShipment, probe)) {
    if (pack->OrderId == orderId) slips.insert(pack->PSlipId);
  }
  return std::ranges::any_of(slips, [&](std::int32_t slipId) {
    PSlipLine ofSlip;
    ofSlip.PSlipId = slipId;
    return std::ranges::any_of(Select(Records(), PSlipLine::kByPSlip, ofSlip), [&](const auto& line) {
      return line->OrderQty > line->PackedQty && line->OrderQty > PackedOfSlipLine(line->LineId);
    });
  });
}

}  // namespace partnerkit

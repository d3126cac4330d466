// The host of a run, watched from the command line: which log records the run writes, and whether it took an order
// away.
#pragma once

#include <cstdint>
#include <vector>

#include "host/sql_host.h"
#include "partnerkit/records.h"

namespace partnerkit::cli {

class WatchedHost : public System, private RecordStore {
 public:
  explicit WatchedHost(host::SqlHost& host) : host_(host), records_(host.Records()) {}

  // Ids of the log records written so far; programs that share the store write theirs in between.
  const std::vector<std::int32_t>& LogIds() const { return logIds_; }
  // How many orders the store gave up.
  std::int32_t OrdersDeleted() const { return ordersDeleted_; }
  // How many were found that a run stored which was stopped before it settled its file.
  std::int32_t OrdersFoundUnsettled() const { return ordersFoundUnsettled_; }

  RecordStore& Records() override { return *this; }
  std::string UserId() override { return host_.UserId(); }
  bool DeleteOrder(const Order& order) override;
  void Commit(std::int32_t mode) override { host_.Commit(mode); }
  void BeginTrans() override { host_.BeginTrans(); }
  void CommitTrans() override { host_.CommitTrans(); }
  void RollbackTrans() override { host_.RollbackTrans(); }
  std::vector<EDIDoc> EDIDocList() override { return host_.EDIDocList(); }
  std::int32_t NextNumber(std::string_view partnerId, Counter counter) override {
    return host_.NextNumber(partnerId, counter);
  }
  std::vector<std::shared_ptr<Pack>> PacksToCompile(std::string_view vendorId, std::string_view partnerId) override {
    return host_.PacksToCompile(vendorId, partnerId);
  }
  bool OrderComplete(std::int32_t orderId) override { return host_.OrderComplete(orderId); }
  bool OrderOpenOnShipment(std::int32_t shipmentId, std::int32_t orderId) override {
    return host_.OrderOpenOnShipment(shipmentId, orderId);
  }
  bool StampPack(std::int32_t packId, std::int32_t noticeId) override { return host_.StampPack(packId, noticeId); }
  std::optional<std::string> Setting(std::string_view name) override { return host_.Setting(name); }

 private:
  // A log record of this run is at hand: a long run's report asks for many.
  bool Load(const RecordType& type, void* record) override;
  bool Add(const RecordType& type, void* record) override;
  bool Update(const RecordType& type, const void* record) override { return records_.Update(type, record); }
  bool Delete(const RecordType& type, const void* record) override { return records_.Delete(type, record); }
  bool Find(const RecordType& type, const Lookup& lookup, void* record) override {
    return records_.Find(type, lookup, record);
  }
  void Select(const RecordType& type, const Lookup& lookup, const void* probe,
              const std::function<void*()>& next) override {
    records_.Select(type, lookup, probe, next);
  }
  std::int32_t Count(const RecordType& type, const Lookup& lookup, const void* probe) override {
    return records_.Count(type, lookup, probe);
  }
  std::int32_t NativeError() const override { return records_.NativeError(); }

  host::SqlHost& host_;
  RecordStore& records_;
  std::vector<std::int32_t> logIds_;
  std::vector<Log> logs_;  // of the same
  std::int32_t ordersDeleted_ = 0;
  std::int32_t ordersFoundUnsettled_ = 0;
};

}  // namespace partnerkit::cli

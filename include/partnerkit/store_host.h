// A base for hosts that bring a record store of their own: everything that a run asks of its host and that the records
// themselves can answer.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/records.h"
#include "partnerkit/store.h"

namespace partnerkit {

// A look-up without members, which every record fits: Select(store, kEveryRecord, Product()).
inline constexpr Lookup kEveryRecord = {"EveryRecord", {}};

// A host derives from this and gives three things: `Records`, `OpenTransaction` and `CloseTransaction`. Each answer
// below may be overridden where the host's database knows a shorter way.
//
// Outside a transaction each change is taken to be durable when the store's operation returns. A host that gathers
// changes overrides `Commit`, and makes them durable in `OpenTransaction` too.
class StoreHost : public System {
 public:
  // The setting "UserId", empty when there is none.
  std::string UserId() override;
  // In a transaction of its own, where none is open. Within the caller's, an order of which the store gave up a part
  // only (False) is made whole again by the caller's RollbackTrans.
  bool DeleteOrder(const Order& order) override;
  // Does nothing.
  void Commit(std::int32_t mode) override;
  // These raise what the two steps below raise, and RunTimeError (run_time::kDatabase) for a transaction within another
  // and for the end of one that was never begun. RollbackTrans without a transaction does nothing.
  void BeginTrans() override;
  void CommitTrans() override;
  void RollbackTrans() override;
  // The store is asked for `kEveryRecord` of EDIDoc.
  std::vector<EDIDoc> EDIDocList() override;
  // From the counters of the stored Partner, in a transaction of its own where none is open. Raises RunTimeError
  // (run_time::kOverflow) for a counter that has come to its end.
  std::int32_t NextNumber(std::string_view partnerId, Counter counter) override;
  // Of the packs with a `Status` of 0 to 7.
  std::vector<std::shared_ptr<Pack>> PacksToCompile(std::string_view vendorId, std::string_view partnerId) override;
  // By what is packed: the quantity noted on the order's or slip's line, or the sum of its pack lines, whichever is
  // more. An order without location lines isn't complete.
  bool OrderComplete(std::int32_t orderId) override;
  bool OrderOpenOnShipment(std::int32_t shipmentId, std::int32_t orderId) override;

 protected:
  // Opens a transaction of the store; what was stored before it is durable. Where several programs share the store,
  // nobody else may write to it from here on: a number drawn within the transaction must not be drawn by another
  // meanwhile. Raises RunTimeError when it cannot be opened.
  virtual void OpenTransaction() = 0;
  // Ends it: makes durable what was stored since it was opened, or takes all of it back. Called once for each
  // transaction opened, which is then over even if this raises RunTimeError.
  virtual void CloseTransaction(bool keep) = 0;

  bool InTransaction() const { return inTransaction_; }

 private:
  bool DeleteWithLines(const Order& order);
  double PackedOfSlipLine(std::int32_t slipLineId);

  bool inTransaction_ = false;
};

}  // namespace partnerkit

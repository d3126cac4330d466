// What the library asks of the host: the record store and the one `System` object of a run. An embedding program
// derives from these; the bundled host keeps its records in SQL.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "partnerkit/record_type.h"

namespace partnerkit {

// Records by type. `record` and `probe` always point to a struct of the type named.
//
// `Load`, `Find` and `Select` raise RunTimeError (run_time::kDatabase) when the store itself fails, so that a broken
// store is never taken for a missing record. `Add`, `Update` and `Delete` give False instead, with the cause in
// `NativeError`.
class RecordStore {
 public:
  virtual ~RecordStore() = default;

  // Reads the record whose key (or, for a record without a key, whose id) is set. False when there is none; the record
  // is then unchanged.
  virtual bool Load(const RecordType& type, void* record) = 0;
  // Stores a new record; one with an id gets it set, to a number that no record of the type has had, not even one that
  // was deleted: `UnsettledOrder` and the run log rely on it. What was stored before a False stays as it is.
  virtual bool Add(const RecordType& type, void* record) = 0;
  // Writes every member back, by id when the type has one, else by key. False when there is no such record.
  virtual bool Update(const RecordType& type, const void* record) = 0;
  // Removes the record, by id when the type has one, else by key. False when there is no such record.
  virtual bool Delete(const RecordType& type, const void* record) = 0;
  // Finds one record by the members of a look-up, whose values `record` carries, and reads it; the oldest, if several
  // fit.
  virtual bool Find(const RecordType& type, const Lookup& lookup, void* record) = 0;
  // Gives every record that fits `probe` in the members of the look-up, in the order added. For each, `next` is asked
  // for a place to read it into; null ends the walk.
  virtual void Select(const RecordType& type, const Lookup& lookup, const void* probe,
                      const std::function<void*()>& next) = 0;
  // How many records fit.
  virtual std::int32_t Count(const RecordType& type, const Lookup& lookup, const void* probe) = 0;
  // The database's own number for its newest failure; 0 when nothing failed since the last success.
  virtual std::int32_t NativeError() const = 0;
};

// The same, typed. R::kType is the record's type.
template <class R>
bool Load(RecordStore& store, R& record) {
  return store.Load(R::kType, &record);
}
template <class R>
bool Add(RecordStore& store, R& record) {
  return store.Add(R::kType, &record);
}
template <class R>
bool Update(RecordStore& store, const R& record) {
  return store.Update(R::kType, &record);
}
template <class R>
bool Delete(RecordStore& store, const R& record) {
  return store.Delete(R::kType, &record);
}
template <class R>
bool Find(RecordStore& store, const Lookup& lookup, R& record) {
  return store.Find(R::kType, lookup, &record);
}
template <class R>
std::int32_t Count(RecordStore& store, const Lookup& lookup, const R& probe) {
  return store.Count(R::kType, lookup, &probe);
}
template <class R>
std::vector<std::shared_ptr<R>> Select(RecordStore& store, const Lookup& lookup, const R& probe) {
  std::vector<std::shared_ptr<R>> found;
  store.Select(R::kType, lookup, &probe,
               [&found]() -> void* { return found.emplace_back(std::make_shared<R>()).get(); });
  // The place handed out last may have stayed unread; a store asks only when it has a record to give.
  return found;
}

struct EDIDoc;
struct Order;
struct Pack;

// Which of a partner's counters.
enum class Counter { kASNNo, kInterchangeNo, kGroupNo };

// The one host object of a run.
class System {
 public:
  virtual ~System() = default;

  virtual RecordStore& Records() = 0;
  // Who is signed on.
  virtual std::string UserId() = 0;
  // Removes a stored order with its lines, locations and location lines. False when the host refuses, or,
  // with the cause in `NativeError`, when the store fails; the order then stays whole.
  virtual bool DeleteOrder(const Order& order) = 0;
  // Makes all that was stored since the last one durable. The argument is the host's; the library passes 0.
  virtual void Commit(std::int32_t mode) = 0;
  // A transaction, around the making of a notice and around its stamping; orders are posted without one, by `Commit`.
  // Transactions don't nest, and there is no `Commit` within one. What was stored before it is made durable first.
  // Records of the run log (`Log`) are no part of it, nor of anything that the store takes back by itself: a host keeps
  // what was added and writes it again, under the id that it had, for that id has been shown to others and must never
  // be given to another record. A record that waits is found by its id, and no failure to write it fails a commit.
  virtual void BeginTrans() = 0;
  virtual void CommitTrans() = 0;
  // Takes back all that was stored since BeginTrans but the log records.
  virtual void RollbackTrans() = 0;
  // All document definitions, by `EDIDocId`.
  virtual std::vector<EDIDoc> EDIDocList() = 0;
  // Moves a counter of the partner on by one and gives the new number, durable at once: no number is given twice,
  // whatever crashes and however many programs share the store. Within BeginTrans it is as durable as the transaction,
  // and taken back with it: such a number must not leave the program before. Raises RunTimeError when the partner is
  // unknown or the store fails.
  virtual std::int32_t NextNumber(std::string_view partnerId, Counter counter) = 0;

  // The packs that wait for a ship notice to the partner, in the order in which they are compiled: packs of one
  // shipment, order and ship-to stand together. Packs in no shipment don't wait, nor do sub packs, which go with their
  // lead pack. Raises RunTimeError. A host without ship notices may leave this and the two questions below as they are.
  virtual std::vector<std::shared_ptr<Pack>> PacksToCompile(std::string_view vendorId, std::string_view partnerId);
  // Whether everything that was ordered is packed.
  virtual bool OrderComplete(std::int32_t /*orderId*/) { return false; }
  // Whether a slip that has packs on the shipment is not packed to its end.
  virtual bool OrderOpenOnShipment(std::int32_t /*shipmentId*/, std::int32_t /*orderId*/) { return false; }
  // Stamps a waiting pack as compiled into the stored notice: `ASNId`, and 8 as its `Status`. False, and nothing is
  // done, when it waits no longer. Raises RunTimeError.
  virtual bool StampPack(std::int32_t packId, std::int32_t noticeId);

  // A setting of the host, by the names below; nothing for one that isn't set. A host without labels and tickets may
  // leave this as it is. Classes ask at every step, so that a change counts at once.
  virtual std::optional<std::string> Setting(std::string_view /*name*/) { return std::nullopt; }
  // Sends text to the port of direct labels, `ComPort`. Raises RunTimeError when it cannot be sent.
  virtual void ComSend(std::string_view text);

  // "LBXII", "ZPL", "WinPCL" (an ordinary printer) or another word for what the printer of labels understands, and the
  // same for tickets.
  std::string PrinterLanguage() { return SettingText("PrinterLanguage"); }
  std::string TicketLanguage() { return SettingText("TicketLanguage"); }
  // Numbers that go into the packets of labels and of tickets, 0 when they aren't set.
  std::string BatchControl() { return Setting("BatchControl").value_or("0"); }
  std::string TicketBatchControl() { return Setting("TicketBatchControl").value_or("0"); }
  // Labels go to `ComPort` and not to the spooler ("true" or "1"). An empty port means that there is none.
  bool ComDirect();
  std::string ComPort() { return SettingText("ComPort"); }
  // Print queues are watched for room unless this is 2.
  std::int32_t PlatformId();
  // What the second free line of a label shows, and what it shows when the first is empty.
  std::string LabelUserField() { return SettingText("LabelUserField"); }
  std::string LabelUserFieldAlt() { return SettingText("LabelUserFieldAlt"); }
  // The model of the packers' hand terminals.
  std::string PDTType() { return SettingText("PDTType"); }

  // What the last check of a scan found, see LabelClass::PackLineValid.
  std::int32_t ErrorCode = 0;
  // The host's own, set by the ship notices: which packs are listed, and running totals that a host may show.
  std::int32_t PackListMode = 0;
  std::int32_t CompileTotal1 = 0, CompileTotal2 = 0;

 private:
  std::string SettingText(std::string_view name) { return Setting(name).value_or(std::string()); }
};

}  // namespace partnerkit

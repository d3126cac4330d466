// What every ship notice does, whatever its format: lists the packs that wait, numbers a notice, and stamps its packs
// once it is written.
//
// The story of a row: its packs are the waiting ones of one shipment and one order. The first of them decides the
// notice's number; the notice is made in memory and added to its files as a whole; then the notice is stored and the
// packs are stamped, in one transaction. What fails before that leaves packs and files as they were; so does a kill, as
// soon as the next run has taken it up.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <tuple>
#include <vector>

#include "frame/translator_base.h"
#include "shipment/notice_files.h"

namespace partnerkit::shipment {

using PackPointers = std::vector<std::shared_ptr<Pack>>;

struct CompileValues {
  std::string_view className;
  bool byShipTo = false;            // an order's notice on a shipment is one for each ship-to
  bool ordersLessLocation = false;  // order numbers are shown without the delivery location behind them
  std::string_view inventoryFailed = "Cannot open inventory file ";
  bool tellsLast = false;  // that the notice is compiled is told behind all that follows on
};

// The order number without a delivery location added to it: what stands before " DEL# ", and of that what stands before
// " #".
std::string PONoLessDelLocn(std::string_view sPONo);

class CompileFrame : public TranslatorBase {
 public:
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;
  // `a_sFileName` is the output; a "*" in it stands for the notice's number.
  std::int32_t Load(const std::string& a_sFileName, RowTable& a_vtRows) override;
  // The id of the notice stored; 0 when none was, and when a further component failed.
  std::int32_t Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) override;
  // There is nothing to take out of a list that the host makes.
  bool Delete(std::int32_t, ErrorList&) override { return false; }
  bool Term() override;
  void Cancel() override;

 protected:
  CompileFrame(const CompileValues& values, const Ports& ports);

  // One notice in the making.
  struct Notice {
    Notice(CompileFrame& frame, ErrorList& list)
        : log(frame, "Process", list), files(frame.FileSystem(), frame.ends_) {}

    ASN asn;
    PackPointers packs;
    CallLog log;
    NoticeFiles files;
    std::size_t output = 0, inventory = 0;  // their numbers in `files`
    std::vector<PendingNotice> pending;     // what the store says of them while they are written
  };

  // --- The steps of a row, in their order. False ends it, with the reason noted.
  // What has to be there before anything is numbered: maps, the inventory file.
  virtual bool Prepare(Notice& notice);
  virtual bool Number(Notice& notice);
  virtual bool OpenOutput(Notice& notice);
  virtual bool WriteNotice(Notice& notice) = 0;
  // Behind the carrier's and the partner's own components.
  virtual bool FollowOn(Notice&) { return true; }

  // --- What the steps are made of
  // The pack's invoice number if the partner's notices bear it, else the next number of the partner's.
  bool NumberFrom(Notice& notice, const Pack& first);
  // Papers that this version doesn't make yet: the notice stands, and its row says so.
  void DeliveryDocket(Notice& notice);
  void ProcessChinaDHL(Notice& notice);
  // The partner takes invoices, by a document definition of its own.
  bool HasInvoiceDocument();
  bool InventoryOn() const { return inventoryOn_; }
  const std::string& InventoryPath() const { return inventoryPath_; }
  bool IsGentran() const;
  // Of the packs that still wait, this row's own included.
  std::size_t WaitingPacks() const { return waitingPacks_; }
  double WaitingCartons() const { return waitingCartons_; }

 private:
  using RowKey = std::tuple<std::int32_t, std::int32_t, std::string>;
  using Tell = std::function<void(std::string_view)>;

  RowKey KeyOf(const Pack& pack) const;
  ASN AsnOf(const Pack& pack);
  void ListPacks(const PackPointers& packs, RowTable& rows);
  std::string NotedName(const std::string& path, Naming naming);
  void ClearDrafts(const std::string& path);
  void TakeUpInterrupted(std::string_view vendorId, std::string_view partnerId, const Tell& tell);
  void TakeUpInterrupted(const PendingNotice& ofFile, const Tell& tell);
  void TakeBack(const PendingNotice& file, const PendingNotice* draft, const Tell& tell);
  bool Forget(const PendingNotice& notice);
  void ForgetAll(Notice& notice);
  void WarnOfCircles();
  std::optional<std::size_t> OpenFile(Notice& notice, const std::string& path, Naming naming);
  bool Make(Notice& notice);
  bool NotePending(Notice& notice);
  bool WriteFiles(Notice& notice);
  void GiveUp(Notice& notice);
  bool Stamp(Notice& notice);
  void StampInTransaction(Notice& notice);
  void TellCompiled(Notice& notice);
  void TakeOut(const RowKey& key);
  void RunCarrier(Notice& notice);
  bool RunExtension(Notice& notice);

  CompileValues compile_;
  std::string output_;
  std::string inventoryPath_;
  bool inventoryOn_ = false;
  FileEnds ends_;  // since the listing
  std::vector<ASN> rows_;
  std::map<RowKey, PackPointers> waiting_;
  std::size_t waitingPacks_ = 0;
  double waitingCartons_ = 0;
};

}  // namespace partnerkit::shipment

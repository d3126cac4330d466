#include "shipment/compile_frame.h"

#include <algorithm>

#include "files/file_name.h"
#include "shipment/lead_circles.h"
#include "values/format.h"

namespace partnerkit::shipment {

namespace {

// Packs and shipments are compiled from this status on.
constexpr std::int32_t kCompiled = 8;
// The partner's option that switches the inventory file on, and no component.
constexpr std::string_view kInventoryOption = "TL2Compatible";

// Records that are all wrong in the same way would fill the log at every listing.
constexpr std::size_t kMostCirclesTold = 10;
// The length before it that tells a draft's record from others.
constexpr std::int64_t kDraft = -1;

bool IsDraft(const PendingNotice& notice) { return notice.LengthBefore == kDraft; }

// The record of a draft stands behind that of its file.
bool IsDraftOf(const PendingNotice& draft, const PendingNotice& file) {
  return IsDraft(draft) && file.NewFile && !IsDraft(file) && draft.ASNNo == file.ASNNo;
}

ColumnTable Columns() {
  return {{"ConNote No", 0, 1500},
          {"Partner", 2, 1000},
          {"Delivery Locn", 0, 2000},
          {"Order No", 0, 2600},
          {"Result", 0, 3000}};
}

std::string_view Before(std::string_view text, std::string_view mark) { return text.substr(0, text.find(mark)); }

[[noreturn]] void RaiseStore(HostedClass& of, std::string_view what) {
  throw RunTimeError(run_time::kDatabase,
                     std::string(what) + ", database error " + std::to_string(of.Records().NativeError()));
}

}  // namespace

std::string PONoLessDelLocn(std::string_view sPONo) { return std::string(Before(Before(sPONo, " DEL# "), " #")); }

CompileFrame::CompileFrame(const CompileValues& values, const Ports& ports)
    : TranslatorBase(values.className, ports), compile_(values) {}

bool CompileFrame::Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) {
  return Procedure("Function Init", false, [&](bool& done) {
    Bind(system, EDIDocId);
    Columns = shipment::Columns();
    done = true;
  });
}

std::int32_t CompileFrame::Load(const std::string& a_sFileName, RowTable& a_vtRows) {
  return Procedure("Function Load", std::int32_t{0}, [&](std::int32_t& rows) {
    const std::string_view extension = Str(TradingPartner().ASNExtension);
    inventoryPath_ = Str(TradingPartner().InventoryFile);
    inventoryOn_ = inventoryPath_.size() > 1 && extension == kInventoryOption;
    output_ = a_sFileName;
    ends_.clear();
    rows_.clear();
    waiting_.clear();
    TakeUpInterrupted(Document().VendorId, Document().PartnerId,
                      [&](std::string_view told) { WriteLog(kWarning, "Load", told); });
    if (output_.find('*') == std::string::npos) ClearDrafts(output_);
    if (inventoryOn_) ClearDrafts(inventoryPath_);
    WarnOfCircles();
    Host().PackListMode = 0;
    const PackPointers packs = Try([&] { return Host().PacksToCompile(Document().VendorId, Document().PartnerId); });
    if (packs.empty()) {
      WriteLog(kInformation, "Load", "No Packs found to process.");
      return;
    }
    ListPacks(packs, a_vtRows);
    rows = static_cast<std::int32_t>(rows_.size());
  });
}

// No host hands these out, and none is asked for more than its records.
void CompileFrame::WarnOfCircles() {
  const auto circles =
      Try([&] { return LeadCircles(Records(), Document().VendorId, Document().PartnerId, kCompiled); });
  for (std::size_t n = 0; n < circles.size() && n < kMostCirclesTold; ++n) {
    WriteLog(kWarning, "Load", Told(circles[n]));
  }
  if (circles.size() <= kMostCirclesTold) return;
  WriteLog(kWarning, "Load",
           "So do packs in " + std::to_string(circles.size() - kMostCirclesTold) + " more circles of leads");
}

CompileFrame::RowKey CompileFrame::KeyOf(const Pack& pack) const {
  return {pack.ShipmentId, pack.OrderId, compile_.byShipTo ? pack.ShipToCode : std::string()};
}

// Neighbours are compared: packs of one row stand together.
void CompileFrame::ListPacks(const PackPointers& packs, RowTable& rows) {
  waitingPacks_ = packs.size();
  waitingCartons_ = 0;
  rows = RowTable(packs.size(), Columns().size());
  RowKey last;
  for (const auto& pack : packs) {
    waitingCartons_ += pack->CartonCount;
    RowKey key = KeyOf(*pack);
    waiting_[key].push_back(pack);
    if (key == last) continue;
    last = std::move(key);
    const ASN& asn = rows_.emplace_back(AsnOf(*pack));
    const std::size_t row = rows_.size() - 1;
    rows.At(row, 0) = std::string(Str(asn.ConNoteNo));
    rows.At(row, 1) = std::string(Str(asn.PartnerName));
    rows.At(row, 2) = std::string(Str(asn.DeliveryLocn));
    rows.At(row, 3) = std::string(Str(asn.OrderNo));
    rows.At(row, 4) = std::string();
  }
}

ASN CompileFrame::AsnOf(const Pack& pack) {
  Shipment shipment;
  shipment.Id = pack.ShipmentId;
  Order order;
  order.OrderId = pack.OrderId;
  PartnerLocn delivery;
  delivery.VendorId = pack.VendorId;
  delivery.PartnerLocnNo = pack.ShipToCode;
  Try([&] { return partnerkit::Load(Records(), shipment); });
  Try([&] { return partnerkit::Load(Records(), order); });
  Try([&] { return partnerkit::Load(Records(), delivery); });
  ASN asn;
  asn.VendorId = Document().VendorId;
  asn.PartnerId = Document().PartnerId;
  asn.PartnerName = TradingPartner().Name;
  asn.ShipmentId = pack.ShipmentId;
  asn.OrderId = pack.OrderId;
  asn.OrderNo = compile_.ordersLessLocation ? PONoLessDelLocn(order.PONo) : order.PONo;
  asn.PartnerLocnId = pack.PartnerLocnId;
  if (compile_.byShipTo) asn.ShipToCode = pack.ShipToCode;
  asn.DeliveryLocn = delivery.Name;
  asn.ConNoteNo = shipment.ConNoteNo;
  asn.CompileDate = Now();
  return asn;
}

// What a killed run left: a notice that is written, in full or in part, and not stored, so that its packs still wait.
// While a file can't be cut back the record of it stays.
void CompileFrame::TakeUpInterrupted(std::string_view vendorId, std::string_view partnerId, const Tell& tell) {
  PendingNotice probe;
  probe.VendorId = vendorId;
  probe.PartnerId = partnerId;
  const auto pending = Try([&] { return Select(Records(), PendingNotice::kByVendorAndPartner, probe); });
  for (std::size_t n = 0; n < pending.size(); ++n) {
    const bool drafted = n + 1 < pending.size() && IsDraftOf(*pending[n + 1], *pending[n]);
    Try([&] { TakeBack(*pending[n], drafted ? pending[n + 1].get() : nullptr, tell); });
    if (drafted) ++n;
  }
}

// Of every partner whose notice went to that file.
void CompileFrame::TakeUpInterrupted(const PendingNotice& ofFile, const Tell& tell) {
  const auto pending = Try([&] { return Select(Records(), PendingNotice::kByFileName, ofFile); });
  for (const auto& notice : pending) TakeUpInterrupted(notice->VendorId, notice->PartnerId, tell);
}

// One that means the same to a run in another folder, and once the user's link leads elsewhere.
std::string CompileFrame::NotedName(const std::string& path, Naming naming) {
  return FileSystem().FullName(naming == Naming::kGiven ? FileSystem().Resolved(path) : path);
}

// Of runs that were killed before they noted anything. The number in a name that we make up comes again, and the next
// draft of that name clears the one that was left; but a file that somebody else made meanwhile has no draft again.
void CompileFrame::ClearDrafts(const std::string& path) {
  PendingNotice noted;
  noted.FileName = NotedName(path, Naming::kGiven);
  const bool none = Try([&] { return Count(Records(), PendingNotice::kByFileName, noted) == 0; });
  if (none && !path.empty()) NoticeFiles::ClearDrafts(FileSystem(), noted.FileName);
}

// The draft goes once nothing is noted of the file that it was to be: without it that one would seem to have had its
// name.
void CompileFrame::TakeBack(const PendingNotice& file, const PendingNotice* draft, const Tell& tell) {
  const auto removeDraft = [&](const PendingNotice& of) {
    if (NoticeFiles::RemoveDraft(FileSystem(), of.FileName)) Forget(of);
  };
  if (IsDraft(file)) return removeDraft(file);
  const auto done = NoticeFiles::TakeBack(
      FileSystem(), {file.FileName, draft != nullptr ? draft->FileName : "", file.NewFile,
                     static_cast<std::uint64_t>(file.LengthBefore), static_cast<std::uint64_t>(file.LengthAdded)});
  if (done == NoticeFiles::TakenBack::kInUse || !Forget(file)) return;
  if (draft != nullptr) removeDraft(*draft);
  const std::string what = "Notice " + file.ASNNo + " of an interrupted run was never stored";
  if (done == NoticeFiles::TakenBack::kCutBack) tell(what + " and is taken out of " + file.FileName);
  if (done == NoticeFiles::TakenBack::kChanged) {
    tell(what + ", and " + file.FileName + " has changed since: look whether the partner got that notice");
  }
}

// False when another program was quicker.
bool CompileFrame::Forget(const PendingNotice& notice) {
  if (partnerkit::Delete(Records(), notice)) return true;
  if (Records().NativeError() != 0) RaiseStore(*this, "A notice stays pending");
  return false;
}

std::int32_t CompileFrame::Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Process", std::int32_t{0}, [&](std::int32_t& id) {
    if (a_lRowNum < 0 || static_cast<std::size_t>(a_lRowNum) >= rows_.size()) return;
    Notice notice(*this, vtErrorLog);
    notice.asn = rows_[static_cast<std::size_t>(a_lRowNum)];
    const RowKey key{notice.asn.ShipmentId, notice.asn.OrderId, std::string(Str(notice.asn.ShipToCode))};
    if (const auto waiting = waiting_.find(key); waiting != waiting_.end()) notice.packs = waiting->second;
    if (notice.packs.empty()) return notice.log.Note(kRejection, "No Packs found to process.");
    if (!(Prepare(notice) && Make(notice) && WriteFiles(notice) && Stamp(notice))) return;
    TakeOut(key);
    RunCarrier(notice);
    if (RunExtension(notice) && FollowOn(notice)) id = notice.asn.Id;
    if (compile_.tellsLast) TellCompiled(notice);
  });
}

// In memory, of one state of the store. The number, and what the files are to be cut back to should the program be
// killed, are durable before the first byte is written, in one wait for the disk.
bool CompileFrame::Make(Notice& notice) {
  if (!Try([&] { Host().BeginTrans(); })) return false;
  try {
    const bool made = Number(notice) && OpenOutput(notice) && WriteNotice(notice) && NotePending(notice);
    if (!made) ForgetAll(notice);
    if (Try([&] { Host().CommitTrans(); })) return made;
  } catch (...) {
    const HandlerOff off(Errors());
    ForgetAll(notice);
    Try([&] { Host().CommitTrans(); });
    throw;
  }
  return false;
}

// A new file has two records: its own, and then that of its draft.
bool CompileFrame::NotePending(Notice& notice) {
  const auto note = [&](const std::string& name, const FileGrowth& growth, std::int64_t before, std::uint64_t added) {
    PendingNotice& pending = notice.pending.emplace_back();
    pending.VendorId = notice.asn.VendorId;
    pending.PartnerId = notice.asn.PartnerId;
    pending.ASNNo = Str(notice.asn.ASNNo);
    pending.FileName = name;
    pending.NewFile = growth.isNew;
    pending.LengthBefore = before;
    pending.LengthAdded = static_cast<std::int64_t>(added);
    return Try([&] {
      if (!Add(Records(), pending)) RaiseStore(*this, "The notice cannot be noted as pending");
      return true;
    });
  };
  for (const FileGrowth& growth : notice.files.Growths()) {
    if (!note(growth.path, growth, static_cast<std::int64_t>(growth.before), growth.added)) return false;
    if (growth.isNew && !note(growth.draft, growth, kDraft, 0)) return false;
  }
  return true;
}

// The file's number among the notice's files; nothing, with the cause in ErrorNumber, when it can't be opened.
std::optional<std::size_t> CompileFrame::OpenFile(Notice& notice, const std::string& path, Naming naming) {
  PendingNotice interrupted;
  interrupted.FileName = NotedName(path, naming);
  const auto isWhole = [&] {
    return Try([&] { return Count(Records(), PendingNotice::kByFileName, interrupted) == 0; });
  };
  for (const bool again : {false, true}) {
    // The draft of a new file would clear away the one that tells what became of the notice that was to be that file.
    if ((again || !FileSystem().Exists(interrupted.FileName)) && !isWhole()) {
      TakeUpInterrupted(interrupted, [&](std::string_view told) { notice.log.Note(kWarning, told); });
    }
    auto file = Try([&] { return std::optional(notice.files.Open(interrupted.FileName, naming)); });
    // No other program writes to a file that is open here. One that had it before may have been killed, though.
    if (!file || isWhole()) return file;
    Try([&] { notice.files.LetGo(); });
  }
  Try([&] { throw RunTimeError(run_time::kPermissionDenied, "An interrupted notice cannot be taken out of " + path); });
  return std::nullopt;
}

bool CompileFrame::Prepare(Notice& notice) {
  if (!inventoryOn_) return true;
  const HandlerOff off(Errors());
  const auto file = OpenFile(notice, inventoryPath_, Naming::kGiven);
  if (!file) {
    notice.log.Note(ErrorNumber(), "Open Inventory File", std::string(compile_.inventoryFailed) + inventoryPath_);
    return false;
  }
  notice.inventory = *file;
  return true;
}

bool CompileFrame::Number(Notice& notice) { return NumberFrom(notice, *notice.packs.front()); }

bool CompileFrame::NumberFrom(Notice& notice, const Pack& first) {
  if (!TradingPartner().ASNNoFromInvoice || !first.InvoiceNo) {
    std::int32_t number = 0;
    if (!Try([&] { number = Host().NextNumber(TradingPartner().PartnerId, Counter::kASNNo); })) return false;
    notice.asn.ASNNo = std::to_string(number);
    return true;
  }
  notice.asn.ASNNo = first.InvoiceNo;
  ASN taken = notice.asn;
  if (!Try([&] { return Find(Records(), ASN::kByNumber, taken); })) return true;
  notice.log.Note(kRejection, "New ASN ", "ASN number already exists " + *first.InvoiceNo);
  return false;
}

bool CompileFrame::OpenOutput(Notice& notice) {
  std::string path;
  for (const char c : output_) {
    if (c == '*') path += FileNamePart(Str(notice.asn.ASNNo));
    else path += c;
  }
  const HandlerOff off(Errors());
  const auto file = OpenFile(notice, path, path == output_ ? Naming::kGiven : Naming::kMadeUp);
  if (!file) {
    notice.log.Note(ErrorNumber(), "Open ASN File", "Cannot open file " + path);
    return false;
  }
  notice.output = *file;
  return true;
}

bool CompileFrame::WriteFiles(Notice& notice) {
  try {
    notice.files.Write();
    return true;
  } catch (const RunTimeError& error) {
    GiveUp(notice);
    notice.log.Note(error.Number(), "Process", "Cannot write ASN " + *notice.asn.ASNNo + ": " + error.Description());
    return false;
  }
}

// A file that can't be cut back now is by the next run.
void CompileFrame::GiveUp(Notice& notice) {
  if (notice.files.Abandon()) ForgetAll(notice);
  else notice.files.LeaveDrafts();
}

void CompileFrame::ForgetAll(Notice& notice) {
  for (const PendingNotice& pending : notice.pending) {
    const bool done = Try([&] {
      Forget(pending);
      return true;
    });
    if (!done) notice.files.LeaveDrafts();
  }
}

bool CompileFrame::Stamp(Notice& notice) {
  Try([&] { Host().BeginTrans(); });
  try {
    StampInTransaction(notice);
  } catch (const RunTimeError& error) {
    Try([&] { Host().RollbackTrans(); });
    notice.asn.Id = 0;
    GiveUp(notice);
    notice.log.Note(error.Number(), "Process",
                    "ASN " + *notice.asn.ASNNo +
                        " was written but not stored, and is taken out of its files again: " + error.Description());
    return false;
  }
  for (const auto& pack : notice.packs) {
    pack->ASNId = notice.asn.Id;
    pack->Status = kCompiled;
  }
  notice.files.Settle();
  if (!compile_.tellsLast) TellCompiled(notice);
  return true;
}

// A pack may have been compiled by another program since it was listed.
void CompileFrame::StampInTransaction(Notice& notice) {
  if (!Add(Records(), notice.asn)) RaiseStore(*this, "The notice cannot be stored");
  for (const auto& pack : notice.packs) {
    if (Host().StampPack(pack->Id, notice.asn.Id)) continue;
    throw RunTimeError(run_time::kInvalidCall, "Pack " + std::string(Str(pack->SSCC)) + " no longer waits");
  }
  Shipment shipment;
  shipment.Id = notice.asn.ShipmentId;
  if (partnerkit::Load(Records(), shipment) && shipment.Status < kCompiled) {
    shipment.Status = kCompiled;
    if (!Update(Records(), shipment)) RaiseStore(*this, "The shipment cannot be stamped");
  }
  for (const PendingNotice& pending : notice.pending) Forget(pending);
  Host().CommitTrans();
}

void CompileFrame::TellCompiled(Notice& notice) {
  notice.log.Note(kInformation, "ASN " + *notice.asn.ASNNo + " compile completed. " +
                                    std::to_string(notice.log.Ids().size()) + " packs added.");
}

void CompileFrame::TakeOut(const RowKey& key) {
  const auto row = waiting_.find(key);
  waitingPacks_ -= row->second.size();
  for (const auto& pack : row->second) waitingCartons_ -= pack->CartonCount;
  waiting_.erase(row);
}

void CompileFrame::RunCarrier(Notice& notice) {
  if (!Components().carrier) return;
  Shipment shipment;
  shipment.Id = notice.asn.ShipmentId;
  Try([&] { return partnerkit::Load(Records(), shipment); });
  PartnerAddress carrier;
  carrier.Id = shipment.CarrierId;
  if (carrier.Id != 0) Try([&] { return partnerkit::Load(Records(), carrier); });
  const std::string_view progId = Str(carrier.ProcessProgID);
  const auto component = progId.empty() ? nullptr : Components().carrier(progId);
  if (component == nullptr) return;
  Try([&] { component->Process(Host(), shipment, notice.asn, notice.packs, notice.log.Ids()); });
  Try([&] { component->Term(); });
}

bool CompileFrame::RunExtension(Notice& notice) {
  const std::string_view progId = Str(TradingPartner().ASNExtension);
  if (progId.empty() || progId == kInventoryOption || !Components().noticeExtension) return true;
  const auto component = Components().noticeExtension(progId);
  if (component == nullptr) return true;
  Try([&] { component->Init(Host(), TradingPartner(), OwnCompany(), Document()); });
  const std::int32_t result = Try([&] { return component->Process(notice.asn, notice.log.Ids()); });
  Try([&] { component->Term(); });
  return result != 0;
}

bool CompileFrame::Term() {
  return Procedure("Function Term", false, [](bool& done) { done = true; });
}

void CompileFrame::Cancel() {
  rows_.clear();
  waiting_.clear();
}

void CompileFrame::DeliveryDocket(Notice& notice) {
  notice.log.Note(kWarning, "No delivery docket is made for ASN " + *notice.asn.ASNNo + ": this version has none.");
}

void CompileFrame::ProcessChinaDHL(Notice& notice) {
  notice.log.Note(kWarning, "No DHL listing is made for ASN " + *notice.asn.ASNNo + ": this version has none.");
}

bool CompileFrame::HasInvoiceDocument() {
  const auto documents = Try([&] { return Host().EDIDocList(); });
  return std::ranges::any_of(documents, [&](const EDIDoc& document) {
    return document.VendorId == Document().VendorId && document.PartnerId == Document().PartnerId &&
           (document.DocumentCode == "INVOIC" || document.DocumentCode == "EI" || document.DocumentCode == "810");
  });
}

bool CompileFrame::IsGentran() const { return Format(TradingPartner().Translator, ">") == "GENTRAN"; }

}  // namespace partnerkit::shipment

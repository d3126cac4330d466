#include "shipment/compile_frame.h"

#include <algorithm>

#include "frame/file_name.h"
#include "frame/format.h"

namespace partnerkit::shipment {

namespace {

// Packs and shipments are compiled from this status on.
constexpr std::int32_t kCompiled = 8;
// The partner's option that switches the inventory file on, and no component.
constexpr std::string_view kInventoryOption = "TL2Compatible";

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
    rows_.clear();
    waiting_.clear();
    const auto tell = [&](std::string_view told) { WriteLog(kWarning, "Load", told); };
    TakeUpInterrupted(output_, tell);
    if (inventoryOn_) TakeUpInterrupted(inventoryPath_, tell);
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

// A run that was killed while it wrote a notice left a note. Once the notice is stored, that is all there is to it;
// else it goes from the file, for its packs still wait. The note stays when that can't be told or done.
void CompileFrame::TakeUpInterrupted(const std::string& name, const std::function<void(std::string_view)>& tell) {
  NoticeFiles files(FileSystem());
  const auto pending = Try([&] { return files.FindPending(name); });
  if (!pending) return;
  const bool dealtWith = Try([&] {
    if (pending->path.empty() || IsStored(pending->id) || !files.TakeBack(*pending)) return;
    tell("Notice " + pending->id.ASNNo + " of an interrupted run was never stored and is taken out of " +
         pending->path);
  });
  if (dealtWith) Try([&] { files.Forget(name); });
}

// Whoever the partner: several documents may write to one file.
bool CompileFrame::IsStored(const NoticeId& id) {
  ASN probe;
  probe.ShipmentId = id.shipmentId;
  return std::ranges::any_of(Select(Records(), ASN::kByShipment, probe), [&](const auto& asn) {
    return asn->OrderId == id.orderId && Str(asn->ASNNo) == id.ASNNo;
  });
}

std::int32_t CompileFrame::Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Process", std::int32_t{0}, [&](std::int32_t& id) {
    if (a_lRowNum < 0 || static_cast<std::size_t>(a_lRowNum) >= rows_.size()) return;
    Notice notice(*this, vtErrorLog);
    notice.asn = rows_[static_cast<std::size_t>(a_lRowNum)];
    const RowKey key{notice.asn.ShipmentId, notice.asn.OrderId, std::string(Str(notice.asn.ShipToCode))};
    if (const auto waiting = waiting_.find(key); waiting != waiting_.end()) notice.packs = waiting->second;
    if (notice.packs.empty()) return notice.log.Note(kRejection, "No Packs found to process.");
    bool compiled = false;
    try {
      compiled = Compile(notice);
    } catch (...) {
      LogPacks(notice);
      throw;
    }
    if (!compiled) return;
    TakeOut(key);
    RunCarrier(notice);
    if (RunExtension(notice) && FollowOn(notice)) id = notice.asn.Id;
    if (compile_.tellsLast) TellCompiled(notice);
  });
}

bool CompileFrame::Compile(Notice& notice) {
  return Prepare(notice) && Number(notice) && OpenOutput(notice) && MakeNotice(notice) && WriteFiles(notice) &&
         Stamp(notice);
}

// Of one state of the store. Hundreds of reads that each ask for it by themselves cost a store noticeably more, too.
bool CompileFrame::MakeNotice(Notice& notice) {
  const bool begun = Try([&] { Host().BeginTrans(); });
  try {
    const bool made = WriteNotice(notice);
    if (begun) Try([&] { Host().CommitTrans(); });
    return made;
  } catch (...) {
    if (begun) Try([&] { Host().RollbackTrans(); });
    throw;
  }
}

// The file's number among the notice's files; nothing, with the cause in ErrorNumber, when it can't be opened.
std::optional<std::size_t> CompileFrame::OpenFile(Notice& notice, const std::string& name, const std::string& path) {
  bool begun = false;
  // Another program may have been interrupted since the listing.
  for (int attempt = 0; attempt < 2 && !begun; ++attempt) {
    if (attempt > 0) TakeUpInterrupted(name, [&](std::string_view told) { notice.log.Note(kWarning, told); });
    if (!Try([&] { begun = notice.files.Begin(name); })) return std::nullopt;
  }
  if (!begun) return std::nullopt;
  return Try([&] { return std::optional(notice.files.Open(path)); });
}

bool CompileFrame::Prepare(Notice& notice) {
  if (!inventoryOn_) return true;
  const HandlerOff off(Errors());
  const auto file = OpenFile(notice, inventoryPath_, inventoryPath_);
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
    notice.asn.ASNNo =
        std::to_string(Try([&] { return Host().NextNumber(TradingPartner().PartnerId, Counter::kASNNo); }));
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
  const auto file = OpenFile(notice, output_, path);
  if (!file) {
    notice.log.Note(ErrorNumber(), "Open ASN File", "Cannot open file " + path);
    return false;
  }
  notice.output = *file;
  return true;
}

bool CompileFrame::WriteFiles(Notice& notice) {
  try {
    notice.files.Write({*notice.asn.ASNNo, notice.asn.ShipmentId, notice.asn.OrderId});
    return true;
  } catch (const RunTimeError& error) {
    LogPacks(notice);
    notice.log.Note(error.Number(), "Process", "Cannot write ASN " + *notice.asn.ASNNo + ": " + error.Description());
    return false;
  }
}

bool CompileFrame::Stamp(Notice& notice) {
  Try([&] { Host().BeginTrans(); });
  const std::size_t told = notice.log.Ids().size();
  try {
    StampInTransaction(notice);
  } catch (const RunTimeError& error) {
    Try([&] { Host().RollbackTrans(); });
    // A record written meanwhile went with the transaction.
    notice.log.Ids().resize(told);
    notice.asn.Id = 0;
    notice.files.Abandon();
    LogPacks(notice);
    notice.log.Note(error.Number(), "Process",
                    "ASN " + *notice.asn.ASNNo +
                        " was written but not stored, and is taken out of its files again: " + error.Description());
    return false;
  }
  notice.packsTold.clear();
  for (const auto& pack : notice.packs) {
    pack->ASNId = notice.asn.Id;
    pack->Status = kCompiled;
  }
  notice.files.Settle();
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
  LogEach(notice);
  if (!compile_.tellsLast) TellCompiled(notice);
  Host().CommitTrans();
}

void CompileFrame::LogEach(Notice& notice) {
  for (const std::string& told : notice.packsTold) notice.log.Note(kInformation, "Process Pack", told);
}

void CompileFrame::LogPacks(Notice& notice) {
  LogEach(notice);
  notice.packsTold.clear();
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

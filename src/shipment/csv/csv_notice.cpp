#include "shipment/csv/csv_notice.h"

#include <algorithm>

#include "shipment/inventory_record.h"
#include "values/delimited.h"
#include "values/numbers.h"
#include "values/outbound_value.h"

namespace partnerkit::shipment {

namespace {

constexpr std::string_view kLineEnd = "\r\n";

const NoticeField* FindField(std::span<const NoticeField> fields, std::string_view name) {
  const auto found = std::ranges::find(fields, name, &NoticeField::name);
  return found == fields.end() ? nullptr : &*found;
}

}  // namespace

CsvNotice::CsvNotice(const CsvNoticeValues& values, const Ports& ports)
    : CompileFrame(values.compile, ports), values_(values), records_(*this) {}

bool CsvNotice::OpenMapFile(const std::string& sMapFileName) {
  return Procedure("Function OpenMapFile", false, [&](bool& opened) { opened = ReadMap(sMapFileName); });
}

bool CsvNotice::ReadMap(const std::string& path) {
  const HandlerOff off(Errors());
  std::uint64_t length = 0;
  MapHeader header;
  const bool read = Try([&] {
    length = FileSystem().Length(path);
    if (length > 0) header = ReadMapHeader(*FileSystem().OpenInput(path, Share::kDenyWrite));
  });
  if (!read || length == 0) {
    WriteLog(ErrorNumber(), "OpenMapFile", "ASN map file " + path + (read ? " is empty." : " does not exist."));
    return false;
  }
  header_ = std::move(header);
  BindColumns();
  mapLoaded_ = true;
  return true;
}

bool CsvNotice::Knows(std::string_view name) const {
  const auto in = [&](std::span<const std::string_view> names) {
    return std::ranges::find(names, name) != names.end();
  };
  if (in(values_.added)) return true;
  if (in(values_.removed)) return false;
  return values_.fields.empty() ? FindField(UsualNoticeFields(), name) != nullptr : in(values_.fields);
}

const NoticeField* CsvNotice::SourceOf(std::string_view name) const {
  for (const auto fields : {values_.own, values_.family, UsualNoticeFields()}) {
    if (const NoticeField* const field = FindField(fields, name)) return field;
  }
  return nullptr;
}

// Fields that no column asks for are not filled.
void CsvNotice::BindColumns() {
  map_.Clear();
  columns_.clear();
  perNotice_.clear();
  perPack_.clear();
  perLine_.clear();
  for (const std::string& column : header_) {
    MapField* field = map_.Find(column);
    if (field == nullptr && Knows(column)) {
      field = &map_.Add(column);
      const NoticeField* const source = SourceOf(column);
      if (source != nullptr && source->fill != nullptr) {
        FilledPer(source->level).push_back({field, source->fill});
      }
    }
    columns_.push_back(field);
  }
  quantity_ = map_.Find("QUANTITYSHIPPED");
  if (values_.lines != NoticeLines::kEach)
    std::erase_if(perLine_, [&](const Filled& f) { return f.field == quantity_; });
  const auto perLine = [&](const MapField* column) {
    return column != nullptr &&
           (column == quantity_ || std::ranges::find(perLine_, column, &Filled::field) != perLine_.end());
  };
  leading_ = static_cast<std::size_t>(std::ranges::find_if(columns_, perLine) - columns_.begin());
}

bool CsvNotice::Prepare(Notice& notice) {
  if (!mapLoaded_) {
    const std::string path = std::string(Str(Document().MapFolder)).append(Str(Document().MapFile));
    if (!OpenMapFile(path)) {
      notice.log.Ids().push_back(LastLogId());
      return false;
    }
  }
  return CompileFrame::Prepare(notice);
}

bool CsvNotice::Number(Notice& notice) {
  records_.SetNotice(notice.asn, notice.packs.front()->InvoiceNo);
  if (!CheckNotice(notice)) return false;
  if (values_.mostPacks > 0) {
    Pack probe;
    probe.ShipmentId = notice.asn.ShipmentId;
    if (Try([&] { return Count(Records(), Pack::kByShipment, probe); }) > values_.mostPacks) {
      notice.log.Note(kRejection, "New ASN ", "ASN pack count exceeds " + std::to_string(values_.mostPacks) + "...");
      return false;
    }
  }
  return CompileFrame::Number(notice);
}

bool CsvNotice::OpenOutput(Notice& notice) {
  if (!CompileFrame::OpenOutput(notice)) return false;
  if (IsGentran()) {
    std::string& text = notice.files.Text(notice.output);
    text += "HEADER,";
    AppendValue(Document().PartnerEDIAddr, text);
    text += kLineEnd;
  }
  return true;
}

bool CsvNotice::WriteNotice(Notice& notice) {
  records_.waitingPacks = WaitingPacks();
  records_.waitingCartons = WaitingCartons();
  records_.linesWritten = 0;
  Fill(perNotice_);
  for (const auto& pack : notice.packs) {
    if (!WritePack(notice, *pack)) return false;
  }
  return true;
}

std::vector<CsvNotice::Filled>& CsvNotice::FilledPer(Level level) {
  return level == Level::kNotice ? perNotice_ : level == Level::kPack ? perPack_ : perLine_;
}

void CsvNotice::Fill(const std::vector<Filled>& fields) {
  for (const Filled& filled : fields) filled.fill(records_, filled.field->FieldValue);
}

bool CsvNotice::FillPack(Notice&, const Pack&) {
  Fill(perPack_);
  return true;
}

bool CsvNotice::WritePack(Notice& notice, const Pack& pack) {
  records_.SetPack(pack);
  if (!FillPack(notice, pack)) return false;
  leadingText_.clear();
  const std::vector<std::shared_ptr<PackLine>> lines = records_.Lines();
  if (lines.empty()) return true;
  std::string told = "......Pack " + std::string(Str(pack.SSCC)) + " added to ConNote " +
                     std::string(Str(records_.Shipment().ConNoteNo));
  if (values_.logsOrder) told += " for PONo " + records_.Order().PONo;
  notice.log.Note(kInformation, "Process Pack", told);
  if (values_.lines == NoticeLines::kEach) {
    WriteEach(notice, lines);
  } else {
    WriteRuns(notice, lines);
  }
  return true;
}

void CsvNotice::SetLine(const PackLine& line) {
  records_.SetLine(line);
  Fill(perLine_);
}

bool CsvNotice::FollowOn(Notice& notice) {
  const bool wanted =
      values_.deliveryDocket && Str(Document().Options).find("#%DeliveryDocket") != std::string_view::npos;
  if (wanted) DeliveryDocket(notice);
  return true;
}

// A run ends where the product changes, and with the carton.
void CsvNotice::WriteRuns(Notice& notice, const Lines& lines) {
  std::int32_t running = 0;
  std::string_view last;
  for (const auto& line : lines) {
    if (!TrimBlanks(last).empty() && line->APN != last && running != 0) {
      WriteRun(notice, running);
      running = 0;
    }
    SetLine(*line);
    last = line->APN;
    const double sum = running + line->Quantity;
    running = values_.lines == NoticeLines::kLongRuns ? ToLong(sum) : ToInteger(sum);
    if (line->Quantity > 0) WriteInventory(notice);
  }
  if (running != 0) WriteRun(notice, running);
}

void CsvNotice::WriteEach(Notice& notice, const Lines& lines) {
  for (const auto& line : lines) {
    SetLine(*line);
    if (line->Quantity <= 0) continue;
    WriteLine(notice);
    WriteInventory(notice);
  }
}

void CsvNotice::WriteRun(Notice& notice, std::int32_t quantity) {
  if (quantity_ != nullptr) quantity_->FieldValue = std::to_string(quantity);
  WriteLine(notice);
}

void CsvNotice::WriteLine(Notice& notice) {
  const auto append = [&](std::string& text, std::size_t from, std::size_t to) {
    for (std::size_t n = from; n < to; ++n) AppendColumn(columns_[n], text);
  };
  if (leadingText_.empty()) append(leadingText_, 0, leading_);
  std::string& text = notice.files.Text(notice.output);
  text += leadingText_;
  append(text, leading_, columns_.size());
  text += kLineEnd;
  ++records_.linesWritten;
}

void CsvNotice::WriteInventory(Notice& notice) {
  if (!InventoryOn()) return;
  const std::string_view orderNo = records_.Order().PONo;
  AppendInventoryRecord(records_, values_.inventoryLessRelease ? LessRelease(orderNo) : orderNo,
                        notice.files.Text(notice.inventory));
}

}  // namespace partnerkit::shipment

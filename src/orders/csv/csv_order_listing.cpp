// Listing a CSV order file and settling it: everything round the posting of its orders.
#include <algorithm>

#include "frame/dates.h"
#include "orders/csv/csv_order_importer.h"
#include "orders/order_columns.h"
#include "orders/products_from_orders.h"

namespace partnerkit::orders {

namespace {

// What listing looks at in a line.
constexpr OrderField kListingFields[] = {
    OrderField::INTCONTROLNO,   OrderField::GRPCONTROLNO, OrderField::TRNCONTROLNO, OrderField::PARTNEREDIADDR,
    OrderField::COMPANYEDIADDR, OrderField::PONUMBER,     OrderField::PODATE};
constexpr OrderField kNumberField[] = {OrderField::PONUMBER};

constexpr std::string_view kDeleteOnEmpty = "#%DELETEONEMPTY";

// Adds a line to the ranges; lines that follow each other make one range.
void Extend(std::vector<ByteRange>& ranges, const Line& line) {
  if (!ranges.empty() && ranges.back().end == line.position) {
    ranges.back().end = line.End();
  } else {
    ranges.push_back({line.position, line.End()});
  }
}

}  // namespace

CsvOrderImporter::CsvOrderImporter(const CsvOrderValues& values, const Ports& ports)
    : TranslatorBase(values.className, ports), values_(values), queue_(FileSystem()), backup_(FileSystem()) {}

bool CsvOrderImporter::Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) {
  return Procedure("Function Init", false, [&](bool& done) {
    Bind(system, EDIDocId);
    listed_.clear();
    processed_.Clear();
    Columns = OrderColumns();
    const std::string backup(Str(OwnCompany().POBackupFile));
    if (!backup.empty()) {
      const HandlerOff off(Errors());
      if (!Try([&] { backup_.Open(backup); })) {
        WriteLog(ErrorNumber(), "Init", "PO import cannot proceed. Backupfile " + backup + " could not be opened.");
        return;
      }
    }
    done = true;
  });
}

std::int32_t CsvOrderImporter::Load(const std::string& a_sFileName, RowTable& a_vtRows) {
  return Procedure("Function Load", std::int32_t{0}, [&](std::int32_t& rows) {
    fileName_ = a_sFileName;
    if (!mapLoaded_ && !OpenMapFile(std::string(Str(Document().MapFolder)).append(Str(Document().MapFile)))) return;
    if (!SetOrderList(fileName_)) return;
    if (listed_.empty()) {
      WriteLog(ErrorNumber(), "Load", "No orders found to match EDI addresses.");
      return;
    }
    FillRows(a_vtRows);
    rows = static_cast<std::int32_t>(listed_.size());
  });
}

bool CsvOrderImporter::OpenMapFile(const std::string& path) {
  return Procedure("Function OpenMapFile", false, [&](bool& open) {
    if (!TakeMapFile(path) || !ExpectFields()) return;
    line_.SetColumns(fieldMap_, mapHeader_.size());
    open = mapLoaded_ = true;
  });
}

bool CsvOrderImporter::TakeMapFile(const std::string& path) {
  std::uint64_t length = 0;
  {
    const HandlerOff off(Errors());
    if (!Try([&] { length = FileSystem().Length(path); })) {
      WriteLog(ErrorNumber(), "OpenMapFile", "PO map file " + path + " does not exist.");
      return false;
    }
  }
  if (length == 0) {
    WriteLog(ErrorNumber(), "OpenMapFile", "PO map file " + path + " is empty.");
    return false;
  }
  std::unique_ptr<InputFile> file;
  {
    const HandlerOff off(Errors());
    if (!Try([&] { file = FileSystem().OpenInput(path, Share::kDenyWrite); })) {
      WriteLog(ErrorNumber(), "OpenMapFile", "Error opening file " + path);
      return false;
    }
  }
  return Try([&] { mapHeader_ = ReadMapHeader(*file); });
}

bool CsvOrderImporter::ExpectFields() {
  fieldMap_.Clear();
  for (const OrderField expected : values_.expectedFields) {
    if (FindColumn(mapHeader_, fieldMap_.Add(Name(expected)))) continue;
    WriteLog(kWarning, "OpenMapFile",
             "Expected field " + std::string(Name(expected)) + " not found. \r\n Add this item to your " +
                 std::string(Str(Document().MapFile)) + " file.");
    return false;
  }
  return true;
}

bool CsvOrderImporter::SetOrderList(const std::string& path) {
  return Procedure("Function SetOrderList", false, [&](bool& listed) {
    listed_.clear();
    if (!HoldOrderFile(path)) return;
    ListTransactions();
    if (values_.importsProducts && !Str(OwnCompany().ProductImportFile).empty()) ImportProduct(*this);
    listed = true;
  });
}

bool CsvOrderImporter::HoldOrderFile(const std::string& path) {
  const HandlerOff off(Errors());
  std::uint64_t length = 0;
  if (!Try([&] { length = FileSystem().Length(path); })) {
    WriteLog(ErrorNumber(), "SetOrderList", "File " + path + " does not exist.");
    return false;
  }
  if (length == 0) {
    WriteLog(ErrorNumber(), "SetOrderList", "File " + path + " is empty.");
    return false;
  }
  if (!Try([&] { queue_.Open(path); })) {
    WriteLog(ErrorNumber(), "SetOrderList", "Error opening file " + path);
    return false;
  }
  return true;
}

void CsvOrderImporter::ListTransactions() {
  const std::size_t columns = std::max(line_.ColumnsFor(kListingFields), line_.ColumnsFor(values_.lineKey));
  std::string lastTransaction, firstLine, transaction, lineKey;
  for (Line line; ReadLine(line);) {
    line_.Read(line.text, columns);
    line_.Join(kTransactionKey, transaction);
    line_.Join(values_.lineKey, lineKey);
    if (transaction == lastTransaction && lineKey != firstLine) continue;
    // A foreign transaction leaves the keys alone: each of its lines is looked at, and passed over, again.
    if (!IsOurs()) continue;
    ListedOrder& entry = listed_.emplace_back();
    entry.InterchangeCtl = line_[OrderField::INTCONTROLNO];
    entry.GroupCtl = line_[OrderField::GRPCONTROLNO];
    entry.TransactionCtl = line_[OrderField::TRNCONTROLNO];
    entry.PONo = line_[OrderField::PONUMBER];
    entry.PODate = OrderDate(line_[OrderField::PODATE]);
    entry.FilePos = static_cast<std::int64_t>(line.position);
    lastTransaction = transaction;
    firstLine = lineKey;
  }
}

bool CsvOrderImporter::IsOurs() const {
  return line_[OrderField::PARTNEREDIADDR] == Str(Document().PartnerEDIAddr) &&
         line_[OrderField::COMPANYEDIADDR] == Str(Document().CompanyEDIAddr);
}

void CsvOrderImporter::FillRows(RowTable& rows) const {
  rows = RowTable(listed_.size(), OrderColumns().size());
  for (std::size_t row = 0; row < listed_.size(); ++row) {
    const ListedOrder& entry = listed_[row];
    rows.At(row, 0) = entry.PONo;
    if (entry.PODate) rows.At(row, 1) = *entry.PODate;
    rows.At(row, 2) = entry.InterchangeCtl + "/" + entry.GroupCtl + "/" + entry.TransactionCtl;
    rows.At(row, 3) = std::string();
  }
}

// Reads the order file's next line. False at its end.
bool CsvOrderImporter::ReadLine(Line& line) {
  return Try([&] { return queue_.Lines().Read(line); });
}

bool CsvOrderImporter::Term() {
  return Procedure("Function Term", false, [&](bool& done) {
    Try([&] { queue_.File(); });
    if (!processed_.Empty()) {
      // Nothing leaves the file before the store holds it for good.
      Try([&] { Host().Commit(0); });
      if (!SettleFile()) return;
    }
    queue_.Close();
    Try([&] { backup_.Close(); });
    DeleteWhenEmpty();
    done = true;
  });
}

// Rewrites the file without the orders dealt with; the lines of the posted ones go to the backup.
bool CsvOrderImporter::SettleFile() {
  WorkQueue::Rewrite rewrite(queue_);
  std::vector<ByteRange> posted;
  if (!Try([&] { DealOut(rewrite, posted); })) return false;
  if (backup_.IsOpen() && !Try([&] { backup_.Append(queue_.File(), queue_.Path(), posted); })) return false;
  if (!Try([&] { rewrite.Claim(); })) return false;
  {
    const HandlerOff off(Errors());
    Try([&] { rewrite.Replace(); });
  }
  return Try([&] { backup_.Settle(); });
}

// Copies what stays to the temporary file and collects the posted ranges.
void CsvOrderImporter::DealOut(WorkQueue::Rewrite& rewrite, std::vector<ByteRange>& posted) {
  rewrite.Begin();
  posted.clear();
  const std::size_t columns = line_.ColumnsFor(kNumberField);
  std::string number;
  std::optional<std::int32_t> outcome = processed_.Find(number);
  LineReader& lines = queue_.Lines();
  lines.Seek(1);
  do {
    for (Line line; lines.Read(line);) {
      line_.Read(line.text, columns);
      if (const std::string_view here = line_[OrderField::PONUMBER]; here != number) {
        number = here;
        outcome = processed_.Find(number);
      }
      if (!outcome) {
        rewrite.Keep(line);
      } else if (*outcome > 0) {
        Extend(posted, line);
      }
    }
    rewrite.Finish();
    // A mailbox that doesn't ask for the hold may have added lines meanwhile.
  } while (queue_.File().Length() >= lines.Position());
}

void CsvOrderImporter::DeleteWhenEmpty() {
  if (Str(Document().Options) != kDeleteOnEmpty) return;
  const HandlerOff off(Errors());
  Try([&] {
    if (FileSystem().Length(fileName_) == 0) FileSystem().Delete(fileName_);
  });
}

bool CsvOrderImporter::Delete(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Delete", false, [&](bool& done) {
    CallLog log(*this, "Delete", vtErrorLog);
    const ListedOrder* const entry = EntryOfRow(a_lRowNum);
    if (entry == nullptr) return;
    const auto begin = static_cast<std::uint64_t>(entry->FilePos);
    std::uint64_t end = 0;
    if (entry != &listed_.back()) {
      end = static_cast<std::uint64_t>(entry[1].FilePos);
    } else if (!Try([&] { end = queue_.File().Length() + 1; })) {
      return;
    }
    WorkQueue::Rewrite rewrite(queue_);
    if (!Try([&] { CopyAllBut(rewrite, begin, end); }) || !Try([&] { rewrite.Claim(); }) ||
        !Try([&] { rewrite.Replace(); })) {
      return;
    }
    queue_.Close();
    DeleteWhenEmpty();
    log.Note(kInformation, "Transaction deleted from file.");
    done = true;
  });
}

// A line of the transaction is any that ends behind its begin and not beyond its end.
void CsvOrderImporter::CopyAllBut(WorkQueue::Rewrite& rewrite, std::uint64_t begin, std::uint64_t end) {
  rewrite.Begin();
  LineReader& lines = queue_.Lines();
  lines.Seek(1);
  for (Line line; lines.Read(line);) {
    if (line.End() <= begin || line.End() > end) rewrite.Keep(line);
  }
  rewrite.Finish();
}

void CsvOrderImporter::Cancel() {
  Procedure("Sub Cancel", false, [&](bool&) {
    queue_.Close();
    Try([&] { backup_.Close(); });
  });
}

void CsvOrderImporter::SetFields(std::string_view aLine, std::vector<std::string>& aFields) const {
  DelimitedLine split(aFields.size());
  split.Split(aLine);
  for (std::size_t field = 0; field < aFields.size(); ++field) {
    if (!split[field].empty()) aFields[field] = split[field];
  }
}

}  // namespace partnerkit::orders

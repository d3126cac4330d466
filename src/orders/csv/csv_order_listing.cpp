// Listing a CSV order file: from the map and the file to the rows.
#include <algorithm>
#include <exception>
#include <utility>

#include "orders/csv/csv_order_importer.h"
#include "orders/order_columns.h"
#include "orders/products_from_orders.h"
#include "values/dates.h"

namespace partnerkit::orders {

namespace {

// What listing looks at in a line.
constexpr OrderField kListingFields[] = {
    OrderField::INTCONTROLNO,   OrderField::GRPCONTROLNO, OrderField::TRNCONTROLNO,      OrderField::PARTNEREDIADDR,
    OrderField::COMPANYEDIADDR, OrderField::PODATE,       OrderField::SHIPTOLOCPARTNERNO};

// The usual fields without those that the partner doesn't send, then those that only it sends.
std::vector<OrderField> ExpectedFields(const CsvOrderValues& values) {
  std::vector<OrderField> fields;
  for (std::size_t field = 0; field < kUsualOrderFields; ++field) {
    const auto usual = static_cast<OrderField>(field);
    if (std::ranges::find(values.removed, usual) == values.removed.end()) fields.push_back(usual);
  }
  fields.insert(fields.end(), values.added.begin(), values.added.end());
  return fields;
}

}  // namespace

CsvOrderImporter::CsvOrderImporter(const CsvOrderValues& values, const Ports& ports)
    : OrderImporter(values.className, ports), values_(values), backup_(FileSystem()) {}

bool CsvOrderImporter::Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) {
  return Procedure("Function Init", false, [&](bool& done) {
    Bind(system, EDIDocId);
    listed_.clear();
    unsettled_.clear();
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
    if (!Try([&] { NoteBackedUp(backup_.Finished()); }) || !Try([&] { backup_.Settle(); })) return;
    done = true;
  });
}

std::int32_t CsvOrderImporter::Load(const std::string& a_sFileName, RowTable& a_vtRows) {
  return Procedure("Function Load", std::int32_t{0}, [&](std::int32_t& rows) {
    fileName_ = a_sFileName;
    if (!mapLoaded_ && !OpenMapFile(std::string(Str(Document().MapFolder)).append(Str(Document().MapFile)))) return;
    if (SetOrderList(fileName_)) rows = ShowRows(a_vtRows);
  });
}

bool CsvOrderImporter::OpenMapFile(const std::string& path) {
  return Procedure("Function OpenMapFile", false, [&](bool& open) {
    if (!TakeMapFile(path) || !ExpectFields()) return;
    line_.SetColumns(fieldMap_, mapHeader_.size(), values_.quotesProtectCommas);
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
  for (const OrderField field : ExpectedFields(values_)) {
    if (FindColumn(mapHeader_, fieldMap_.Add(Name(field)))) continue;
    WriteLog(kWarning, "OpenMapFile",
             "Expected field " + std::string(Name(field)) + " not found. \r\n Add this item to your " +
                 std::string(Str(Document().MapFile)) + " file.");
    return false;
  }
  for (const OrderField field : values_.optional) FindColumn(mapHeader_, fieldMap_.Add(Name(field)));
  return true;
}

bool CsvOrderImporter::SetOrderList(const std::string& path) {
  return Procedure("Function SetOrderList", false, [&](bool& listed) {
    listed_.clear();
    twins_.clear();
    ForgetRows();
    if (!FindOrderFile(path) || !HoldOrderFile(path)) return;
    lines_.emplace(queue_.File());
    if (!ListTransactions()) return;
    ForgetUnlisted();
    if (values_.importsProducts && !Str(OwnCompany().ProductImportFile).empty()) ImportProduct(*this);
    listed = true;
  });
}

// False when the file cannot be an order file.
bool CsvOrderImporter::ListTransactions() {
  if (!Try([&] { lines_->Seek(queue_.Begin()); })) throw ErrorHandling::LeaveProcedure{};
  std::int64_t lineNo = 0;
  try {
    ListLines(lineNo);
  } catch (const LineTooLong&) {
    WriteLog(
        kRejection, "SetOrderList",
        "Line " + std::to_string(lineNo + 1) + " of " + fileName_ + " is longer than 64 MB, as no order's line is.");
    return false;
  }
  return true;
}

void CsvOrderImporter::ListLines(std::int64_t& lineNo) {
  const std::size_t columns = std::max(
      {line_.ColumnsFor(kListingFields), line_.ColumnsFor(values_.lineKey), line_.ColumnsFor(values_.orderKey)});
  std::string lastTransaction, firstLine, transaction, lineKey, number;
  std::uint64_t before = 0, last = 0;
  bool ended = true;
  for (Line line; ReadLine(line);) {
    ++lineNo;
    before = std::exchange(last, line.position);
    ended = line.ended;
    if (values_.skipsBlankLines && TrimBlanks(line.text).empty()) continue;
    line_.Read(line.text, columns);
    if (!line.ended) WarnOfCutLine(line, lineNo);
    line_.Join(values_.transactionKey, transaction);
    JoinLineKey(lineKey);
    if (transaction == lastTransaction && lineKey != firstLine) continue;
    // A foreign transaction leaves the keys alone: each of its lines is looked at, and passed over, again.
    if (!IsOurs()) continue;
    ListedOrder& entry = listed_.emplace_back();
    entry.InterchangeCtl = line_[OrderField::INTCONTROLNO];
    if (values_.transactionKey.size() == std::size(kTransactionKey)) entry.GroupCtl = line_[OrderField::GRPCONTROLNO];
    entry.TransactionCtl = line_[OrderField::TRNCONTROLNO];
    entry.PONo = OrderNumber(number);
    entry.PODate = OrderDate(line_[OrderField::PODATE]);
    entry.FilePos = static_cast<std::int64_t>(line.position);
    entry.line = lineNo;
    lastTransaction = transaction;
    firstLine = lineKey;
  }
  listedTo_ = lines_->Position();
  // A file of one line is held against its map.
  if (ended) lastLineNeeds_ = 0;
  else lastLineNeeds_ = before == 0 ? line_.ColumnsFor(ExpectedFields(values_)) : FieldsAt(before);
}

std::size_t CsvOrderImporter::FieldsAt(std::uint64_t position) {
  Line line;
  lines_->Seek(position);
  return ReadLine(line) ? CountFields(line.text) : 0;
}

// Nobody can tell yet whose line it is.
void CsvOrderImporter::WarnOfCutLine(const Line& line, std::int64_t lineNo) {
  if (TrimBlanks(line.text).empty() || CountFields(line.text) >= line_.ColumnsFor(kAddresses)) return;
  WriteLog(
      kWarning, "SetOrderList",
      "Line " + std::to_string(lineNo) + " of " + fileName_ +
          " stops before its EDI addresses, at the end of the file: an upload that isn't finished. It stays there.");
}

std::string_view CsvOrderImporter::OrderNumber(std::string&) const { return line_[OrderField::PONUMBER]; }

void CsvOrderImporter::JoinLineKey(std::string& key) const {
  key.clear();
  for (const OrderField field : values_.lineKey) {
    key += field == OrderField::BUYINGLOCPARTNERNO ? BuyingLocn() : line_[field];
  }
}

bool CsvOrderImporter::IsOurs() const {
  return line_[OrderField::PARTNEREDIADDR] == Str(Document().PartnerEDIAddr) &&
         line_[OrderField::COMPANYEDIADDR] == Str(Document().CompanyEDIAddr);
}

// Reads the order file's next line. False at its end. A line that cannot be read leaves the procedure even when the
// user says to go on: taken for the end of the file, it would cut an order short.
bool CsvOrderImporter::ReadLine(Line& line) {
  bool read = false;
  std::exception_ptr tooLong;
  const auto readOne = [&] {
    try {
      read = Lines().Read(line);
    } catch (const LineTooLong&) {
      tooLong = std::current_exception();
    }
  };
  if (!Try(readOne)) throw ErrorHandling::LeaveProcedure{};
  if (tooLong) std::rethrow_exception(tooLong);
  return read;
}

LineReader& CsvOrderImporter::Lines() {
  queue_.File();
  return *lines_;
}

void CsvOrderImporter::SetFields(std::string_view aLine, std::vector<std::string>& aFields) const {
  DelimitedLine split(aFields.size(), values_.quotesProtectCommas);
  split.Split(aLine);
  for (std::size_t field = 0; field < aFields.size(); ++field) {
    if (split[field].data() != nullptr) aFields[field] = split[field];
  }
}

}  // namespace partnerkit::orders

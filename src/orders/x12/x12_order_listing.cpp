// Listing an X12 order file: from the file to the rows, with an acknowledgement for each group on the way.
#include "frame/delimited.h"
#include "orders/functional_ack.h"
#include "orders/order_columns.h"
#include "orders/x12/x12_order_importer.h"

namespace partnerkit::orders {

X12OrderImporter::X12OrderImporter(const X12OrderValues& values, const Ports& ports)
    : OrderImporter(values.className, ports), values_(values) {}

bool X12OrderImporter::Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) {
  return Procedure("Function Init", false, [&](bool& done) {
    Bind(system, EDIDocId);
    listed_.clear();
    listedWhole_ = false;
    Columns = OrderColumns();
    done = true;
  });
}

std::int32_t X12OrderImporter::Load(const std::string& a_sFileName, RowTable& a_vtRows) {
  return Procedure("Function Load", std::int32_t{0}, [&](std::int32_t& rows) {
    fileName_ = a_sFileName;
    listedWhole_ = SetOrderList(fileName_);
    // What a walk that was stopped has listed is nothing to settle.
    if (listedWhole_) rows = ShowRows(a_vtRows);
    else listed_.clear();
  });
}

bool X12OrderImporter::SetOrderList(const std::string& path) {
  return Procedure("Function SetOrderList", false, [&](bool& listed) {
    listed_.clear();
    if (!FindOrderFile(path)) return;
    if (values_.archives) Archive(path);
    if (!HoldOrderFile(path)) return;
    segments_.emplace(queue_.File(), SegmentSyntax{.terminator = values_.wholeLines ? '\0' : '~',
                                                   .otherEnd = values_.otherEnd,
                                                   .wholeLines = values_.wholeLines});
    listed = WalkFile();
  });
}

// A copy under the same name, in the place of an older one. A folder that cannot be written to is nobody's trouble.
void X12OrderImporter::Archive(const std::string& path) {
  const HandlerOff off(Errors());
  const std::string folder = std::string(Str(Document().MapFolder)) + "archive";
  Try([&] { FileSystem().CreateFolder(folder); });
  Try([&] { FileSystem().Copy(path, folder + "/" + path.substr(path.find_last_of("/\\") + 1)); });
}

X12Walk X12OrderImporter::Walk() const { return {values_, Document().PartnerEDIAddr, Document().CompanyEDIAddr}; }

// False when a group could not be acknowledged.
bool X12OrderImporter::WalkFile() {
  X12Walk walk = Walk();
  std::string gs;
  int transactions = 0;
  ListedOrder entry;
  while (NextSegment()) {
    const X12Walk::Event event = walk.Take(segment_);
    if (event == X12Walk::Event::kGroupEnds && !ProcessFA(gs, transactions)) return false;
    if (walk.OpensInterchange()) interchangeCtl_ = Element(13);
    if (event == X12Walk::Event::kGroupBegins) {
      gs = segment_.Text();
      groupCtl_ = Element(6);
      transactions = 0;
    } else if (event == X12Walk::Event::kTransactionBegins) {
      ++transactions;
      entry = BeginEntry();
    } else if (event == X12Walk::Event::kOrderBegins) {
      CompleteEntry(entry);
      listed_.push_back(std::move(entry));
    }
  }
  listedTo_ = Segments().Position();
  return !walk.InOrders() || ProcessFA(gs, transactions);
}

ListedOrder X12OrderImporter::BeginEntry() {
  ListedOrder entry;
  entry.InterchangeCtl = interchangeCtl_;
  entry.GroupCtl = groupCtl_;
  entry.TransactionCtl =
      Try([&] { return std::string(TrimBlanks(segment_.Rest(8).substr(0, values_.longestControl))); });
  entry.FilePos = static_cast<std::int64_t>(segment_.End());
  return entry;
}

void X12OrderImporter::CompleteEntry(ListedOrder& entry) {
  entry.PONo = OrderNumber();
  // A change has its date behind the number of the change.
  entry.PODate = Try([&] { return segment_.Date(segment_.Begins("BCH") ? 6 : 5); });
}

// Tells the sender that the group came, unless an earlier run did. A group without orders gets its word, too.
bool X12OrderImporter::ProcessFA(std::string_view gs, int transactions) {
  if (gs.find(kAcknowledged) != std::string_view::npos) return true;
  return WriteFunctionalAck(*this, *X12EnvelopeOf(values_.className, "997"), "PO", "FA_PO_", groupCtl_, transactions);
}

bool X12OrderImporter::ReadSegment() {
  SegmentReader& segments = Segments();
  if (segments.AtEnd()) return false;
  const Segment segment = segments.Read();
  if (values_.wholeLines) segment_.TakeLine(segment);
  else segment_.Take(segment);
  if (values_.cutsApostrophe && !segment.terminated) segment_.CutApostrophe();
  return true;
}

bool X12OrderImporter::NextSegment() {
  bool read = false;
  if (!Try([&] { read = ReadSegment(); })) throw ErrorHandling::LeaveProcedure{};
  return read;
}

SegmentReader& X12OrderImporter::Segments() {
  queue_.File();
  return *segments_;
}

void X12OrderImporter::CloseOrderFile() {
  segments_.reset();
  queue_.Close();
}

}  // namespace partnerkit::orders

// Listing an X12 order file: from the file to the rows, with an acknowledgement for each group on the way.
#include <algorithm>
#include <span>

#include "orders/functional_ack.h"
#include "orders/order_columns.h"
#include "orders/x12/x12_order_importer.h"
#include "values/delimited.h"

namespace partnerkit::orders {

namespace {

// Raises RunTimeError.
bool BeginsWith(InputFile& file, InputFile& front) {
  std::vector<char> wanted(256 * 1024), found(wanted.size());
  for (std::uint64_t offset = 0;;) {
    const std::size_t read = front.ReadAt(offset, wanted);
    if (read == 0) return true;
    std::size_t got = 0;
    while (got < read) {
      const std::size_t more = file.ReadAt(offset + got, std::span(found).subspan(got, read - got));
      if (more == 0) return false;
      got += more;
    }
    if (!std::equal(found.begin(), found.begin() + static_cast<std::ptrdiff_t>(read), wanted.begin())) return false;
    offset += read;
  }
}

}  // namespace

X12OrderImporter::X12OrderImporter(const X12OrderValues& values, const Ports& ports)
    : OrderImporter(values.className, ports), values_(values) {}

bool X12OrderImporter::Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) {
  return Procedure("Function Init", false, [&](bool& done) {
    Bind(system, EDIDocId);
    listed_.clear();
    unsettled_.clear();
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
    ForgetRows();
    if (!FindOrderFile(path)) return;
    if (values_.archives) Archive(path);
    if (!HoldOrderFile(path)) return;
    segments_.emplace(queue_.File(), SegmentSyntax{.terminator = values_.wholeLines ? '\0' : '~',
                                                   .otherEnd = values_.otherEnd,
                                                   .wholeLines = values_.wholeLines});
    if (!WalkFile()) return;
    ForgetUnlisted();
    listed = true;
  });
}

// A copy under the same name. A folder that cannot be written to stops nothing.
void X12OrderImporter::Archive(const std::string& path) {
  const std::string folder = std::string(Str(Document().MapFolder)) + "archive";
  const std::string archived = folder + "/" + path.substr(path.find_last_of("/\\") + 1);
  try {
    FileSystem().CreateFolder(folder);
  } catch (const RunTimeError&) {
    // It is there, as a rule.
  }
  try {
    KeepArchived(path, archived);
    FileSystem().Copy(path, archived);
  } catch (const RunTimeError& error) {
    Tell(Told::kDone, "The file " + path + " is not archived: " + error.Description());
  }
}

// An earlier copy is replaced only by a file that begins with all of it. One that holds what has left the file since,
// or another day's orders, stays under a number.
void X12OrderImporter::KeepArchived(const std::string& path, const std::string& archived) {
  Files& files = FileSystem();
  if (!files.Exists(archived)) return;
  bool contained = files.Length(archived) <= files.Length(path);
  if (contained) {
    const auto now = files.OpenInput(path, Share::kDenyWrite), before = files.OpenInput(archived, Share::kDenyWrite);
    contained = BeginsWith(*now, *before);
  }
  if (!contained) RenameToFree(files, archived, archived);
}

X12Walk X12OrderImporter::Walk() const { return {values_, Document().PartnerEDIAddr, Document().CompanyEDIAddr}; }

// False when a group could not be acknowledged.
bool X12OrderImporter::WalkFile() {
  X12Walk walk = Walk();
  Group group;
  ListedOrder entry;
  if (!Try([&] { Segments().Seek(queue_.Begin()); })) throw ErrorHandling::LeaveProcedure{};
  while (NextSegment()) {
    const X12Walk::Event event = walk.Take(segment_);
    if (event == X12Walk::Event::kGroupEnds && !ProcessFA(group)) return false;
    if (walk.OpensInterchange()) BeginInterchange();
    if (event == X12Walk::Event::kGroupBegins) {
      group = BeginGroup();
    } else if (event == X12Walk::Event::kTransactionBegins) {
      ++group.transactions;
      entry = BeginEntry(group);
    } else if (event == X12Walk::Event::kOrderBegins) {
      CompleteEntry(entry);
      listed_.push_back(std::move(entry));
    }
  }
  listedTo_ = Segments().Position();
  return !walk.InOrders() || ProcessFA(group);
}

// What cannot be read of an envelope or of a beginning makes rows that are turned away, and stay: the rest of the file
// goes on.
void X12OrderImporter::BeginInterchange() {
  interchangeCtl_.clear();
  interchangeFault_.clear();
  try {
    interchangeCtl_ = Element(13);
  } catch (const Unreadable& fault) {
    interchangeFault_ = fault.why;
  }
}

X12OrderImporter::Group X12OrderImporter::BeginGroup() {
  Group group;
  group.header = segment_.Text();
  try {
    group.control = Element(6);
  } catch (const Unreadable& fault) {
    group.fault = fault.why;
  }
  return group;
}

ListedOrder X12OrderImporter::BeginEntry(const Group& group) {
  ListedOrder entry;
  entry.InterchangeCtl = interchangeCtl_;
  entry.GroupCtl = group.control;
  entry.fault = interchangeFault_.empty() ? group.fault : interchangeFault_;
  entry.FilePos = static_cast<std::int64_t>(segment_.End());
  try {
    entry.TransactionCtl = TrimBlanks(segment_.Rest(8).substr(0, values_.longestControl));
  } catch (const RunTimeError& error) {
    entry.fault = Fault(error).why;
  }
  return entry;
}

void X12OrderImporter::CompleteEntry(ListedOrder& entry) {
  try {
    entry.PONo = OrderNumber();
    // A change has its date behind the number of the change.
    entry.PODate = segment_.Date(segment_.Begins("BCH") ? 6 : 5);
  } catch (const Unreadable& fault) {
    entry.fault = fault.why;
  } catch (const RunTimeError& error) {
    entry.fault = Fault(error).why;
  }
}

// Tells the sender that the group came, unless an earlier run did. A group without orders gets its word, too.
bool X12OrderImporter::ProcessFA(const Group& group) {
  if (group.header.find(kAcknowledged) != std::string_view::npos) return true;
  if (!group.fault.empty()) {
    WriteLog(kRejection, "SetOrderList", "A group cannot be acknowledged: " + group.fault);
    return true;
  }
  return WriteFunctionalAck(*this, *X12EnvelopeOf(values_.className, "997"), "PO", "FA_PO_", group.control,
                            group.transactions);
}

bool X12OrderImporter::ReadSegment() {
  SegmentReader& segments = Segments();
  if (segments.AtEnd()) return false;
  const Segment segment = segments.Read();
  // Half a segment is an upload that isn't finished. What it says must not be taken for the whole.
  if (!segment.ended && !segment.text.empty() && !EndsInterchange(segment.text)) {
    segments.Seek(segment.begin);
    segment_.Take({});
    return false;
  }
  if (values_.wholeLines) segment_.TakeLine(segment);
  else segment_.Take(segment);
  if (values_.cutsApostrophe && !segment.terminated) segment_.CutApostrophe();
  return true;
}

// The whole trailer of the last interchange, though nothing ends it.
bool X12OrderImporter::EndsInterchange(std::string_view text) const {
  return text.starts_with("IEA*") && !interchangeCtl_.empty() && text.ends_with("*" + interchangeCtl_);
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

// Settling an X12 order file: the rewrite without what is done, and the removal of one transaction.
#include <algorithm>
#include <array>

#include "files/ctrl_z.h"
#include "orders/x12/x12_order_importer.h"
#include "values/delimited.h"

namespace partnerkit::orders {

namespace {

constexpr std::string_view kLineEnd = "\r\n";

// The group's header with the mark that it was acknowledged.
std::string Marked(std::string_view gs) {
  if (gs.find(kAcknowledged) != std::string_view::npos) return std::string(gs);
  const std::size_t end = std::min(gs.find('~'), gs.size());
  return std::string(gs.substr(0, end)).append(kAcknowledged).append(gs.substr(end));
}

bool IsBlank(std::string_view text) {
  return std::ranges::all_of(text, [](unsigned char c) { return c <= ' '; });
}

}  // namespace

// Writes what stays of the file. An envelope's opening segment is held until something within it is written: so an
// envelope that holds nothing disappears. The segments of a transaction that is done go, but its ST and SE stay as an
// empty pair, which the next rewrite sweeps away; a file in which nothing else is left is not kept at all.
//
// What isn't ours to judge stays byte for byte: interchanges of others, groups that hold no orders, and what stands
// outside of all interchanges. So does, as segments, a transaction that could not be listed.
class X12OrderImporter::Sweep {
 public:
  Sweep(X12OrderImporter& importer, WorkQueue::Rewrite& rewrite)
      : importer_(importer), rewrite_(rewrite), walk_(importer.Walk()) {}

  // Keeps what isn't done.
  void Settle() {
    Run([this](const X12Segment& segment, X12Walk::Event event) {
      if (OpensTransaction(segment, event)) Judge(segment, event);
      CleanUp(segment, event);
    });
  }

  // Keeps everything but the transaction whose ST ends at the position; of that, the envelope stays.
  void TakeOut(std::uint64_t position) {
    bool doomed = false;
    Run([&](const X12Segment& segment, X12Walk::Event event) {
      if (walk_.At() != X12Walk::Place::kOrders || OpensTransaction(segment, event)) doomed = false;
      if (!doomed || IsEnvelopeSegment(segment.Text())) Write(segment);
      if (event == X12Walk::Event::kTransactionBegins && segment.End() == position) doomed = true;
    });
  }

  bool AnythingLeft() const { return anyLeft_; }

 private:
  // An opening segment that waits to be written.
  struct Held {
    std::string text;
    bool pending = false;
  };

  // Listing is content with less of a tag than its separator.
  static bool OpensTransaction(const X12Segment& segment, X12Walk::Event event) {
    return event == X12Walk::Event::kTransactionBegins || segment.Begins("ST*");
  }

  template <class F>
  void Run(F take) {
    rewrite_.Begin();
    importer_.Segments().Seek(importer_.queue_.Begin());
    while (importer_.ReadSegment()) {
      const X12Segment& segment = importer_.segment_;
      const X12Walk::Event event = walk_.Take(segment);
      NoteAdded(segment);
      if (added_ || IsForeign(segment)) {
        KeepUntouched(segment);
      } else {
        CopyUntouched(segment.Begin());
        take(segment, event);
      }
    }
    std::uint64_t end = importer_.Segments().Position();
    CopyUntouched(end);
    if (walk_.InInterchange()) KeepOpen();
    KeepCtrlZ(end);
    rewrite_.Finish(end - 1);
    // The mailbox may still be at it.
    for (std::uint64_t length; (length = importer_.queue_.File().Length()) >= end; end = length + 1) {
      rewrite_.KeepRange({end, length + 1});
      rewrite_.Finish(length);
      anyLeft_ = true;
    }
  }

  // The file ends within the interchange: the rest of an upload will be appended, and needs what it stands in.
  void KeepOpen() {
    WriteHeld(interchange_);
    if (walk_.InOrders()) WriteHeld(group_);
    if (inTransaction_) WriteHeld(transaction_);
    anyLeft_ = true;
  }

  // Old systems end a file with it; it stays behind whatever does.
  void KeepCtrlZ(std::uint64_t end) {
    if (wasUntouched_) return;
    std::array<char, 1> last{};
    if (rewrite_.Empty() || end < 2 || importer_.queue_.File().ReadAt(end - 2, last) == 0) return;
    if (last[0] == kCtrlZ) rewrite_.Keep({last.data(), 1});
  }

  // A mailbox that doesn't ask for the hold may have added to the file since it was listed. What it added of a group is
  // settled with it; later groups were neither listed nor acknowledged, and stay as they are for the next run.
  void NoteAdded(const X12Segment& segment) {
    if (segment.End() > importer_.listedTo_ && (segment.Begins("ISA") || segment.Begins("GS"))) added_ = true;
  }

  bool IsForeign(const X12Segment& segment) const {
    switch (walk_.At()) {
      case X12Walk::Place::kForeign:
      case X12Walk::Place::kOtherGroup:
        return true;
      case X12Walk::Place::kOutside:
        return untouchedFrom_ != 0 || !IsBlank(segment.Text());
      default:
        return false;
    }
  }

  void KeepUntouched(const X12Segment& segment) {
    if (untouchedFrom_ != 0) return;
    if (segment.Begins("GS")) WriteHeld(interchange_);
    untouchedFrom_ = segment.Begin();
    anyLeft_ = true;
  }

  void CopyUntouched(std::uint64_t end) {
    wasUntouched_ = untouchedFrom_ != 0;
    if (wasUntouched_) rewrite_.KeepRange({untouchedFrom_, end});
    untouchedFrom_ = 0;
  }

  // The fate of the transaction that begins.
  void Judge(const X12Segment& st, X12Walk::Event event) {
    inTransaction_ = true;
    keep_ = true;
    const std::vector<ListedOrder>& listed = importer_.listed_;
    if (event != X12Walk::Event::kTransactionBegins || next_ == listed.size() ||
        listed[next_].FilePos != static_cast<std::int64_t>(st.End())) {
      return;
    }
    const ListedOrder& entry = listed[next_++];
    // Another control number: the file was written over since it was listed.
    keep_ = !entry.done || TrimBlanks(st.Rest(8).substr(0, importer_.values_.longestControl)) != entry.TransactionCtl;
    if (keep_) anyLeft_ = true;
  }

  void CleanUp(const X12Segment& segment, X12Walk::Event event) {
    const std::string_view text = segment.Text();
    if (segment.Overlong()) return WriteAll(segment);
    if (segment.Begins("ISA")) {
      Hold(interchange_, text);
    } else if (event == X12Walk::Event::kGroupBegins || segment.Begins("GS*")) {
      Hold(group_, Marked(text));
    } else if (OpensTransaction(segment, event)) {
      Hold(transaction_, text);
    } else if (segment.Begins("SE*")) {
      inTransaction_ = false;
      WriteClosing(transaction_, segment);
    } else if (event == X12Walk::Event::kGroupEnds || segment.Begins("GE*")) {
      inTransaction_ = false;
      WriteClosing(group_, segment);
    } else if (segment.Begins("IEA")) {
      WriteClosing(interchange_, segment);
    } else if (importer_.values_.keepsBareSegments || (!text.empty() && text != kAcknowledged)) {
      WriteAll(segment);
    }
  }

  // The segment, and before it the envelope that waits for one.
  void WriteAll(const X12Segment& segment) {
    for (Held* held : {&interchange_, &group_, &transaction_}) WriteHeld(*held);
    if (!keep_) return;
    Write(segment);
    if (inTransaction_ && !IsBlank(segment.Text())) anyLeft_ = true;
  }

  static void Hold(Held& held, std::string_view text) { held = {std::string(text), true}; }

  void WriteHeld(Held& held) {
    if (held.pending) Write(held.text);
    held.pending = false;
  }

  // Of an envelope that is still held, nothing was written: it goes as a whole.
  void WriteClosing(Held& opening, const X12Segment& closing) {
    if (!opening.pending) Write(closing);
    opening.pending = false;
  }

  void Write(const X12Segment& segment) {
    if (segment.Text().empty() && !importer_.values_.keepsBareSegments) return;
    if (!segment.Overlong()) return Write(segment.Text());
    rewrite_.KeepRange({segment.Begin(), segment.Begin() + segment.Length()});
    Write(std::string_view());
  }

  void Write(std::string_view text) {
    rewrite_.Keep(text);
    if (!importer_.values_.wholeLines) rewrite_.Keep("~");
    rewrite_.Keep(kLineEnd);
  }

  X12OrderImporter& importer_;
  WorkQueue::Rewrite& rewrite_;
  X12Walk walk_;
  Held interchange_, group_, transaction_;
  std::size_t next_ = 0;  // the listed order that comes next
  bool keep_ = true;
  bool inTransaction_ = false;
  bool anyLeft_ = false;
  bool added_ = false;  // the segments in hand came after the listing
  std::uint64_t untouchedFrom_ = 0;
  bool wasUntouched_ = false;  // what came last was copied as it stands
};

bool X12OrderImporter::Term() {
  return Procedure("Function Term", false, [&](bool& done) {
    Try([&] { queue_.File(); });
    // Nothing leaves the file before the store holds it for good.
    if (listedWhole_ && (!MakeDurable() || !SettleFile())) return;
    CloseOrderFile();
    DeleteWhenEmpty();
    done = true;
  });
}

bool X12OrderImporter::SettleFile() {
  WorkQueue::Rewrite rewrite(queue_, TellOfRewrite());
  bool anyLeft = false;
  const auto settle = [&] {
    Sweep sweep(*this, rewrite);
    sweep.Settle();
    anyLeft = sweep.AnythingLeft();
  };
  if (!Try(settle) || !Try([&] { rewrite.Claim(); })) return false;
  const bool settled = PutInPlace([&] {
    if (anyLeft) rewrite.Replace();
    else rewrite.Remove(values_.deletesTemporary);
  });
  if (settled) ForgetUnsettled();
  return true;
}

bool X12OrderImporter::Delete(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Delete", false, [&](bool& done) {
    CallLog log(*this, "Delete", vtErrorLog);
    const ListedOrder* const entry = EntryOfRow(a_lRowNum);
    if (entry == nullptr) return;
    WorkQueue::Rewrite rewrite(queue_, TellOfRewrite());
    const auto takeOut = [&] { Sweep(*this, rewrite).TakeOut(static_cast<std::uint64_t>(entry->FilePos)); };
    if (!Try(takeOut) || !Try([&] { rewrite.Claim(); }) || !Try([&] { rewrite.Replace(); })) return;
    CloseOrderFile();
    DeleteWhenEmpty();
    log.Note(kInformation, "Transaction deleted from file.");
    done = true;
  });
}

void X12OrderImporter::Cancel() {
  Procedure("Sub Cancel", false, [&](bool&) {
    if (values_.cancelSettles && !listed_.empty() && queue_.IsOpen()) Term();
    CloseOrderFile();
  });
}

}  // namespace partnerkit::orders

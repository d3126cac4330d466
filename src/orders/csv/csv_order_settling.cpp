// Settling a CSV order file: the rewrite without what is done, and the removal of one transaction.
#include <algorithm>

#include "orders/csv/csv_order_importer.h"

namespace partnerkit::orders {

namespace {

// Adds a line to the ranges; lines that follow each other make one range.
void Extend(std::vector<ByteRange>& ranges, const Line& line) {
  if (!ranges.empty() && ranges.back().end == line.position) {
    ranges.back().end = line.End();
  } else {
    ranges.push_back({line.position, line.End()});
  }
}

}  // namespace

bool CsvOrderImporter::Term() {
  return Procedure("Function Term", false, [&](bool& done) {
    Try([&] { queue_.File(); });
    // With nothing to take out, the file stays as it is.
    if (!processed_.Empty() || values_.skipsBlankLines) {
      // Nothing leaves the file before the store holds it for good.
      Try([&] { Host().Commit(0); });
      if (!SettleFile()) return;
    }
    CloseOrderFile();
    Try([&] { backup_.Close(); });
    DeleteWhenEmpty(values_.deleteOnEmptyAnywhere);
    done = true;
  });
}

// Rewrites the file without the orders dealt with; the lines of the posted ones go to the backup.
bool CsvOrderImporter::SettleFile() {
  WorkQueue::Rewrite rewrite(queue_, TellOfRewrite());
  std::vector<ByteRange> posted;
  if (!Try([&] { DealOut(rewrite, posted); })) return false;
  const std::vector<std::int32_t> orders(unsettled_.begin(), unsettled_.end());
  if (backup_.IsOpen() && !Try([&] { backup_.Append(queue_.File(), queue_.Path(), posted, orders); })) return false;
  if (!Try([&] { rewrite.Claim(); })) return false;
  if (PutInPlace([&] { rewrite.Replace(); })) {
    ForgetUnsettled();
  } else if (backup_.IsOpen() && !Try([&] { NoteBackedUp(orders); })) {
    return false;
  }
  return Try([&] { backup_.Settle(); });
}

// Copies what stays to the draft and collects the posted ranges. Only what was listed leaves: another company's lines
// stay whatever their number, and so does what a mailbox that doesn't ask for the hold has added meanwhile.
void CsvOrderImporter::DealOut(WorkQueue::Rewrite& rewrite, std::vector<ByteRange>& posted) {
  rewrite.Begin();
  posted.clear();
  const std::size_t controls = values_.settlesByControls ? line_.ColumnsFor(values_.transactionKey) : 0;
  const std::size_t columns = std::max({line_.ColumnsFor(values_.orderKey), line_.ColumnsFor(kAddresses), controls});
  std::string key, number, lastKey;
  std::optional<std::int32_t> outcome = processed_.Find(lastKey);
  LineReader& lines = Lines();
  lines.Seek(queue_.Begin());
  std::uint64_t length = 0;
  do {
    length = queue_.File().Length();
    for (Line line; lines.Read(line);) {
      if (values_.skipsBlankLines && WasListed(line) && TrimBlanks(line.text).empty()) continue;
      line_.Read(line.text, columns);
      SettledKey(key, number);
      if (key != lastKey) {
        lastKey = key;
        outcome = processed_.Find(key);
      }
      if (!outcome || !WasListed(line) || !IsOurs()) {
        rewrite.Keep(line.raw);
      } else if (*outcome > 0) {
        Extend(posted, line);
      }
    }
    rewrite.Finish(length);
  } while (queue_.File().Length() > length);
  // The Ctrl-Z that the file ends with.
  if (rewrite.Empty()) return;
  rewrite.KeepRange({lines.Position(), length + 1});
  rewrite.Finish(length);
}

// What the line's order is dealt with under.
void CsvOrderImporter::SettledKey(std::string& key, std::string& number) const {
  key = OrderNumber(number);
  if (!values_.settlesByControls) return;
  key += '\0';
  for (const OrderField field : values_.transactionKey) key += line_[field];
}

std::string CsvOrderImporter::SettledKey(const ListedOrder& entry) const {
  return values_.settlesByControls ? entry.PONo + '\0' + entry.Controls() : entry.PONo;
}

std::string CsvOrderImporter::SettledKey(const Order& stored) const {
  return values_.settlesByControls ? stored.PONo + '\0' + ControlsOf(stored) : stored.PONo;
}

void CsvOrderImporter::MarkPosted(ListedOrder& entry) { processed_.Add(SettledKey(entry), entry.OrderId); }

bool CsvOrderImporter::Delete(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Delete", false, [&](bool& done) {
    CallLog log(*this, "Delete", vtErrorLog);
    const ListedOrder* const entry = EntryOfRow(a_lRowNum);
    if (entry == nullptr) return;
    const auto begin = static_cast<std::uint64_t>(entry->FilePos);
    const auto end = EndOf(*entry);
    if (!end) return;
    if (!StillStandsAt(begin, *entry)) {
      log.Note(kRejection, "The file " + fileName_ + " has changed since it was listed; nothing is deleted from it.");
      return;
    }
    WorkQueue::Rewrite rewrite(queue_, TellOfRewrite());
    if (!Try([&] { CopyAllBut(rewrite, begin, *end); }) || !Try([&] { rewrite.Claim(); }) ||
        !Try([&] { rewrite.Replace(); })) {
      return;
    }
    CloseOrderFile();
    DeleteWhenEmpty(values_.deleteOnEmptyAnywhere);
    log.Note(kInformation, "Transaction deleted from file.");
    done = true;
  });
}

// Raises RunTimeError.
bool CsvOrderImporter::StillStandsAt(std::uint64_t position, const ListedOrder& entry) {
  Line line;
  std::string number, key;
  Lines().Seek(position);
  if (!ReadLine(line)) return false;
  line_.Read(line.text);
  line_.Join(values_.transactionKey, key);
  return OrderNumber(number) == entry.PONo && key == entry.Controls() && IsOurs();
}

// Of the lines up to the next row's, another company's and those that came since the listing stay.
void CsvOrderImporter::CopyAllBut(WorkQueue::Rewrite& rewrite, std::uint64_t begin, std::uint64_t end) {
  rewrite.Begin();
  LineReader& lines = Lines();
  lines.Seek(queue_.Begin());
  for (Line line; lines.Read(line);) {
    const bool inside = line.position >= begin && line.End() <= end && WasListed(line);
    if (inside) line_.Read(line.text, line_.ColumnsFor(kAddresses));
    // Some mailboxes leave segments of an interchange between the lines.
    const bool envelope = IsEnvelopeSegment(line.text);
    const bool nobodys = inside && line_[kAddresses[0]].empty() && line_[kAddresses[1]].empty();
    const bool goes = envelope ? values_.deletesEnvelopes : nobodys || IsOurs();
    if (!inside || !goes) rewrite.Keep(line.raw);
  }
  const std::uint64_t length = queue_.File().Length();
  if (!rewrite.Empty()) rewrite.KeepRange({lines.Position(), length + 1});
  rewrite.Finish(length);
}

void CsvOrderImporter::Cancel() {
  Procedure("Sub Cancel", false, [&](bool&) {
    CloseOrderFile();
    Try([&] { backup_.Close(); });
  });
}

void CsvOrderImporter::CloseOrderFile() {
  lines_.reset();
  queue_.Close();
}

}  // namespace partnerkit::orders

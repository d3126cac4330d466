// Posting one transaction of an X12 order file.
#include <algorithm>
#include <cctype>

#include "orders/order_export.h"
#include "orders/order_store.h"
#include "orders/x12/x12_order_importer.h"
#include "values/delimited.h"

namespace partnerkit::orders {

namespace {

// The transaction ends here: at its SE, or where the file was cut short and goes on with something else. What follows
// is never taken for a part of it.
bool EndsTransaction(std::string_view tag) { return IsOneOf(tag, "SE* ST* GE* GS* IEA ISA"); }

}  // namespace

std::int32_t X12OrderImporter::Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Process", std::int32_t{0}, [&](std::int32_t& orderId) {
    ListedOrder* const entry = EntryOfRow(a_lRowNum);
    if (entry == nullptr || !Reaches(*entry)) return;
    Posting posting(*this, *entry, "Process", vtErrorLog);
    try {
      orderId = PostTransaction(posting) == Next::kEnd ? posting.result : Store(posting);
    } catch (const Unreadable& fault) {
      Refuse(posting, fault);
    } catch (const RunTimeError& error) {
      // A segment too long to have positions, asked for one.
      Refuse(posting, Fault(error));
    }
  });
}

X12OrderImporter::Next X12OrderImporter::PostTransaction(Posting& posting) {
  if (!posting.entry.fault.empty()) throw Unreadable{posting.entry.fault};
  posting.complete = false;
  posting.checks.SetRules(values_.checks);
  BeginPosting(posting);
  Segments().Seek(static_cast<std::uint64_t>(posting.entry.FilePos));
  if (ReadTransaction(posting) == Next::kEnd) return Next::kEnd;
  if (!posting.complete) TellCutShort(posting);
  if (values_.datesDefaultToToday) {
    Order& header = posting.draft.header;
    if (!header.CancelAfter) header.CancelAfter = Now().Date();
    if (!header.NotBefore) header.NotBefore = Now().Date();
  }
  return Next::kGoOn;
}

void X12OrderImporter::TellCutShort(Posting& posting) {
  posting.log.Note(kRejection, "...Cannot process PO " + posting.entry.PONo + ", " + posting.cutBy +
                                   ": the transaction ends here without its " + (posting.begun ? "CTT" : "beginning") +
                                   ". It stays in the file.");
}

// Reads and checks the transaction's segments. Nothing is stored here: an order goes in whole or not at all. A
// transaction without its CTT was cut short.
X12OrderImporter::Next X12OrderImporter::ReadTransaction(Posting& posting) {
  while (NextSegment()) {
    const std::string_view tag = segment_.Text().substr(0, 3);
    Next next = Next::kGoOn;
    if (IsOneOf(tag, values_.beginnings)) {
      if (posting.begun) return CutShort(posting);
      next = TakeBeginning(posting);
    } else if (tag == "CTT") {
      posting.complete = posting.begun;
      if (!posting.complete) return CutShort(posting);
      return Distribute(posting);
    } else if (EndsTransaction(tag)) {
      return CutShort(posting);
    } else if (tag == "DTM") {
      TakeDate(posting.draft.header);
    } else if (tag == "N1*") {
      TakeN1(posting);
    } else if (tag == "SDQ") {
      next = TakeStores(posting);
    } else if (const auto line = std::ranges::find(values_.lines, tag, &LineElements::tag);
               line != values_.lines.end()) {
      next = TakeLine(posting, *line);
    } else if (tag == "CTP") {
      TakeRetail(posting);
    } else if (tag == "PO4") {
      TakePack(posting);
    } else {
      ReadOther(posting);
    }
    if (next == Next::kEnd) return Next::kEnd;
  }
  posting.cutBy = "the end of the file";
  return Next::kGoOn;
}

// With what ends the transaction in hand.
X12OrderImporter::Next X12OrderImporter::CutShort(Posting& posting) {
  posting.cutBy = SegmentText();
  return Next::kGoOn;
}

// A program that doesn't ask for the hold may have written over the file.
void X12OrderImporter::NeedListedOrder(const Posting& posting) {
  if (OrderNumber() == posting.entry.PONo) return;
  throw Unreadable{SegmentText() + ": the file " + fileName_ +
                   " has changed since it was listed, and begins another order here"};
}

X12OrderImporter::Next X12OrderImporter::TakeBeginning(Posting& posting) {
  posting.begun = true;
  NeedListedOrder(posting);
  WarnOfNoNumber(posting, SegmentText());
  const std::string purpose = Element(1), type = Element(2);
  OrderFacts facts;
  facts.purpose = purpose;
  facts.type = type;
  if (SettleStoredOrder(posting, facts, values_.storedOrder, "Process") == Next::kEnd ||
      RefuseNewOrder(posting, facts, values_.newOrder) == Next::kEnd) {
    return Next::kEnd;
  }
  FillHeader(posting);
  posting.draft.header.PurposeCode = purpose;
  posting.draft.header.TypeCode = type;
  return Next::kGoOn;
}

bool X12OrderImporter::SameTransaction(const Order& stored, const ListedOrder& entry) const {
  return Str(stored.InterchangeCtl) == entry.InterchangeCtl && Str(stored.GroupCtl) == entry.GroupCtl &&
         Str(stored.TransactionCtl) == entry.TransactionCtl;
}

void X12OrderImporter::FillHeader(Posting& posting) {
  const ListedOrder& entry = posting.entry;
  Order& header = posting.draft.header;
  header.VendorId = OwnCompany().VendorId;
  header.PartnerId = TradingPartner().PartnerId;
  header.InterchangeCtl = entry.InterchangeCtl;
  header.GroupCtl = entry.GroupCtl;
  header.TransactionCtl = entry.TransactionCtl;
  if (values_.keepsSourceFile) header.SourceFile = fileName_;
  header.FilePos = entry.FilePos;
  header.PONo = entry.PONo;
  header.PODate = entry.PODate;
  header.ImportDate = Now().Date();
  header.Status = kBeingStored;
}

// The qualifier and the date stand at fixed positions.
void X12OrderImporter::TakeDate(Order& order) {
  for (const DateOfOrder& date : values_.dates) {
    if (segment_.Fixed(5, 3) == date.qualifier) order.*date.member = segment_.FixedDate(9);
  }
}

// Only the dates of an order in work can still be changed.
X12OrderImporter::Next X12OrderImporter::ChangeStored(OrderPosting& posting, Order& stored) {
  while (NextSegment()) {
    if (EndsTransaction(segment_.Text().substr(0, 3))) break;
    if (segment_.Begins("DTM")) TakeDate(stored);
    if (!segment_.Begins("CTT")) continue;
    const bool changed = Try([&] {
      if (Update(Records(), stored)) return true;
      if (Records().NativeError() == 0) return false;
      throw RunTimeError(run_time::kDatabase, "The stored PO " + stored.PONo + " cannot be changed");
    });
    if (changed && !MakeDurable()) return Next::kEnd;
    posting.log.Note(kWarning, (changed ? words::kChange : words::kChangeFailed).With(posting.entry.PONo));
    if (changed) posting.result = stored.OrderId;
    return TurnAway(posting);
  }
  return Next::kEnd;
}

void X12OrderImporter::TakeN1(Posting& posting) {
  constexpr int kLocation = 4;
  posting.n1 = Element(kLocation, values_.n1Form);
  if (!values_.directToStore.empty() && posting.n1 == values_.directToStore) return;
  posting.locationLookedAt = posting.n1;
  if (posting.checks.FindLocation(posting.n1) != nullptr) return;
  const std::string shown = values_.showsWholeN1 ? posting.n1 : Element(kLocation, {ElementForm::kSpan, 17});
  posting.checks.Reject("ship to location " + shown + " does not exist.");
}

void X12OrderImporter::Export(OrderPosting& posting) {
  if (values_.exports) ExportOrder(*this, posting.log, posting.draft.header);
}

// "segment SDQ*EA*92*0001 at byte 812".
std::string X12OrderImporter::SegmentText() const {
  constexpr std::size_t kShown = 60;
  const std::string_view text = segment_.Text();
  return "segment " + std::string(text.substr(0, kShown)) + (text.size() > kShown ? "..." : "") + " at byte " +
         std::to_string(segment_.Begin());
}

// What is wrong with the segment in hand. One that is too long has no positions to count by.
Unreadable X12OrderImporter::Fault(const RunTimeError& error) const {
  if (error.Number() == run_time::kOverflow) return {SegmentText() + " is too long to be read"};
  std::string text = error.Description();
  if (!text.empty()) text.front() = static_cast<char>(std::tolower(static_cast<unsigned char>(text.front())));
  return {text};
}

std::string X12OrderImporter::Element(int n, ElementForm form) const {
  try {
    return std::string(segment_.Read(n, form));
  } catch (const RunTimeError& error) {
    throw Fault(error);
  }
}

std::string X12OrderImporter::ElementOrEnd(int n, ElementForm atEnd) const {
  return Element(n, segment_.PosEndSplat(n) != 0 ? ElementForm{} : atEnd);
}

double X12OrderImporter::NumberOf(Posting& posting, int n, std::string_view text, bool isQuantity) {
  text = TrimBlanks(text);
  if (const auto plain = PlainNumber(text, isQuantity)) return *plain;
  const std::string_view tag = segment_.Text().substr(0, segment_.Text().find('*'));
  const std::string name = std::string(tag) + (n < 10 ? "0" : "") + std::to_string(n);
  return ReadNumber(posting, text, SegmentText(), name, isQuantity);
}

// A cancellation that waits for an order before it must not take this one, which came later, for that.
void X12OrderImporter::MarkPosted(ListedOrder& entry) {
  entry.done = true;
  for (const std::uint32_t row : RowsOfNumber(entry.PONo)) {
    ListedOrder& other = listed_[row];
    if (&other < &entry && other.waits) other.done = true;
  }
}

bool X12OrderImporter::EarlierStays(const ListedOrder& entry) {
  const auto own = static_cast<std::size_t>(&entry - listed_.data());
  return std::ranges::any_of(RowsOfNumber(entry.PONo),
                             [&](std::uint32_t row) { return row < own && !listed_[row].done; });
}

}  // namespace partnerkit::orders

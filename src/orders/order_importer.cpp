#include "orders/order_importer.h"

#include <algorithm>
#include <numeric>

#include "orders/order_columns.h"
#include "orders/order_store.h"
#include "values/numbers.h"

namespace partnerkit::orders {

namespace {

constexpr std::string_view kDeleteOnEmpty = "#%DELETEONEMPTY";

}  // namespace

bool OrderImporter::FindOrderFile(const std::string& path) {
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
  return true;
}

bool OrderImporter::HoldOrderFile(const std::string& path) {
  const HandlerOff off(Errors());
  if (Try([&] { queue_.Open(path); })) return true;
  WriteLog(ErrorNumber(), "SetOrderList", "Error opening file " + path);
  return false;
}

std::int32_t OrderImporter::ShowRows(RowTable& rows) {
  if (listed_.empty()) {
    WriteLog(ErrorNumber(), "Load", "No orders found to match EDI addresses.");
    return 0;
  }
  rows = RowTable(listed_.size(), OrderColumns().size());
  for (std::size_t row = 0; row < listed_.size(); ++row) {
    const ListedOrder& entry = listed_[row];
    rows.At(row, 0) = entry.PONo;
    if (entry.PODate) rows.At(row, 1) = *entry.PODate;
    rows.At(row, 2) = entry.InterchangeCtl + "/" + entry.GroupCtl + "/" + entry.TransactionCtl;
    rows.At(row, 3) = std::string();
  }
  return static_cast<std::int32_t>(listed_.size());
}

std::span<const std::uint32_t> OrderImporter::RowsOfNumber(std::string_view PONo) {
  const auto number = [this](std::uint32_t row) { return std::string_view(listed_[row].PONo); };
  if (rowsByNumber_.size() != listed_.size()) {
    rowsByNumber_.resize(listed_.size());
    std::iota(rowsByNumber_.begin(), rowsByNumber_.end(), 0U);
    std::ranges::stable_sort(rowsByNumber_, {}, number);
  }
  return {std::ranges::lower_bound(rowsByNumber_, PONo, {}, number),
          std::ranges::upper_bound(rowsByNumber_, PONo, {}, number)};
}

ListedOrder* OrderImporter::EntryOfRow(std::int32_t row) {
  ListedOrder* entry = nullptr;
  Try([&] {
    if (row < 0 || static_cast<std::size_t>(row) >= listed_.size()) {
      throw RunTimeError(run_time::kSubscript, "There is no row " + std::to_string(row) + " in the list");
    }
    entry = &listed_[static_cast<std::size_t>(row)];
  });
  return entry;
}

bool OrderImporter::Reaches(const ListedOrder& entry) {
  const auto position = static_cast<std::uint64_t>(entry.FilePos);
  return Try([&] {
    if (queue_.File().Length() >= position) return;
    throw RunTimeError(run_time::kPastEnd,
                       "The order file ends before PO " + entry.PONo + ", at byte " + std::to_string(position));
  });
}

std::optional<std::uint64_t> OrderImporter::EndOf(const ListedOrder& entry) {
  if (&entry != &listed_.back()) return static_cast<std::uint64_t>((&entry)[1].FilePos);
  return Try([&] { return std::optional(queue_.File().Length() + 1); });
}

void OrderImporter::DeleteWhenEmpty(bool optionAnywhere) {
  const std::string_view options = Str(Document().Options);
  if (optionAnywhere ? options.find(kDeleteOnEmpty) == std::string_view::npos : options != kDeleteOnEmpty) return;
  PutInPlace([&] {
    Files& files = FileSystem();
    if (files.Exists(fileName_) && files.Length(fileName_) == 0) files.Delete(files.Resolved(fileName_));
  });
}

UnsettledOrder OrderImporter::NoteOf(std::int32_t orderId) {
  UnsettledOrder note;
  note.OrderId = orderId;
  note.EDIDocId = Document().EDIDocId;
  note.FileName = FileSystem().FullName(queue_.Path());
  return note;
}

void OrderImporter::ForgetUnlisted() {
  const auto notes = Try([&] { return Select(Records(), UnsettledOrder::kByFileName, NoteOf(0)); });
  if (notes.empty()) return;
  std::set<std::string> listed;
  for (const ListedOrder& entry : listed_) listed.insert(entry.PONo + '\0' + entry.Controls());
  for (const auto& note : notes) {
    Order order;
    order.OrderId = note->OrderId;
    const bool stored = Try([&] { return partnerkit::Load(Records(), order); });
    if (stored && listed.contains(order.PONo + '\0' + ControlsOf(order))) continue;
    Try([&] { partnerkit::Delete(Records(), *note); });
  }
}

void OrderImporter::ForgetUnsettled() {
  Try([&] {
    for (const std::int32_t orderId : unsettled_) {
      UnsettledOrder note;
      note.OrderId = orderId;
      partnerkit::Delete(Records(), note);
    }
    if (!unsettled_.empty()) Host().Commit(0);
  });
  unsettled_.clear();
}

void OrderImporter::NoteBackedUp(std::span<const std::int32_t> orders) {
  for (const std::int32_t orderId : orders) {
    UnsettledOrder note;
    note.OrderId = orderId;
    if (!partnerkit::Load(Records(), note)) continue;
    note.BackedUp = true;
    if (!Update(Records(), note)) {
      throw RunTimeError(run_time::kDatabase, "An order cannot be noted as backed up");
    }
  }
  if (!orders.empty()) Host().Commit(0);
}

double OrderImporter::ReadNumber(OrderPosting& posting, std::string_view text, std::string_view place,
                                 std::string_view name, bool isQuantity) {
  const auto said = [&] {
    constexpr std::size_t kShown = 60;
    return std::string(place).append(": ").append(name).append(" \"").append(text.substr(0, kShown)).append("\" ");
  };
  double value = 0;
  try {
    value = NumberAtStart(text);
  } catch (const RunTimeError&) {
    throw Unreadable{said() + "is beyond all numbers"};
  }
  const bool odd = !text.empty() && !IsNumber(text);
  if ((odd || (isQuantity && value < 0)) && posting.warned.insert(std::string(place).append(" ").append(name)).second) {
    posting.log.Note(kWarning, "PO " + posting.entry.PONo + ", " + said() +
                                   (odd ? "is not a number; it is read as " + NumberText(value) + "."
                                        : std::string("is a negative quantity.")));
  }
  return value;
}

std::optional<double> OrderImporter::PlainNumber(std::string_view text, bool isQuantity) {
  if (text.empty()) return 0.0;
  if (!IsNumber(text)) return {};
  try {
    const double value = NumberAtStart(text);
    return isQuantity && value < 0 ? std::nullopt : std::optional(value);
  } catch (const RunTimeError&) {
    return {};
  }
}

void OrderImporter::Refuse(OrderPosting& posting, const Unreadable& fault) {
  posting.entry.OrderId = 0;
  posting.log.Note(kRejection,
                   "...Cannot process PO " + posting.entry.PONo + ", " + fault.why + ". It stays in the file.");
  posting.log.Note(kInformation, words::kImportIncomplete.With(posting.entry.PONo));
}

void OrderImporter::WarnOfNoNumber(OrderPosting& posting, std::string_view place) {
  if (posting.entry.PONo.empty()) posting.log.Note(kWarning, "The order of " + std::string(place) + " has no number.");
}

OrderImporter::Next OrderImporter::SettleStoredOrder(OrderPosting& posting, OrderFacts facts,
                                                     std::span<const OrderRule> rules, std::string_view procedure,
                                                     const Words& announce) {
  Order stored;
  stored.VendorId = OwnCompany().VendorId;
  stored.PartnerId = TradingPartner().PartnerId;
  stored.PONo = posting.entry.PONo;
  if (!Try([&] { return Find(Records(), Order::kByNumber, stored); })) return Next::kGoOn;

  facts.storedType = Str(stored.TypeCode);
  facts.storedChangeFlag = Str(stored.ChangeFlag);
  facts.incomplete = stored.Status == kBeingStored;
  // The same transaction again. One that an earlier run left half stored is no order yet: it is replaced, for turned
  // away it would be neither in the store nor in the file. One stored with its faults looks like it, and is an order.
  if (SameTransaction(stored, posting.entry)) {
    const bool half = facts.incomplete && !posting.checks.FaultsPass();
    if (!half && IsStoredEarlier(posting, stored)) return Next::kEnd;
    if (half) {
      return CarryOut(posting, {.number = kWarning, .message = words::kIncomplete, .fate = Fate::kReplace}, facts,
                      stored);
    }
    posting.log.Note(kRejection, words::kAlreadyExists.With(posting.entry.PONo));
    return TurnAway(posting);
  }
  if (!announce.Empty()) WriteLog(kWarning, procedure, announce.With(posting.entry.PONo));
  facts.hasJobs = HasJobs(stored);
  const OrderRule* const rule = FirstFitting(rules, facts);
  return rule == nullptr ? Next::kEnd : CarryOut(posting, *rule, facts, stored);
}

// A run that stored the order and was stopped before the file was settled: its lines go where those of a posted order
// do.
bool OrderImporter::IsStoredEarlier(OrderPosting& posting, const Order& stored) {
  if (unsettled_.contains(stored.OrderId)) return false;  // it comes twice
  UnsettledOrder note;
  note.OrderId = stored.OrderId;
  if (!Try([&] { return partnerkit::Load(Records(), note); })) return false;
  posting.log.Note(kRejection, words::kAlreadyExists.With(posting.entry.PONo));
  posting.entry.OrderId = note.BackedUp ? 0 : stored.OrderId;
  unsettled_.insert(stored.OrderId);
  MarkPosted(posting.entry);
  return true;
}

bool OrderImporter::SameTransaction(const Order& stored, const ListedOrder& entry) const {
  return ControlsOf(stored) == entry.Controls();
}

OrderImporter::Next OrderImporter::CarryOut(OrderPosting& posting, const OrderRule& rule, const OrderFacts& facts,
                                            Order& stored) {
  const std::string_view number = rule.fileNumber ? facts.fileNumber : posting.entry.PONo;
  const auto note = [&](const Words& message) {
    if (!message.Empty()) posting.log.Note(rule.number, message.With(number));
  };
  const auto deleted = [&] {
    if (DeleteStored(stored)) return posting.deletedStored = true;
    note(rule.refused);
    return false;
  };
  if (rule.fate != Fate::kCancelThenSay) note(rule.message);
  switch (rule.fate) {
    case Fate::kTurnAway:
      return TurnAway(posting);
    case Fate::kLeaveInFile:
    case Fate::kGoOn:
      return Next::kEnd;
    case Fate::kReplace:
      posting.replaces = stored;
      return Next::kGoOn;
    case Fate::kCancel:
      deleted();
      return TurnAway(posting);
    case Fate::kCancelIfDeleted:
      return deleted() ? TurnAway(posting) : Next::kEnd;
    case Fate::kCancelInFile:
      posting.entry.OrderId = 0;
      deleted();
      return Next::kEnd;
    case Fate::kCancelThenSay:
      if (!deleted()) return TurnAway(posting);
      if (!MakeDurable()) return Next::kEnd;
      note(rule.message);
      posting.result = stored.OrderId;
      return Next::kEnd;
    case Fate::kChangeStored:
      return ChangeStored(posting, stored);
  }
  return Next::kEnd;
}

// The deletion of a stored order is durable before the one that asked for it counts as done: a later failure of the
// store must not bring it back.
OrderImporter::Next OrderImporter::TurnAway(OrderPosting& posting) {
  if (posting.deletedStored && !MakeDurable()) return Next::kEnd;
  posting.entry.OrderId = 0;
  MarkTurnedAway(posting.entry);
  return Next::kEnd;
}

bool OrderImporter::DeleteReplaced(OrderPosting& posting) {
  if (!posting.replaces) return true;
  if (!DeleteStored(*posting.replaces)) return false;
  Forget(*posting.replaces);
  posting.replaces.reset();
  return posting.deletedStored = true;
}

bool OrderImporter::MakeDurable() {
  return Try([&] { Host().Commit(0); });
}

// False when the host says no. A store that fails is a fault: what was to be cancelled or replaced must come up again.
bool OrderImporter::DeleteStored(const Order& stored) {
  return Try([&] {
    if (Host().DeleteOrder(stored)) return true;
    if (Records().NativeError() == 0) return false;
    throw RunTimeError(run_time::kDatabase, "The stored PO " + stored.PONo + " cannot be deleted");
  });
}

bool OrderImporter::HasJobs(const Order& stored) {
  Job probe;
  probe.OrderId = stored.OrderId;
  return Try([&] { return Count(Records(), Job::kByOrder, probe); }) > 0;
}

OrderImporter::Next OrderImporter::RefuseNewOrder(OrderPosting& posting, const OrderFacts& facts,
                                                  std::span<const OrderRule> rules) {
  while (const OrderRule* const rule = FirstFitting(rules, facts)) {
    if (rule->fate == Fate::kCancel && !DeleteReplaced(posting)) return Next::kEnd;
    posting.log.Note(rule->number, rule->message.With(rule->fileNumber ? facts.fileNumber : posting.entry.PONo));
    if (rule->fate == Fate::kTurnAway || rule->fate == Fate::kCancel) {
      // A cancellation must not overtake its order, which a later run may store.
      const bool refersToAnother = !rule->purpose.empty() || !rule->response.empty();
      posting.entry.waits = refersToAnother && !posting.deletedStored && EarlierStays(posting.entry);
      return posting.entry.waits ? Next::kEnd : TurnAway(posting);
    }
    if (rule->fate != Fate::kGoOn) return Next::kEnd;
    rules = rules.subspan(static_cast<std::size_t>(rule - rules.data()) + 1);
  }
  return Next::kGoOn;
}

void OrderImporter::CheckShipTo(OrderPosting& posting, std::string_view wanted) {
  if (!posting.shipTo.empty() && posting.shipTo == wanted) return;
  posting.shipTo = wanted;
  posting.locationLookedAt = wanted;
  posting.checks.CheckLocation("ship to", wanted);
}

void OrderImporter::CheckBuyingLocn(OrderPosting& posting, std::string_view wanted, bool looksItUp,
                                    std::string_view what) {
  if (!posting.buyingLocn.empty() && posting.buyingLocn == wanted) return;
  posting.buyingLocn = wanted;
  if (!looksItUp || posting.locationLookedAt == wanted) return;
  posting.locationLookedAt = wanted;
  posting.checks.CheckLocation(what, wanted);
}

OrderLocn* OrderImporter::NewLocation(OrderPosting& posting) {
  if (posting.draft.locations.Find(posting.buyingLocn)) return nullptr;
  const auto added = std::make_shared<OrderLocn>();
  added->VendorId = OwnCompany().VendorId;
  added->ShipToLocn = posting.shipTo;
  added->BuyingLocn = posting.buyingLocn;
  posting.draft.locations.Add(added, posting.buyingLocn);
  return added.get();
}

OrderImporter::Next OrderImporter::RejectRepeat(OrderPosting& posting, std::string_view ordered) {
  posting.entry.OrderId = 0;
  posting.log.Note(ErrorNumber(),
                   "Duplicate lines found for store " + posting.buyingLocn + " EAN " + std::string(ordered));
  return Next::kEnd;
}

std::int32_t OrderImporter::Store(OrderPosting& posting, std::optional<std::string_view> lineSequence) {
  ListedOrder& entry = posting.entry;
  if (!posting.checks.Ok() || !posting.complete) {
    posting.log.Note(kInformation, words::kImportIncomplete.With(entry.PONo));
    return 0;
  }
  entry.OrderId = 0;
  if (!DeleteReplaced(posting)) return 0;
  if (!StoreDraft(*this, posting.log, posting.draft, lineSequence)) return 0;
  const bool complete = !posting.checks.PassedWithErrors();
  UnsettledOrder note = NoteOf(posting.draft.header.OrderId);
  if (!orders::MakeDurable(*this, posting.draft, complete, note)) return 0;
  entry.OrderId = posting.draft.header.OrderId;
  unsettled_.insert(entry.OrderId);
  MarkPosted(entry);
  Export(posting);
  posting.log.Note(kInformation, (complete ? words::kImportCompleted : words::kImportWithErrors).With(entry.PONo));
  return complete ? entry.OrderId : 0;
}

}  // namespace partnerkit::orders

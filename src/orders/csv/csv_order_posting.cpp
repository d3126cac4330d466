// Posting one transaction of a CSV order file.
#include "frame/dates.h"
#include "frame/format.h"
#include "frame/numbers.h"
#include "orders/csv/csv_order_importer.h"
#include "orders/order_store.h"
#include "orders/products_from_orders.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr std::int32_t kBeingStored = 9;  // Order.Status of an order that isn't complete

template <class R>
void TakeTexts(const CsvOrderLine& line, std::span<const FieldText<R>> texts, R& record) {
  for (const FieldText<R>& text : texts) {
    const std::string_view value = line[text.field];
    record.*text.member = text.nullWhenEmpty ? NullIfEmpty(value) : Text(std::string(value));
  }
}

}  // namespace

CsvOrderImporter::Posting::Posting(CsvOrderImporter& importer, ListedOrder& listed, const PostingValues& postingValues,
                                   ErrorList& errorList)
    : entry(listed),
      values(postingValues),
      log(importer, postingValues.procedure, errorList),
      checks(importer, log, listed.PONo) {
  checks.SetRules(postingValues.checks);
}

std::int32_t CsvOrderImporter::Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Process", std::int32_t{0},
                   [&](std::int32_t& orderId) { orderId = PostRow(a_lRowNum, nullptr, vtErrorLog); });
}

std::int32_t CsvOrderImporter::PostRow(std::int32_t row, const PostingValues* values, ErrorList& errorList) {
  ListedOrder* const entry = EntryOfRow(row);
  if (entry == nullptr) return 0;
  // Which values hold may depend on the order's first line.
  Line first;
  if (values == nullptr) {
    if (!SeekTo(*entry) || !ReadLine(first)) return 0;
    line_.Read(first.text);
    values = &ValuesOf();
  }
  Posting posting(*this, *entry, *values, errorList);
  if (!BeginPosting(posting) || StartPosting(posting) == Next::kEnd || SettleStoredOrder(posting) == Next::kEnd ||
      RefuseNewOrder(posting) == Next::kEnd) {
    return 0;
  }
  FillHeader(posting);
  return ReadLines(posting) == Next::kEnd ? 0 : Store(posting);
}

ListedOrder* CsvOrderImporter::EntryOfRow(std::int32_t row) {
  ListedOrder* entry = nullptr;
  Try([&] {
    if (row < 0 || static_cast<std::size_t>(row) >= listed_.size()) {
      throw RunTimeError(run_time::kSubscript, "There is no row " + std::to_string(row) + " in the list");
    }
    entry = &listed_[static_cast<std::size_t>(row)];
  });
  return entry;
}

// Finds the transaction's first line.
CsvOrderImporter::Next CsvOrderImporter::StartPosting(Posting& posting) {
  return SeekTo(posting.entry) && NextLine(posting) ? Next::kGoOn : Next::kEnd;
}

bool CsvOrderImporter::SeekTo(const ListedOrder& entry) {
  const auto position = static_cast<std::uint64_t>(entry.FilePos);
  return Try([&] {
    if (queue_.File().Length() < position) {
      throw RunTimeError(run_time::kPastEnd,
                         "The order file ends before PO " + entry.PONo + ", at byte " + std::to_string(position));
    }
    queue_.Lines().Seek(position);
  });
}

OrderFacts CsvOrderImporter::Facts(const Posting& posting) const {
  const std::string_view accept = posting.values.acceptDirectToStore;
  const bool accepted = !accept.empty() && Str(Document().ReadOptions).find(accept) != std::string_view::npos;
  OrderFacts facts;
  facts.purpose = line_[POPURPOSECODE];
  facts.type = line_[POTYPECODE];
  facts.response = line_[RESPONSETYPECODE];
  facts.version = line_[POVERSIONNO];
  facts.directToStore = !accepted && line_[SHIPTOLOCPARTNERNO] == line_[BUYINGLOCPARTNERNO];
  return facts;
}

// An order that is already stored under the number.
CsvOrderImporter::Next CsvOrderImporter::SettleStoredOrder(Posting& posting) {
  Order stored;
  stored.VendorId = OwnCompany().VendorId;
  stored.PartnerId = TradingPartner().PartnerId;
  stored.PONo = posting.entry.PONo;
  if (!Try([&] { return Find(Records(), Order::kByNumber, stored); })) return Next::kGoOn;

  OrderFacts facts = Facts(posting);
  facts.storedType = Str(stored.TypeCode);
  facts.incomplete = stored.Status == kBeingStored;
  // The same transaction again. One that an earlier run left half stored is no order yet: it is replaced, for turned
  // away it would be neither in the store nor in the file.
  if (ControlsOf(stored) == posting.entry.Controls()) {
    if (facts.incomplete && !values_.postsWithErrors) {
      return CarryOut(posting, {.number = kWarning, .message = words::kIncomplete, .fate = Fate::kReplace}, stored);
    }
    posting.log.Note(kRejection, words::kAlreadyExists.With(posting.entry.PONo));
    return TurnAway(posting);
  }
  if (!posting.values.announceStored.Empty()) {
    WriteLog(kWarning, posting.values.procedure, posting.values.announceStored.With(posting.entry.PONo));
  }
  facts.hasJobs = HasJobs(stored);
  const OrderRule* const rule = FirstFitting(posting.values.storedOrder, facts);
  return rule == nullptr ? Next::kEnd : CarryOut(posting, *rule, stored);
}

CsvOrderImporter::Next CsvOrderImporter::CarryOut(Posting& posting, const OrderRule& rule, const Order& stored) {
  NoteRule(posting, rule);
  const auto deleted = [&] { return DeleteStored(stored); };
  switch (rule.fate) {
    case Fate::kTurnAway:
      return TurnAway(posting);
    case Fate::kLeaveInFile:
      return Next::kEnd;
    case Fate::kReplace:
      if (!deleted()) return Next::kEnd;
      processed_.Forget(SettledKey(stored));
      return Next::kGoOn;
    case Fate::kCancel:
      deleted();
      return MakeDurable() ? TurnAway(posting) : Next::kEnd;
    case Fate::kCancelIfDeleted:
      return deleted() && MakeDurable() ? TurnAway(posting) : Next::kEnd;
    case Fate::kCancelInFile:
      posting.entry.OrderId = 0;
      deleted();
      return Next::kEnd;
    case Fate::kCancelOrSay:
      if (deleted()) return MakeDurable() ? TurnAway(posting) : Next::kEnd;
      posting.log.Note(kWarning, words::kCancelFailed.With(posting.entry.PONo));
      return Next::kEnd;
  }
  return Next::kEnd;
}

// A cancellation is durable before its order counts as done: a later failure of the store must not bring the order
// back.
bool CsvOrderImporter::MakeDurable() {
  return Try([&] { Host().Commit(0); });
}

// False when the host says no. A store that fails is a fault: what was to be cancelled or replaced must come up again.
bool CsvOrderImporter::DeleteStored(const Order& stored) {
  return Try([&] {
    if (Host().DeleteOrder(stored)) return true;
    if (Records().NativeError() == 0) return false;
    throw RunTimeError(run_time::kDatabase, "The stored PO " + stored.PONo + " cannot be deleted");
  });
}

bool CsvOrderImporter::HasJobs(const Order& stored) {
  Job probe;
  probe.OrderId = stored.OrderId;
  return Try([&] { return Count(Records(), Job::kByOrder, probe); }) > 0;
}

// An order whose number isn't stored, or no longer, may still be none to post.
CsvOrderImporter::Next CsvOrderImporter::RefuseNewOrder(Posting& posting) {
  const OrderRule* const rule = FirstFitting(posting.values.newOrder, Facts(posting));
  if (rule == nullptr) return Next::kGoOn;
  NoteRule(posting, *rule);
  return rule->fate == Fate::kTurnAway ? TurnAway(posting) : Next::kEnd;
}

void CsvOrderImporter::NoteRule(Posting& posting, const OrderRule& rule) {
  posting.log.Note(rule.number, rule.message.With(rule.fileNumber ? line_[PONUMBER] : posting.entry.PONo));
}

CsvOrderImporter::Next CsvOrderImporter::TurnAway(Posting& posting) {
  posting.entry.OrderId = 0;
  if (!values_.keepsTurnedAway) MarkProcessed(posting.entry);
  return Next::kEnd;
}

void CsvOrderImporter::FillHeader(Posting& posting) {
  const ListedOrder& entry = posting.entry;
  const auto control = [&](const std::string& number) {
    return values_.nullControls ? NullIfEmpty(number) : Text(number);
  };
  Order& header = posting.draft.header;
  header.VendorId = OwnCompany().VendorId;
  header.PartnerId = TradingPartner().PartnerId;
  header.InterchangeCtl = control(entry.InterchangeCtl);
  if (values_.transactionKey.size() == std::size(kTransactionKey)) header.GroupCtl = control(entry.GroupCtl);
  header.TransactionCtl = control(entry.TransactionCtl);
  header.FilePos = entry.FilePos;
  header.PONo = entry.PONo;
  header.PurposeCode = std::string(line_[POPURPOSECODE]);
  header.TypeCode = std::string(line_[POTYPECODE]);
  header.PODate = OrderDate(line_[PODATE]);
  header.NotBefore = OrderDate(line_[NOTBEFORE]);
  header.CancelAfter = OrderDate(line_[CANCAFTER]);
  header.ImportDate = Now().Date();
  header.CustomerRef = NullIfEmpty(line_[CUSTOMERREF]);
  if (posting.values.advertisedDate) {
    if (const auto advertised = OrderDate(line_[ADDATE])) header.Header1 = Format(*advertised, "mmdd");
  }
  TakeTexts(line_, posting.values.headerTexts, header);
  header.Status = kBeingStored;
}

// Reads and checks the transaction's lines. Nothing is stored here: an order goes in whole or not at all.
CsvOrderImporter::Next CsvOrderImporter::ReadLines(Posting& posting) {
  JoinLineKey(posting.firstLineKey);
  std::string key;
  do {
    if (LineCounts() && TakeLine(posting) == Next::kEnd) return Next::kEnd;
  } while (NextLine(posting) && !EndsTransaction(posting, key));
  return Next::kGoOn;
}

// Takes the next line in hand. False at the end of the file. A blank line inside an order doesn't end it: what stands
// behind it would be lost.
bool CsvOrderImporter::NextLine(Posting& posting) {
  Line line;
  do {
    if (!ReadLine(line)) return false;
  } while (TrimBlanks(line.text).empty());
  line_.Read(line.text);
  posting.lineSequence = line_[SEQUENTIALLINENO];
  return true;
}

bool CsvOrderImporter::EndsTransaction(const Posting& posting, std::string& key) const {
  line_.Join(values_.transactionKey, key);
  if (key != posting.entry.Controls()) return true;
  if (values_.endsAtOtherCompany && line_[COMPANYEDIADDR] != Str(Document().CompanyEDIAddr)) return true;
  JoinLineKey(key);
  return key == posting.firstLineKey;
}

CsvOrderImporter::Next CsvOrderImporter::TakeLine(Posting& posting) {
  if (LookAtLine(posting) == Next::kEnd) return Next::kEnd;
  const std::string_view ordered = line_[INCOMINGPRODUCTNO];
  LineProduct product;
  if (const auto& line = posting.draft.lines.Find(ordered)) {
    product = {std::string(ordered), line->ProductNo, line->GTIN};
    const double quantity = LineQuantity(posting);
    Try([&] { line->Quantity = Plus(line->Quantity, quantity); });
  } else {
    product = CheckLineProduct(posting);
    const auto added = std::make_shared<OrderLine>();
    added->ProductNo = product.productNo;
    added->GTIN = product.GTIN;
    FillLine(posting, *added);
    posting.draft.lines.Add(added, product.ordered);
  }
  CheckLineLocations(posting);
  TakeLocation(posting);
  return AddToLocation(posting, product);
}

CsvOrderImporter::LineProduct CsvOrderImporter::CheckLineProduct(Posting& posting) {
  const std::string number(line_[INCOMINGPRODUCTNO]);
  if (Document().ValidateProduct) {
    FitProductMaster();
    const LineClaims claims = Claims(number);
    if (const auto product = posting.checks.CheckProduct(claims)) CheckFoundProduct(posting, *product);
    if (AsksForPrices()) posting.checks.CheckPrice(claims);
  }
  return {number, number};
}

// A line that tells style, colour or size keeps the product master up to date.
void CsvOrderImporter::FitProductMaster() {
  if (line_.Raw(STYLE).empty() && line_.Raw(COLOUR).empty() && line_.Raw(SIZE).empty()) return;
  AddProduct(*this, {.numberAsRead = line_.Raw(INCOMINGPRODUCTNO),
                     .style = line_[STYLE],
                     .colour = line_[COLOUR],
                     .size = line_[SIZE],
                     .description = line_[DESCRIPTION],
                     .uom = line_[UNITMEASURECODE],
                     .bin = line_[BIN],
                     .weight = line_[WEIGHT],
                     .volume = line_[VOLUME]});
}

LineClaims CsvOrderImporter::Claims(std::string_view productNo) const {
  return {.productNo = productNo,
          .uom = line_[UNITMEASURECODE],
          .qualifier = line_[PRODUCTQUALIFIER],
          .cost = line_[UNITPRICE],
          .retail = line_[RETAILUNITPRICE],
          .sku = line_[SKUPRODUCTKEYCODE]};
}

double CsvOrderImporter::NumberOf(OrderField field) {
  return Try([&] { return NumberAtStart(line_[field]); });
}

std::string CsvOrderImporter::AdvertisedText(std::string_view date) {
  return std::string(date.size() > 6 ? date.substr(date.size() - 4) : date);
}

double CsvOrderImporter::LineQuantity(const Posting& posting) { return NumberOf(posting.values.quantity); }

void CsvOrderImporter::FillLine(Posting& posting, OrderLine& line) {
  line.Quantity = LineQuantity(posting);
  TakeTexts(line_, posting.values.lineTexts, line);
  for (const auto& number : posting.values.lineNumbers) line.*number.member = NumberOf(number.field);
  for (const auto& number : posting.values.lineNumbersOrNull) {
    if (!line_[number.field].empty()) line.*number.member = NumberOf(number.field);
  }
}

std::string_view CsvOrderImporter::BuyingLocn() const {
  const std::string_view buying = line_[BUYINGLOCPARTNERNO];
  return buying.empty() && values_.shipToForBuyingLocn ? line_[SHIPTOLOCPARTNERNO] : buying;
}

void CsvOrderImporter::CheckLineLocations(Posting& posting) {
  const std::string_view shipTo = line_[SHIPTOLOCPARTNERNO];
  const std::string_view direct = posting.values.directToStore;
  CheckShipTo(posting, !direct.empty() && shipTo == direct ? BuyingLocn() : shipTo);
  CheckBuyingLocn(posting);
}

// A location is looked at when it changes from one line to the next.
void CsvOrderImporter::CheckShipTo(Posting& posting, std::string_view wanted) {
  if (!posting.shipTo.empty() && posting.shipTo == wanted) return;
  posting.shipTo = wanted;
  posting.locationLookedAt = wanted;
  posting.checks.CheckLocation("ship to", wanted);
}

void CsvOrderImporter::CheckBuyingLocn(Posting& posting) {
  const std::string_view wanted = BuyingLocn();
  if (!posting.buyingLocn.empty() && posting.buyingLocn == wanted) return;
  posting.buyingLocn = wanted;
  if (!posting.values.checksBuyingLocn || posting.locationLookedAt == wanted) return;
  posting.locationLookedAt = wanted;
  posting.checks.CheckLocation("buying", wanted);
}

void CsvOrderImporter::TakeLocation(Posting& posting) {
  if (posting.draft.locations.Find(posting.buyingLocn)) return;
  const auto added = std::make_shared<OrderLocn>();
  added->VendorId = OwnCompany().VendorId;
  added->ShipToLocn = posting.shipTo;
  added->BuyingLocn = posting.buyingLocn;
  added->CustomerRef = NullIfEmpty(line_[CUSTOMERREF]);
  added->CustomerNo = NullIfEmpty(line_[CUSTOMERNO]);
  posting.draft.locations.Add(added, posting.buyingLocn);
}

CsvOrderImporter::Next CsvOrderImporter::AddToLocation(Posting& posting, const LineProduct& product) {
  const std::string key = OrderDraft::LocnLineKey(posting.buyingLocn, product.ordered);
  const auto& there = posting.draft.locnLines.Find(key);
  if (there && !posting.values.repeatsAddUp) {
    posting.entry.OrderId = 0;
    posting.log.Note(ErrorNumber(),
                     "Duplicate lines found for store " + posting.buyingLocn + " EAN " + product.ordered);
    return Next::kEnd;
  }
  const auto added = std::make_shared<OrderLocnLine>();
  added->ProductNo = product.productNo;
  added->GTIN = product.GTIN;
  added->BuyingLocn = posting.buyingLocn;
  FillLocationLine(posting, *added);
  if (there) {
    Try([&] { there->Quantity = Plus(there->Quantity, added->Quantity); });
    Try([&] { there->AllocateQty = Plus(there->AllocateQty, added->AllocateQty); });
  } else {
    posting.draft.locnLines.Add(added, key);
  }
  return Next::kGoOn;
}

void CsvOrderImporter::FillLocationLine(const Posting& posting, OrderLocnLine& locnLine) {
  locnLine.Quantity = LineQuantity(posting);
  locnLine.AllocateQty = line_[ALLOCATEQUANTITY].empty() ? locnLine.Quantity : NumberOf(ALLOCATEQUANTITY);
  locnLine.LineRef = NullIfEmpty(line_[LINEREF]);
}

// Stores the order when every check passed, and tells the outcome. The stored order's id, 0 when nothing was posted.
std::int32_t CsvOrderImporter::Store(Posting& posting) {
  ListedOrder& entry = posting.entry;
  if (!posting.checks.Ok()) {
    posting.log.Note(kInformation, words::kImportIncomplete.With(entry.PONo));
    return 0;
  }
  entry.OrderId = 0;
  if (!StoreDraft(*this, posting.log, posting.draft, posting.lineSequence)) return 0;
  const bool complete = !posting.checks.PassedWithErrors();
  if (!orders::MakeDurable(*this, posting.draft, complete)) return 0;
  entry.OrderId = posting.draft.header.OrderId;
  MarkProcessed(entry);
  posting.log.Note(kInformation, (complete ? words::kImportCompleted : words::kImportWithErrors).With(entry.PONo));
  return complete ? entry.OrderId : 0;
}

}  // namespace partnerkit::orders

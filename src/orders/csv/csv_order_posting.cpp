// Posting one transaction of a CSV order file.
#include "orders/csv/csv_order_importer.h"
#include "orders/order_store.h"
#include "orders/products_from_orders.h"
#include "values/dates.h"
#include "values/format.h"
#include "values/numbers.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

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
    : OrderPosting(importer, listed, postingValues.procedure, errorList), values(postingValues) {
  checks.SetRules(postingValues.checks);
}

namespace {

// What `object` is set to as long as the scope lasts.
template <class T>
class SetFor {
 public:
  SetFor(T*& object, T& value) : object_(object) { object_ = &value; }
  ~SetFor() { object_ = nullptr; }
  SetFor(const SetFor&) = delete;
  SetFor& operator=(const SetFor&) = delete;

 private:
  T*& object_;
};

std::string LineText(std::int64_t number) { return "line " + std::to_string(number); }

}  // namespace

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
  const SetFor<Posting> inHand(posting_, posting);
  try {
    if (PostLines(posting) == Next::kGoOn) return Store(posting, posting.lineSequence);
  } catch (const Unreadable& fault) {
    Refuse(posting, fault);
  }
  return 0;
}

CsvOrderImporter::Next CsvOrderImporter::PostLines(Posting& posting) {
  const PostingValues& chosen = posting.values;
  if (!BeginPosting(posting) || StartPosting(posting) == Next::kEnd ||
      SettleStoredOrder(posting, Facts(posting), chosen.storedOrder, chosen.procedure, chosen.announceStored) ==
          Next::kEnd ||
      RefuseNewOrder(posting, Facts(posting), chosen.newOrder) == Next::kEnd) {
    return Next::kEnd;
  }
  FillHeader(posting);
  return ReadLines(posting);
}

// Finds the transaction's first line.
CsvOrderImporter::Next CsvOrderImporter::StartPosting(Posting& posting) {
  NeedOneText(posting.entry);
  posting.lineNo = posting.entry.line - 1;
  if (!SeekTo(posting.entry) || !NextLine(posting)) return Next::kEnd;
  NeedListedOrder(posting);
  NeedWholeLine(posting);
  WarnOfNoNumber(posting, LineText(posting.lineNo));
  return Next::kGoOn;
}

// A program that doesn't ask for the hold may have written over the file.
void CsvOrderImporter::NeedListedOrder(const Posting& posting) const {
  std::string number, key;
  line_.Join(values_.transactionKey, key);
  if (OrderNumber(number) == posting.entry.PONo && key == posting.entry.Controls() && IsOurs()) return;
  throw Unreadable{LineText(posting.lineNo) + ": the file " + fileName_ +
                   " has changed since it was listed, and begins another order here"};
}

// A last line that stops short is an upload that isn't finished: its quantity, or a part of it, is still to come.
void CsvOrderImporter::NeedWholeLine(const Posting& posting) const {
  const std::string where = LineText(posting.lineNo) + ": ";
  if (!posting.listed) {
    throw Unreadable{where + "the file " + fileName_ + " has grown by this line of the order since it was listed"};
  }
  if (posting.ended) return;
  const OrderField quantity[] = {posting.values.quantity};
  const std::size_t needed = line_.ColumnsFor(quantity);
  const bool hasQuantity = posting.fields > needed || (posting.fields == needed && !line_[quantity[0]].empty());
  if (hasQuantity && posting.fields >= lastLineNeeds_) return;
  const std::string before = hasQuantity ? "all its columns" : "the end of " + std::string(Name(quantity[0]));
  throw Unreadable{where + "the last line of the file " + fileName_ + " stops before " + before +
                   " and has no line end: an upload that isn't finished"};
}

// The same, of a line that stops before it says whose it is: it may be of this order.
void CsvOrderImporter::NeedControls(const Posting& posting) const {
  if (posting.ended || posting.fields > line_.ColumnsFor(kAddresses)) return;
  std::string key;
  line_.Join(values_.transactionKey, key);
  if (posting.fields > line_.ColumnsFor(values_.transactionKey) && key != posting.entry.Controls()) return;
  throw Unreadable{LineText(posting.lineNo) + ": the last line of the file " + fileName_ +
                   " stops before it says which order it is of, and has no line end: an upload that isn't finished"};
}

// Lines leave the file by their order number, so that a line of another number would stay, and be posted again.
void CsvOrderImporter::NeedOwnNumber(const Posting& posting) const {
  std::string number;
  const std::string_view own = OrderNumber(number);
  if (own == posting.entry.PONo) return;
  throw Unreadable{LineText(posting.lineNo) + ": it has the order number " + std::string(own) +
                   ", but stands in the transaction of another"};
}

// A transaction that stands in the file twice, with other lines the second time: nobody can tell which are right.
void CsvOrderImporter::NeedOneText(const ListedOrder& entry) {
  const auto rows = RowsOfNumber(entry.PONo);
  if (rows.size() < 2) return;
  const auto [known, isNew] = twins_.try_emplace(entry.PONo + '\0' + entry.Controls(), nullptr);
  if (isNew) {
    std::optional<std::string> text;
    for (const std::uint32_t row : rows) {
      const ListedOrder& twin = listed_[row];
      if (twin.Controls() != entry.Controls()) continue;
      const std::string own = DigestOf(twin);
      if (text && *text != own) known->second = &twin;
      text = own;
    }
  }
  if (known->second == nullptr) return;
  throw Unreadable{LineText(known->second->line) + ": the transaction stands in the file " + fileName_ +
                   " more than once, not with the same lines"};
}

// How many lines the transaction has, and a number made of what the map names of them.
std::string CsvOrderImporter::DigestOf(const ListedOrder& entry) {
  std::size_t lines = 0, digest = 0;
  std::string controls, key, firstKey;
  if (!SeekTo(entry)) return {};
  for (Line line; ReadLine(line);) {
    line_.Read(line.text);
    if (!IsOurs()) continue;
    line_.Join(values_.transactionKey, controls);
    JoinLineKey(key);
    if (lines == 0) firstKey = key;
    else if (controls != entry.Controls() || key == firstKey) break;
    ++lines;
    for (std::size_t field = 0; field < kOrderFields; ++field) {
      digest = digest * 31 + std::hash<std::string_view>{}(line_[static_cast<OrderField>(field)]);
    }
  }
  return std::to_string(lines) + ' ' + std::to_string(digest);
}

bool CsvOrderImporter::SeekTo(const ListedOrder& entry) {
  if (!Reaches(entry)) return false;
  Lines().Seek(static_cast<std::uint64_t>(entry.FilePos));
  return true;
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
  facts.fileNumber = line_[PONUMBER];
  return facts;
}

void CsvOrderImporter::MarkTurnedAway(ListedOrder& entry) {
  if (!values_.keepsTurnedAway) MarkPosted(entry);
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
    NeedWholeLine(posting);
    NeedOwnNumber(posting);
    if (LineCounts() && TakeLine(posting) == Next::kEnd) return Next::kEnd;
  } while (NextOwnLine(posting, key));
  return Next::kGoOn;
}

// Takes the transaction's next line in hand. Lines that aren't ours, another company's or no order's at all, may stand
// between; they stay in the file, and so are no part of the order.
bool CsvOrderImporter::NextOwnLine(Posting& posting, std::string& key) {
  while (NextLine(posting)) {
    NeedControls(posting);
    if (IsOurs()) return !EndsTransaction(posting, key);
  }
  return false;
}

// Takes the next line in hand. False at the end of the file. A blank line inside an order doesn't end it: what stands
// behind it would be lost.
bool CsvOrderImporter::NextLine(Posting& posting) {
  Line line;
  do {
    if (!ReadLine(line)) return false;
    ++posting.lineNo;
  } while (TrimBlanks(line.text).empty());
  line_.Read(line.text);
  posting.ended = line.ended;
  posting.listed = WasListed(line);
  posting.fields = CountFields(line.text);
  posting.lineSequence = line_[SEQUENTIALLINENO];
  return true;
}

bool CsvOrderImporter::EndsTransaction(const Posting& posting, std::string& key) const {
  line_.Join(values_.transactionKey, key);
  if (key != posting.entry.Controls()) return true;
  JoinLineKey(key);
  return key == posting.firstLineKey;
}

CsvOrderImporter::Next CsvOrderImporter::TakeLine(Posting& posting) {
  if (LookAtLine(posting) == Next::kEnd) return Next::kEnd;
  const std::string_view ordered = line_[INCOMINGPRODUCTNO];
  LineProduct product;
  if (const auto& line = posting.draft.lines.Find(ordered)) {
    product = {std::string(ordered), line->ProductNo, line->GTIN};
    line->Quantity = Sum(posting, line->Quantity, LineQuantity(posting));
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
  // Read for what is wrong with them.
  NumberOf(WEIGHT);
  NumberOf(VOLUME);
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

double CsvOrderImporter::Sum(const Posting& posting, double before, double quantity) {
  try {
    return Plus(before, quantity);
  } catch (const RunTimeError&) {
    throw Unreadable{LineText(posting.lineNo) + ": the quantities of product " + std::string(line_[INCOMINGPRODUCTNO]) +
                     " add up beyond all numbers"};
  }
}

double CsvOrderImporter::NumberOf(OrderField field) {
  const bool isQuantity = field == posting_->values.quantity || field == ALLOCATEQUANTITY;
  if (const auto plain = PlainNumber(line_[field], isQuantity)) return *plain;
  return ReadNumber(*posting_, line_[field], LineText(posting_->lineNo), Name(field), isQuantity);
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

void CsvOrderImporter::CheckBuyingLocn(Posting& posting) {
  OrderImporter::CheckBuyingLocn(posting, BuyingLocn(), posting.values.checksBuyingLocn);
}

void CsvOrderImporter::TakeLocation(Posting& posting) {
  OrderLocn* const added = NewLocation(posting);
  if (added == nullptr) return;
  added->CustomerRef = NullIfEmpty(line_[CUSTOMERREF]);
  added->CustomerNo = NullIfEmpty(line_[CUSTOMERNO]);
}

CsvOrderImporter::Next CsvOrderImporter::AddToLocation(Posting& posting, const LineProduct& product) {
  const std::string key = OrderDraft::LocnLineKey(posting.buyingLocn, product.ordered);
  const auto& there = posting.draft.locnLines.Find(key);
  if (there && !posting.values.repeatsAddUp) return RejectRepeat(posting, product.ordered);
  const auto added = std::make_shared<OrderLocnLine>();
  added->ProductNo = product.productNo;
  added->GTIN = product.GTIN;
  added->BuyingLocn = posting.buyingLocn;
  FillLocationLine(posting, *added);
  if (there) {
    there->Quantity = Sum(posting, there->Quantity, added->Quantity);
    there->AllocateQty = Sum(posting, there->AllocateQty, added->AllocateQty);
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

}  // namespace partnerkit::orders

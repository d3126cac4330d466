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

}  // namespace

CsvOrderImporter::Posting::Posting(CsvOrderImporter& importer, ListedOrder& listed, ErrorList& errorList)
    : entry(listed),
      log(importer, "Process", errorList),
      checks(importer, log, listed.PONo, importer.values_.checkWords) {}

std::int32_t CsvOrderImporter::Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function Process", std::int32_t{0}, [&](std::int32_t& orderId) {
    ListedOrder* const entry = EntryOfRow(a_lRowNum);
    if (entry == nullptr) return;
    Posting posting(*this, *entry, vtErrorLog);
    if (StartPosting(posting) == Next::kEnd) return;
    if (SettleStoredOrder(posting) == Next::kEnd) return;
    if (RefuseCancellationOfNothing(posting) == Next::kEnd) return;
    FillHeader(posting);
    if (ReadLines(posting) == Next::kEnd) return;
    orderId = Post(posting);
  });
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
  return Try([&] {
    queue_.Lines().Seek(static_cast<std::uint64_t>(posting.entry.FilePos));
    return NextLine(posting);
  })
             ? Next::kGoOn
             : Next::kEnd;
}

// An order that is already stored under the number.
CsvOrderImporter::Next CsvOrderImporter::SettleStoredOrder(Posting& posting) {
  Order stored;
  stored.VendorId = OwnCompany().VendorId;
  stored.PartnerId = TradingPartner().PartnerId;
  stored.PONo = line_[PONUMBER];
  if (!Try([&] { return Find(Records(), Order::kByNumber, stored); })) return Next::kGoOn;

  const std::string& number = posting.entry.PONo;
  const bool incomplete = stored.Status == kBeingStored;
  const std::string storedControls =
      std::string(Str(stored.InterchangeCtl)).append(Str(stored.GroupCtl)).append(Str(stored.TransactionCtl));
  // The same file again. An order that an earlier run of it left half stored is no order yet, and is taken up anew
  // below.
  if (storedControls == posting.entry.Controls() && !incomplete) {
    posting.log.Note(kRejection, words::kAlreadyExists.With(number));
    return TurnAway(posting);
  }
  const StoredOrderRule* rule = FirstFitting(
      values_.storedOrder, {.purpose = line_[POPURPOSECODE], .hasJobs = HasJobs(stored), .incomplete = incomplete});
  if (rule == nullptr) return Next::kEnd;
  posting.log.Note(rule->number, rule->message.With(number));
  switch (rule->fate) {
    case Fate::kReplace:
      return Try([&] { return Host().DeleteOrder(stored); }) ? Next::kGoOn : Next::kEnd;
    case Fate::kCancel:
      Try([&] { return Host().DeleteOrder(stored); });
      return TurnAway(posting);
    case Fate::kTurnAway:
      break;
  }
  return TurnAway(posting);
}

bool CsvOrderImporter::HasJobs(const Order& stored) {
  Job probe;
  probe.OrderId = stored.OrderId;
  return Try([&] { return Count(Records(), Job::kByOrder, probe); }) > 0;
}

CsvOrderImporter::Next CsvOrderImporter::RefuseCancellationOfNothing(Posting& posting) {
  if (!IsOneOf(line_[POPURPOSECODE], values_.cancelCodes)) return Next::kGoOn;
  posting.log.Note(kRejection, words::kCancelOfNothing.With(posting.entry.PONo));
  return TurnAway(posting);
}

CsvOrderImporter::Next CsvOrderImporter::TurnAway(Posting& posting) {
  posting.entry.OrderId = 0;
  processed_.Add(posting.entry);
  return Next::kEnd;
}

void CsvOrderImporter::FillHeader(Posting& posting) {
  Order& header = posting.draft.header;
  header.VendorId = OwnCompany().VendorId;
  header.PartnerId = TradingPartner().PartnerId;
  header.InterchangeCtl = posting.entry.InterchangeCtl;
  header.GroupCtl = posting.entry.GroupCtl;
  header.TransactionCtl = posting.entry.TransactionCtl;
  header.FilePos = posting.entry.FilePos;
  header.PONo = line_[PONUMBER];
  header.PurposeCode = std::string(line_[POPURPOSECODE]);
  header.TypeCode = std::string(line_[POTYPECODE]);
  header.PODate = OrderDate(line_[PODATE]);
  header.NotBefore = OrderDate(line_[NOTBEFORE]);
  header.CancelAfter = OrderDate(line_[CANCAFTER]);
  header.ImportDate = Now().Date();
  if (const auto advertised = OrderDate(line_[ADDATE])) header.Header1 = Format(*advertised, "mmdd");
  header.DeptNo = NullIfEmpty(line_[DEPTNO]);
  header.CustomerRef = NullIfEmpty(line_[CUSTOMERREF]);
  header.SupplierNo = NullIfEmpty(line_[SUPPLIERNO]);
  header.CustCat = NullIfEmpty(line_[CUSTCAT]);
  header.Status = kBeingStored;
}

// Reads and checks the transaction's lines. Nothing is stored here: an order goes in whole or not at all.
CsvOrderImporter::Next CsvOrderImporter::ReadLines(Posting& posting) {
  line_.Join(values_.lineKey, posting.firstLineKey);
  std::string transaction, lineKey;
  const std::string own = posting.entry.Controls();
  for (;;) {
    if (TakeLine(posting) == Next::kEnd) return Next::kEnd;
    if (!NextLine(posting)) return Next::kGoOn;
    line_.Join(kTransactionKey, transaction);
    line_.Join(values_.lineKey, lineKey);
    if (transaction != own || lineKey == posting.firstLineKey) return Next::kGoOn;
  }
}

// Takes the next line in hand. False at the end of the file.
bool CsvOrderImporter::NextLine(Posting& posting) {
  Line line;
  if (!ReadLine(line)) return false;
  line_.Read(line.text);
  posting.lineSequence = line_[SEQUENTIALLINENO];
  return true;
}

CsvOrderImporter::Next CsvOrderImporter::TakeLine(Posting& posting) {
  const std::string productNo(line_[INCOMINGPRODUCTNO]);
  if (const auto& line = posting.draft.lines.Find(productNo)) {
    Try([&] { line->Quantity = Plus(line->Quantity, NumberAtStart(line_[ORDERQUANTITY])); });
  } else {
    CheckLineProduct(posting);
    const auto added = std::make_shared<OrderLine>();
    added->ProductNo = productNo;
    Try([&] { FillLine(*added); });
    posting.draft.lines.Add(added, productNo);
  }
  CheckLineLocations(posting);
  if (!posting.draft.locations.Find(posting.buyingLocn)) {
    const auto added = std::make_shared<OrderLocn>();
    added->VendorId = OwnCompany().VendorId;
    added->ShipToLocn = posting.shipTo;
    added->BuyingLocn = posting.buyingLocn;
    FillLocation(*added);
    posting.draft.locations.Add(added, posting.buyingLocn);
  }
  return AddToLocation(posting, productNo);
}

void CsvOrderImporter::CheckLineProduct(Posting& posting) {
  if (!Document().ValidateProduct) return;
  if (!(line_.Raw(STYLE).empty() && line_.Raw(COLOUR).empty() && line_.Raw(SIZE).empty())) {
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
  const LineClaims claims{.productNo = line_[INCOMINGPRODUCTNO],
                          .uom = line_[UNITMEASURECODE],
                          .qualifier = line_[PRODUCTQUALIFIER],
                          .cost = line_[UNITPRICE],
                          .retail = line_[RETAILUNITPRICE],
                          .sku = line_[SKUPRODUCTKEYCODE]};
  posting.checks.CheckProduct(claims);
  if (Document().ValidateCost || Document().ValidateRetail) posting.checks.CheckPrice(claims);
}

void CsvOrderImporter::FillLine(OrderLine& line) {
  line.LineNo = std::string(line_[SEQUENTIALLINENO]);
  line.UOM = std::string(line_[UNITMEASURECODE]);
  line.PriceCode = std::string(line_[UNITPRICECODE]);
  line.Cost = NumberAtStart(line_[UNITPRICE]);
  line.Quantity = NumberAtStart(line_[ORDERQUANTITY]);
  line.SKU = std::string(line_[SKUPRODUCTKEYCODE]);
  line.RetailPrice = NumberAtStart(line_[RETAILUNITPRICE]);
}

// Locations are looked at when they change from one line to the next.
void CsvOrderImporter::CheckLineLocations(Posting& posting) {
  const std::string_view buying = line_[BUYINGLOCPARTNERNO];
  std::string_view shipTo = line_[SHIPTOLOCPARTNERNO];
  if (!values_.directToStore.empty() && shipTo == values_.directToStore) shipTo = buying;
  std::string_view lookedAt = posting.locationLookedAt;
  if (posting.shipTo.empty() || posting.shipTo != shipTo) {
    posting.shipTo = shipTo;
    posting.checks.CheckLocation("ship to", shipTo);
    lookedAt = shipTo;
  }
  if (posting.buyingLocn.empty() || posting.buyingLocn != buying) {
    posting.buyingLocn = buying;
    if (lookedAt != buying) {
      posting.checks.CheckLocation("buying", buying);
      lookedAt = buying;
    }
  }
  posting.locationLookedAt = std::string(lookedAt);
}

void CsvOrderImporter::FillLocation(OrderLocn& location) {
  location.CustomerRef = NullIfEmpty(line_[CUSTOMERREF]);
  location.CustomerNo = NullIfEmpty(line_[CUSTOMERNO]);
}

CsvOrderImporter::Next CsvOrderImporter::AddToLocation(Posting& posting, const std::string& productNo) {
  const std::string key = OrderDraft::LocnLineKey(posting.buyingLocn, productNo);
  if (posting.draft.locnLines.Find(key)) {
    posting.entry.OrderId = 0;
    posting.log.Note(ErrorNumber(), "Duplicate lines found for store " + posting.buyingLocn + " EAN " + productNo);
    return Next::kEnd;
  }
  const auto added = std::make_shared<OrderLocnLine>();
  added->ProductNo = productNo;
  added->BuyingLocn = posting.buyingLocn;
  Try([&] { FillLocationLine(*added); });
  posting.draft.locnLines.Add(added, key);
  return Next::kGoOn;
}

void CsvOrderImporter::FillLocationLine(OrderLocnLine& locnLine) {
  locnLine.Quantity = NumberAtStart(line_[ORDERQUANTITY]);
  const std::string_view allocated = line_[ALLOCATEQUANTITY];
  locnLine.AllocateQty = allocated.empty() ? locnLine.Quantity : NumberAtStart(allocated);
  locnLine.LineRef = NullIfEmpty(line_[LINEREF]);
}

// Stores the order when every check passed, and tells the outcome. The stored order's id, 0 when nothing was stored.
std::int32_t CsvOrderImporter::Post(Posting& posting) {
  const std::string& number = posting.entry.PONo;
  if (!posting.checks.Ok()) {
    posting.log.Note(kInformation, words::kImportIncomplete.With(number));
    return 0;
  }
  if (!StoreDraft(*this, posting.log, posting.draft, posting.lineSequence) ||
      !CompleteStoredOrder(*this, posting.draft)) {
    posting.entry.OrderId = 0;
    return 0;
  }
  posting.entry.OrderId = posting.draft.header.OrderId;
  processed_.Add(posting.entry);
  posting.log.Note(kInformation, words::kImportCompleted.With(number));
  return posting.entry.OrderId;
}

}  // namespace partnerkit::orders

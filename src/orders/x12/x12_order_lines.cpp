// The lines of an X12 order and the stores that they go to.
#include <utility>

#include "orders/x12/x12_order_importer.h"
#include "values/delimited.h"

namespace partnerkit::orders {

namespace {

constexpr int kFirstStore = 3, kLastStore = 21;  // elements of an SDQ, which names up to ten stores

}  // namespace

X12OrderImporter::Next X12OrderImporter::TakeLine(Posting& posting, const LineElements& elements) {
  if (Distribute(posting) == Next::kEnd) return Next::kEnd;
  const std::string number = Element(elements.productNo, values_.productForm);
  ++posting.lines;
  posting.price.reset();
  if (Document().ValidateProduct) CheckLine(posting, elements, number);
  const auto line = std::make_shared<OrderLine>();
  line->ProductNo = number;
  FillLine(posting, elements, *line);
  // The same product again would leave no telling which of the two its stores are for.
  if (posting.draft.lines.Find(number)) {
    throw Unreadable{SegmentText() + ": product " + number + " stands in two lines of the order"};
  }
  if (TrimBlanks(number).empty()) {
    posting.log.Note(kWarning, "PO " + posting.entry.PONo + ", " + SegmentText() + ": the line has no product number.");
  }
  posting.draft.lines.Add(line, number);
  posting.line = line;
  posting.distributed = false;
  return Next::kGoOn;
}

void X12OrderImporter::CheckLine(Posting& posting, const LineElements& elements, const std::string& number) {
  const std::string uom = Element(elements.uom), qualifier = Element(elements.qualifier), cost = Element(elements.cost);
  LineClaims claims;
  claims.productNo = number;
  claims.uom = uom;
  claims.qualifier = qualifier;
  claims.cost = cost;
  claims.needsPrice = elements.needsPrice;
  CheckRules rules = values_.checks;
  const bool loose =
      values_.looseNumberLength != 0 && std::cmp_equal(TrimBlanks(number).size(), values_.looseNumberLength);
  if (loose) rules.symbology = Symbology::kSkip;
  posting.checks.SetRules(rules);
  posting.checks.CheckProduct(claims);
  if (Document().ValidateCost) posting.price = posting.checks.CheckPrice(claims);
}

void X12OrderImporter::FillLine(Posting& posting, const LineElements& elements, OrderLine& line) {
  line.LineNo = values_.countsLines ? std::to_string(posting.lines) : Element(elements.lineNo);
  line.UOM = Element(elements.uom);
  line.PriceCode = Element(elements.priceCode);
  line.Cost = NumberOf(posting, elements.cost, Element(elements.cost));
  line.Quantity = NumberOf(posting, elements.quantity, Element(elements.quantity), true);
  line.SKU = Sku();
}

Text X12OrderImporter::Sku() {
  constexpr int kQualifier = 8;
  const SkuElements& sku = values_.sku;
  if (sku.qualifiers.empty() || segment_.PosBegSplat(kQualifier) == 0) return {};
  const std::string_view qualifier = segment_.Inner(kQualifier);
  if (!IsOneOf(sku.byFront ? qualifier.substr(0, 2) : qualifier, sku.qualifiers)) return {};
  return ElementOrEnd(kQualifier + 1, sku.atEnd);
}

void X12OrderImporter::TakeRetail(Posting& posting) {
  if (!values_.retail) return;
  NeedLine(posting);
  const std::string retail = Element(3, *values_.retail);
  // The price record is at hand only when costs are checked as well.
  if (Document().ValidateRetail && posting.price) posting.checks.CheckRetail(*posting.price, retail);
  posting.line->RetailPrice = NumberOf(posting, 3, retail);
}

void X12OrderImporter::TakePack(Posting& posting) {
  if (values_.packNumbers.empty() && !values_.packUOM) return;
  NeedLine(posting);
  for (const PackNumber& number : values_.packNumbers) {
    const bool ends = segment_.PosBegSplat(number.element + 1) == 0;
    const std::string text = Element(number.element, ends ? ElementForm{ElementForm::kLast} : ElementForm{});
    if (!text.empty()) *posting.line.*number.member = NumberOf(posting, number.element, text);
  }
  if (values_.packUOM) posting.line->PackUOM = NullIfEmpty(Element(3, *values_.packUOM));
}

void X12OrderImporter::NeedLine(const Posting& posting) const {
  if (!posting.line) throw Unreadable{SegmentText() + ": it stands before any line of the order"};
}

// An SDQ gives quantities of the line to stores, in pairs; a line may have several.
X12OrderImporter::Next X12OrderImporter::TakeStores(Posting& posting) {
  NeedLine(posting);
  for (int n = kFirstStore; n <= kLastStore && segment_.PosBegSplat(n) != 0; n += 2) {
    if (segment_.PosBegSplat(n + 1) == 0) {
      throw Unreadable{SegmentText() + ": store " + Element(n, {ElementForm::kLast}) + " has no quantity"};
    }
    const std::string store = Element(n);
    if (posting.n1 == values_.directToStore) {
      CheckShipTo(posting, store);
    } else {
      posting.shipTo = posting.n1;
    }
    if (values_.rechecksStores) posting.locationLookedAt.clear();
    CheckBuyingLocn(posting, store, true, values_.storeWord);
    const double quantity = NumberOf(posting, n + 1, ElementOrEnd(n + 1, values_.quantityForm), true);
    if (AddToLocation(posting, quantity) == Next::kEnd) return Next::kEnd;
  }
  posting.distributed = true;
  return Next::kGoOn;
}

// A line without stores goes whole to the location of the N1.
X12OrderImporter::Next X12OrderImporter::Distribute(Posting& posting) {
  if (posting.distributed) return Next::kGoOn;
  posting.distributed = true;
  posting.shipTo = posting.buyingLocn = posting.n1;
  return AddToLocation(posting, posting.line->Quantity);
}

X12OrderImporter::Next X12OrderImporter::AddToLocation(Posting& posting, double quantity) {
  NewLocation(posting);
  const std::string& number = posting.line->ProductNo;
  const std::string key = OrderDraft::LocnLineKey(posting.buyingLocn, number);
  if (posting.draft.locnLines.Find(key)) return RejectRepeat(posting, number);
  const auto added = std::make_shared<OrderLocnLine>();
  added->ProductNo = number;
  added->BuyingLocn = posting.buyingLocn;
  added->Quantity = added->AllocateQty = quantity;
  posting.draft.locnLines.Add(added, key);
  return Next::kGoOn;
}

}  // namespace partnerkit::orders

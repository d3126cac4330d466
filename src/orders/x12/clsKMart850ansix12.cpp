// Purchase orders of Kmart, and changes to them: releases of blanket orders, and orders that are stored with their
// faults.
#include "orders/order_answers.h"
#include "orders/x12/x12_order_importer.h"
#include "values/delimited.h"

namespace partnerkit::orders {

namespace {

// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.purpose = "07", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,   .fate = Fate::kReplace},
    {.incomplete = true,                   .number = kWarning,   .message = words::kIncomplete,  .fate = Fate::kReplace},
    {.purpose = "05", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kChange,      .fate = Fate::kReplace},
    {.purpose = "01", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kCancel,      .refused = words::kCancelFailed, .fate = Fate::kCancelThenSay},
    {.purpose = "01",                      .number = kWarning,   .message = words::kCancelBegun},
    {.purpose = "05", .storedChangeFlag = "1",                                                   .fate = Fate::kChangeStored},
    {.purpose = "05",                      .number = kWarning,   .message = words::kChangeBegun, .fate = Fate::kLeaveInFile},
    {                                      .number = kRejection, .message = words::kAlreadyExists},
};
constexpr OrderRule kNewOrder[] = {
    {.type = "BK",    .number = kRejection, .message = words::kBlanketNotedDash, .fate = Fate::kGoOn},
    {.purpose = "01", .number = kRejection, .message = words::kChangeCancelsNothing, .fate = Fate::kCancel},
};
constexpr LineElements kLines[] = {
    {},
    {.tag = "POC", .lineNo = 1, .quantity = 3, .uom = 5, .cost = 6, .priceCode = 7, .qualifier = 8, .productNo = 9, .needsPrice = true},
};
constexpr PackNumber kPackNumbers[] = {
    {&OrderLine::PackCount, 1},
    {&OrderLine::PackSize,  2},
};
// clang-format on

constexpr X12OrderValues kValues{
    .className = "clsKMart850ansix12",
    .cutsApostrophe = true,
    .addressesOf13 = true,
    .groups = "PO PC",
    .sets = "850 860",
    .beginnings = "BEG BCH",
    .storedOrder = kStoredOrder,
    .newOrder = kNewOrder,
    .datesDefaultToToday = true,
    .storeWord = "store",
    .rechecksStores = true,
    .lines = kLines,
    .productForm = {ElementForm::kLast},
    .packNumbers = kPackNumbers,
    .packUOM = ElementForm{ElementForm::kSpan, 2},
    .checks = {.before = "...PO ",
               .after = " in error, ",
               .symbologyOf = "product ",
               .symbologyClaim = " qualifier ",
               .retail = false},
};

class clsKMart850ansix12 final : public X12OrderImporter {
 public:
  explicit clsKMart850ansix12(const Ports& ports) : X12OrderImporter(kValues, ports) {}
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;

 private:
  std::string OrderNumber() override;
  void BeginPosting(Posting& posting) override;
  void FillHeader(Posting& posting) override;
  void ReadOther(Posting& posting) override;
  std::string ReleaseNo();

  bool answersOrders_ = false;  // an order acknowledgement goes back to the partner
};

bool clsKMart850ansix12::Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) {
  const bool bound = X12OrderImporter::Init(system, EDIDocId, Columns);
  answersOrders_ = bound && HasOrderAcknowledgement(*this, CodeForm::kTrimmedAnyCase);
  return bound;
}

// A release is an order of its own under its blanket order's number.
std::string clsKMart850ansix12::OrderNumber() {
  const std::string number = Element(3);
  return Element(2) == "RL" ? number + " REL# " + ReleaseNo() : number;
}

void clsKMart850ansix12::BeginPosting(Posting& posting) {
  if (answersOrders_) posting.checks.LetFaultsPass();
}

void clsKMart850ansix12::FillHeader(Posting& posting) {
  X12OrderImporter::FillHeader(posting);
  posting.draft.header.Header2 = NullIfEmpty(ReleaseNo());
}

std::string clsKMart850ansix12::ReleaseNo() { return std::string(TrimBlanks(Element(4))); }

void clsKMart850ansix12::ReadOther(Posting& posting) {
  constexpr ElementForm kRest{ElementForm::kLast};
  Order& header = posting.draft.header;
  if (InHand().Begins("REF")) {
    const std::string kind = Element(1);
    if (kind == "IA") header.SupplierNo = NullIfEmpty(Element(2, kRest));
    if (kind == "DP") header.DeptNo = NullIfEmpty(Element(2, kRest));
  } else if (InHand().Begins("PKG")) {
    const int elements = InHand().SplatCount();
    if (elements != 4 && elements != 5) return;
    // An advertisement is kept by its last four characters, day and month.
    const std::string mark = Element(4, elements == 4 ? kRest : ElementForm{});
    header.Header1 = TrimBlanks(mark).empty() ? Text() : Text(mark);
    if (mark.starts_with("AD") && mark.size() > 4) header.Header1 = mark.substr(mark.size() - 4);
    if (elements == 5) header.Header4 = Element(5, kRest);
  }
}

}  // namespace

std::unique_ptr<Translator> MakeKMart850ansix12(const Ports& ports) {
  return std::make_unique<clsKMart850ansix12>(ports);
}

}  // namespace partnerkit::orders

// Purchase orders of MGB.
#include "orders/x12/x12_order_importer.h"
#include "values/format.h"

namespace partnerkit::orders {

namespace {

// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.purpose = "07", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,       .fate = Fate::kReplace},
    {.purpose = "01",                      .number = kWarning,   .message = words::kCancelProcessed, .refused = words::kCancelRefused, .fate = Fate::kCancel},
    {.incomplete = true,                   .number = kWarning,   .message = words::kIncomplete,      .fate = Fate::kReplace},
    {                                      .number = kRejection, .message = words::kAlreadyExists},
};
constexpr OrderRule kNewOrder[] = {
    {.purpose = "01", .number = kRejection, .message = words::kCancelOfNone, .fate = Fate::kLeaveInFile},
};
constexpr DateOfOrder kDates[] = {
    {"001", &Order::CancelAfter},
    {"037", &Order::NotBefore},
};
// clang-format on

constexpr X12OrderValues kValues{
    .className = "clsMGB850ansix12",
    .otherEnd = '\'',
    .keepsBareSegments = false,
    .keepsSourceFile = true,
    .storedOrder = kStoredOrder,
    .newOrder = kNewOrder,
    .dates = kDates,
    .sku = {.qualifiers = "SK", .byFront = true, .atEnd = {ElementForm::kSpan, 8}},
    .retail = ElementForm{ElementForm::kSpan, 14},
    .exports = true,
};

class clsMGB850ansix12 final : public X12OrderImporter {
 public:
  explicit clsMGB850ansix12(const Ports& ports) : X12OrderImporter(kValues, ports) {}

 private:
  void ReadOther(Posting& posting) override;
  void TakeDate(Order& order) override;
};

// Whatever a reference is called, it is the department.
void clsMGB850ansix12::ReadOther(Posting& posting) {
  if (InHand().Begins("REF") && InHand().PosBegSplat(2) != 0) {
    posting.draft.header.DeptNo = ElementOrEnd(2, {ElementForm::kSpan, 4});
  }
}

// The date of an advertisement is kept as day and month, too.
void clsMGB850ansix12::TakeDate(Order& order) {
  X12OrderImporter::TakeDate(order);
  if (InHand().Fixed(5, 3) != "015") return;
  order.Header1 = std::string(InHand().Fixed(13, 2)).append(InHand().Fixed(11, 2));
  if (const auto advertised = InHand().FixedDate(9))
    order.Note = "Advertised date " + Format(*advertised, "Short Date");
}

}  // namespace

std::unique_ptr<Translator> MakeMGB850ansix12(const Ports& ports) { return std::make_unique<clsMGB850ansix12>(ports); }

}  // namespace partnerkit::orders

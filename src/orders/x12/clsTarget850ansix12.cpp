// Purchase orders of Target: blanket orders and releases, direct deliveries to stores.
#include "orders/x12/x12_order_importer.h"

namespace partnerkit::orders {

namespace {

// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.purpose = "07",                   .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,  .fate = Fate::kReplace},
    {.type = "RL", .storedType = "BL",  .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,  .fate = Fate::kReplace},
    {.incomplete = true,                                     .number = kWarning,   .message = words::kIncomplete, .fate = Fate::kReplace},
    {                                                        .number = kRejection, .message = words::kAlreadyExists},
};
constexpr OrderRule kNewOrder[] = {
    {.type = "BL", .number = kRejection, .message = words::kBlanketNoted, .fate = Fate::kGoOn},
};
constexpr PackNumber kPackNumbers[] = {
    {&OrderLine::PackSize, 2},
};
// clang-format on

constexpr X12OrderValues kValues{
    .className = "clsTarget850ansix12",
    .storedOrder = kStoredOrder,
    .newOrder = kNewOrder,
    .showsWholeN1 = true,
    .directToStore = "DTS",
    .countsLines = true,
    .sku = {.qualifiers = "CB SK", .atEnd = {ElementForm::kLast}},
    .retail = ElementForm{ElementForm::kLast},
    .packNumbers = kPackNumbers,
    .packUOM = ElementForm{ElementForm::kLast},
    .quantityForm = {ElementForm::kLast},
    .exports = true,
    .deletesTemporary = false,
};

class clsTarget850ansix12 final : public X12OrderImporter {
 public:
  explicit clsTarget850ansix12(const Ports& ports) : X12OrderImporter(kValues, ports) {}

 private:
  void ReadOther(Posting& posting) override;
};

// Marks for the carton, and for the ticket.
void clsTarget850ansix12::ReadOther(Posting& posting) {
  if (!InHand().Begins("PKG")) return;
  Order& header = posting.draft.header;
  const std::string kind = Element(1);
  if (kind == "X") {
    header.Header1 = Element(4);
    header.Header2 = Element(5, {ElementForm::kLast});
  } else if (kind == "F") {
    header.Header3 = Element(5, {ElementForm::kLast});
  }
}

}  // namespace

std::unique_ptr<Translator> MakeTarget850ansix12(const Ports& ports) {
  return std::make_unique<clsTarget850ansix12>(ports);
}

}  // namespace partnerkit::orders

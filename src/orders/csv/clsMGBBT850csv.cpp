// Purchase orders of MGB by the business-to-business translator: a line with a store zone belongs to a customer's
// order, one without to a merchandise order.
#include "orders/csv/clsMGBBT850csv.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

// A customer's name and text, which the translator sends to some suppliers only.
constexpr OrderField kOptional[] = {HEADER1, HEADER2, HEADER3, HEADER4};

// clang-format off
constexpr OrderRule kMerchStoredOrder[] = {
    {.purpose = "07", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,     .fate = Fate::kReplace},
    {.purpose = "05", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kChange,        .fate = Fate::kReplace},
    {.purpose = "01", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kCancel,        .fate = Fate::kCancelInFile},
    {.purpose = "01", .jobs = Jobs::kSome, .number = kRejection, .message = words::kCancelWithJob},
    {.incomplete = true,                   .number = kWarning,   .message = words::kIncomplete,    .fate = Fate::kReplace},
    {                                      .number = kRejection, .message = words::kAlreadyExists},
};
// A cancellation stays in the file, where the next run meets it again: it must never be posted as the order it cancels.
constexpr OrderRule kMerchNewOrder[] = {
    {.purpose = "01", .number = kWarning, .message = words::kCancel, .fate = Fate::kLeaveInFile},
};
constexpr OrderRule kCustomerStoredOrder[] = {
    {.purpose = "1", .type = "230", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kCancelProcessed, .refused = words::kCancelFailed, .fate = Fate::kCancelIfDeleted},
    {                .type = "230", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kChangeProcessed, .fate = Fate::kReplace},
    {.incomplete = true,                                 .number = kWarning,   .message = words::kIncomplete,      .fate = Fate::kReplace},
    {                                                    .number = kRejection, .message = words::kAlreadyExists},
};
constexpr FieldText<Order> kCustomerHeader[] = {
    {&Order::DeptNo,     DEPTNO},
    {&Order::SupplierNo, SUPPLIERNO},
    {&Order::CustCat,    CUSTCAT},
    {&Order::Header2,    HEADER1},
    {&Order::Header3,    STOREZONE, false},
};
// clang-format on

constexpr PostingValues kMerchandise{
    .procedure = "MerchPOProcess",
    .storedOrder = kMerchStoredOrder,
    .newOrder = kMerchNewOrder,
    .advertisedDate = true,
};

constexpr CsvOrderValues kValues{
    .className = "clsMGBBT850csv",
    .optional = kOptional,
    .quotesProtectCommas = true,
    .importsProducts = true,
    .posting = {.storedOrder = kCustomerStoredOrder,
                .newOrder = {},
                .headerTexts = kCustomerHeader,
                .advertisedDate = true,
                .repeatsAddUp = true,
                .checks = {.uom = false, .symbology = Symbology::kSkip, .retail = false}},
    .settlesByControls = true,
};

}  // namespace

clsMGBBT850csv::clsMGBBT850csv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

std::int32_t clsMGBBT850csv::MerchPOProcess(std::int32_t a_lRowNum, ErrorList& vtErrorLog) {
  return Procedure("Function MerchPOProcess", std::int32_t{0},
                   [&](std::int32_t& orderId) { orderId = PostRow(a_lRowNum, &kMerchandise, vtErrorLog); });
}

const PostingValues& clsMGBBT850csv::ValuesOf() const {
  return (*this)[STOREZONE].empty() ? kMerchandise : kValues.posting;
}

void clsMGBBT850csv::FillHeader(Posting& posting) {
  CsvOrderImporter::FillHeader(posting);
  if (&posting.values == &kMerchandise) return;
  Order& header = posting.draft.header;
  header.TypeCode = "CO";
  std::string name((*this)[HEADER2]);
  name.append(" ").append((*this)[HEADER3]).append(" ").append((*this)[HEADER4]);
  header.CustomerName = NullIfEmpty(TrimBlanks(name));
}

// A customer's line without product and quantity takes the order back.
CsvOrderImporter::Next clsMGBBT850csv::LookAtLine(Posting& posting) {
  if (&posting.values == &kMerchandise || !(*this)[INCOMINGPRODUCTNO].empty() || LineQuantity(posting) != 0) {
    return Next::kGoOn;
  }
  if (!DeleteReplaced(posting)) return Next::kEnd;
  posting.log.Note(kRejection, words::kOrderCancelled.With(posting.entry.PONo));
  return TurnAway(posting);
}

std::unique_ptr<Translator> MakeMGBBT850csv(const Ports& ports) { return std::make_unique<clsMGBBT850csv>(ports); }

}  // namespace partnerkit::orders

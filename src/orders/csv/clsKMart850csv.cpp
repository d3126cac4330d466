// Purchase orders of Kmart: releases of blanket orders, and orders that are stored with their faults.
#include "orders/csv/csv_order_importer.h"
#include "orders/order_answers.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

constexpr OrderField kAdded[] = {POVERSIONNO, CARTONSOUTER, UNITSINNERPACK, PACKUOM};
constexpr OrderField kRemoved[] = {CUSTCAT, SKUPRODUCTKEYCODE, RETAILUNITPRICE};
constexpr OrderField kNumberFields[] = {PONUMBER, POTYPECODE, POVERSIONNO};

// clang-format off
constexpr OrderRule kStoredOrder[] = {
    {.purpose = "07", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,  .fate = Fate::kReplace},
    {.purpose = "05", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kChange,     .fate = Fate::kReplace},
    {.purpose = "01", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kCancel,     .fate = Fate::kCancelInFile},
    {.incomplete = true,                   .number = kWarning,   .message = words::kIncomplete, .fate = Fate::kReplace},
    {                                      .number = kRejection, .message = words::kAlreadyExists},
};
constexpr OrderRule kNewOrder[] = {
    {.purpose = "01", .number = kWarning,   .message = words::kCancel, .fate = Fate::kLeaveInFile},
    {.type = "BK",    .number = kRejection, .message = words::kBlanketDash},
};
constexpr FieldText<Order> kHeader[] = {
    {&Order::SupplierNo, SUPPLIERNO,  false},
    {&Order::DeptNo,     DEPTNO,      false},
    {&Order::Header2,    POVERSIONNO},
    {&Order::Header4,    STOREZONE,   false},
};
constexpr FieldText<OrderLine> kLine[] = {
    {&OrderLine::LineNo,    SEQUENTIALLINENO, false},
    {&OrderLine::UOM,       UNITMEASURECODE,  false},
    {&OrderLine::PriceCode, UNITPRICECODE,    false},
    {&OrderLine::PackUOM,   PACKUOM,          false},
};
constexpr FieldNumber<double> kLineNumbers[] = {
    {&OrderLine::Cost, UNITPRICE},
};
constexpr FieldNumber<std::optional<double>> kPackNumbers[] = {
    {&OrderLine::PackCount, CARTONSOUTER},
    {&OrderLine::PackSize,  UNITSINNERPACK},
};
// clang-format on

constexpr CsvOrderValues kValues{
    .className = "clsKMart850csv",
    .added = kAdded,
    .removed = kRemoved,
    .orderKey = kNumberFields,
    .skipsBlankLines = true,
    .posting = {.storedOrder = kStoredOrder,
                .newOrder = kNewOrder,
                .headerTexts = kHeader,
                .lineTexts = kLine,
                .lineNumbers = kLineNumbers,
                .lineNumbersOrNull = kPackNumbers,
                .checks = {.before = "...PO ",
                           .after = " in error, ",
                           .uom = false,
                           .symbology = Symbology::kWarn,
                           .retail = false}},
};

class clsKMart850csv final : public CsvOrderImporter {
 public:
  explicit clsKMart850csv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;

 private:
  std::string_view OrderNumber(std::string& number) const override;
  bool BeginPosting(Posting& posting) override;
  void FillHeader(Posting& posting) override;
  bool LineCounts() override;
  void CheckLineLocations(Posting& posting) override;

  bool answersOrders_ = false;  // an order acknowledgement goes back to the partner
};

bool clsKMart850csv::Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) {
  const bool bound = CsvOrderImporter::Init(system, EDIDocId, Columns);
  answersOrders_ = bound && HasOrderAcknowledgement(*this);
  return bound;
}

// A release is an order of its own under its blanket order's number.
std::string_view clsKMart850csv::OrderNumber(std::string& number) const {
  if ((*this)[POTYPECODE] != "RL") return (*this)[PONUMBER];
  return number.assign((*this)[PONUMBER]).append(" REL# ").append((*this)[POVERSIONNO]);
}

bool clsKMart850csv::BeginPosting(Posting& posting) {
  if (answersOrders_) posting.checks.LetFaultsPass();
  return true;
}

void clsKMart850csv::FillHeader(Posting& posting) {
  CsvOrderImporter::FillHeader(posting);
  posting.draft.header.Header1 = AdvertisedText((*this)[ADDATE]);
}

bool clsKMart850csv::LineCounts() { return NumberOf(SEQUENTIALLINENO) > 0 && !(*this)[INCOMINGPRODUCTNO].empty(); }

// Without a ship-to, the goods go through the location that the buying location receives through.
void clsKMart850csv::CheckLineLocations(Posting& posting) {
  const std::string_view buying = BuyingLocn();
  if (!(*this)[SHIPTOLOCPARTNERNO].empty()) {
    CheckShipTo(posting, (*this)[SHIPTOLOCPARTNERNO]);
  } else if (posting.buyingLocn.empty() || posting.buyingLocn != buying) {
    const PartnerLocn* const location = posting.checks.FindLocation(buying);
    const std::string through(location == nullptr ? std::string_view() : Str(location->DeliverToCode));
    posting.locationLookedAt = buying;
    if (through.empty()) {
      posting.shipTo.clear();
      posting.checks.Reject("ship to location " + std::string(buying) + " does not exist.");
    } else {
      CheckShipTo(posting, through);
    }
  }
  CheckBuyingLocn(posting);
}

}  // namespace

std::unique_ptr<Translator> MakeKMart850csv(const Ports& ports) { return std::make_unique<clsKMart850csv>(ports); }

}  // namespace partnerkit::orders

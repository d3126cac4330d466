// Purchase orders of the MGB stores.
#include "orders/csv/csv_classes.h"

namespace partnerkit::orders {

namespace {

using enum OrderField;

// clang-format off
constexpr OrderField kFields[] = {
    INTCONTROLNO, GRPCONTROLNO, TRNCONTROLNO, PARTNEREDIADDR, COMPANYEDIADDR, POPURPOSECODE, POTYPECODE, PONUMBER,
    PODATE, SUPPLIERNO, CUSTCAT, DEPTNO, NOTBEFORE, CANCAFTER, ADDATE, STOREZONE, BUYINGLOCPARTNERNO, SHIPTOLOCPARTNERNO,
    SEQUENTIALLINENO, PRODUCTQUALIFIER, INCOMINGPRODUCTNO, UNITMEASURECODE, UNITPRICECODE, UNITPRICE, ORDERQUANTITY,
    SKUPRODUCTKEYCODE, RETAILUNITPRICE, ALLOCATEQUANTITY, CUSTOMERREF, CUSTOMERNO, STYLE, COLOUR, SIZE, DESCRIPTION,
    WEIGHT, VOLUME, BIN, LINEREF};

constexpr StoredOrderRule kStoredOrder[] = {
    {.purpose = "07",   .jobs = Jobs::kNone, .number = kWarning,   .message = words::kDuplicate,     .fate = Fate::kReplace},
    {.purpose = "05",   .jobs = Jobs::kNone, .number = kWarning,   .message = words::kChange,        .fate = Fate::kReplace},
    {.purpose = "01 1", .jobs = Jobs::kNone, .number = kWarning,   .message = words::kCancel,        .fate = Fate::kCancel},
    {.purpose = "01 1", .jobs = Jobs::kSome, .number = kRejection, .message = words::kCancelWithJob, .fate = Fate::kTurnAway},
    {.incomplete = true,                     .number = kWarning,   .message = words::kIncomplete,    .fate = Fate::kReplace},
    {                                        .number = kRejection, .message = words::kAlreadyExists, .fate = Fate::kTurnAway},
};
// clang-format on

constexpr CsvOrderValues kValues{
    .className = "clsMGB850csv",
    .expectedFields = kFields,
    .storedOrder = kStoredOrder,
};

}  // namespace

clsMGB850csv::clsMGB850csv(const Ports& ports) : CsvOrderImporter(kValues, ports) {}

}  // namespace partnerkit::orders

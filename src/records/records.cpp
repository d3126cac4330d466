#include "partnerkit/records.h"

#include <algorithm>

namespace partnerkit {
namespace {

constexpr const RecordType* kAllTypes[] = {
    &Partner::kType,       &Vendor::kType,
    &EDIDoc::kType,        &PartnerAddress::kType,
    &PartnerLocn::kType,   &Product::kType,
    &ProductPrice::kType,  &ProductInner::kType,
    &Prepack::kType,       &PackType::kType,
    &Printer::kType,       &LabelJob::kType,
    &LabelJobItem::kType,  &Order::kType,
    &OrderLine::kType,     &OrderLocn::kType,
    &OrderLocnLine::kType, &UnsettledOrder::kType,
    &Job::kType,           &PSlip::kType,
    &PSlipLine::kType,     &Shipment::kType,
    &ASN::kType,           &PendingNotice::kType,
    &Pack::kType,          &PackLine::kType,
    &PADRecord::kType,     &PADItem::kType,
    &PADStore::kType,      &Log::kType,
};

}  // namespace

std::span<const RecordType* const> AllRecordTypes() { return kAllTypes; }

const RecordType* FindRecordType(std::string_view kind) {
  const auto found = std::ranges::find(kAllTypes, kind, &RecordType::kind);
  return found == std::end(kAllTypes) ? nullptr : *found;
}

}  // namespace partnerkit

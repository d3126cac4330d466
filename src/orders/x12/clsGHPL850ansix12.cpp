// Purchase orders of GHPL: a line of the file is a segment.
#include "orders/x12/x12_order_importer.h"

namespace partnerkit::orders {

namespace {

constexpr PackNumber kPackNumbers[] = {{&OrderLine::PackSize, 2}};

constexpr X12OrderValues kValues{
    .className = "clsGHPL850ansix12",
    .wholeLines = true,
    .keepsBareSegments = false,
    .archives = false,
    .addressesOf13 = true,
    .longestControl = 9,
    .n1Form = {ElementForm::kSpan, 17},
    .productForm = {ElementForm::kSpan, 30},
    .countsLines = true,
    .sku = {.qualifiers = "SK", .atEnd = {ElementForm::kSpan, 30}},
    .packNumbers = kPackNumbers,
    .looseNumberLength = 14,
    .cancelSettles = false,
    .deletesTemporary = false,
};

class clsGHPL850ansix12 final : public X12OrderImporter {
 public:
  explicit clsGHPL850ansix12(const Ports& ports) : X12OrderImporter(kValues, ports) {}

 private:
  void ReadOther(Posting& posting) override;
};

// The delivery date stands in a reference.
void clsGHPL850ansix12::ReadOther(Posting& posting) {
  if (!InHand().Begins("N9") || InHand().SplatCount() < 4) return;
  Order& header = posting.draft.header;
  header.CancelAfter = header.NotBefore = InHand().Date(4);
}

}  // namespace

std::unique_ptr<Translator> MakeGHPL850ansix12(const Ports& ports) {
  return std::make_unique<clsGHPL850ansix12>(ports);
}

}  // namespace partnerkit::orders

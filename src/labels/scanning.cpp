#include "labels/scanning.h"

#include <memory>
#include <vector>

#include "values/delimited.h"
#include "values/format.h"
#include "values/numbers.h"
#include "values/windows_1252.h"

namespace partnerkit::labels {

namespace {

template <class R>
bool Read(HostedClass& label, R& record) {
  return label.Try([&] { return Load(label.Records(), record); });
}

// A slip line and all that hangs from it; what isn't there is empty.
struct SlipLine {
  const PSlipLine& line;
  PSlip slip = {};
  Order order = {};
  Partner vendor = {};
  PartnerLocn store = {};
  Product product = {};
};

SlipLine ReadSlipLine(HostedClass& label, const PSlipLine& line) {
  SlipLine all{.line = line};
  Job job;
  all.slip.Id = line.PSlipId;
  Read(label, all.slip);
  job.JobId = all.slip.JobId;
  Read(label, job);
  all.order.OrderId = job.OrderId;
  Read(label, all.order);
  all.vendor.PartnerId = all.order.VendorId;
  Read(label, all.vendor);
  all.store.VendorId = all.order.VendorId;
  all.store.PartnerLocnNo = all.slip.StoreCode;
  Read(label, all.store);
  all.product.ProductNo = line.APN;
  Read(label, all.product);
  return all;
}

// The texts of a product's inner pack, both empty when it has none.
struct Inner {
  std::string ean, quantity;
};

Inner FirstInner(HostedClass& label, const Lookup& lookup, const ProductInner& probe) {
  const auto inners = label.Try([&] { return Select(label.Records(), lookup, probe); });
  if (inners.empty()) return {};
  return {inners.front()->InnerEAN, NumberText(inners.front()->InnerQty)};
}

Inner FirstInner(HostedClass& label, const Product& product) {
  ProductInner probe;
  probe.ProductNo = product.ProductNo;
  return FirstInner(label, ProductInner::kByProduct, probe);
}

// The inner pack that holds as many units as the packs of the line, else the product's first.
Inner InnerFor(HostedClass& label, const SlipLine& all) {
  ProductInner probe;
  probe.ProductNo = all.product.ProductNo;
  probe.InnerQty = all.line.PackedCount;
  const Inner inner = FirstInner(label, ProductInner::kByQuantity, probe);
  return inner.ean.empty() && inner.quantity.empty() ? FirstInner(label, all.product) : inner;
}

std::string StoreNo(std::string_view code) { return Format(code, "0000"); }

std::string OpenQuantity(const PSlipLine& line) { return NumberText(line.OrderQty - line.PackedQty); }

std::string Fixed(std::string_view text, std::size_t width) {
  std::string field = Windows1252(text).substr(0, width);
  field.resize(width, ' ');
  return field;
}

std::string DensoRecord(HostedClass& label, const Job& job, const SlipLine& all) {
  const Inner inner = InnerFor(label, all);
  const std::string number = Fixed(all.line.APN, 13), innerNumber = Fixed(inner.ean, 16);
  const std::string innerQuantity = Fixed(inner.quantity, 6);
  const bool scansInner = TrimBlanks(innerNumber) == TrimBlanks(number);
  const std::string_view store = all.slip.StoreCode == "DC" ? Str(all.store.DeliverToCode) : all.slip.StoreCode;
  std::string record = Fixed(Str(all.vendor.PartnerCode), 7);
  record += Fixed(Str(job.PackerId), 6);
  record += Fixed(Format(std::to_string(all.line.LineId), "!@@@@@@@@@@"), 10);
  record += Fixed(all.order.PONo, 22);
  record += Fixed(std::to_string(job.JobId), 20);
  record += Fixed(StoreNo(store), 13);
  record += Fixed(Str(all.store.Name), 20);
  record += number;
  record += Fixed(Str(all.product.ItemCode), 20);
  record += Fixed(Str(all.product.Description), 20);
  record += Fixed(Str(all.product.ProductSize), 10);
  record += Fixed(OpenQuantity(all.line), 6);
  // A single unit is the one value that stands at the right of its field.
  record += scansInner ? Fixed(TrimBlanks(innerQuantity), 6) : "     1";
  record += '0';
  return record.append(innerNumber).append(innerQuantity);
}

std::string FenwickRecord(HostedClass& label, const Job& job, const SlipLine& all) {
  const Inner inner = FirstInner(label, all.product);
  const std::string fields[] = {std::string(Str(all.vendor.PartnerCode)),
                                std::to_string(all.line.LineId),
                                std::string(Str(job.PackerId)),
                                all.order.PONo,
                                std::to_string(job.JobId),
                                StoreNo(all.slip.StoreCode),
                                std::string(TrimBlanks(all.line.APN)),
                                OpenQuantity(all.line),
                                Str(all.product.UOM) == "EA" ? "1" : "",
                                inner.ean.substr(0, 16),
                                inner.quantity.substr(0, 6)};
  std::string record;
  for (const std::string& field : fields) record.append(record.empty() && &field == fields ? "" : ",").append(field);
  return Windows1252(record);
}

class ScanCheck {
 public:
  ScanCheck(HostedClass& label, std::string_view number, double quantity, std::int32_t lineId)
      : label_(label), number_(number), quantity_(quantity), lineId_(lineId) {}

  std::shared_ptr<PSlipLine> Line(LabelClass::PSlipArgument slip, LabelClass::PackArgument pack) {
    code_ = scan::kNotGot;
    std::optional<PSlip> slipRead;
    std::optional<Pack> packRead;
    if (!Get(slip, slipRead) || !Get(pack, packRead)) return nullptr;
    const PSlip& theSlip = *std::get<const PSlip*>(slip);
    const Pack* const thePack = std::get<const Pack*>(pack);
    code_ = scan::kOtherStore;
    if (thePack != nullptr && thePack->BuyStoreCode != theSlip.StoreCode) return nullptr;
    return LineOf(theSlip);
  }

  std::int32_t Code() const { return code_; }

 private:
  // Reads what only its id was given of; false when there is no such record.
  template <class R>
  bool Get(std::variant<const R*, std::int32_t>& argument, std::optional<R>& read) {
    if (const auto* id = std::get_if<std::int32_t>(&argument)) {
      read.emplace().Id = *id;
      bool found = false;
      const HandlerOff off(label_.Errors());
      label_.Try([&] { found = Load(label_.Records(), *read); });
      if (!found) return false;
      argument = &*read;
    }
    return std::is_same_v<R, Pack> || std::get<const R*>(argument) != nullptr;
  }

  std::shared_ptr<PSlipLine> LineOf(const PSlip& slip) {
    PSlipLine probe;
    probe.PSlipId = slip.Id;
    const auto lines = label_.Try([&] { return Select(label_.Records(), PSlipLine::kByPSlip, probe); });
    code_ = scan::kUnknownNumber;
    const auto byNumber = [&](const PSlipLine& line) {
      return (lineId_ == 0 || lineId_ == line.LineId) && line.APN == number_;
    };
    if (auto line = FirstThatFits(lines, byNumber); line != nullptr || code_ != scan::kUnknownNumber) return line;
    // The number of an outer carton leads to the product in it.
    Product outer;
    outer.ProductNo = number_;
    if (!Read(label_, outer) || Str(outer.CartonAPN).empty()) return nullptr;
    return FirstThatFits(lines, [&](const PSlipLine& line) { return line.APN == Str(outer.CartonAPN); });
  }

  template <class F>
  std::shared_ptr<PSlipLine> FirstThatFits(const std::vector<std::shared_ptr<PSlipLine>>& lines, F matches) {
    for (const auto& line : lines) {
      if (!matches(*line)) continue;
      code_ = scan::kQuantity;
      const double packed = line->PackedQty + quantity_;
      if (packed < 0 || packed > line->OrderQty) continue;
      code_ = scan::kFits;
      return line;
    }
    return nullptr;
  }

  HostedClass& label_;
  std::string number_;
  double quantity_;
  std::int32_t lineId_;
  std::int32_t code_ = scan::kNotGot;
};

}  // namespace

std::string LookupLine(HostedClass& label, const std::string& model, const Job& job, const PSlipLine& line) {
  if (model == "Denso") return DensoRecord(label, job, ReadSlipLine(label, line));
  if (model == "Fenwick6030") return FenwickRecord(label, job, ReadSlipLine(label, line));
  return {};
}

LabelClass::LineFound CheckScan(HostedClass& label, LabelClass::PSlipArgument slip, LabelClass::PackArgument pack,
                                std::string_view number, double quantity, std::int32_t lineId) {
  ScanCheck check(label, number, quantity, lineId);
  const bool byId = std::holds_alternative<std::int32_t>(slip);
  std::shared_ptr<PSlipLine> line = check.Line(slip, pack);
  label.Host().ErrorCode = check.Code();
  if (byId) return line != nullptr ? line->LineId : 0;
  return line;
}

}  // namespace partnerkit::labels

#include "orders/order_export.h"

#include <algorithm>

#include "orders/order_messages.h"

namespace partnerkit::orders {

namespace {

std::string_view NamedComponent(std::string_view options) {
  constexpr std::string_view kName = "XOLE=\"";
  const std::size_t name = options.find(kName);
  if (name == std::string_view::npos) return {};
  options.remove_prefix(name + kName.size());
  const std::size_t end = options.find('"');
  return end == std::string_view::npos ? std::string_view() : options.substr(0, end);
}

}  // namespace

void ExportOrder(TranslatorBase& translator, CallLog& log, const Order& order) {
  const EDIDoc& own = translator.Document();
  const std::string_view progId = NamedComponent(Str(own.Options));
  if (progId.empty() || !translator.Components().orderExport) return;
  const auto documents = translator.Try([&] { return translator.Host().EDIDocList(); });
  const auto document = std::ranges::find_if(documents, [&](const EDIDoc& other) {
    return other.ProgId == progId && other.PartnerId == own.PartnerId && other.VendorId == own.VendorId;
  });
  if (document == documents.end()) return;
  const auto component = translator.Components().orderExport(progId);
  if (!component) return;
  translator.Try(
      [&] { component->Init(*document, translator.Host(), translator.TradingPartner(), translator.OwnCompany()); });
  if (!translator.Try([&] { return component->Process(order, log.Ids()); })) {
    log.Note(kInformation, words::kExportFailed.With(order.PONo));
  }
  translator.Try([&] { component->Term(); });
}

}  // namespace partnerkit::orders

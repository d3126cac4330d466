#include "orders/order_store.h"

namespace partnerkit::orders {

namespace {

// The number a refused record is logged under: the database's failure, or the error of the moment when the host itself
// said no.
std::int32_t RefusalNumber(const TranslatorBase& translator) {
  return translator.Records().NativeError() != 0 ? run_time::kDatabase : translator.ErrorNumber();
}

class Storing {
 public:
  Storing(TranslatorBase& translator, CallLog& log, OrderDraft& draft, std::optional<std::string_view> lineSequence)
      : translator_(translator), log_(log), draft_(draft), lineSequence_(lineSequence) {}

  bool Header() { return Stored(draft_.header) || Refused("tbOrder", {}); }

  bool Lines() {
    for (const auto& line : draft_.lines) {
      line->OrderId = draft_.header.OrderId;
      if (!Stored(*line)) return Refused("tbOrderLine", Sequence(Str(line->LineNo)));
    }
    return true;
  }

  bool Locations() {
    for (const auto& location : draft_.locations) {
      location->OrderId = draft_.header.OrderId;
      if (!Stored(*location)) return Refused("tbOrderLocn", " location " + location->BuyingLocn);
    }
    return true;
  }

  bool LocationLines() {
    for (const auto& locnLine : draft_.locnLines) {
      const auto line = draft_.lines.Find(OrderDraft::LineKey(*locnLine));
      const auto location = draft_.locations.Find(locnLine->BuyingLocn);
      locnLine->OrderId = draft_.header.OrderId;
      locnLine->LineId = line->LineId;
      locnLine->LocnId = location->LocnId;
      if (!Stored(*locnLine)) {
        return Refused("tbOrderLocnLine", Sequence(Str(line->LineNo)) + " location " + locnLine->BuyingLocn);
      }
    }
    return true;
  }

 private:
  template <class R>
  bool Stored(R& record) {
    return translator_.Try([&] { return Add(translator_.Records(), record); });
  }

  std::string Sequence(std::string_view own) const {
    return " line sequence " + std::string(lineSequence_.value_or(own));
  }

  bool Refused(std::string_view table, const std::string& where) {
    draft_.header.OrderId = 0;
    log_.Note(RefusalNumber(translator_),
              "Error while inserting " + std::string(table) + " for PO " + draft_.header.PONo + where);
    return false;
  }

  TranslatorBase& translator_;
  CallLog& log_;
  OrderDraft& draft_;
  std::optional<std::string_view> lineSequence_;
};

}  // namespace

bool StoreDraft(TranslatorBase& translator, CallLog& log, OrderDraft& draft,
                std::optional<std::string_view> lineSequence) {
  Storing storing(translator, log, draft, lineSequence);
  return storing.Header() && storing.Lines() && storing.Locations() && storing.LocationLines();
}

bool MakeDurable(TranslatorBase& translator, OrderDraft& draft, bool complete, UnsettledOrder& note) {
  const auto markComplete = [&] {
    draft.header.Status = 0;
    if (!Update(translator.Records(), draft.header)) {
      throw RunTimeError(run_time::kDatabase, "PO " + draft.header.PONo + " cannot be marked complete");
    }
  };
  const auto noteUnsettled = [&] {
    if (!Add(translator.Records(), note)) {
      throw RunTimeError(run_time::kDatabase, "PO " + draft.header.PONo + " cannot be noted as not settled");
    }
  };
  // In this order: a complete order without the note would reach neither the file's next run nor the backup.
  if (!translator.Try(noteUnsettled)) return false;
  if (complete && !translator.Try(markComplete)) return false;
  return translator.Try([&] { translator.Host().Commit(0); });
}

}  // namespace partnerkit::orders

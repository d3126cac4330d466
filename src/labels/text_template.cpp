#include "labels/text_template.h"

#include <cstdlib>
#include <utility>

namespace partnerkit::labels {

namespace {

using Values = LabelValues;

// clang-format off
constexpr std::pair<std::string_view, std::string Values::*> kValues[] = {
    {"FromName",     &Values::FromName},     {"FromSuburb",     &Values::FromSuburb},
    {"FromState",    &Values::FromState},    {"CarrierName",    &Values::CarrierName},
    {"ConNoteNo",    &Values::ConNoteNo},    {"BillOfLadingNo", &Values::BillOfLadingNo},
    {"ToName",       &Values::ToName},       {"ToAddress",      &Values::ToAddress},
    {"ToSuburb",     &Values::ToSuburb},     {"ToPostcode",     &Values::ToPostcode},
    {"ToLocnNo",     &Values::ToLocnNo},     {"ForName",        &Values::ForName},
    {"ForLocnName",  &Values::ForLocnName},  {"ForAddress",     &Values::ForAddress},
    {"ForSuburb",    &Values::ForSuburb},    {"ForPostcode",    &Values::ForPostcode},
    {"ForLocnNo",    &Values::ForLocnNo},    {"FinalLocnNo",    &Values::FinalLocnNo},
    {"CountryCode",  &Values::CountryCode},  {"SSCCText",       &Values::SSCCText},
    {"POText",       &Values::POText},       {"ADFlag",         &Values::ADFlag},
    {"ADDate",       &Values::ADDate},       {"DeptText",       &Values::DeptText},
    {"DeptCapitals", &Values::DeptCapitals}, {"PalletText",     &Values::PalletText},
    {"User1",        &Values::User1},        {"User2",          &Values::User2},
    {"StoreZoneDept", &Values::StoreZoneDept}, {"StoreZoneCapitals", &Values::StoreZoneCapitals},
    {"ComponentItem", &Values::ComponentItem}, {"ComponentCount", &Values::ComponentCount},
    {"ComponentStyle", &Values::ComponentStyle}, {"FormatNo",   &Values::FormatNo},
    {"Qty",          &Values::Qty},          {"BatchControl",   &Values::BatchControl},
};
// clang-format on

}  // namespace

std::string LabelValues::*ValueNamed(std::string_view name) {
  for (const auto& [known, value] : kValues) {
    if (known == name) return value;
  }
  return nullptr;
}

TextTemplate::TextTemplate(std::string_view source) {
  while (!source.empty()) {
    const std::size_t open = source.find('`');
    Piece& piece = pieces_.emplace_back(Piece{source.substr(0, open), nullptr});
    if (open == std::string_view::npos) return;
    const std::size_t close = source.find('`', open + 1);
    if (close != std::string_view::npos) piece.value = ValueNamed(source.substr(open + 1, close - open - 1));
    if (piece.value == nullptr) std::abort();
    source.remove_prefix(close + 1);
  }
}

void TextTemplate::AppendTo(std::string& text, const LabelValues& values) const {
  for (const Piece& piece : pieces_) {
    text += piece.literal;
    if (piece.value != nullptr) text += values.*piece.value;
  }
}

std::string TextTemplate::With(const LabelValues& values) const {
  std::string text;
  AppendTo(text, values);
  return text;
}

}  // namespace partnerkit::labels

#include "edi/envelopes.h"

#include <algorithm>

#include "values/format.h"

namespace partnerkit {

namespace {

constexpr std::size_t kIsaAddress = 15;
constexpr std::size_t kGroupAddress = 12;
constexpr std::string_view kLineEnd = "\r\n";
constexpr std::string_view kLinesMark = "#%CRLF";

// Tails of the UNB. The test mark is the eleventh element; some partners want the empty ones up to it in production
// too, and one group gets none of them, in test neither.
constexpr std::string_view kTestTail = "++++1++1'";
constexpr std::string_view kUsual = "++++1'";
constexpr std::string_view kLong = "++++1++'";
constexpr std::string_view kBare = "'";

constexpr std::string_view kControl2 = "CONTRL:2:2:UN:EAN002";
constexpr std::string_view kControl4 = "CONTRL:D:3:UN:EAN004";
constexpr std::string_view kDespatch96a = "DESADV:D:96A:UN:EAN005";
constexpr std::string_view kDespatch01b = "DESADV:D:01B:UN:EAN007";
constexpr std::string_view kResponse96a = "ORDRSP:D:96A:UN:EAN005";
constexpr std::string_view kResponse01b = "ORDRSP:D:01B:UN:EAN007";
constexpr std::string_view kInvoice = "INVOIC:D:01B:UN:EAN010";

using enum X12End;
using enum EancomLines;
using enum NumberForm;

// clang-format off
constexpr X12Envelope kX12Envelopes[] = {
    // class                  set    ISA12    GS01  GS03     GS08
    {"clsMGB850ansix12",     "997", "00200", "FA", "EQ850", "002040VICS", kLine},
    {"clsMGB852ansix12",     "997", "00200", "FA", "EQ850", "002040VICS", kLine},
    {"clsTarget850ansix12",  "997", "00200", "FA", "",      "003020",     kLine},
    {"clsGHPL850ansix12",    "997", "00200", "FA", "",      "003020",     kLine},
    {"clsKMart850ansix12",   "997", "00204", "FA", "",      "003020",     kLine},
    {"clsKMart820ansix12",   "997", "00204", "FA", "",      "003010",     kLine},
    {"clsMGB856ansix12",     "856", "00200", "SH", "EQ856", "003020",     kTildeBeforeLine},
    {"clsTarget856ansix12",  "856", "00200", "SH", "",      "003020",     kAsTranslated},
    {"clsKMart856ansix12",   "856", "00200", "SH", "",      "003020",     kAsTranslated},
    {"clsKMart855POAansix12","855", "00200", "PR", "",      "003020",     kLine},
    {"clsMGB855ansix12",     "855", "00200", "PR", "",      "003020",     kLine},
};

constexpr EancomEnvelope kEancomEnvelopes[] = {
    // class                     message       UNA    tail    numbers      lines
    {"clsOfficePOeancom",        kControl2,    true,  kUsual, kNineDigits, kIfMarkedAnyCase},
    {"clsMGBPOeancom",           kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsMGBBTPOeancom",         kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsARAPOd01b",             kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsMyerORDERSd01b",        kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsOfficeRCTIeancom",      kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsCMLFLFRCTId01b",        kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsTargetRCTId01b",        kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsARARCTId01b",           kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsCMLFLFREMADVd01b",      kControl2,    true,  kUsual, kNineDigits, kNever},
    {"clsGHPLPOeancom",          kControl2,    true,  kUsual, kPlain,      kIfMarked},
    {"clsCMLFLFORDERSd01b",      kControl4,    false, kBare,  kPlain,      kAlways},
    {"clsTargetBulkORDERSd01b",  kControl4,    false, kBare,  kPlain,      kAlways},
    {"clsOfficeDAeancom",        kDespatch96a, false, kUsual, kNineDigits, kIfMarked},
    {"clsARADA96a",              kDespatch96a, false, kUsual, kNineDigits, kIfMarked},
    {"clsMGBDAeancom",           kDespatch96a, false, kLong,  kNineDigits, kNever},
    {"clsMGBBTDAeancom",         kDespatch96a, false, kLong,  kNineDigits, kIfMarkedAnywhere},
    {"clsARADAd01b",             kDespatch01b, false, kUsual, kNineDigits, kIfMarked},
    {"clsCMLFLFDESADVd01b",      kDespatch01b, false, kUsual, kPlain,      kIfMarkedAnywhere},
    {"clsTargetBulkDESADVd01b",  kDespatch01b, false, kUsual, kPlain,      kIfMarkedAnywhere},
    {"clsMyerDESADVd01b",        kDespatch01b, false, kLong,  kNineDigits, kNever},
    {"clsOfficePOAeancom",       kResponse96a, false, kUsual, kNineDigits, kAlways},
    {"clsARAPOAd01b",            kResponse01b, false, kUsual, kNineDigits, kAlways},
    {"clsMyerORDRSPd01b",        kResponse01b, false, kUsual, kNineDigits, kAlways},
    {"clsCMLFLFORDRSPd01b",      kResponse01b, false, kUsual, kPlain,      kAlways},
    {"clsCMLFLFDESADVd01b",      kInvoice,     true,  kUsual, kPlain,      kIfMarkedAnywhere},
};
// clang-format on

template <class Rows, class Fits>
auto FindRow(const Rows& rows, Fits fits) {
  const auto found = std::ranges::find_if(rows, fits);
  return found == std::end(rows) ? nullptr : &*found;
}

std::string UpperCase(const Text& text) { return Format(Str(text), ">"); }

std::string Fixed(std::string_view address) {
  std::string field(address.substr(0, kIsaAddress));
  field.resize(kIsaAddress, ' ');
  return field;
}

std::string NineDigits(std::int32_t number) { return Format(number, "000000000"); }
std::string FourDigits(std::int32_t number) { return Format(number, "0000"); }

std::string InterchangeNumber(const EancomEnvelope& row, std::int32_t number) {
  return row.numberForm == kPlain ? std::to_string(number) : NineDigits(number);
}

std::string DateAndTime(Clock& clock, std::string_view between) {
  std::string text = Format(clock.Now(), "yymmdd");
  text += between;
  return text += Format(clock.Now(), "hhmm");
}

template <class... Parts>
std::string Join(const Parts&... parts) {
  std::string segment;
  (segment.append(parts), ...);
  return segment;
}

}  // namespace

const X12Envelope* X12EnvelopeOf(std::string_view className, std::string_view set) {
  return FindRow(kX12Envelopes, [&](const X12Envelope& row) { return row.className == className && row.set == set; });
}

std::string_view SegmentEnd(const X12Envelope& row, const Partner& partner) {
  if (row.end == kLine) return kLineEnd;
  const std::string translator = UpperCase(partner.Translator);
  if (translator == "B2BE") return "~\r\n";
  if (row.end == kTildeBeforeLine) return kLineEnd;
  return translator == "MINCOM" ? "~" : translator == "LEADTEC" ? "\n" : kLineEnd;
}

std::string Isa(const X12Envelope& row, const EDIDoc& document, Clock& clock, std::int32_t interchangeNo) {
  return Join("ISA*00*          *00*          *ZZ*", Fixed(document.CompanyEDIAddr), "*ZZ*",
              Fixed(document.PartnerEDIAddr), "*", DateAndTime(clock, "*"), "*U*", row.isaVersion, "*",
              NineDigits(interchangeNo), document.TestMode ? "*0*T*>" : "*0*P*>");
}

std::string Gs(const X12Envelope& row, const EDIDoc& document, Clock& clock, std::int32_t groupNo) {
  const std::string_view own = document.CompanyEDIAddr;
  const std::string_view partner = document.PartnerEDIAddr;
  return Join("GS*", row.functionalCode, "*", own.substr(0, kGroupAddress), "*",
              row.groupReceiver.empty() ? partner.substr(0, kGroupAddress) : row.groupReceiver, "*",
              DateAndTime(clock, "*"), "*", std::to_string(groupNo), "*X*", row.version);
}

std::string St(const X12Envelope& row, std::int32_t transactionNo) {
  return Join("ST*", row.set, "*", FourDigits(transactionNo));
}

std::string Se(std::int32_t segments, std::int32_t transactionNo) {
  return Join("SE*", std::to_string(segments), "*", FourDigits(transactionNo));
}

std::string Ge(std::int32_t transactions, std::int32_t groupNo) {
  return Join("GE*", std::to_string(transactions), "*", std::to_string(groupNo));
}

std::string Iea(std::int32_t interchangeNo) { return Join("IEA*1*", NineDigits(interchangeNo)); }

const EancomEnvelope* EancomEnvelopeOf(std::string_view className, std::string_view type) {
  return FindRow(kEancomEnvelopes, [&](const EancomEnvelope& row) {
    return row.className == className && row.message.substr(0, row.message.find(':')) == type;
  });
}

std::string_view SegmentEnd(const EancomEnvelope& row, const EDIDoc& document) {
  const std::string_view options = Str(document.ReadOptions);
  bool lines = false;
  switch (row.lines) {
    case kIfMarked:
      lines = options == kLinesMark;
      break;
    case kIfMarkedAnyCase:
      lines = UpperCase(document.ReadOptions) == kLinesMark;
      break;
    case kIfMarkedAnywhere:
      lines = options.find(kLinesMark) != std::string_view::npos;
      break;
    case kAlways:
      lines = true;
      break;
    case kNever:
      break;
  }
  return lines ? kLineEnd : std::string_view();
}

std::string Unb(const EancomEnvelope& row, const EDIDoc& document, Clock& clock, std::int32_t interchangeNo) {
  const bool marked = document.TestMode && row.tail != kBare;
  return Join("UNB+UNOA:3+", document.CompanyEDIAddr, ":ZZ+", document.PartnerEDIAddr, ":ZZ+", DateAndTime(clock, ":"),
              "+", InterchangeNumber(row, interchangeNo), marked ? kTestTail : row.tail);
}

std::string Unh(const EancomEnvelope& row, std::int32_t groupNo) {
  return Join("UNH+", std::to_string(groupNo), "+", row.message, "'");
}

std::string Unt(std::int32_t segments, std::int32_t groupNo) {
  return Join("UNT+", std::to_string(segments), "+", std::to_string(groupNo), "'");
}

std::string Unz(const EancomEnvelope& row, std::int32_t messages, std::int32_t interchangeNo) {
  return Join("UNZ+", std::to_string(messages), "+", InterchangeNumber(row, interchangeNo), "'");
}

}  // namespace partnerkit

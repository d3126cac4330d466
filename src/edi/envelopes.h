// The interchange envelope round every document that goes out: one row per writer with what its partner wants
// otherwise, and the envelope's segments. A writer names its row by its class.
//
// Segments come as text without what ends them on the line: X12 segments bare, EANCOM segments with their apostrophe;
// `SegmentEnd` gives the rest. The date and the time of a segment are two readings of the clock, the date first.
// Interchange numbers of up to nine and transaction numbers of up to four digits keep their fixed width.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "partnerkit/ports.h"
#include "partnerkit/records.h"

namespace partnerkit {

// How the writer's segments end. In the second and third, `Partner.Translator`, in either case, has a say.
enum class X12End {
  kLine,             // carriage return and line feed
  kTildeBeforeLine,  // the same, with "~" in front for B2BE
  kAsTranslated,     // B2BE "~" and a line end, MINCOM "~", LEADTEC a line feed, any other a line end
};

struct X12Envelope {
  std::string_view className;       // "clsMGB850ansix12"
  std::string_view set;             // "997"
  std::string_view isaVersion;      // ISA12
  std::string_view functionalCode;  // GS01
  std::string_view groupReceiver;   // GS03; empty: the partner's address
  std::string_view version;         // GS08
  X12End end;
};

// The envelope that the class puts round its sets of that number; null when it writes none.
const X12Envelope* X12EnvelopeOf(std::string_view className, std::string_view set);

// What stands behind each segment. Asked once a document: a partner's translator doesn't change half way.
std::string_view SegmentEnd(const X12Envelope& row, const Partner& partner);

// Addresses are padded to the 15 characters of ISA06 and ISA08, and longer ones cut: the header is read by position.
std::string Isa(const X12Envelope& row, const EDIDoc& document, Clock& clock, std::int32_t interchangeNo);
std::string Gs(const X12Envelope& row, const EDIDoc& document, Clock& clock, std::int32_t groupNo);
std::string St(const X12Envelope& row, std::int32_t transactionNo);
// `segments` counts ST and SE as well.
std::string Se(std::int32_t segments, std::int32_t transactionNo);
std::string Ge(std::int32_t transactions, std::int32_t groupNo);
// For an interchange of one group, as all are.
std::string Iea(std::int32_t interchangeNo);

// When a segment has a line of its own: by the mark "#%CRLF" in `EDIDoc.ReadOptions`, or whatever that says.
enum class EancomLines {
  kIfMarked,          // the options are the mark
  kIfMarkedAnyCase,   // in upper case they are the mark
  kIfMarkedAnywhere,  // the mark is among them
  kNever,
  kAlways,
};

// How an interchange number is written.
enum class NumberForm { kNineDigits, kPlain };

struct EancomEnvelope {
  std::string_view className;  // "clsOfficePOeancom"
  std::string_view message;    // "CONTRL:2:2:UN:EAN002"
  bool una;                    // the interchange starts with the service string
  std::string_view tail;       // of the UNB, in production
  NumberForm numberForm;
  EancomLines lines;
};

// The envelope that the class puts round its messages of that type ("CONTRL"); null when it writes none.
const EancomEnvelope* EancomEnvelopeOf(std::string_view className, std::string_view type);

// A line end or nothing.
std::string_view SegmentEnd(const EancomEnvelope& row, const EDIDoc& document);

constexpr std::string_view Una() { return "UNA:+.? '"; }
std::string Unb(const EancomEnvelope& row, const EDIDoc& document, Clock& clock, std::int32_t interchangeNo);
std::string Unh(const EancomEnvelope& row, std::int32_t groupNo);
// `segments` counts UNH and UNT as well.
std::string Unt(std::int32_t segments, std::int32_t groupNo);
std::string Unz(const EancomEnvelope& row, std::int32_t messages, std::int32_t interchangeNo);

}  // namespace partnerkit

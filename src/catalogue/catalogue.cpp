#include "partnerkit/catalogue.h"

#include <algorithm>

namespace partnerkit {

// Each class is made by a function at the end of its file. They have no header of their own: a new class rebuilds its
// file and this one.
using MakesTranslator = std::unique_ptr<Translator>(const Ports& ports);
using MakesLabel = std::unique_ptr<LabelClass>(const Ports& ports);

namespace orders {
MakesTranslator MakeMGB850csv, MakeTarget850csv, MakeKMart850csv, MakeGHPL850csv, MakeOfficeworks850csv,
    MakeMGBBT850csv, MakeCMLFLFPOcsv, MakeColesEIDCPOcsv, MakeMYERDropShipPOcsv, MakeTargetBulkPOcsv, MakeMGB850ansix12,
    MakeTarget850ansix12, MakeGHPL850ansix12, MakeKMart850ansix12;
}  // namespace orders

namespace shipment {
MakesTranslator MakeMGB856csv, MakeTarget856csv, MakeKMart856csv, MakeOfficeworks856csv, MakeMGBBT856csv,
    MakeCMLFLFDAcsv, MakeMYERDropShipDAcsv, MakeTargetBulkDAcsv;
}  // namespace shipment

namespace labels {
MakesLabel MakeCMLSCM;
}  // namespace labels

namespace {

// clang-format off
constexpr PublicClass kClasses[] = {
    {"PartnerKit.clsMGB850csv",           "Purchase order (850)", "in", "CSV", orders::MakeMGB850csv},
    {"PartnerKit.clsTarget850csv",        "Purchase order (850)", "in", "CSV", orders::MakeTarget850csv},
    {"PartnerKit.clsKMart850csv",         "Purchase order (850)", "in", "CSV", orders::MakeKMart850csv},
    {"PartnerKit.clsGHPL850csv",          "Purchase order (850)", "in", "CSV", orders::MakeGHPL850csv},
    {"PartnerKit.clsOfficeworks850csv",   "Purchase order (850)", "in", "CSV", orders::MakeOfficeworks850csv},
    {"PartnerKit.clsMGBBT850csv",         "Purchase order (850)", "in", "CSV", orders::MakeMGBBT850csv},
    {"PartnerKit.clsCMLFLFPOcsv",         "Purchase order (850)", "in", "CSV", orders::MakeCMLFLFPOcsv},
    {"PartnerKit.clsColesEIDCPOcsv",      "Purchase order (850)", "in", "CSV", orders::MakeColesEIDCPOcsv},
    {"PartnerKit.clsMYERDropShipPOcsv",   "Purchase order (850)", "in", "CSV", orders::MakeMYERDropShipPOcsv},
    {"PartnerKit.clsTargetBulkPOcsv",     "Purchase order (850)", "in", "CSV", orders::MakeTargetBulkPOcsv},
    {"PartnerKit.clsMGB850ansix12",       "Purchase order (850)", "in", "ANSI X12", orders::MakeMGB850ansix12},
    {"PartnerKit.clsTarget850ansix12",    "Purchase order (850)", "in", "ANSI X12", orders::MakeTarget850ansix12},
    {"PartnerKit.clsGHPL850ansix12",      "Purchase order (850)", "in", "ANSI X12", orders::MakeGHPL850ansix12},
    {"PartnerKit.clsKMart850ansix12",     "Purchase order (850, 860)", "in", "ANSI X12", orders::MakeKMart850ansix12},
    {"PartnerKit.clsMGB856csv",            "Advance ship notice (856)", "out", "CSV", shipment::MakeMGB856csv},
    {"PartnerKit.clsTarget856csv",         "Advance ship notice (856)", "out", "CSV", shipment::MakeTarget856csv},
    {"PartnerKit.clsKMart856csv",          "Advance ship notice (856)", "out", "CSV", shipment::MakeKMart856csv},
    {"PartnerKit.clsOfficeworks856csv",    "Advance ship notice (856)", "out", "CSV", shipment::MakeOfficeworks856csv},
    {"PartnerKit.clsMGBBT856csv",          "Advance ship notice (856)", "out", "CSV", shipment::MakeMGBBT856csv},
    {"PartnerKit.clsCMLFLFDAcsv",          "Advance ship notice (856)", "out", "CSV", shipment::MakeCMLFLFDAcsv},
    {"PartnerKit.clsMYERDropShipDAcsv",    "Advance ship notice (856)", "out", "CSV", shipment::MakeMYERDropShipDAcsv},
    {"PartnerKit.clsTargetBulkDAcsv",      "Advance ship notice (856)", "out", "CSV", shipment::MakeTargetBulkDAcsv},
    {"PartnerKit.clsCMLSCM",              "Shipping carton label", "label", "LBXII, ZPL, WinPCL", {}, labels::MakeCMLSCM},
};
// clang-format on

char Lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

bool SameLetters(std::string_view left, std::string_view right) {
  return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                    [](char a, char b) { return Lower(a) == Lower(b); });
}

}  // namespace

std::span<const PublicClass> Catalogue() { return kClasses; }

const PublicClass* FindClass(std::string_view progId) {
  const auto found = std::find_if(std::begin(kClasses), std::end(kClasses),
                                  [&](const PublicClass& row) { return SameLetters(row.progId, progId); });
  return found == std::end(kClasses) ? nullptr : found;
}

std::unique_ptr<Translator> CreateTranslator(std::string_view progId, const Ports& ports) {
  const PublicClass* const row = FindClass(progId);
  return row == nullptr || row->create == nullptr ? nullptr : row->create(ports);
}

std::unique_ptr<LabelClass> CreateLabelClass(std::string_view progId, const Ports& ports) {
  const PublicClass* const row = FindClass(progId);
  return row == nullptr || row->createLabel == nullptr ? nullptr : row->createLabel(ports);
}

}  // namespace partnerkit

#include "partnerkit/catalogue.h"

#include <algorithm>

#include "labels/label_classes.h"
#include "orders/csv/csv_classes.h"
#include "orders/x12/x12_classes.h"
#include "shipment/csv/csv_notice_classes.h"

namespace partnerkit {

namespace {

template <class T>
std::unique_ptr<Translator> Make(const Ports& ports) {
  return std::make_unique<T>(ports);
}

template <class T>
std::unique_ptr<LabelClass> MakeLabel(const Ports& ports) {
  return std::make_unique<T>(ports);
}

// clang-format off
constexpr PublicClass kClasses[] = {
    {"PartnerKit.clsMGB850csv",           "Purchase order (850)", "in", "CSV", Make<orders::clsMGB850csv>},
    {"PartnerKit.clsTarget850csv",        "Purchase order (850)", "in", "CSV", Make<orders::clsTarget850csv>},
    {"PartnerKit.clsKMart850csv",         "Purchase order (850)", "in", "CSV", Make<orders::clsKMart850csv>},
    {"PartnerKit.clsGHPL850csv",          "Purchase order (850)", "in", "CSV", Make<orders::clsGHPL850csv>},
    {"PartnerKit.clsOfficeworks850csv",   "Purchase order (850)", "in", "CSV", Make<orders::clsOfficeworks850csv>},
    {"PartnerKit.clsMGBBT850csv",         "Purchase order (850)", "in", "CSV", Make<orders::clsMGBBT850csv>},
    {"PartnerKit.clsCMLFLFPOcsv",         "Purchase order (850)", "in", "CSV", Make<orders::clsCMLFLFPOcsv>},
    {"PartnerKit.clsColesEIDCPOcsv",      "Purchase order (850)", "in", "CSV", Make<orders::clsColesEIDCPOcsv>},
    {"PartnerKit.clsMYERDropShipPOcsv",   "Purchase order (850)", "in", "CSV", Make<orders::clsMYERDropShipPOcsv>},
    {"PartnerKit.clsTargetBulkPOcsv",     "Purchase order (850)", "in", "CSV", Make<orders::clsTargetBulkPOcsv>},
    {"PartnerKit.clsMGB850ansix12",       "Purchase order (850)", "in", "ANSI X12", Make<orders::clsMGB850ansix12>},
    {"PartnerKit.clsTarget850ansix12",    "Purchase order (850)", "in", "ANSI X12", Make<orders::clsTarget850ansix12>},
    {"PartnerKit.clsGHPL850ansix12",      "Purchase order (850)", "in", "ANSI X12", Make<orders::clsGHPL850ansix12>},
    {"PartnerKit.clsKMart850ansix12",     "Purchase order (850, 860)", "in", "ANSI X12", Make<orders::clsKMart850ansix12>},
    {"PartnerKit.clsMGB856csv",            "Advance ship notice (856)", "out", "CSV", Make<shipment::clsMGB856csv>},
    {"PartnerKit.clsTarget856csv",         "Advance ship notice (856)", "out", "CSV", Make<shipment::clsTarget856csv>},
    {"PartnerKit.clsKMart856csv",          "Advance ship notice (856)", "out", "CSV", Make<shipment::clsKMart856csv>},
    {"PartnerKit.clsOfficeworks856csv",    "Advance ship notice (856)", "out", "CSV", Make<shipment::clsOfficeworks856csv>},
    {"PartnerKit.clsMGBBT856csv",          "Advance ship notice (856)", "out", "CSV", Make<shipment::clsMGBBT856csv>},
    {"PartnerKit.clsCMLFLFDAcsv",          "Advance ship notice (856)", "out", "CSV", Make<shipment::clsCMLFLFDAcsv>},
    {"PartnerKit.clsMYERDropShipDAcsv",    "Advance ship notice (856)", "out", "CSV", Make<shipment::clsMYERDropShipDAcsv>},
    {"PartnerKit.clsTargetBulkDAcsv",      "Advance ship notice (856)", "out", "CSV", Make<shipment::clsTargetBulkDAcsv>},
    {"PartnerKit.clsCMLSCM",              "Shipping carton label", "label", "LBXII, ZPL, WinPCL", {}, MakeLabel<labels::clsCMLSCM>},
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

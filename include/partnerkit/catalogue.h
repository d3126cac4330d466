// The catalogue of public classes: one row per class, and creation by ProgID.
#pragma once

#include <memory>
#include <span>
#include <string_view>

#include "partnerkit/label.h"
#include "partnerkit/translator.h"

namespace partnerkit {

struct PublicClass {
  std::string_view progId;     // "PartnerKit.clsMGB850csv"
  std::string_view document;   // "Purchase order (850)"
  std::string_view direction;  // "in" or "out", seen from the supplier; "label" for labels
  std::string_view format;     // "CSV", "ANSI X12", ...
  // Which one of them is set tells the class's contract.
  std::unique_ptr<Translator> (*create)(const Ports& ports) = nullptr;
  std::unique_ptr<LabelClass> (*createLabel)(const Ports& ports) = nullptr;
};

// Every public class, in the order of the documents.
std::span<const PublicClass> Catalogue();

// The class of that ProgID, letters compared without regard to case as ProgIDs always were; nothing for an unknown one.
const PublicClass* FindClass(std::string_view progId);

// A new object of the class, or nothing when the ProgID is unknown or of another contract. The objects in `ports` must
// outlive it.
std::unique_ptr<Translator> CreateTranslator(std::string_view progId, const Ports& ports);
std::unique_ptr<LabelClass> CreateLabelClass(std::string_view progId, const Ports& ports);

}  // namespace partnerkit

// `print`, `print-all` and `preview`: labels of the workspace's packs.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cli/output/command.h"

namespace partnerkit::cli {

struct LabelOrder {
  std::string className;  // a ProgID, or the class's name alone
  std::vector<std::int32_t> packs;
  std::string printer;   // empty: the workspace's only one, else its folder spool/
  std::string language;  // empty: the setting PrinterLanguage
};

int PrintLabels(const Command& command, const LabelOrder& order, std::int16_t quantity);
int PrintAllLabels(const Command& command, const LabelOrder& order, bool separators, bool styleSort);
// Draws a pack's label as an ordinary printer would, into a picture or a document by the ending of the file's name.
int PreviewLabel(const Command& command, const std::string& className, std::int32_t packId, const std::string& file);

}  // namespace partnerkit::cli

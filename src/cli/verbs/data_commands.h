// `data load` and `data dump`: records as JSON.
#pragma once

#include <string>
#include <vector>

#include "cli/output/command.h"

namespace partnerkit::cli {

// Stores the records of all files, or none of them.
int LoadData(const Command& command, const std::vector<std::string>& files);

// Writes the records of the kinds named, or of every kind that has any.
int DumpData(const Command& command, const std::vector<std::string>& kinds);

}  // namespace partnerkit::cli

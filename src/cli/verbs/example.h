// `data example`: a first set of records for a class, with the files that they name.
#pragma once

#include <string>

#include "cli/output/command.h"

namespace partnerkit::cli {

// Writes the records to the output or, with a folder, a records file, the map and an order file into it, and tells what
// to type next. No file that is there is replaced.
int WriteExample(const Command& command, const std::string& className, const std::string& folder);

}  // namespace partnerkit::cli

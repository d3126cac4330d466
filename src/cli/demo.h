// `demo`: a workspace with a small supplier in it, and its first day told step by step.
#pragma once

#include <string>

#include "cli/output/command.h"

namespace partnerkit::cli {

// The folder must be new or empty.
int RunDemo(const Command& command, const std::string& folder);

}  // namespace partnerkit::cli

// `demo`: a workspace with a small supplier in it, and its first day told step by step.
#pragma once

#include <span>
#include <string>
#include <string_view>

#include "cli/command.h"

namespace partnerkit::cli {

// The folder must be new or empty.
int RunDemo(const Command& command, const std::string& folder);

// A file that the demo puts into its workspace.
struct DemoFile {
  std::string_view path;  // below the workspace
  std::string_view text;
};
// The files of samples/, as the build found them.
std::span<const DemoFile> DemoFiles();

}  // namespace partnerkit::cli

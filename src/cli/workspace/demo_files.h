// The files of samples/, as the build found them.
#pragma once

#include <span>
#include <string_view>

namespace partnerkit::cli {

struct DemoFile {
  std::string_view path;  // below the workspace
  std::string_view text;
};
std::span<const DemoFile> DemoFiles();

}  // namespace partnerkit::cli

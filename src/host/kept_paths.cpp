#include "host/kept_paths.h"

#include <filesystem>
#include <utility>

namespace partnerkit::host {
namespace {

constexpr std::string_view kMark = "${workspace}";

bool IsBelow(std::string_view text, std::string_view folder) {
  return text.starts_with(folder) && (text.size() == folder.size() || text[folder.size()] == '/');
}

// The mark, behind any number of more "$". The text begins with one.
bool HasMark(std::string_view text) {
  const std::size_t behind = text.find_first_not_of('$');
  return behind != std::string_view::npos && text.substr(behind - 1).starts_with(kMark);
}

}  // namespace

KeptPaths::KeptPaths(std::string folder) : folder_(std::move(folder)), withoutLinks_(folder_) {
  std::error_code failure;
  const std::filesystem::path path = std::filesystem::canonical(folder_, failure);
  if (!failure) withoutLinks_ = path.string();
}

void KeptPaths::Shorten(std::string& text) const {
  if (folder_.empty()) return;
  if (text.front() == '$') {
    if (HasMark(text)) text.insert(0, 1, '$');
    return;
  }
  for (const std::string* folder : {&folder_, &withoutLinks_}) {
    if (!IsBelow(text, *folder)) continue;
    text.replace(0, folder->size(), kMark);
    return;
  }
}

void KeptPaths::Expand(std::string& text) const {
  if (folder_.empty() || !HasMark(text)) return;
  if (text.starts_with("$$")) text.erase(0, 1);
  else if (IsBelow(text, kMark)) text.replace(0, kMark.size(), folder_);
}

}  // namespace partnerkit::host

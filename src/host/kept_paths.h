// Paths below one folder, as the store keeps them: they hold good wherever that folder has gone.
#pragma once

#include <string>
#include <string_view>

namespace partnerkit::host {

// The folder stands in the store as "${workspace}", where a text is its path or begins with its path and a "/". A text
// that begins with those very characters itself gets one more "$" there, so that every text comes back as it was.
class KeptPaths {
 public:
  // No folder: every text is kept as it is.
  KeptPaths() = default;
  // An absolute path, without a "/" at its end. It is also known by the path without its links.
  explicit KeptPaths(std::string folder);

  void Keep(std::string& text) const {
    if (!text.empty() && (text.front() == '/' || text.front() == '$')) Shorten(text);
  }
  void GiveBack(std::string& text) const {
    if (!text.empty() && text.front() == '$') Expand(text);
  }

 private:
  void Shorten(std::string& text) const;
  void Expand(std::string& text) const;

  std::string folder_, withoutLinks_;
};

}  // namespace partnerkit::host

// Partners' texts in the names of files.
#pragma once

#include <string>
#include <string_view>

namespace partnerkit {

// A reference from a partner's file as part of a file's name, which so stays in its folder: separators ("/", "\") and
// control characters become "_". Cut to 100 bytes, so that the whole name stays within what file systems take.
std::string FileNamePart(std::string_view reference);

}  // namespace partnerkit

// Values on the lines that we send, whatever their format.
#pragma once

#include <string>
#include <string_view>

namespace partnerkit {

// Appends a value as it stands, but for line ends and NUL in it, which become blanks: nothing that a record holds can
// break its line in two, or end it for a reader that stops at a NUL.
void AppendValue(std::string_view value, std::string& line);

// The same without blanks at both ends.
void AppendTrimmedValue(std::string_view value, std::string& line);

}  // namespace partnerkit

// Lines of the small notes that tell what was begun beside a file, for a run after a killed one to read.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace partnerkit {

// A text on one line: line ends, and the mark itself, as "%" and two digits.
std::string NoteLine(std::string_view text);
std::string TextOfNoteLine(std::string_view line);

// A whole number and nothing else.
std::optional<std::uint64_t> WholeNumber(std::string_view text);

}  // namespace partnerkit

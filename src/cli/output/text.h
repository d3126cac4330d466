// Text as the command line shows it. The store holds bytes as partners sent them.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "values/windows_1252.h"

namespace partnerkit::cli {

// How many bytes the control character at the position of a UTF-8 text has: U+0000 to U+001F and U+007F one, U+0080 to
// U+009F two. 0 for any other character.
std::size_t ControlAt(std::string_view utf8, std::size_t at);

// The text as UTF-8 on one line that a terminal may be sent: each run of blanks and line ends is one blank, any other
// control character a "?", and so is one that changes the direction of writing, for what follows it would not be read
// as it stands.
std::string OneLine(std::string_view bytes);

// Characters of a UTF-8 text, which are its columns on a terminal.
std::size_t Width(std::string_view utf8);

// The shortest text that reads back as the same number: "10.5", "6", "1e+308".
std::string ShortestNumber(double number);

}  // namespace partnerkit::cli

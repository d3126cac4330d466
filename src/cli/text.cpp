#include "cli/text.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace partnerkit::cli {

namespace {

unsigned char Byte(char c) { return static_cast<unsigned char>(c); }

}  // namespace

std::string OneLine(std::string_view bytes) {
  std::string line;
  const std::string text = Utf8(bytes);
  for (std::size_t i = 0; i < text.size(); ++i) {
    const unsigned char c = Byte(text[i]);
    if (c == ' ' || (c >= '\t' && c <= '\r')) {
      if (!line.empty() && line.back() != ' ') line += ' ';
    } else if (c < ' ' || c == 0x7F) {
      line += '?';
    } else if (c == 0xC2 && Byte(text[i + 1]) < 0xA0) {
      // U+0080 to U+009F: a terminal may take them for commands.
      line += '?';
      ++i;
    } else {
      line += text[i];
    }
  }
  if (!line.empty() && line.back() == ' ') line.pop_back();
  return line;
}

std::size_t Width(std::string_view utf8) {
  return static_cast<std::size_t>(std::ranges::count_if(utf8, [](char c) { return (Byte(c) & 0xC0) != 0x80; }));
}

std::string ShortestNumber(double number) {
  std::array<char, 32> digits{};
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), number).ptr;
  return {digits.data(), end};
}

}  // namespace partnerkit::cli

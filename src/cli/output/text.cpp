#include "cli/output/text.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace partnerkit::cli {

namespace {

unsigned char Byte(char c) { return static_cast<unsigned char>(c); }

// U+061C, U+200E, U+200F, U+202A to U+202E and U+2066 to U+2069, as the bytes that they share and the range of the
// last.
struct Directions {
  std::string_view start;
  unsigned char first, last;
};
constexpr Directions kDirections[] = {
    {"\xD8", 0x9C, 0x9C}, {"\xE2\x80", 0x8E, 0x8F}, {"\xE2\x80", 0xAA, 0xAE}, {"\xE2\x81", 0xA6, 0xA9}};

// The bytes of the character at the position that changes the direction of writing; 0 when it is none.
std::size_t DirectionAt(std::string_view utf8, std::size_t at) {
  if (Byte(utf8[at]) < 0x80) return 0;
  for (const Directions& directions : kDirections) {
    const std::size_t last = at + directions.start.size();
    if (last >= utf8.size() || !utf8.substr(at).starts_with(directions.start)) continue;
    if (Byte(utf8[last]) >= directions.first && Byte(utf8[last]) <= directions.last) return last + 1 - at;
  }
  return 0;
}

}  // namespace

std::size_t ControlAt(std::string_view utf8, std::size_t at) {
  const unsigned char c = Byte(utf8[at]);
  if (c < ' ' || c == 0x7F) return 1;
  return c == 0xC2 && Byte(utf8[at + 1]) < 0xA0 ? 2 : 0;
}

std::string OneLine(std::string_view bytes) {
  std::string line;
  const std::string text = Utf8(bytes);
  for (std::size_t i = 0; i < text.size(); ++i) {
    const unsigned char c = Byte(text[i]);
    if (c == ' ' || (c >= '\t' && c <= '\r')) {
      if (!line.empty() && line.back() != ' ') line += ' ';
    } else if (const std::size_t length = std::max(ControlAt(text, i), DirectionAt(text, i)); length > 0) {
      line += '?';
      i += length - 1;
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

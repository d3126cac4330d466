#include "cli/text.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>

namespace partnerkit::cli {

namespace {

// Windows-1252 from 0x80 to 0x9F; the five bytes that it leaves free keep their number.
constexpr std::array<char16_t, 32> kWindows1252 = {0x20AC, 0x0081, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
                                                   0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0x008D, 0x017D, 0x008F,
                                                   0x0090, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
                                                   0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x009D, 0x017E, 0x0178};

unsigned char Byte(char c) { return static_cast<unsigned char>(c); }

bool IsTail(std::string_view bytes, std::size_t at) { return at < bytes.size() && (Byte(bytes[at]) & 0xC0) == 0x80; }

// The length of the well-formed character at `at`; 0 when there is none. Overlong forms, surrogates and what lies
// beyond U+10FFFF are turned away by the second byte's range.
std::size_t CharacterLength(std::string_view bytes, std::size_t at) {
  const unsigned first = Byte(bytes[at]);
  if (first < 0x80) return 1;
  const std::size_t length = first < 0xC2 ? 0 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : first < 0xF5 ? 4 : 0;
  if (length == 0 || !IsTail(bytes, at + 1)) return 0;
  const unsigned second = Byte(bytes[at + 1]);
  const unsigned least = first == 0xE0 ? 0xA0 : first == 0xF0 ? 0x90 : 0x80;
  const unsigned most = first == 0xED ? 0x9F : first == 0xF4 ? 0x8F : 0xBF;
  if (second < least || second > most) return 0;
  for (std::size_t i = 2; i < length; ++i) {
    if (!IsTail(bytes, at + i)) return 0;
  }
  return length;
}

bool IsUtf8(std::string_view bytes) {
  for (std::size_t at = 0; at < bytes.size();) {
    const std::size_t length = CharacterLength(bytes, at);
    if (length == 0) return false;
    at += length;
  }
  return true;
}

void AppendFromWindows1252(std::string& text, unsigned char byte) {
  const unsigned code = byte >= 0x80 && byte < 0xA0 ? kWindows1252[byte - 0x80U] : byte;
  if (code < 0x80) {
    text += static_cast<char>(code);
  } else if (code < 0x800) {
    text += static_cast<char>(0xC0 | (code >> 6));
    text += static_cast<char>(0x80 | (code & 0x3F));
  } else {
    text += static_cast<char>(0xE0 | (code >> 12));
    text += static_cast<char>(0x80 | ((code >> 6) & 0x3F));
    text += static_cast<char>(0x80 | (code & 0x3F));
  }
}

}  // namespace

std::string Utf8(std::string_view bytes) {
  if (IsUtf8(bytes)) return std::string(bytes);
  std::string text;
  text.reserve(bytes.size() + bytes.size() / 4);
  for (const char c : bytes) AppendFromWindows1252(text, Byte(c));
  return text;
}

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

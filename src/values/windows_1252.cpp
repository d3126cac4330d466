#include "values/windows_1252.h"

#include <algorithm>
#include <array>
#include <cstddef>

namespace partnerkit {

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

// Of the well-formed character at `at`.
char32_t CodeAt(std::string_view text, std::size_t at, std::size_t length) {
  constexpr std::array<unsigned, 5> kLead = {0, 0x7F, 0x1F, 0x0F, 0x07};
  char32_t code = Byte(text[at]) & kLead[length];
  for (std::size_t i = 1; i < length; ++i) code = code << 6 | (Byte(text[at + i]) & 0x3FU);
  return code;
}

char ToWindows1252(char32_t code) {
  if (code < 0x80 || (code >= 0xA0 && code < 0x100)) return static_cast<char>(code);
  const auto found = std::find(kWindows1252.begin(), kWindows1252.end(), code);
  return found == kWindows1252.end() ? '?' : static_cast<char>(0x80 + (found - kWindows1252.begin()));
}

char Capital(char byte) {
  switch (const unsigned char code = Byte(byte)) {
    case 0x9A:  // s, oe and z with their marks stand a row above their capitals
    case 0x9C:
    case 0x9E:
      return static_cast<char>(code - 0x10);
    case 0xFF:
      return static_cast<char>(0x9F);
    default:
      const bool small = (code >= 'a' && code <= 'z') || (code >= 0xE0 && code != 0xF7);
      return static_cast<char>(small ? code - 0x20 : code);
  }
}

}  // namespace

char16_t FromWindows1252(char byte) {
  const unsigned char code = Byte(byte);
  return code >= 0x80 && code < 0xA0 ? kWindows1252[code - 0x80U] : code;
}

void AppendUtf8(std::string& text, char16_t character) {
  const unsigned code = character;
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

std::string Utf8(std::string_view text) {
  if (IsUtf8(text)) return std::string(text);
  std::string utf8;
  utf8.reserve(text.size() + text.size() / 4);
  for (const char c : text) AppendUtf8(utf8, FromWindows1252(c));
  return utf8;
}

std::string Windows1252(std::string_view text) {
  const bool plain = std::ranges::all_of(text, [](char c) { return Byte(c) < 0x80; });
  if (plain || !IsUtf8(text)) return std::string(text);
  std::string bytes;
  bytes.reserve(text.size());
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t length = CharacterLength(text, at);
    bytes += ToWindows1252(CodeAt(text, at, length));
    at += length;
  }
  return bytes;
}

std::string Windows1252Capitals(std::string_view bytes) {
  std::string capitals(bytes);
  std::ranges::transform(capitals, capitals.begin(), Capital);
  return capitals;
}

}  // namespace partnerkit

#include "files/note_lines.h"

#include <charconv>

namespace partnerkit {

std::string NoteLine(std::string_view text) {
  std::string escaped;
  for (const char c : text) {
    if (c == '%') escaped += "%25";
    else if (c == '\n') escaped += "%0A";
    else if (c == '\r') escaped += "%0D";
    else escaped += c;
  }
  return escaped;
}

std::string TextOfNoteLine(std::string_view line) {
  std::string path;
  for (std::size_t at = 0; at < line.size(); ++at) {
    if (line[at] != '%') {
      path += line[at];
      continue;
    }
    const std::string_view code = line.substr(at + 1, 2);
    path += code == "0A" ? '\n' : code == "0D" ? '\r' : '%';
    at += 2;
  }
  return path;
}

std::optional<std::uint64_t> WholeNumber(std::string_view text) {
  std::uint64_t value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return value;
}

}  // namespace partnerkit

#include "frame/delimited.h"

#include <algorithm>
#include <cstring>

namespace partnerkit {

namespace {

// A field with a comma behind it loses its quotes only when it has both.
std::string_view InnerField(std::string_view field) {
  if (field.empty() || field.front() != '"' || field.back() != '"') return field;
  return field.size() < 2 ? std::string_view() : field.substr(1, field.size() - 2);
}

// The line's last field gives up its last character to a quote in front, whatever that character is.
std::string_view LastField(std::string_view field) {
  if (field.empty() || field.front() != '"') return field;
  return field.size() < 2 ? std::string_view() : field.substr(1, field.size() - 2);
}

}  // namespace

std::string_view TrimBlanks(std::string_view text) {
  while (!text.empty() && text.front() == ' ') text.remove_prefix(1);
  while (!text.empty() && text.back() == ' ') text.remove_suffix(1);
  return text;
}

void DelimitedLine::Split(std::string_view line, std::size_t upTo) {
  upTo = std::min(upTo, columns_.size());
  const char* start = line.data();
  const char* const end = start + line.size();
  for (split_ = 0; split_ < upTo; ++split_) {
    const std::size_t left = static_cast<std::size_t>(end - start);
    const void* comma = left == 0 ? nullptr : std::memchr(start, ',', left);
    if (comma == nullptr) {
      columns_[split_++] = LastField({start, left});
      return;
    }
    const char* const at = static_cast<const char*>(comma);
    columns_[split_] = InnerField({start, static_cast<std::size_t>(at - start)});
    start = at + 1;
  }
}

}  // namespace partnerkit

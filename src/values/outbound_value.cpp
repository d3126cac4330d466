#include "values/outbound_value.h"

#include <algorithm>

namespace partnerkit {

namespace {

bool BreaksTheLine(char c) { return c == '\n' || c == '\r' || c == '\0'; }

bool ShowsAsBlank(char c) { return c == ' ' || BreaksTheLine(c); }

}  // namespace

void AppendValue(std::string_view value, std::string& line) {
  const auto begin = static_cast<std::ptrdiff_t>(line.size());
  line += value;
  std::replace_if(line.begin() + begin, line.end(), BreaksTheLine, ' ');
}

void AppendTrimmedValue(std::string_view value, std::string& line) {
  while (!value.empty() && ShowsAsBlank(value.front())) value.remove_prefix(1);
  while (!value.empty() && ShowsAsBlank(value.back())) value.remove_suffix(1);
  AppendValue(value, line);
}

}  // namespace partnerkit

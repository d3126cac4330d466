#include "files/file_name.h"

#include <algorithm>

namespace partnerkit {

namespace {

constexpr std::size_t kLongestPart = 100;

bool LeavesTheName(char c) {
  const auto code = static_cast<unsigned char>(c);
  return c == '/' || c == '\\' || code < ' ' || code == 0x7F;
}

}  // namespace

std::string FileNamePart(std::string_view reference) {
  std::string part(reference.substr(0, kLongestPart));
  std::ranges::replace_if(part, LeavesTheName, '_');
  return part;
}

}  // namespace partnerkit

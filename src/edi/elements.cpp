#include "edi/elements.h"

#include <cstring>

#include "values/numbers.h"

namespace partnerkit {

void Elements::Take(std::string_view segment) {
  separators_.clear();
  const char* const begin = segment.data();
  const char* const end = begin + segment.size();
  for (const char* at = begin; at < end; ++at) {
    at = static_cast<const char*>(std::memchr(at, separator_, static_cast<std::size_t>(end - at)));
    if (at == nullptr) break;
    separators_.push_back(static_cast<std::uint32_t>(at - begin) + 1);
  }
}

std::size_t Elements::Found(int n) const {
  const std::size_t place = static_cast<std::size_t>(n) % (separators_.size() + 1);
  return place == 0 ? 0 : separators_[place - 1];
}

std::int16_t Elements::PosBeg(int n) const {
  const std::size_t at = Found(n);
  return at == 0 ? std::int16_t{0} : ToInteger(static_cast<double>(at + 1));
}

std::int16_t Elements::PosEnd(int n) const {
  const std::size_t at = Found(n + 1);
  return at == 0 ? std::int16_t{0} : ToInteger(static_cast<double>(at) - PosBeg(n));
}

std::int16_t Elements::Count() const { return ToInteger(static_cast<double>(separators_.size())); }

}  // namespace partnerkit

#include "values/delimited.h"

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>

namespace partnerkit {

namespace {

// A field with a comma behind it loses its quotes only when it has both.
std::string_view InnerField(std::string_view field) {
  if (field.empty() || field.front() != '"' || field.back() != '"') return field;
  return field.size() < 2 ? field.substr(1) : field.substr(1, field.size() - 2);
}

// The line's last field gives up its last character to a quote in front, whatever that character is.
std::string_view LastField(std::string_view field) {
  if (field.empty() || field.front() != '"') return field;
  return field.size() < 2 ? field.substr(1) : field.substr(1, field.size() - 2);
}

constexpr std::ptrdiff_t kWord = 8;

constexpr std::uint64_t InEachByte(std::uint64_t value) { return value * 0x0101010101010101; }

// The commas among the eight bytes at `at`, as the high bits of a word whose lowest byte is the first. Fields are a few
// bytes long, so that a call of memchr for each costs more than twice as much.
std::uint64_t CommasAt(const char* at) {
  std::uint64_t word = 0;
  std::memcpy(&word, at, kWord);
  if constexpr (std::endian::native == std::endian::big) word = __builtin_bswap64(word);
  constexpr std::uint64_t kLowBits = InEachByte(0x7F);
  const std::uint64_t rest = word ^ InEachByte(',');  // 0 in the bytes looked for
  return ~(((rest & kLowBits) + kLowBits) | rest | kLowBits);
}

// Calls `cut` with each comma's place until it says that it has enough. False when the line ends before.
template <class F>
bool AtCommas(const char* at, const char* end, F cut) {
  for (; end - at >= kWord; at += kWord) {
    for (std::uint64_t commas = CommasAt(at); commas != 0; commas &= commas - 1) {
      if (cut(at + std::countr_zero(commas) / 8)) return true;
    }
  }
  for (; at != end; ++at) {
    if (*at == ',' && cut(at)) return true;
  }
  return false;
}

}  // namespace

std::string_view TrimBlanks(std::string_view text) {
  while (!text.empty() && text.front() == ' ') text.remove_prefix(1);
  while (!text.empty() && text.back() == ' ') text.remove_suffix(1);
  return text;
}

// From where on a comma ends the field that starts here.
const char* DelimitedLine::CommasCountFrom(const char* start, const char* end) const {
  if (!quotesProtectCommas_ || start == end || *start != '"') return start;
  const void* const close = std::memchr(start + 1, '"', static_cast<std::size_t>(end - start - 1));
  return close == nullptr ? start : static_cast<const char*>(close);
}

void DelimitedLine::Split(std::string_view line, std::size_t upTo) {
  upTo = std::min(upTo, columns_.size());
  split_ = 0;
  if (upTo == 0) return;
  std::string_view* column = columns_.data();
  const std::string_view* const enough = column + upTo;
  const char* start = line.data();
  const char* const end = start + line.size();
  const char* countFrom = CommasCountFrom(start, end);
  const bool full = AtCommas(start, end, [&](const char* comma) {
    if (comma < countFrom) return false;
    *column++ = comma == start ? std::string_view() : InnerField({start, comma});
    start = comma + 1;
    countFrom = CommasCountFrom(start, end);
    return column == enough;
  });
  if (!full) *column++ = LastField({start, end});
  split_ = static_cast<std::size_t>(column - columns_.data());
}

}  // namespace partnerkit

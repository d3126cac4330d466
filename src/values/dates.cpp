#include "values/dates.h"

#include <cstddef>

namespace partnerkit {
namespace {

constexpr int kFirstYearOf1900s = 30;  // two-digit years below it are 20xx

std::string_view WithoutBlanks(std::string_view text) {
  const std::size_t first = text.find_first_not_of(' ');
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(' ') - first + 1);
}

// Up to `width` digits and nothing else.
std::optional<int> Digits(std::string_view text, std::size_t width) {
  if (text.empty() || text.size() > width) return std::nullopt;
  int number = 0;
  for (const char c : text) {
    if (c < '0' || c > '9') return std::nullopt;
    number = number * 10 + (c - '0');
  }
  return number;
}

std::optional<DateTime> DateOfDigits(std::string_view yearText, std::string_view monthText, std::string_view dayText) {
  const std::optional<int> year = Digits(yearText, 4);
  const std::optional<int> month = Digits(monthText, 2);
  const std::optional<int> day = Digits(dayText, 2);
  if (!year || !month || !day) return std::nullopt;
  const int century = yearText.size() > 2 ? 0 : *year < kFirstYearOf1900s ? 2000 : 1900;
  return DateTime::FromYmd(century + *year, *month, *day);
}

struct SlashParts {
  std::string_view first, second, third;
};

std::optional<SlashParts> SplitAtSlashes(std::string_view text) {
  const std::size_t one = text.find('/');
  if (one == std::string_view::npos) return std::nullopt;
  const std::size_t two = text.find('/', one + 1);
  if (two == std::string_view::npos) return std::nullopt;
  return SlashParts{text.substr(0, one), text.substr(one + 1, two - one - 1), text.substr(two + 1)};
}

}  // namespace

std::optional<DateTime> OrderDate(std::string_view text) {
  if (text.find('/') != std::string_view::npos) {
    const std::optional<SlashParts> parts = SplitAtSlashes(text);
    return parts ? DateFromParts(parts->first, parts->second, parts->third) : std::nullopt;
  }
  if (text.size() == 6) return DateOfDigits(text.substr(0, 2), text.substr(2, 2), text.substr(4));
  if (text.size() == 8) return DateOfDigits(text.substr(0, 4), text.substr(4, 2), text.substr(6));
  return std::nullopt;
}

std::optional<DateTime> DateFromParts(std::string_view yearText, std::string_view monthText, std::string_view dayText) {
  return DateOfDigits(WithoutBlanks(yearText), WithoutBlanks(monthText), WithoutBlanks(dayText));
}

std::optional<DateTime> ShownDate(std::string_view text) {
  text = WithoutBlanks(text);
  const std::optional<SlashParts> parts = SplitAtSlashes(text);
  if (!parts) return DateTime::FromIso(text);
  if (parts->first.size() == 4) return DateFromParts(parts->first, parts->second, parts->third);
  return DateFromParts(parts->third, parts->second, parts->first);
}

}  // namespace partnerkit

#include "values/numbers.h"

#include <array>
#include <charconv>
#include <cmath>
#include <cstdlib>
#include <limits>
#include <system_error>
#include <utility>

#include "partnerkit/run_time_error.h"

namespace partnerkit {
namespace {

constexpr int kSignificantDigits = 15;  // what a double holds of any decimal number
constexpr double kWholeFrom = 1e15;     // from here on 15 digits leave no room for a fraction
constexpr int kLastExponent = std::numeric_limits<double>::max_exponent10;

[[noreturn]] void RaiseOverflow() { throw RunTimeError(run_time::kOverflow, "Overflow"); }

bool IsDigit(char c) { return c >= '0' && c <= '9'; }
bool IsBlank(char c) { return c == ' ' || c == '\t'; }

// A digit, or a point with a digit behind it. Keeps out "inf" and "nan", which std::from_chars would read.
bool StartsNumber(const char* at, const char* end) {
  if (at != end && *at == '.') ++at;
  return at != end && IsDigit(*at);
}

void DropTrailingZeros(std::string& digits) { digits.resize(digits.find_last_not_of('0') + 1); }

struct ScannedNumber {
  Decimal value;
  int exponent = 0;
  bool exponentHasSign = true;
  const char* end = nullptr;
};

// Reads "E" and its number into the scan; an "E" without digits is no exponent and stays unread.
void ScanExponent(ScannedNumber& scan, const char* end) {
  const char* at = scan.end;
  if (at == end || (*at != 'E' && *at != 'e')) return;
  ++at;
  const bool hasSign = at != end && (*at == '+' || *at == '-');
  const bool negative = hasSign && *at == '-';
  if (hasSign) ++at;
  if (at == end || !IsDigit(*at)) return;
  constexpr int kFarAway = 100'000'000;
  const auto [rest, error] = std::from_chars(at, end, scan.exponent);
  if (error != std::errc() || scan.exponent > kFarAway) scan.exponent = kFarAway;
  if (negative) scan.exponent = -scan.exponent;
  scan.exponentHasSign = hasSign;
  scan.end = rest;
}

// An unsigned number at `at`, with every digit it has. Expects StartsNumber.
ScannedNumber ScanNumber(const char* at, const char* end) {
  ScannedNumber scan;
  Decimal& value = scan.value;
  for (bool behindPoint = false; at != end && (IsDigit(*at) || (*at == '.' && !behindPoint)); ++at) {
    if (*at == '.') {
      behindPoint = true;
      continue;
    }
    if (*at != '0' || !value.digits.empty()) {
      value.digits.push_back(*at);
      if (!behindPoint) ++value.point;
    } else if (behindPoint) {
      --value.point;
    }
  }
  DropTrailingZeros(value.digits);
  scan.end = at;
  ScanExponent(scan, end);
  value.point = value.IsZero() ? 0 : value.point + scan.exponent;
  return scan;
}

void AppendExponent(std::string& text, int exponent) {
  text += exponent < 0 ? "E-" : "E+";
  const std::string digits = std::to_string(std::abs(exponent));
  if (digits.size() < 2) text += '0';
  text += digits;
}

std::string PlainText(const Decimal& value) {
  const int size = static_cast<int>(value.digits.size());
  if (value.point <= 0) return "0." + std::string(static_cast<std::size_t>(-value.point), '0') + value.digits;
  const auto point = static_cast<std::size_t>(value.point);
  if (value.point >= size) return value.digits + std::string(point - value.digits.size(), '0');
  return value.digits.substr(0, point) + '.' + value.digits.substr(point);
}

std::string ScientificText(const Decimal& value) {
  std::string text = value.digits.substr(0, 1);
  if (value.digits.size() > 1) text.append(1, '.').append(value.digits, 1);
  AppendExponent(text, value.point - 1);
  return text;
}

template <class Whole>
Whole Narrowed(double value) {
  const double whole = std::nearbyint(value);
  // Written so that a value that is no number fails it too.
  if (!(whole >= std::numeric_limits<Whole>::min() && whole <= std::numeric_limits<Whole>::max())) RaiseOverflow();
  return static_cast<Whole>(whole);
}

}  // namespace

double NumberAtStart(std::string_view text) {
  const char* at = text.data();
  const char* const end = at + text.size();
  while (at != end && IsBlank(*at)) ++at;
  const bool negative = at != end && *at == '-';
  if (at != end && (*at == '-' || *at == '+')) ++at;
  if (!StartsNumber(at, end)) return 0;
  double value = 0;
  if (std::from_chars(at, end, value).ec == std::errc::result_out_of_range) {
    if (ScanNumber(at, end).value.point > 0) RaiseOverflow();
    return 0;  // too small to be told from nothing
  }
  return negative ? 0 - value : value;
}

bool IsNumber(std::string_view text) {
  const char* at = text.data();
  const char* end = at + text.size();
  while (at != end && IsBlank(*at)) ++at;
  while (at != end && IsBlank(end[-1])) --end;
  if (at != end && (*at == '-' || *at == '+')) ++at;
  double value = 0;
  return StartsNumber(at, end) && std::from_chars(at, end, value).ptr == end;
}

std::int32_t ToLong(double value) { return Narrowed<std::int32_t>(value); }

std::int16_t ToInteger(double value) { return Narrowed<std::int16_t>(value); }

double RoundHalfEven(double value, int digits) {
  if (digits >= 0 && std::isfinite(value) && std::abs(value) >= kWholeFrom) return value;
  const Decimal rounded = Rounded(DecimalOf(value), digits, Half::kToEven);
  if (rounded.IsZero()) return 0;
  const int exponent = rounded.point - static_cast<int>(rounded.digits.size());
  const std::string text = rounded.digits + 'e' + std::to_string(exponent);
  const double magnitude = NumberAtStart(text);
  return rounded.negative ? -magnitude : magnitude;
}

std::string NumberText(double value) {
  if (std::abs(value) < kWholeFrom && value == std::trunc(value)) {
    return std::to_string(static_cast<std::int64_t>(value));
  }
  const Decimal decimal = DecimalOf(value);
  const int places = static_cast<int>(decimal.digits.size()) - decimal.point;
  const bool plain = decimal.point <= kSignificantDigits && places <= kSignificantDigits;
  return (decimal.negative ? "-" : "") + (plain ? PlainText(decimal) : ScientificText(decimal));
}

double Plus(double left, double right) {
  const double sum = left + right;
  if (!std::isfinite(sum)) RaiseOverflow();
  return sum;
}

double Times(double left, double right) {
  const double product = left * right;
  if (!std::isfinite(product)) RaiseOverflow();
  return product;
}

Decimal DecimalOf(double value) {
  if (!std::isfinite(value)) RaiseOverflow();
  if (value == 0) return {};
  std::array<char, 32> buffer;  // d.dddddddddddddde-ddd
  const char* const end = std::to_chars(buffer.data(), buffer.data() + buffer.size(), std::abs(value),
                                        std::chars_format::scientific, kSignificantDigits - 1)
                              .ptr;
  ScannedNumber scan = ScanNumber(buffer.data(), end);
  scan.value.negative = value < 0;
  return std::move(scan.value);
}

std::optional<Decimal> DecimalOf(std::string_view text) {
  while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
  while (!text.empty() && IsBlank(text.back())) text.remove_suffix(1);
  const bool negative = text.starts_with('-');
  if (negative || text.starts_with('+')) text.remove_prefix(1);
  const char* const end = text.data() + text.size();
  if (!StartsNumber(text.data(), end)) return std::nullopt;
  ScannedNumber scan = ScanNumber(text.data(), end);
  // Store and article codes such as "12E4" are no powers of ten: only a signed exponent, as NumberText writes it, is
  // one.
  if (scan.end != end || !scan.exponentHasSign || std::abs(scan.exponent) > kLastExponent) return std::nullopt;
  scan.value.negative = negative && !scan.value.IsZero();
  return std::move(scan.value);
}

Decimal Rounded(Decimal value, int places, Half half) {
  const int keep = value.point + places;
  if (keep < 0) return {};
  const auto kept = static_cast<std::size_t>(keep);
  if (kept >= value.digits.size()) return value;

  const char next = value.digits[kept];
  const bool tie = next == '5' && kept + 1 == value.digits.size();
  const bool odd = kept > 0 && (value.digits[kept - 1] - '0') % 2 != 0;
  const bool up = tie ? half == Half::kAwayFromZero || odd : next >= '5';
  value.digits.resize(kept);
  if (up) {
    value.digits.resize(value.digits.find_last_not_of('9') + 1);
    if (value.digits.empty()) {
      value.digits = "1";
      ++value.point;
    } else {
      ++value.digits.back();
    }
  }
  DropTrailingZeros(value.digits);
  return value.IsZero() ? Decimal{} : value;
}

}  // namespace partnerkit

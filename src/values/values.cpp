#include "partnerkit/values.h"

#include <algorithm>
#include <chrono>
#include <cstddef>

namespace partnerkit {
namespace {

using std::chrono::days;
using std::chrono::seconds;
using std::chrono::sys_days;
using std::chrono::year_month_day;

constexpr std::int64_t kSecondsOfDay = 86400;
constexpr int kLastYear = 9999;

sys_days DayOf(std::int64_t secondCount) { return sys_days(std::chrono::floor<days>(seconds(secondCount))); }

year_month_day CalendarOf(std::int64_t secondCount) { return year_month_day(DayOf(secondCount)); }

// Seconds since midnight, also of days before 1970.
int TimeOfDay(std::int64_t secondCount) {
  const std::int64_t rest = secondCount % kSecondsOfDay;
  return static_cast<int>(rest < 0 ? rest + kSecondsOfDay : rest);
}

bool Between(int value, int low, int high) { return low <= value && value <= high; }

// The number in fixed columns of a text; -1 when one of them holds no digit.
int ColumnNumber(std::string_view text, std::size_t from, std::size_t width) {
  int number = 0;
  for (const char c : text.substr(from, width)) {
    if (c < '0' || c > '9') return -1;
    number = number * 10 + (c - '0');
  }
  return number;
}

void AppendNumber(std::string& out, int number, int width) {
  const std::string digits = std::to_string(number);
  out.append(static_cast<std::size_t>(std::max(0, width - static_cast<int>(digits.size()))), '0').append(digits);
}

}  // namespace

std::optional<DateTime> DateTime::FromYmd(int year, int month, int day) {
  return FromYmdHms(year, month, day, 0, 0, 0);
}

std::optional<DateTime> DateTime::FromYmdHms(int year, int month, int day, int hour, int minute, int second) {
  if (!Between(year, 1, kLastYear) || !Between(month, 1, 12) || !Between(day, 1, 31)) return std::nullopt;
  if (!Between(hour, 0, 23) || !Between(minute, 0, 59) || !Between(second, 0, 59)) return std::nullopt;
  const year_month_day date{std::chrono::year(year), std::chrono::month(static_cast<unsigned>(month)),
                            std::chrono::day(static_cast<unsigned>(day))};
  if (!date.ok()) return std::nullopt;
  const std::int64_t dayCount = sys_days(date).time_since_epoch().count();
  return DateTime(dayCount * kSecondsOfDay + hour * 3600 + minute * 60 + second);
}

std::optional<DateTime> DateTime::FromIso(std::string_view text) {
  constexpr std::size_t kDateLength = 10;
  constexpr std::size_t kFullLength = 19;
  if (text.size() != kDateLength && text.size() != kFullLength) return std::nullopt;
  if (text[4] != '-' || text[7] != '-') return std::nullopt;
  int hour = 0, minute = 0, second = 0;
  if (text.size() == kFullLength) {
    if ((text[10] != 'T' && text[10] != ' ') || text[13] != ':' || text[16] != ':') return std::nullopt;
    hour = ColumnNumber(text, 11, 2);
    minute = ColumnNumber(text, 14, 2);
    second = ColumnNumber(text, 17, 2);
  }
  return FromYmdHms(ColumnNumber(text, 0, 4), ColumnNumber(text, 5, 2), ColumnNumber(text, 8, 2), hour, minute, second);
}

int DateTime::Year() const { return static_cast<int>(CalendarOf(seconds_).year()); }
int DateTime::Month() const { return static_cast<int>(static_cast<unsigned>(CalendarOf(seconds_).month())); }
int DateTime::Day() const { return static_cast<int>(static_cast<unsigned>(CalendarOf(seconds_).day())); }
int DateTime::Hour() const { return TimeOfDay(seconds_) / 3600; }
int DateTime::Minute() const { return TimeOfDay(seconds_) / 60 % 60; }
int DateTime::Second() const { return TimeOfDay(seconds_) % 60; }

int DateTime::Weekday() const { return static_cast<int>(std::chrono::weekday(DayOf(seconds_)).c_encoding()); }

int DateTime::DayOfYear() const {
  const sys_days day = DayOf(seconds_);
  const sys_days newYear = year_month_day(day).year() / std::chrono::January / 1;
  return static_cast<int>((day - newYear).count()) + 1;
}

DateTime DateTime::Date() const { return DateTime(seconds_ - TimeOfDay(seconds_)); }

bool DateTime::HasTime() const { return TimeOfDay(seconds_) != 0; }

std::string DateTime::Iso() const {
  const year_month_day date = CalendarOf(seconds_);
  std::string text;
  AppendNumber(text, static_cast<int>(date.year()), 4);
  AppendNumber(text.append(1, '-'), static_cast<int>(static_cast<unsigned>(date.month())), 2);
  AppendNumber(text.append(1, '-'), static_cast<int>(static_cast<unsigned>(date.day())), 2);
  if (!HasTime()) return text;
  AppendNumber(text.append(1, 'T'), Hour(), 2);
  AppendNumber(text.append(1, ':'), Minute(), 2);
  AppendNumber(text.append(1, ':'), Second(), 2);
  return text;
}

}  // namespace partnerkit

// The small value types that travel between a host and the classes: text that may be null, local dates, grid cells,
// and the tables made of them.
#pragma once

#include <compare>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace partnerkit {

// Text that may be null. Null and empty are different things in the store; most comparisons take null for empty (Str).
using Text = std::optional<std::string>;

// The text, a null one as empty.
inline std::string_view Str(const Text& text) { return text ? std::string_view(*text) : std::string_view(); }

// The text, or null when it is empty: how an absent partner field is stored.
inline Text NullIfEmpty(std::string_view text) { return text.empty() ? Text() : Text(std::string(text)); }

// A local date and time of day, to the second, in the proleptic Gregorian calendar, years 1 to 9999. No time zone:
// trading partners exchange wall-clock dates.
class DateTime {
 public:
  DateTime() = default;

  // Nothing when the calendar has no such day ("31 February" is not carried over into March).
  static std::optional<DateTime> FromYmd(int year, int month, int day);
  static std::optional<DateTime> FromYmdHms(int year, int month, int day, int hour, int minute, int second);
  // "2004-07-31" or "2004-07-31T10:15:00" (a blank may stand for the "T"); nothing for any other text.
  static std::optional<DateTime> FromIso(std::string_view text);
  static DateTime FromSeconds(std::int64_t seconds) { return DateTime(seconds); }

  int Year() const;
  int Month() const;      // 1 to 12
  int Day() const;        // 1 to 31
  int Hour() const;       // 0 to 23
  int Minute() const;     // 0 to 59
  int Second() const;     // 0 to 59
  int Weekday() const;    // 0 is Sunday
  int DayOfYear() const;  // 1 to 366

  // The same day at midnight.
  DateTime Date() const;
  bool HasTime() const;
  // Seconds from 1970-01-01 00:00:00 of the same wall clock.
  std::int64_t Seconds() const { return seconds_; }
  // "2004-07-31" at midnight, else "2004-07-31T10:15:00".
  std::string Iso() const;

  friend auto operator<=>(const DateTime&, const DateTime&) = default;

 private:
  explicit DateTime(std::int64_t seconds) : seconds_(seconds) {}
  std::int64_t seconds_ = 0;
};

// A cell of a grid: empty, a truth value, a number, a text or a date.
using Cell = std::variant<std::monostate, bool, double, std::string, DateTime>;

// One column of a host's grid. The kind code and the width are the host's own; the classes pass them through unread.
struct GridColumn {
  std::string_view caption;
  int kind;
  int width;
};

// The column table that `Init` hands to the host, column from 0.
using ColumnTable = std::vector<GridColumn>;

// The rows that `Load` hands to the host: a table of cells, row and column from 0.
class RowTable {
 public:
  RowTable() = default;
  RowTable(std::size_t rows, std::size_t columns) : columns_(columns), cells_(rows * columns) {}

  std::size_t Rows() const { return columns_ == 0 ? 0 : cells_.size() / columns_; }
  std::size_t Columns() const { return columns_; }
  // Cuts off what stands behind so many rows.
  void KeepRows(std::size_t rows) {
    if (rows < Rows()) cells_.resize(rows * columns_);
  }
  Cell& At(std::size_t row, std::size_t column) { return cells_[row * columns_ + column]; }
  const Cell& At(std::size_t row, std::size_t column) const { return cells_[row * columns_ + column]; }

 private:
  std::size_t columns_ = 0;
  std::vector<Cell> cells_;
};

// `vtErrorLog`: the `LogId` of each log record that one call wrote, in the order written. A call that wrote none leaves
// the caller's variant as it was, which is why it may be absent.
using ErrorList = std::optional<std::vector<std::int32_t>>;

}  // namespace partnerkit

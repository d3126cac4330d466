// The general text formatter: a value and a pattern give a text, the same under every process locale. What a pattern is
// made of decides its kind.
//
//   Numbers  0 a digit or a zero, # a digit or nothing, . the point, % times a hundred, E+00 E-00 an exponent,
//            a comma between digits groups thousands, one behind the last whole digit divides by a thousand;
//            sections by ";" for positive, negative and zero. Halves go away from zero, whole digits are never cut.
//   Dates    y yy yyyy m mm mmm mmmm d dd ddd dddd h hh n nn s ss AM/PM, in either case; y alone is the day of the
//            year; "m" and "mm" next behind an hour are minutes. "Short Date" is 31/07/2004, "Long Date"
//            Saturday, 31 July 2004.
//   Texts    @ a character or a blank, & a character or nothing, ! fills from the left instead of the right,
//            < and > lower and upper case; characters beyond the places are kept. A section behind ";" is for "".
//
// Any other character stands for itself, as do "quoted" ones and the one behind "\".
//
// A pattern that doesn't suit the value: under a number or date pattern a text that reads as one counts as one, any
// other text stands as it is; a number under a date pattern, or a date under a number pattern, gives its plain text.
#pragma once

#include <concepts>
#include <optional>
#include <string>
#include <string_view>

#include "partnerkit/values.h"

namespace partnerkit {

// Raises error 6 for an infinite value or one that is no number.
std::string Format(double value, std::string_view pattern);
std::string Format(std::string_view text, std::string_view pattern);
std::string Format(DateTime date, std::string_view pattern);

// Null, of any kind, gives "".
template <class T>
std::string Format(const std::optional<T>& value, std::string_view pattern) {
  return value ? Format(*value, pattern) : std::string();
}

std::string FormatCell(const Cell& cell, std::string_view pattern);

// A template so that texts and numbers don't turn into cells on their way to Format. An empty cell gives "".
template <std::same_as<Cell> C>
std::string Format(const C& cell, std::string_view pattern) {
  return FormatCell(cell, pattern);
}

}  // namespace partnerkit

// Numbers as trading files carry them: read from the front of a field, narrowed with the overflow error, rounded and
// written in decimal. Nothing here asks the process locale.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace partnerkit {

// The number at the front of a field, blanks before it skipped: "12.50EA" is 12.5, "" and "N/A" are 0. Takes a sign,
// digits, a point and an exponent. Raises error 6 when the value is beyond a double.
double NumberAtStart(std::string_view text);

// Whether what NumberAtStart reads is all of the text, blanks around it aside.
bool IsNumber(std::string_view text);

// The nearest whole number, a half going to the even neighbour. Raise error 6 beyond 32 and 16 bits.
std::int32_t ToLong(double value);
std::int16_t ToInteger(double value);

// Rounds to so many decimal places, a half going to the even neighbour. The half is that of the decimal value that a
// person reads: 1.015 counts as a half, though the binary fraction lies below it.
double RoundHalfEven(double value, int digits);

// The shortest text of up to 15 significant digits: "10.5", "0.1", "-3", "1E+20".
std::string NumberText(double value);

// The sum and the product; raise error 6 when they leave the range of a double.
double Plus(double left, double right);
double Times(double left, double right);

// A number in decimal: 0.DIGITS times ten to the power of `point`.
struct Decimal {
  bool negative = false;
  std::string digits;  // without zeros at either end; empty for zero
  int point = 0;       // digits in front of the decimal point; 0 or less for a pure fraction

  bool IsZero() const { return digits.empty(); }
};

enum class Half { kToEven, kAwayFromZero };

// The value to 15 significant digits. Raises error 6 when it is infinite or no number.
Decimal DecimalOf(double value);
// A text that is a number as a whole, with all its digits, blanks around it allowed. Nothing for any other text.
std::optional<Decimal> DecimalOf(std::string_view text);
Decimal Rounded(Decimal value, int places, Half half);

}  // namespace partnerkit

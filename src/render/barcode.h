// Code 128 (with FNC1, for GS1-128) and EAN-13 as patterns: a text of "0" and "1", one character a module, "1" for a
// dark one.
#pragma once

#include <string>
#include <string_view>

namespace partnerkit::render {

// Stands for FNC1 within the data of a Code 128 symbol, as does the text "~201".
inline constexpr char kFnc1 = '\x1d';

// The widths of a symbol's bars and spaces in turn: six of them, seven for the stop (106). Empty outside of 0 to 106.
std::string_view Code128Widths(int value);

// The symbol value of a character, or a negative number if the encoder doesn't take the character from that subset: A
// serves for controls (0 to 28), the blank and punctuation, B for all else up to "~". Both know FNC1 (kFnc1 or the
// word) and the words FNC2, FNC3, FNC4, SHIFT, CODEC, and CODEB or CODEA.
int Code128ValueA(std::string_view character);
int Code128ValueB(std::string_view character);

// The whole Code 128 symbol, from start to stop. Begins in subset C if the first four characters read as a number or
// FNC1 is anywhere in the data; otherwise in B, without a switch for punctuation, which has the same values in A.
// Characters of neither subset are dropped, and so are controls where subset A was never entered.
std::string BarPattern(std::string_view data);

// "212" gives "11011".. in turn: so many dark modules, so many light ones. Other characters than digits are nothing.
std::string ConvertPattern(std::string_view widths);

// EAN-13 of 13 digits, the last of which is the check digit. Other characters leave their modules out.
std::string BuildBarcode(std::string_view data);

// "0", then the sets (A or B) of the six digits of the left half, by the first digit. Empty for another character.
std::string_view GetBarcodeSystem(char firstDigit);

// The seven modules of a digit in set A, B or C. Empty for another digit or set.
std::string_view GetBars(char digit, char set);

}  // namespace partnerkit::render

// The input is the data of a barcode. The Code 128 symbol must read as the data, but for the characters that no symbol
// takes; the functions that barcodes are built from must take anything.
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>

#include "../tests/support/code128_reader.h"
#include "render/barcode.h"

namespace {

using namespace partnerkit::render;
using partnerkit::testing::Code128Reader;

void Check(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "does not hold: %s\n", what);
  std::abort();
}

Code128Reader TaughtReader() {
  Code128Reader reader;
  for (int value = 0; value < 106; ++value) {
    std::string modules;
    for (const char width : Code128Widths(value)) {
      modules.append(static_cast<std::size_t>(width - '0'), modules.empty() || modules.back() == '0' ? '1' : '0');
    }
    reader.Learn(modules, value);
  }
  return reader;
}

// As the symbol should read; controls only if there are any in it.
std::string Readable(std::string_view data, bool controls) {
  std::string text;
  for (std::size_t at = 0; at < data.size(); ++at) {
    const char c = data[at];
    if (c == kFnc1 || data.substr(at).starts_with("~201")) {
      at += c == kFnc1 ? 0 : 3;
      text += Code128Reader::kFnc1;
    } else if ((c >= ' ' && c <= '~') || (controls && c >= 0 && c < kFnc1)) {
      text += c;
    }
  }
  return text;
}

void CheckCode128(std::string_view data) {
  static const Code128Reader reader = TaughtReader();
  const std::string pattern = BarPattern(data);
  Check(pattern.size() % 11 == 13 % 11 && pattern.size() >= 35, "symbols of eleven modules, and the stop");
  const Code128Reader::Reading reading = reader.Read(pattern);
  Check(reading.subsets.size() == (pattern.size() - 13) / 11 - 1, "the symbol can be read");
  const bool startsInC = reading.subsets[0] == 'C';
  Check(reading.text == Readable(data, startsInC), "the symbol reads as the data");
  Check(startsInC || reading.subsets.find_first_not_of('B') == std::string::npos, "subset B is kept to");
  Check(startsInC || reading.text.find(Code128Reader::kFnc1) == std::string::npos, "FNC1 takes subset C");
}

void CheckCharacter(std::string_view character) {
  const int a = Code128ValueA(character), b = Code128ValueB(character);
  for (const int value : {a, b}) Check(value >= -1 && value <= 102, "what a character stands for");
  if (character.size() == 1 && a >= 0 && a == b) Check(character[0] == kFnc1, "one subset for each character");
}

void CheckWidths(std::string_view widths) {
  std::string pattern;
  bool dark = true;
  for (const char width : widths) {
    if (width < '0' || width > '9') continue;
    pattern += std::string(static_cast<std::size_t>(width - '0'), dark ? '1' : '0');
    dark = !dark;
  }
  Check(ConvertPattern(widths) == pattern, "modules by widths");
}

void CheckBars(char digit, char set) {
  const std::string_view bars = GetBars(digit, set);
  const bool known = digit >= '0' && digit <= '9' && set >= 'A' && set <= 'C';
  Check(bars.size() == (known ? 7 : 0), "seven modules a digit");
  std::size_t dark = 0;
  for (std::size_t k = 0; k < bars.size(); ++k) {
    dark += bars[k] == '1' ? 1 : 0;
    Check((bars[k] == '1') != (GetBars(digit, 'C')[k] == '1') || set != 'A', "set C is A inverted");
    Check(bars[k] == GetBars(digit, 'C')[6 - k] || set != 'B', "set B is C from behind");
  }
  Check(bars.empty() || (dark % 2 == 1) == (set == 'A'), "the parity of a set");
}

void CheckEan(std::string_view data) {
  const std::string pattern = BuildBarcode(data);
  const auto isDigit = [](char c) { return c >= '0' && c <= '9'; };
  std::size_t modules = data.size() > 7 ? 11 : 6;
  for (std::size_t k = 1; k < data.size(); ++k) modules += isDigit(data[k]) && (k > 6 || isDigit(data[0])) ? 7 : 0;
  Check(pattern.size() == modules, "seven modules for each digit between the guards");
  Check(pattern.find_first_not_of("01") == std::string::npos, "modules are dark or light");
  Check(pattern.starts_with("101") && pattern.ends_with("101"), "the guards");
  Check(data.empty() || GetBarcodeSystem(data[0]).size() == (isDigit(data[0]) ? 7 : 0), "the sets of six digits");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view bytes(reinterpret_cast<const char*>(data), size);
  CheckCode128(bytes);
  CheckWidths(bytes);
  CheckEan(bytes);
  CheckCharacter(bytes);
  for (std::size_t at = 0; at < size; ++at) {
    CheckCharacter(bytes.substr(at, 1));
    CheckBars(bytes[at], bytes[(at + 1) % size]);
  }
  return 0;
}

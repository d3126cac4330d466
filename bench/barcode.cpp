// Patterns of shipping container numbers, each of another number, by us or by the yardstick:
//   barcode ours|libzint COUNT
// The yardstick is used as by one who prints labels: one symbol for all barcodes, the checks of its input left on. Its
// modules stay the bits that it makes, ours are text.
#include <zint.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "render/barcode.h"
#include "stopwatch.h"

namespace {

// 18 digits, the last of them the check digit, behind what marks them as a container's number.
std::vector<std::string> Numbers(std::size_t count, std::string_view mark) {
  std::vector<std::string> numbers;
  numbers.reserve(count);
  std::uint64_t number = 39'312'345'000'000'000;
  while (numbers.size() < count) {
    number += 1'000'003;
    std::uint64_t sum = 0, weight = 3;
    for (std::uint64_t rest = number; rest != 0; rest /= 10, weight = 4 - weight) sum += rest % 10 * weight;
    const std::string digits = std::to_string(number * 10 + (10 - sum % 10) % 10);
    numbers.emplace_back(mark).append(18 - digits.size(), '0').append(digits);
  }
  return numbers;
}

// Another module of each barcode, so that they can't be left unmade and the two sides can be held against each other.
std::size_t Ours(const std::vector<std::string>& numbers) {
  std::size_t dark = 0;
  for (std::size_t n = 0; n < numbers.size(); ++n) {
    const std::string pattern = partnerkit::render::BarPattern(numbers[n]);
    dark += pattern[n % pattern.size()] == '1' ? 1 : 0;
  }
  return dark;
}

std::size_t Libzints(const std::vector<std::string>& numbers) {
  const std::unique_ptr<zint_symbol, void (*)(zint_symbol*)> symbol{ZBarcode_Create(), ZBarcode_Delete};
  symbol->symbology = BARCODE_GS1_128;
  std::size_t dark = 0;
  for (std::size_t n = 0; n < numbers.size(); ++n) {
    ZBarcode_Clear(symbol.get());
    if (ZBarcode_Encode(symbol.get(), reinterpret_cast<const unsigned char*>(numbers[n].data()),
                        static_cast<int>(numbers[n].size())) != 0) {
      throw std::runtime_error(numbers[n] + ": " + symbol->errtxt);
    }
    const std::size_t module = n % static_cast<std::size_t>(symbol->width);
    dark += symbol->encoded_data[0][module / 8] >> module % 8 & 1U;
  }
  return dark;
}

void Measure(bool ours, std::size_t count) {
  const std::vector<std::string> numbers = Numbers(count, ours ? "~20100" : "[00]");
  const Stopwatch watch;
  const std::size_t dark = ours ? Ours(numbers) : Libzints(numbers);
  std::printf("{\"dark\": %zu, \"seconds\": %.6f, \"busy\": %.6f}\n", dark, watch.Elapsed(), watch.Busy());
}

}  // namespace

int main(int count, char** arguments) {
  const std::string_view side = count == 3 ? arguments[1] : "";
  const std::size_t barcodes = count == 3 ? std::strtoul(arguments[2], nullptr, 10) : 0;
  if ((side != "ours" && side != "libzint") || barcodes == 0) {
    std::fputs("usage: barcode ours|libzint COUNT\n", stderr);
    return 2;
  }
  try {
    Measure(side == "ours", barcodes);
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "barcode: %s\n", error.what());
    return 1;
  }
}

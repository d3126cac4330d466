#include "render/barcode.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory_resource>
#include <utility>

#include "values/numbers.h"

namespace partnerkit::render {

namespace {

constexpr int kFnc1Value = 102, kCodeB = 100, kCodeA = 101, kStartB = 104, kStartC = 105, kStop = 106;
constexpr std::string_view kFnc1Text = "~201";

// clang-format off
constexpr std::string_view kWidths[] = {
    "212222", "222122", "222221", "121223", "121322", "131222", "122213", "122312", "132212", "221213",
    "221312", "231212", "112232", "122132", "122231", "113222", "123122", "123221", "223211", "221132",
    "221231", "213212", "223112", "312131", "311222", "321122", "321221", "312212", "322112", "322211",
    "212123", "212321", "232121", "111323", "131123", "131321", "112313", "132113", "132311", "211313",
    "231113", "231311", "112133", "112331", "132131", "113123", "113321", "133121", "313121", "211331",
    "231131", "213113", "213311", "213131", "311123", "311321", "331121", "312113", "312311", "332111",
    "314111", "221411", "431111", "111224", "111422", "121124", "121421", "141122", "141221", "112214",
    "112412", "122114", "122411", "142112", "142211", "241211", "221114", "413111", "241112", "134111",
    "111242", "121142", "121241", "114212", "124112", "124211", "411212", "421112", "421211", "212141",
    "214121", "412121", "111143", "111341", "131141", "114113", "114311", "411113", "411311", "113141",
    "114131", "311141", "411131", "211412", "211214", "211232", "2331112",
};

constexpr std::pair<std::string_view, int> kWordsOfBoth[] = {
    {"FNC3", 96}, {"FNC2", 97}, {"SHIFT", 98}, {"CODEC", 99}, {"FNC1", kFnc1Value},
};
constexpr std::pair<std::string_view, int> kWordsOfA[] = {{"CODEB", kCodeB}, {"FNC4", 101}};
constexpr std::pair<std::string_view, int> kWordsOfB[] = {{"FNC4", 100}, {"CODEA", kCodeA}};

constexpr std::string_view kBarcodeSystems[] = {
    "0AAAAAA", "0AABABB", "0AABBAB", "0AABBBA", "0ABAABB", "0ABBAAB", "0ABBBAA", "0ABABAB", "0ABABBA", "0ABBABA",
};

constexpr std::string_view kBars[][10] = {
    {"0001101", "0011001", "0010011", "0111101", "0100011", "0110001", "0101111", "0111011", "0110111", "0001011"},
    {"0100111", "0110011", "0011011", "0100001", "0011101", "0111001", "0000101", "0010001", "0001001", "0010111"},
    {"1110010", "1100110", "1101100", "1000010", "1011100", "1001110", "1010000", "1000100", "1001000", "1110100"},
};
// clang-format on

constexpr std::size_t kSymbolModules = 11, kStopModules = 13;

// The modules of a symbol in the first places of a chunk that is copied whole: one move instead of a loop.
using Chunk = std::array<char, 16>;

constexpr Chunk Modules(std::string_view widths) {
  Chunk modules{};
  std::size_t at = 0;
  for (std::size_t k = 0; k < widths.size(); ++k) {
    for (char n = '0'; n < widths[k]; ++n) modules[at++] = k % 2 == 0 ? '1' : '0';
  }
  return modules;
}

constexpr std::array<Chunk, std::size(kWidths)> AllModules() {
  std::array<Chunk, std::size(kWidths)> all{};
  for (std::size_t value = 0; value < all.size(); ++value) all[value] = Modules(kWidths[value]);
  return all;
}

constexpr std::array<Chunk, std::size(kWidths)> kModules = AllModules();

constexpr bool IsDigit(char c) { return c >= '0' && c <= '9'; }

constexpr bool IsPunctuation(char c) {
  return (c >= ' ' && c <= '/') || (c >= ':' && c <= '@') || (c >= '[' && c <= '_');
}

constexpr int ValueA(char c) {
  if (IsPunctuation(c)) return c - ' ';
  if (c == kFnc1) return kFnc1Value;
  return c >= 0 && c < kFnc1 ? c + 64 : -1;
}

constexpr int ValueB(char c) {
  if (c == kFnc1) return kFnc1Value;
  return c > ' ' && c <= '~' && !IsPunctuation(c) ? c - ' ' : -1;
}

template <std::size_t kCount>
int Find(const std::pair<std::string_view, int> (&words)[kCount], std::string_view word, int otherwise) {
  const auto found = std::ranges::find(words, word, [](const auto& entry) { return entry.first; });
  return found == std::end(words) ? otherwise : found->second;
}

// Symbols one behind the other, with the sum that the check symbol is made of.
class SymbolWriter {
 public:
  // `most` is the number of symbols, start and check included, that may come.
  SymbolWriter(int start, std::size_t most)
      : pattern_(most * kSymbolModules + sizeof(Chunk), '\0'), sum_(Value(start)) {
    Append(start);
  }

  void Write(int value) {
    Append(value);
    sum_ += ++weight_ * Value(value);
  }

  std::string Finish() {
    Append(static_cast<int>(sum_ % 103));
    Append(kStop);
    pattern_.resize(end_ - kSymbolModules + kStopModules);
    return std::move(pattern_);
  }

 private:
  static std::uint64_t Value(int value) { return static_cast<std::uint64_t>(value); }

  void Append(int value) {
    std::memcpy(pattern_.data() + end_, kModules[static_cast<std::size_t>(value)].data(), sizeof(Chunk));
    end_ += kSymbolModules;
  }

  std::string pattern_;
  std::size_t end_ = 0;
  std::uint64_t sum_, weight_ = 0;
};

enum class Subset { kNone, kA, kB, kC };

class Code128 {
 public:
  // `data` holds FNC1 as kFnc1 only.
  explicit Code128(std::string_view data)
      : data_(data),
        subset_(StartsInC(data) ? Subset::kC : Subset::kNone),
        // A switch may stand before each character; start, check and stop come to them.
        symbols_(subset_ == Subset::kC ? kStartC : kStartB, 2 * data.size() + 3) {}

  std::string Encode() {
    while (at_ < data_.size()) {
      if (subset_ != Subset::kC || !WriteInC()) WriteCharacter(data_[at_++]);
    }
    return symbols_.Finish();
  }

 private:
  static bool StartsInC(std::string_view data) {
    return data.find(kFnc1) != std::string_view::npos || DecimalOf(data.substr(0, 4)).has_value();
  }

  bool WriteInC() {
    if (at_ + 1 < data_.size() && IsDigit(data_[at_]) && IsDigit(data_[at_ + 1])) {
      symbols_.Write((data_[at_] - '0') * 10 + (data_[at_ + 1] - '0'));
      at_ += 2;
      return true;
    }
    if (data_[at_] != kFnc1) return false;
    symbols_.Write(kFnc1Value);
    ++at_;
    return true;
  }

  void WriteCharacter(char c) {
    if (c == kFnc1) return symbols_.Write(kFnc1Value);
    if (const int value = ValueA(c); value >= 0) {
      if (subset_ == Subset::kNone && !IsPunctuation(c)) return;
      Switch(Subset::kA, kCodeA);
      symbols_.Write(value);
    } else if (const int other = ValueB(c); other >= 0) {
      Switch(Subset::kB, kCodeB);
      symbols_.Write(other);
    }
  }

  void Switch(Subset subset, int code) {
    if (subset_ == Subset::kNone || subset_ == subset) return;
    symbols_.Write(code);
    subset_ = subset;
  }

  std::string_view data_;
  std::size_t at_ = 0;
  Subset subset_;
  SymbolWriter symbols_;
};

}  // namespace

std::string_view Code128Widths(int value) {
  return value < 0 || value > kStop ? std::string_view() : kWidths[static_cast<std::size_t>(value)];
}

int Code128ValueA(std::string_view character) {
  if (character.size() == 1) return ValueA(character[0]);
  return Find(kWordsOfA, character, Find(kWordsOfBoth, character, -1));
}

int Code128ValueB(std::string_view character) {
  if (character.size() == 1) return ValueB(character[0]);
  return Find(kWordsOfB, character, Find(kWordsOfBoth, character, -1));
}

std::string BarPattern(std::string_view data) {
  std::size_t found = data.find(kFnc1Text);
  if (found == std::string_view::npos) return Code128(data).Encode();
  // The text of a label needs no memory from the heap.
  std::array<std::byte, 128> room;
  std::pmr::monotonic_buffer_resource memory(room.data(), room.size());
  std::pmr::string text(&memory);
  text.reserve(data.size());
  std::size_t from = 0;
  for (; found != std::string_view::npos; found = data.find(kFnc1Text, from)) {
    text.append(data, from, found - from) += kFnc1;
    from = found + kFnc1Text.size();
  }
  text.append(data, from);
  return Code128(text).Encode();
}

std::string ConvertPattern(std::string_view widths) {
  std::string pattern;
  char module = '1';
  for (const char width : widths) {
    if (!IsDigit(width)) continue;
    pattern.append(static_cast<std::size_t>(width - '0'), module);
    module = module == '1' ? '0' : '1';
  }
  return pattern;
}

std::string BuildBarcode(std::string_view data) {
  const std::string_view system = data.empty() ? std::string_view() : GetBarcodeSystem(data[0]);
  std::string pattern = "101";
  for (std::size_t k = 1; k < data.size(); ++k) {
    if (k == 7) pattern += "01010";
    pattern += GetBars(data[k], k >= 7 ? 'C' : k < system.size() ? system[k] : ' ');
  }
  return pattern += "101";
}

std::string_view GetBarcodeSystem(char firstDigit) {
  return IsDigit(firstDigit) ? kBarcodeSystems[firstDigit - '0'] : std::string_view();
}

std::string_view GetBars(char digit, char set) {
  return IsDigit(digit) && set >= 'A' && set <= 'C' ? kBars[set - 'A'][digit - '0'] : std::string_view();
}

}  // namespace partnerkit::render

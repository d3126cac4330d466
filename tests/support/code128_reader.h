// Reads Code 128 from its modules, as a scanner does. It brings no table of symbols, so that what it is taught them
// from is its user's choice.
#pragma once

#include <array>
#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace partnerkit::testing {

class Code128Reader {
 public:
  // Stands for FNC1 in what was read: no character of the data can.
  static constexpr char kFnc1 = '\xf1';

  // A text that can't be read is a complaint, without subsets.
  struct Reading {
    std::string text = {};
    std::string subsets = {};  // of the start, then of each symbol of the data, S for a shift
  };

  Code128Reader() { values_.fill(-1); }

  // Eleven modules, and what they stand for.
  void Learn(std::string_view modules, int value) {
    if (const std::size_t key = Key(modules); key < kKeys) values_[key] = value;
  }

  Reading Read(std::string_view pattern) const {
    std::vector<int> values;
    for (; pattern.size() > kStop.size(); pattern.remove_prefix(kModules)) {
      values.push_back(values_[Key(pattern.substr(0, kModules))]);
    }
    if (pattern != kStop) return {"no stop"};
    if (values.size() < 2 || values[0] < kStartA || values[0] > kStartC) return {"no start"};
    std::size_t sum = static_cast<std::size_t>(values[0]);
    for (std::size_t k = 1; k + 1 < values.size(); ++k) {
      if (values[k] < 0 || values[k] >= kStartA) return {"no symbol"};
      sum += k * static_cast<std::size_t>(values[k]);
    }
    if (values.back() != static_cast<int>(sum % 103)) return {"wrong check symbol"};
    values.pop_back();
    return TextOf(values);
  }

 private:
  static constexpr std::string_view kStop = "1100011101011";
  static constexpr std::size_t kModules = 11, kKeys = std::size_t{1} << kModules;
  static constexpr int kShift = 98, kCodeC = 99, kCodeB = 100, kCodeA = 101, kFnc1Value = 102, kStartA = 103,
                       kStartC = 105;

  // The last place, where nothing is learned, for what isn't eleven modules.
  static std::size_t Key(std::string_view modules) {
    std::size_t key = 0;
    for (const char module : modules) {
      if (module != '0' && module != '1') return kKeys;
      key = key * 2 + (module == '1' ? 1 : 0);
    }
    return modules.size() == kModules ? key : kKeys;
  }

  static Reading TextOf(const std::vector<int>& values) {
    char subset = static_cast<char>('A' + values[0] - kStartA), next = subset;
    Reading reading{"", {subset}};
    for (std::size_t k = 1; k < values.size(); ++k) {
      const char now = std::exchange(next, subset);
      const int value = values[k];
      if (value == kFnc1Value) {
        reading.text += kFnc1;
      } else if (now == 'C' && value < 100) {
        reading.text += {static_cast<char>('0' + value / 10), static_cast<char>('0' + value % 10)};
      } else if (value < 96) {
        reading.text += static_cast<char>(value < 64 || now == 'B' ? value + ' ' : value - 64);
      } else if (value == kShift) {
        next = now == 'A' ? 'B' : 'A';
      } else if (const char into = Switched(now, value); into != '\0') {
        next = subset = into;
      } else {
        return {"an unexpected function"};
      }
      reading.subsets += value == kShift ? 'S' : now;
    }
    return reading;
  }

  // The subset that a switch leads to. None for one to where it stands already, which is FNC4.
  static char Switched(char from, int value) {
    const char into = value == kCodeC ? 'C' : value == kCodeB ? 'B' : value == kCodeA ? 'A' : '\0';
    return into == from ? '\0' : into;
  }

  std::array<int, kKeys + 1> values_;
};

}  // namespace partnerkit::testing

// Barcodes against those of libzint, an encoder that owes us nothing. It looks for the shortest symbol, ours switches
// subsets as it comes to a character; where that makes two symbols, both have to read as the text.
#include <gtest/gtest.h>
#include <zint.h>

#include <cstddef>
#include <initializer_list>
#include <iterator>
#include <memory>
#include <random>
#include <string>
#include <string_view>

#include "render/barcode.h"
#include "support/code128_reader.h"

namespace partnerkit::render {
namespace {

using testing::Code128Reader;

constexpr int kTexts = 500;
constexpr std::string_view kDigits = "0123456789", kCapitals = "ABCDEFGHIJKLMNOPQRSTUVWXYZ",
                           kSmall = "abcdefghijklmnopqrstuvwxyz";
// Without brackets, which mark the application identifiers for libzint.
constexpr std::string_view kPunctuation = " !\"#$%&'*+,-./:;<=>?@\\^_";

class Zint {
 public:
  std::string Pattern(int symbology, const std::string& text, int mode = DATA_MODE) {
    ZBarcode_Clear(symbol_.get());
    symbol_->symbology = symbology;
    symbol_->input_mode = mode;
    const int result = ZBarcode_Encode(symbol_.get(), reinterpret_cast<const unsigned char*>(text.data()),
                                       static_cast<int>(text.size()));
    if (result >= ZINT_ERROR) return "libzint: " + std::string(symbol_->errtxt);
    std::string pattern;
    for (int module = 0; module < symbol_->width; ++module) {
      pattern += static_cast<char>('0' + (symbol_->encoded_data[0][module / 8] >> module % 8 & 1));
    }
    return pattern;
  }

 private:
  std::unique_ptr<zint_symbol, void (*)(zint_symbol*)> symbol_{ZBarcode_Create(), ZBarcode_Delete};
};

std::string Join(std::initializer_list<std::string_view> parts) {
  std::string text;
  for (const std::string_view part : parts) text += part;
  return text;
}

std::string WithCheckDigit(const std::string& digits) {
  std::size_t sum = 0;
  for (std::size_t k = 0; k < digits.size(); ++k) {
    sum += kDigits.find(digits[k]) * ((digits.size() - k) % 2 == 1 ? 3 : 1);
  }
  return digits + kDigits[(10 - sum % 10) % 10];
}

class BarcodeZintTest : public ::testing::Test {
 protected:
  // Teaches the reader every symbol from texts that leave libzint no choice of subsets.
  BarcodeZintTest() {
    const auto learn = [this](const std::string& pattern, std::size_t symbol, int value) {
      reader_.Learn(std::string_view(pattern).substr(symbol * 11, 11), value);
    };
    for (int value = 0; value < 100; ++value) {
      const std::string pair = {static_cast<char>('0' + value / 10), static_cast<char>('0' + value % 10)};
      learn(zint_.Pattern(BARCODE_CODE128, "00" + pair), 2, value);
    }
    learn(zint_.Pattern(BARCODE_CODE128, "0000ab"), 3, 100);
    learn(zint_.Pattern(BARCODE_CODE128, "0000\x01\x02"), 3, 101);
    learn(zint_.Pattern(BARCODE_GS1_128, "[90]1234", GS1_MODE), 1, 102);
    learn(zint_.Pattern(BARCODE_CODE128, "\x01\x02"), 0, 103);
    learn(zint_.Pattern(BARCODE_CODE128, "ab"), 0, 104);
    learn(zint_.Pattern(BARCODE_CODE128, "0000"), 0, 105);
  }

  std::size_t Below(std::size_t limit) { return random_() % limit; }

  std::string Some(std::string_view characters, std::size_t count) {
    std::string text;
    while (text.size() < count) text += characters[Below(characters.size())];
    return text;
  }

  // Both have to read as the text; they have to be one where their subsets are. Tells whether they are.
  bool Agree(const std::string& ours, const std::string& theirs, const std::string& text) const {
    const Code128Reader::Reading ourReading = reader_.Read(ours), theirReading = reader_.Read(theirs);
    EXPECT_EQ(ourReading.text, text);
    EXPECT_EQ(theirReading.text, text) << theirs;
    if (ourReading.subsets == theirReading.subsets) {
      EXPECT_EQ(ours, theirs) << text;
    }
    return ours == theirs;
  }

  Zint zint_;
  Code128Reader reader_;
  std::mt19937 random_{128};
};

TEST_F(BarcodeZintTest, DrawsShippingContainersAsLibzintDoes) {
  for (int n = 0; n < kTexts; ++n) {
    const std::string number = WithCheckDigit(Some(kDigits, 17));
    EXPECT_EQ(BarPattern("~20100" + number), zint_.Pattern(BARCODE_GS1_128, "[00]" + number, GS1_MODE)) << number;
  }
}

TEST_F(BarcodeZintTest, DrawsDestinationsAsLibzintDoes) {
  for (int n = 0; n < kTexts; ++n) {
    const std::string postcode = Some(kDigits, 7), place = Some(kDigits, 4);
    // Unchecked, as not all numbers are those of a country.
    EXPECT_EQ(BarPattern(Join({"~201421", postcode, "~20190", place})),
              zint_.Pattern(BARCODE_GS1_128, Join({"[421]", postcode, "[90]", place}), GS1_MODE | GS1NOCHECK_MODE))
        << postcode << ' ' << place;
  }
}

TEST_F(BarcodeZintTest, DrawsTextsThatReadAsLibzintsDo) {
  const std::string letters = Join({kCapitals, kSmall});
  const struct {
    std::string_view first;
    std::string others;
    int equal;  // so many at least
  } cases[] = {
      {"", std::string(kCapitals), 500},
      {"", std::string(kDigits), 450},
      {"", Join({letters, kDigits}), 480},
      {"", Join({letters, kPunctuation, "()[]`{|}~"}), 500},
      {"", Join({kDigits, kDigits, letters, kPunctuation}), 480},
      {"4096", Join({letters, kDigits}), 480},
      {"4096", Join({letters, kDigits, kPunctuation, "\x01\x02\t\r\n\x1c"}), 20},
  };
  for (const auto& test : cases) {
    int equal = 0;
    for (int n = 0; n < kTexts; ++n) {
      const std::string text = std::string(test.first) + Some(test.others, 1 + Below(30));
      equal += Agree(BarPattern(text), zint_.Pattern(BARCODE_CODE128, text), text) ? 1 : 0;
    }
    EXPECT_GE(equal, test.equal) << test.first << test.others;
  }
}

TEST_F(BarcodeZintTest, DrawsElementStringsThatReadAsLibzintsDo) {
  // Of no fixed length, so that FNC1 stands behind each.
  constexpr std::string_view kIdentifiers[] = {"10", "21", "240", "400", "7002", "8002", "8200"};
  const std::string letters = Join({kCapitals, kSmall});
  const struct {
    std::string characters;
    std::size_t elements;  // so many at most
    int equal;             // so many at least
  } cases[] = {
      {std::string(kDigits), 1, 450},
      {std::string(kDigits), 3, 200},
      {letters, 1, 210},
      {Join({letters, kDigits}), 3, 90},
      {Join({letters, kDigits, kPunctuation}), 3, 15},
  };
  for (const auto& test : cases) {
    int equal = 0;
    for (int n = 0; n < kTexts; ++n) {
      std::string ours, theirs, text;
      for (std::size_t elements = 1 + Below(test.elements); elements > 0; --elements) {
        const std::string_view identifier = kIdentifiers[Below(std::size(kIdentifiers))];
        const std::string value = Some(test.characters, 1 + Below(12));
        ours += Join({"~201", identifier, value});
        theirs += Join({"[", identifier, "]", value});
        (text += Code128Reader::kFnc1) += Join({identifier, value});
      }
      equal +=
          Agree(BarPattern(ours), zint_.Pattern(BARCODE_GS1_128, theirs, GS1_MODE | GS1NOCHECK_MODE), text) ? 1 : 0;
    }
    EXPECT_GE(equal, test.equal) << test.characters;
  }
}

TEST_F(BarcodeZintTest, DrawsEan13AsLibzintDoes) {
  for (int n = 0; n < kTexts; ++n) {
    const char first = kDigits[static_cast<std::size_t>(n) % 10];
    const std::string number = WithCheckDigit(first + Some(kDigits, 11));
    EXPECT_EQ(BuildBarcode(number), zint_.Pattern(BARCODE_EANX, number)) << number;
  }
}

}  // namespace
}  // namespace partnerkit::render

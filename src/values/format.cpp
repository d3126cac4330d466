#include "values/format.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdlib>
#include <span>
#include <utility>
#include <variant>
#include <vector>

#include "values/dates.h"
#include "values/numbers.h"

namespace partnerkit {
namespace {

constexpr std::string_view kShortDate = "dd/mm/yyyy";
constexpr std::string_view kLongDate = "dddd, d mmmm yyyy";

constexpr std::array<std::string_view, 7> kDayNames = {"Sunday",   "Monday", "Tuesday", "Wednesday",
                                                       "Thursday", "Friday", "Saturday"};
constexpr std::array<std::string_view, 12> kMonthNames = {"January",   "February", "March",    "April",
                                                          "May",       "June",     "July",     "August",
                                                          "September", "October",  "November", "December"};
constexpr std::size_t kShortName = 3;

constexpr std::string_view kTextMarks = "@&<>!";
constexpr std::string_view kNumberMarks = "0#";
constexpr std::string_view kDateMarks = "ymdhns";

char Lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }
char Upper(char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; }

bool SameWord(std::string_view left, std::string_view right) {
  return std::ranges::equal(left, right, {}, Lower, Lower);
}

// --- Patterns
// ---------------------------------------------------------------------------------------------------------

// One character of a pattern, quotes and backslashes resolved: a literal stands for itself.
struct Mark {
  char value;
  bool literal;

  bool Is(char token) const { return !literal && value == token; }
  bool IsOneOf(std::string_view tokens) const { return !literal && tokens.find(value) != std::string_view::npos; }
};

using Marks = std::span<const Mark>;

enum class PatternKind { kLiteral, kText, kNumber, kDate };

class Pattern {
 public:
  explicit Pattern(std::string_view text) {
    if (SameWord(text, "Short Date")) text = kShortDate;
    if (SameWord(text, "Long Date")) text = kLongDate;
    Read(text);
    kind_ = Uses(kTextMarks)     ? PatternKind::kText
            : Uses(kNumberMarks) ? PatternKind::kNumber
            : Uses(kDateMarks)   ? PatternKind::kDate
                                 : PatternKind::kLiteral;
  }

  bool Is(PatternKind kind) const { return kind_ == kind; }
  bool Empty() const { return marks_.empty(); }
  Marks All() const { return marks_; }

  // The section of that number from 0; nothing when the pattern hasn't got it or leaves it empty.
  std::optional<Marks> Section(int number) const {
    auto begin = marks_.begin();
    const auto isEnd = [](const Mark& mark) { return mark.Is(';'); };
    for (; number > 0; --number) {
      begin = std::find_if(begin, marks_.end(), isEnd);
      if (begin == marks_.end()) return std::nullopt;
      ++begin;
    }
    const auto end = std::find_if(begin, marks_.end(), isEnd);
    if (begin == end) return std::nullopt;
    return Marks(begin, end);
  }

 private:
  void Read(std::string_view text) {
    marks_.reserve(text.size());
    bool quoted = false;
    for (std::size_t i = 0; i < text.size(); ++i) {
      if (text[i] == '"') {
        quoted = !quoted;
      } else if (text[i] == '\\' && !quoted && i + 1 < text.size()) {
        marks_.push_back({text[++i], true});
      } else {
        marks_.push_back({text[i], quoted});
      }
    }
  }

  bool Uses(std::string_view tokens) const {
    return std::ranges::any_of(marks_, [&](const Mark& mark) {
      return Mark{Lower(mark.value), mark.literal}.IsOneOf(tokens);
    });
  }

  std::vector<Mark> marks_;
  PatternKind kind_ = PatternKind::kLiteral;
};

// --- Numbers
// ----------------------------------------------------------------------------------------------------------

enum class NumberToken { kLiteral, kZero, kHash, kPoint, kComma, kExponent };

// A section of a number pattern, read: what each mark means, and the counts that the digits are laid out by.
struct NumberLayout {
  std::vector<NumberToken> tokens;
  int wholePlaces = 0;
  int fractionPlaces = 0;
  int zeroFraction = 0;    // places behind the point up to the last "0": printed even when nothing stands there
  int exponentPlaces = 0;  // 0 when there is no exponent
  std::size_t exponentEnd = 0;
  int shift = 0;  // power of ten asked for by "%" and by commas that divide
  bool grouped = false;
};

bool IsDigitMark(const Mark& mark) { return mark.IsOneOf(kNumberMarks); }

// Digits behind an "E+" or "E-" that stands at `at`; 0 when it is no exponent.
int ExponentPlaces(Marks section, std::size_t at) {
  if (!section[at].IsOneOf("Ee") || at + 1 == section.size() || !section[at + 1].IsOneOf("+-")) return 0;
  const Marks rest = section.subspan(at + 2);
  return static_cast<int>(std::ranges::find_if_not(rest, IsDigitMark) - rest.begin());
}

// A comma in front of the point: it groups when a digit of the whole part follows, otherwise it divides.
void ReadComma(Marks rest, NumberLayout& layout) {
  for (const Mark& mark : rest) {
    if (mark.Is('.')) break;
    if (IsDigitMark(mark)) {
      layout.grouped = true;
      return;
    }
  }
  layout.shift -= 3;
}

NumberLayout ReadNumberSection(Marks section) {
  NumberLayout layout;
  bool behindPoint = false;
  for (std::size_t i = 0; i < section.size(); ++i) {
    NumberToken token = NumberToken::kLiteral;
    if (IsDigitMark(section[i])) {
      const bool zero = section[i].value == '0';
      token = zero ? NumberToken::kZero : NumberToken::kHash;
      ++(behindPoint ? layout.fractionPlaces : layout.wholePlaces);
      if (zero && behindPoint) layout.zeroFraction = layout.fractionPlaces;
    } else if (section[i].Is('.') && !behindPoint) {
      token = NumberToken::kPoint;
      behindPoint = true;
    } else if (section[i].Is(',') && !behindPoint && layout.wholePlaces > 0) {
      token = NumberToken::kComma;
      ReadComma(section.subspan(i + 1), layout);
    } else if (section[i].Is('%')) {
      layout.shift += 2;
    } else if (const int places = ExponentPlaces(section, i); places > 0 && layout.exponentPlaces == 0) {
      token = NumberToken::kExponent;
      layout.exponentPlaces = places;
      layout.exponentEnd = i + 2 + static_cast<std::size_t>(places);
      layout.tokens.resize(layout.exponentEnd - 1, NumberToken::kExponent);
      i = layout.exponentEnd - 1;
    }
    layout.tokens.push_back(token);
  }
  return layout;
}

// Writes the digits of one number into the places of one section.
class NumberWriter {
 public:
  NumberWriter(Decimal value, Marks section)
      : section_(section), layout_(ReadNumberSection(section)), value_(std::move(value)) {
    if (!value_.IsZero()) value_.point += layout_.shift;
    if (layout_.exponentPlaces > 0) {
      const int places = layout_.wholePlaces + layout_.fractionPlaces;
      value_ = Rounded(std::move(value_), places - value_.point, Half::kAwayFromZero);
      if (!value_.IsZero()) exponent_ = std::exchange(value_.point, layout_.wholePlaces) - layout_.wholePlaces;
    } else {
      value_ = Rounded(std::move(value_), layout_.fractionPlaces, Half::kAwayFromZero);
    }
    wholeDigits_ = std::max(0, value_.point);
    fractionDigits_ = std::max(layout_.zeroFraction, static_cast<int>(value_.digits.size()) - value_.point);
  }

  std::string Write(bool withSign) {
    if (withSign && value_.negative) out_ += '-';
    int wholePlace = layout_.wholePlaces;
    int fractionPlace = 0;
    bool behindPoint = false;
    for (std::size_t i = 0; i < section_.size(); ++i) {
      switch (layout_.tokens[i]) {
        case NumberToken::kZero:
        case NumberToken::kHash:
          if (behindPoint) {
            if (++fractionPlace <= fractionDigits_) out_ += DigitAt(-fractionPlace);
          } else {
            WriteWholePlace(--wholePlace, layout_.tokens[i] == NumberToken::kZero);
          }
          break;
        case NumberToken::kPoint:
          if (layout_.wholePlaces == 0) WriteExcess();
          out_ += '.';
          behindPoint = true;
          break;
        case NumberToken::kComma:
          break;
        case NumberToken::kExponent:
          WriteExponent(section_[i].value, section_[i + 1].value == '+');
          i = layout_.exponentEnd - 1;
          break;
        case NumberToken::kLiteral:
          out_ += section_[i].value;
          break;
      }
    }
    return std::move(out_);
  }

 private:
  // The digit of ten to the power of `power`.
  char DigitAt(int power) const {
    const int index = value_.point - 1 - power;
    const bool held = index >= 0 && index < static_cast<int>(value_.digits.size());
    return held ? value_.digits[static_cast<std::size_t>(index)] : '0';
  }

  void WriteWholeDigit(int power) {
    out_ += DigitAt(power);
    if (layout_.grouped && power > 0 && power % 3 == 0) out_ += ',';
    started_ = true;
  }

  // The whole digits that have no place of their own; they stand in front of the first one.
  void WriteExcess() {
    for (int power = wholeDigits_ - 1; power >= layout_.wholePlaces; --power) WriteWholeDigit(power);
  }

  void WriteWholePlace(int power, bool zero) {
    if (power == layout_.wholePlaces - 1) WriteExcess();
    if (zero || started_ || power < wholeDigits_) WriteWholeDigit(power);
  }

  void WriteExponent(char letter, bool alwaysSigned) {
    out_ += letter;
    if (exponent_ < 0 || alwaysSigned) out_ += exponent_ < 0 ? '-' : '+';
    const std::string digits = std::to_string(std::abs(exponent_));
    const auto places = static_cast<std::size_t>(layout_.exponentPlaces);
    if (digits.size() < places) out_.append(places - digits.size(), '0');
    out_ += digits;
  }

  Marks section_;
  NumberLayout layout_;
  Decimal value_;
  std::string out_;
  int exponent_ = 0;
  int wholeDigits_ = 0;
  int fractionDigits_ = 0;
  bool started_ = false;
};

std::string FormatNumber(const Decimal& value, const Pattern& pattern) {
  const int wanted = value.IsZero() ? 2 : value.negative ? 1 : 0;
  if (wanted > 0) {
    if (const std::optional<Marks> own = pattern.Section(wanted)) return NumberWriter(value, *own).Write(false);
  }
  return NumberWriter(value, pattern.Section(0).value_or(Marks())).Write(true);
}

// --- Dates
// ------------------------------------------------------------------------------------------------------------

void AppendPadded(std::string& out, int number, std::size_t width) {
  const std::string digits = std::to_string(number);
  if (digits.size() < width) out.append(width - digits.size(), '0');
  out += digits;
}

class DateWriter {
 public:
  DateWriter(DateTime date, Marks marks) : date_(date), marks_(marks) {
    for (std::size_t i = 0; i < marks_.size(); ++i) twelveHours_ = twelveHours_ || HalfDayLength(i) > 0;
  }

  std::string Write() {
    for (std::size_t i = 0; i < marks_.size();) {
      if (const std::size_t length = HalfDayLength(i); length > 0) {
        WriteHalfDay(i, length);
        i += length;
      } else {
        const std::size_t width = RunLength(i);
        WriteRun(i, width);
        i += width;
      }
    }
    return std::move(out_);
  }

 private:
  // "AM/PM" or "A/P" at that place: its length, otherwise 0.
  std::size_t HalfDayLength(std::size_t at) const {
    for (const std::string_view word : {std::string_view("am/pm"), std::string_view("a/p")}) {
      if (marks_.size() - at < word.size()) continue;
      const auto same = [](char c, const Mark& mark) { return !mark.literal && Lower(mark.value) == c; };
      if (std::ranges::equal(word, marks_.subspan(at, word.size()), same)) return word.size();
    }
    return 0;
  }

  // The letters are those of the pattern, so that "am/pm" gives small ones.
  void WriteHalfDay(std::size_t at, std::size_t length) {
    const std::size_t half = length / 2;
    const std::size_t from = date_.Hour() < 12 ? at : at + half + 1;
    for (const Mark& mark : marks_.subspan(from, half)) out_ += mark.value;
  }

  // How many of the same letter, in either case, make one token.
  std::size_t RunLength(std::size_t at) const {
    const char letter = Lower(marks_[at].value);
    const std::size_t longest = letter == 'y' || letter == 'm' || letter == 'd' ? 4 : 2;
    std::size_t length = 1;
    while (length < longest && at + length < marks_.size() && !marks_[at + length].literal &&
           Lower(marks_[at + length].value) == letter) {
      ++length;
    }
    return marks_[at].literal ? 1 : length;
  }

  void WriteRun(std::size_t at, std::size_t width) {
    const char letter = marks_[at].literal ? '\0' : Lower(marks_[at].value);
    switch (letter) {
      case 'y':
        WriteYear(width);
        break;
      case 'm':
        WriteMonthOrMinute(width);
        break;
      case 'd':
        WriteDay(width);
        break;
      case 'h':
        AppendPadded(out_, ShownHour(), width);
        break;
      case 'n':
        AppendPadded(out_, date_.Minute(), width);
        break;
      case 's':
        AppendPadded(out_, date_.Second(), width);
        break;
      default:
        for (const Mark& mark : marks_.subspan(at, width)) out_ += mark.value;
        return;  // what stands between hour and minute changes nothing: "hh:mm"
    }
    behindHour_ = letter == 'h';
  }

  void WriteYear(std::size_t width) {
    if (width == 1) {
      AppendPadded(out_, date_.DayOfYear(), 1);
    } else if (width == 2) {
      AppendPadded(out_, date_.Year() % 100, 2);
    } else {
      AppendPadded(out_, date_.Year(), 4);
    }
  }

  void WriteMonthOrMinute(std::size_t width) {
    if (width > 2) {
      WriteName(kMonthNames[static_cast<std::size_t>(date_.Month() - 1)], width);
    } else {
      AppendPadded(out_, behindHour_ ? date_.Minute() : date_.Month(), width);
    }
  }

  void WriteDay(std::size_t width) {
    if (width > 2) {
      WriteName(kDayNames[static_cast<std::size_t>(date_.Weekday())], width);
    } else {
      AppendPadded(out_, date_.Day(), width);
    }
  }

  void WriteName(std::string_view name, std::size_t width) { out_ += width == 3 ? name.substr(0, kShortName) : name; }

  int ShownHour() const {
    if (!twelveHours_) return date_.Hour();
    const int hour = date_.Hour() % 12;
    return hour == 0 ? 12 : hour;
  }

  DateTime date_;
  Marks marks_;
  std::string out_;
  bool twelveHours_ = false;
  bool behindHour_ = false;
};

std::string PlainText(DateTime date) {
  return Format(date, date.HasTime() ? std::string_view("dd/mm/yyyy hh:nn:ss") : kShortDate);
}

// --- Texts
// ------------------------------------------------------------------------------------------------------------

std::string FormatText(std::string_view text, const Pattern& pattern) {
  const std::optional<Marks> forEmpty = text.empty() ? pattern.Section(1) : std::nullopt;
  const Marks section = forEmpty ? *forEmpty : pattern.Section(0).value_or(Marks());
  const auto uses = [&](char token) {
    return std::ranges::any_of(section, [&](const Mark& m) { return m.Is(token); });
  };
  const auto isPlace = [](const Mark& mark) { return mark.IsOneOf("@&"); };
  const auto places = static_cast<std::size_t>(std::ranges::count_if(section, isPlace));
  const bool fromLeft = uses('!'), upper = uses('>'), lower = uses('<');
  const std::size_t blanks = !fromLeft && text.size() < places ? places - text.size() : 0;

  std::string out;
  const auto take = [&](std::size_t count) {
    for (const char c : text.substr(0, count)) out += upper ? Upper(c) : lower ? Lower(c) : c;
    text.remove_prefix(count);
  };
  const std::size_t excess = text.size() > places ? text.size() - places : 0;
  std::size_t place = 0;
  for (const Mark& mark : section) {
    if (isPlace(mark)) {
      if (place == 0 && !fromLeft) take(excess);
      if (place >= blanks && !text.empty()) {
        take(1);
      } else if (mark.value == '@') {
        out += ' ';
      }
      if (++place == places && fromLeft) take(excess);
    } else if (!mark.IsOneOf(kTextMarks)) {
      out += mark.value;
    }
  }
  if (places == 0) take(excess);
  return out;
}

}  // namespace

std::string Format(double value, std::string_view pattern) {
  const Pattern read(pattern);
  if (read.Is(PatternKind::kText)) return FormatText(NumberText(value), read);
  if (read.Is(PatternKind::kDate) || read.Empty()) return NumberText(value);
  return FormatNumber(DecimalOf(value), read);
}

std::string Format(std::string_view text, std::string_view pattern) {
  const Pattern read(pattern);
  if (read.Is(PatternKind::kText)) return FormatText(text, read);
  if (read.Is(PatternKind::kNumber)) {
    if (const std::optional<Decimal> number = DecimalOf(text)) return FormatNumber(*number, read);
  }
  if (read.Is(PatternKind::kDate)) {
    if (const std::optional<DateTime> date = ShownDate(text)) return DateWriter(*date, read.All()).Write();
  }
  return std::string(text);
}

std::string Format(DateTime date, std::string_view pattern) {
  const Pattern read(pattern);
  if (read.Is(PatternKind::kText)) return FormatText(PlainText(date), read);
  if (read.Is(PatternKind::kNumber) || read.Empty()) return PlainText(date);
  return DateWriter(date, read.All()).Write();
}

std::string FormatCell(const Cell& cell, std::string_view pattern) {
  if (const auto* number = std::get_if<double>(&cell)) return Format(*number, pattern);
  if (const auto* text = std::get_if<std::string>(&cell)) return Format(std::string_view(*text), pattern);
  if (const auto* date = std::get_if<DateTime>(&cell)) return Format(*date, pattern);
  if (const auto* truth = std::get_if<bool>(&cell)) return Format(std::string_view(*truth ? "True" : "False"), pattern);
  return {};
}

}  // namespace partnerkit

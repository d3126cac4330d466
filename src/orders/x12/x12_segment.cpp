#include "orders/x12/x12_segment.h"

#include <algorithm>

#include "partnerkit/run_time_error.h"
#include "values/dates.h"
#include "values/delimited.h"

namespace partnerkit::orders {

namespace {

// Of the segment's text, in a message.
constexpr std::size_t kShown = 60;

std::string_view UpToTerminator(std::string_view text) { return text.substr(0, text.find('~')); }

}  // namespace

void X12Segment::Take(const Segment& segment) {
  text_ = segment.text;
  begin_ = segment.begin;
  end_ = segment.end;
  length_ = segment.length;
  overlong_ = segment.Overlong();
  indexed_ = false;
}

void X12Segment::TakeLine(const Segment& segment) {
  Take(segment);
  if (text_.find('\'') == std::string_view::npos) return;
  withoutApostrophes_.assign(text_);
  std::erase(withoutApostrophes_, '\'');
  text_ = withoutApostrophes_;
}

// Most segments are passed over, so the index waits to be asked for.
const Elements& X12Segment::Index() const {
  NeedWhole();
  if (!indexed_) elements_.Take(text_);
  indexed_ = true;
  return elements_;
}

void X12Segment::NeedWhole() const {
  if (!overlong_) return;
  throw RunTimeError(run_time::kOverflow, "The segment " + std::string(text_.substr(0, kShown)) + "... at byte " +
                                              std::to_string(begin_) + " is too long to be read");
}

std::string_view X12Segment::From(int n) const {
  const std::int16_t position = PosBegSplat(n);
  if (position == 0) {
    throw RunTimeError(run_time::kInvalidCall, "The segment " + std::string(text_.substr(0, kShown)) + " at byte " +
                                                   std::to_string(begin_) + " has no element " + std::to_string(n));
  }
  return text_.substr(static_cast<std::size_t>(position) - 1);
}

std::string_view X12Segment::Inner(int n) const {
  return From(n).substr(0, static_cast<std::size_t>(std::max<std::int16_t>(PosEndSplat(n), 0)));
}

std::string_view X12Segment::Last(int n) const { return TrimBlanks(UpToTerminator(From(n))); }

std::string_view X12Segment::Span(int n, int width) const {
  return TrimBlanks(UpToTerminator(From(n).substr(0, static_cast<std::size_t>(width))));
}

std::string_view X12Segment::Read(int n, ElementForm form) const {
  if (form.kind == ElementForm::kInner) return Inner(n);
  return form.kind == ElementForm::kLast ? Last(n) : Span(n, form.width);
}

std::optional<DateTime> X12Segment::Date(int n) const { return SixDigitDate(From(n)); }

std::string_view X12Segment::Fixed(std::size_t position, std::size_t length) const {
  return position > text_.size() ? std::string_view() : text_.substr(position - 1, length);
}

std::optional<DateTime> X12Segment::FixedDate(std::size_t position) const { return SixDigitDate(Fixed(position, 6)); }

std::string_view X12Segment::Rest(std::size_t position) const {
  NeedWhole();
  return TrimBlanks(UpToTerminator(Fixed(position, std::string_view::npos)));
}

std::optional<DateTime> SixDigitDate(std::string_view text) {
  if (text.size() < 6) return std::nullopt;
  return DateFromParts(text.substr(0, 2), text.substr(2, 2), text.substr(4, 2));
}

}  // namespace partnerkit::orders

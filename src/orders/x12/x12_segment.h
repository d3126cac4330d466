// A segment of an X12 file in hand, and how the order readers get at its elements.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "edi/elements.h"
#include "edi/segment_reader.h"
#include "partnerkit/values.h"

namespace partnerkit::orders {

// How an element is read. The partners' files have settled it element by element: a last element cannot be read as an
// inner one, and a reader that takes the rest of the segment takes what a partner adds behind it, too.
struct ElementForm {
  enum Kind { kInner, kLast, kSpan } kind = kInner;
  int width = 0;  // of a span, in characters
};

class X12Segment {
 public:
  void Take(const Segment& segment);
  // The same of a line that is a segment: apostrophes are no part of it.
  void TakeLine(const Segment& segment);
  // One apostrophe at the end is no part of it.
  void CutApostrophe() {
    if (text_.ends_with('\'')) text_.remove_suffix(1);
  }

  // Without its terminator; empty for a bare one.
  std::string_view Text() const { return text_; }
  bool Begins(std::string_view tag) const { return text_.starts_with(tag); }
  std::uint64_t Begin() const { return begin_; }  // byte positions in the file
  std::uint64_t End() const { return end_; }
  // `Text` is only its front, of so many bytes.
  bool Overlong() const { return overlong_; }
  std::uint64_t Length() const { return length_; }

  // Where element n starts, and how long it is; see Elements.
  std::int16_t PosBegSplat(int n) const { return Index().PosBeg(n); }
  std::int16_t PosEndSplat(int n) const { return Index().PosEnd(n); }
  std::int16_t SplatCount() const { return Index().Count(); }

  // All raise error 5 where the segment has no element n, with its text and place.
  std::string_view Inner(int n) const;            // as it stands; empty when it is the last one
  std::string_view Last(int n) const;             // the rest of the segment, blanks cut
  std::string_view Span(int n, int width) const;  // at most so many characters of the rest, blanks cut
  std::string_view Read(int n, ElementForm form) const;
  // Three two-digit numbers: year, month, day.
  std::optional<DateTime> Date(int n) const;

  // The characters at a position, counted from 1, whatever the separators say; fewer beyond the end.
  std::string_view Fixed(std::size_t position, std::size_t length) const;
  std::optional<DateTime> FixedDate(std::size_t position) const;
  // From that position to the terminator, blanks cut. Raises error 6 for an overlong segment.
  std::string_view Rest(std::size_t position) const;

 private:
  const Elements& Index() const;
  void NeedWhole() const;
  // The text from element n on.
  std::string_view From(int n) const;

  std::string_view text_;
  std::string withoutApostrophes_;
  std::uint64_t begin_ = 1;
  std::uint64_t end_ = 1;
  std::uint64_t length_ = 0;
  bool overlong_ = false;
  mutable bool indexed_ = false;
  mutable Elements elements_{'*'};
};

// The three two-digit numbers at the text's front.
std::optional<DateTime> SixDigitDate(std::string_view text);

}  // namespace partnerkit::orders

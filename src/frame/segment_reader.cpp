#include "frame/segment_reader.h"

#include <algorithm>
#include <cstring>
#include <span>

namespace partnerkit {

namespace {

// What is kept of an overlong segment: enough to tell what it is.
constexpr std::size_t kFront = 256;

bool IsLineEnd(char c) { return c == '\r' || c == '\n'; }

}  // namespace

SegmentReader::SegmentReader(InputFile& file, const SegmentSyntax& syntax, std::size_t block)
    : file_(file), syntax_(syntax), buffer_(block) {
  for (const char end : {'\r', '\n', syntax.terminator, syntax.otherEnd}) {
    if (end != '\0') ends_.push_back({end});
  }
}

void SegmentReader::Seek(std::uint64_t position) {
  ForgetEnds();
  const std::uint64_t offset = position - 1;
  if (offset >= base_ && offset <= base_ + filled_) {
    begin_ = static_cast<std::size_t>(offset - base_);
  } else {
    base_ = offset;
    begin_ = filled_ = 0;
  }
}

Segment SegmentReader::Read() {
  if (!SkipLineEnds()) return Give(filled_);
  for (std::size_t from = begin_;;) {
    std::size_t end = FindEnd(from);
    // The LF of a CR LF may lie in the next block.
    if (syntax_.wholeLines && end + 1 == filled_) {
      const std::size_t length = end - begin_;
      Fill();
      end = begin_ + length;
    }
    if (end < filled_) return Give(end);
    const std::size_t searched = filled_ - begin_;
    if (searched >= kLongestText) return GiveOverlong();
    if (!Fill()) return Give(filled_);
    from = begin_ + searched;
  }
}

// False at the end of the file.
bool SegmentReader::SkipLineEnds() {
  do {
    while (begin_ < filled_ && IsLineEnd(buffer_[begin_])) ++begin_;
    if (begin_ < filled_) return true;
  } while (Fill());
  return false;
}

// The next byte that ends a segment, or `filled_`. What was found is remembered: in a file of one line, the line ends
// would otherwise be searched for to the end of the buffer for every segment.
std::size_t SegmentReader::FindEnd(std::size_t from) {
  std::size_t first = filled_;
  for (End& end : ends_) {
    if (!end.known || end.next < from) {
      const void* const at = from < filled_ ? std::memchr(buffer_.data() + from, end.byte, filled_ - from) : nullptr;
      end.next = at ? static_cast<std::size_t>(static_cast<const char*>(at) - buffer_.data()) : filled_;
      end.known = true;
    }
    first = std::min(first, end.next);
  }
  return first;
}

void SegmentReader::ForgetEnds() {
  for (End& end : ends_) end.known = false;
}

// Brings more of the file into the buffer, which grows when one segment fills it. False at the end of the file. What
// the buffer held may have moved to its front either way.
bool SegmentReader::Fill() {
  if (begin_ > 0) {
    std::memmove(buffer_.data(), buffer_.data() + begin_, filled_ - begin_);
    base_ += begin_;
    filled_ -= begin_;
    begin_ = 0;
  } else if (filled_ == buffer_.size()) {
    buffer_.resize(buffer_.size() * 2);
  }
  ForgetEnds();
  const std::size_t read = file_.ReadAt(base_ + filled_, std::span(buffer_).subspan(filled_));
  filled_ += read;
  return read > 0;
}

// The segment from `begin_` to the byte at `end` that ends it, which is `filled_` at the end of the file.
Segment SegmentReader::Give(std::size_t end) {
  Segment segment;
  segment.begin = Position();
  segment.text = {buffer_.data() + begin_, end - begin_};
  segment.terminated = end < filled_ && buffer_[end] == syntax_.terminator;
  if (!segment.terminated && segment.text.find_first_not_of(' ') == std::string_view::npos) segment.text = {};
  segment.length = segment.text.size();
  GoBehind(end);
  segment.end = Position();
  return segment;
}

void SegmentReader::GoBehind(std::size_t end) {
  const bool pair = syntax_.wholeLines && end + 1 < filled_ && buffer_[end] == '\r' && buffer_[end + 1] == '\n';
  begin_ = std::min(end + (pair ? 2 : 1), filled_);
}

// Reads over the rest of it in place.
Segment SegmentReader::GiveOverlong() {
  Segment segment;
  segment.begin = Position();
  front_.assign(buffer_.begin() + static_cast<std::ptrdiff_t>(begin_),
                buffer_.begin() + static_cast<std::ptrdiff_t>(begin_ + kFront));
  std::size_t end = filled_;
  try {
    do {
      begin_ = filled_;
    } while (Fill() && (end = FindEnd(0)) == filled_);
  } catch (const RunTimeError&) {
    Seek(segment.begin);
    throw;
  }
  end = std::min(end, filled_);
  segment.text = {front_.data(), front_.size()};
  segment.length = base_ + end + 1 - segment.begin;
  segment.terminated = end < filled_ && buffer_[end] == syntax_.terminator;
  GoBehind(end);
  segment.end = Position();
  return segment;
}

}  // namespace partnerkit

#include "edi/segment_reader.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <span>

#include "files/ctrl_z.h"

namespace partnerkit {

namespace {

// What is kept of an overlong segment: enough to tell what it is.
constexpr std::size_t kFront = 256;

constexpr std::uint64_t kOnes = 0x0101010101010101;

constexpr std::uint64_t Repeated(char c) { return kOnes * static_cast<unsigned char>(c); }

// The high bit of each byte below `limit`, which is at most 128. Bytes behind the first such may be marked wrongly.
constexpr std::uint64_t Below(std::uint64_t bytes, unsigned limit) {
  return (bytes - kOnes * limit) & ~bytes & (kOnes * 0x80);
}

bool IsBetweenSegments(char c) { return c == '\r' || c == '\n' || c == kCtrlZ; }

}  // namespace

SegmentReader::SegmentReader(InputFile& file, const SegmentSyntax& syntax, std::size_t block)
    : file_(file), syntax_(syntax), buffer_(block) {
  for (const char end : {'\r', '\n', syntax.terminator, syntax.otherEnd}) {
    if (end != '\0') ends_[static_cast<unsigned char>(end)] = true;
  }
}

void SegmentReader::Seek(std::uint64_t position) {
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
    while (begin_ < filled_ && IsBetweenSegments(buffer_[begin_])) ++begin_;
    if (begin_ < filled_) return true;
  } while (Fill());
  return false;
}

// The next byte that ends a segment, or `filled_`. Eight bytes are looked at together: of those that are a terminator,
// the other end or some control character, the first is found by its bit, and then asked whether it ends one.
std::size_t SegmentReader::FindEnd(std::size_t from) const {
  const char* const bytes = buffer_.data();
  if constexpr (std::endian::native == std::endian::little) {
    const std::uint64_t terminator = Repeated(syntax_.terminator), other = Repeated(syntax_.otherEnd);
    while (from + sizeof(std::uint64_t) <= filled_) {
      std::uint64_t eight;
      std::memcpy(&eight, bytes + from, sizeof eight);
      const std::uint64_t found = Below(eight, '\r' + 1) | Below(eight ^ terminator, 1) | Below(eight ^ other, 1);
      if (found == 0) {
        from += sizeof eight;
        continue;
      }
      from += static_cast<std::size_t>(std::countr_zero(found)) / 8;
      if (ends_[static_cast<unsigned char>(bytes[from])]) return from;
      ++from;
    }
  }
  while (from < filled_ && !ends_[static_cast<unsigned char>(bytes[from])]) ++from;
  return from;
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
  const std::size_t read = file_.ReadAt(base_ + filled_, std::span(buffer_).subspan(filled_));
  filled_ += read;
  return read > 0;
}

// The segment from `begin_` to the byte at `end` that ends it, which is `filled_` at the end of the file.
Segment SegmentReader::Give(std::size_t end) {
  Segment segment;
  segment.begin = Position();
  segment.text = {buffer_.data() + begin_, end - begin_};
  segment.ended = end < filled_;
  segment.terminated = segment.ended && buffer_[end] == syntax_.terminator;
  while (!segment.ended && segment.text.ends_with(kCtrlZ)) segment.text.remove_suffix(1);
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
  segment.ended = end < filled_;
  segment.terminated = segment.ended && buffer_[end] == syntax_.terminator;
  GoBehind(end);
  segment.end = Position();
  return segment;
}

}  // namespace partnerkit

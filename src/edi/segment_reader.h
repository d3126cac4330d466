// Reads the segments of a held file in large blocks, each with its byte positions: one reader for every syntax.
#pragma once

#include <array>
#include <cstdint>
#include <string_view>
#include <vector>

#include "partnerkit/ports.h"

namespace partnerkit {

// What ends a segment. Line ends always do, and Ctrl-Z, with which old systems end a file; they belong to none. Blank
// lines and the second half of a CR LF are passed over in front of a segment.
struct SegmentSyntax {
  char terminator = '~';    // ends a segment and belongs to it; NUL when lines alone end segments
  char otherEnd = '\0';     // ends a segment too, and belongs to none; NUL when there is no such character
  bool wholeLines = false;  // a segment takes the whole line end behind it along, so that the next read begins a line
};

struct Segment {
  std::string_view text;     // without terminator and line ends; empty for a bare terminator and at the end of the file
  std::uint64_t begin = 1;   // byte position, from 1, of the first byte behind line ends
  std::uint64_t end = 1;     // where the next read begins: just behind what ended the segment
  std::uint64_t length = 0;  // in bytes, more than `text` has when the segment is overlong
  bool terminated = false;   // it has its terminator
  bool ended = false;        // that, or a line end; else the file ends in it, and it may be half a segment

  // `text` holds the front of it only. Such a segment can be passed over and copied, not read.
  bool Overlong() const { return length > text.size(); }
};

class SegmentReader {
 public:
  // No partner's segment comes near it; longer ones are unterminated rubbish, which must not fill the memory.
  static constexpr std::size_t kLongestText = 1024 * 1024;

  SegmentReader(InputFile& file, const SegmentSyntax& syntax, std::size_t block = 256 * 1024);

  // The next read begins at this byte position, from 1.
  void Seek(std::uint64_t position);
  // Where the next read begins.
  std::uint64_t Position() const { return base_ + begin_ + 1; }
  // Nothing is left to read, not even line ends. Raises RunTimeError.
  bool AtEnd() { return begin_ == filled_ && !Fill(); }
  // The next segment; an empty one at the end of the file, and for a line of blanks. The view stays valid until the
  // next call. Raises RunTimeError, the position then unchanged.
  Segment Read();

 private:
  bool SkipLineEnds();
  std::size_t FindEnd(std::size_t from) const;
  void GoBehind(std::size_t end);
  bool Fill();
  Segment Give(std::size_t end);
  Segment GiveOverlong();

  InputFile& file_;
  SegmentSyntax syntax_;
  std::array<bool, 256> ends_{};
  std::vector<char> buffer_;
  std::uint64_t base_ = 0;   // file offset of the buffer's first byte
  std::size_t begin_ = 0;    // of the next segment in the buffer
  std::size_t filled_ = 0;   // bytes in the buffer
  std::vector<char> front_;  // of an overlong segment
};

}  // namespace partnerkit

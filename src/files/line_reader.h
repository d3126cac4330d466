// Reads the lines of a held file in large blocks, each with its byte position.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "partnerkit/ports.h"

namespace partnerkit {

struct Line {
  std::uint64_t position = 1;  // of the first byte, counted from 1
  std::string_view text;       // without its line end
  std::string_view raw;        // with it, as it stands in the file
  bool ended = true;           // false for a last line without an end, which may be an upload that isn't finished

  // Where the next line begins.
  std::uint64_t End() const { return position + raw.size(); }
};

// A line that is longer than any may be.
class LineTooLong : public RunTimeError {
 public:
  using RunTimeError::RunTimeError;
};

// A line ends at LF, CR LF or a lone CR, so that files from every system read alike; the last one may have no end.
// Ctrl-Z, with which old systems end a file, is no part of any line: at the file's end it is left unread, and one that
// a file was appended to behind is passed over with the line that it stands in front of.
class LineReader {
 public:
  // No partner's line comes near it; a longer one is no text, and must not fill the memory.
  static constexpr std::size_t kLongestLine = 64 * 1024 * 1024;

  explicit LineReader(InputFile& file, std::size_t block = 256 * 1024) : file_(file), buffer_(block) {}

  // The next read begins at this byte position, from 1.
  void Seek(std::uint64_t position);
  // Where the next read begins.
  std::uint64_t Position() const { return base_ + begin_ + 1; }
  // False at the end of the file, as long as it doesn't grow. The views stay valid until the next Read or Seek. Raises
  // RunTimeError, the position then unchanged; LineTooLong for a line beyond the longest.
  bool Read(Line& line);

 private:
  std::size_t FindEnd();
  bool Fill();
  bool GiveLast(Line& line);
  bool Give(Line& line, std::size_t length, std::size_t end);

  InputFile& file_;
  std::vector<char> buffer_;
  std::uint64_t base_ = 0;  // file offset of the buffer's first byte
  std::size_t begin_ = 0;   // of the next line in the buffer
  std::size_t filled_ = 0;  // bytes in the buffer
  std::size_t feed_ = 0;    // the next LF at or behind `begin_`, or `filled_` when the buffer holds none
  bool feedKnown_ = false;
};

}  // namespace partnerkit

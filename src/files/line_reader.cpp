#include "files/line_reader.h"

#include <algorithm>
#include <cstring>
#include <span>
#include <string>

#include "files/ctrl_z.h"

namespace partnerkit {

void LineReader::Seek(std::uint64_t position) {
  const std::uint64_t offset = position - 1;
  if (offset >= base_ && offset <= base_ + filled_) {
    begin_ = static_cast<std::size_t>(offset - base_);
  } else {
    base_ = offset;
    begin_ = filled_ = 0;
  }
  feedKnown_ = false;
}

bool LineReader::Read(Line& line) {
  for (;;) {
    const std::size_t end = FindEnd();
    if (end == filled_) {
      if (Fill()) continue;
      return GiveLast(line);
    }
    if (buffer_[end] == '\n') return Give(line, end - begin_, end + 1);
    // A CR: the LF of a CR LF pair may lie in the next block.
    if (end + 1 == filled_) {
      if (Fill()) continue;
      return Give(line, filled_ - 1 - begin_, filled_);
    }
    return Give(line, end - begin_, end + (buffer_[end + 1] == '\n' ? 2 : 1));
  }
}

// The first CR or LF at or behind `begin_`. The LF found is remembered, for a file of lone CRs would otherwise be
// searched to the end of the buffer for every line.
std::size_t LineReader::FindEnd() {
  if (!feedKnown_ || feed_ < begin_) {
    const void* at = filled_ > begin_ ? std::memchr(buffer_.data() + begin_, '\n', filled_ - begin_) : nullptr;
    feed_ = at ? static_cast<std::size_t>(static_cast<const char*>(at) - buffer_.data()) : filled_;
    feedKnown_ = true;
  }
  const void* at = feed_ > begin_ ? std::memchr(buffer_.data() + begin_, '\r', feed_ - begin_) : nullptr;
  return at ? static_cast<std::size_t>(static_cast<const char*>(at) - buffer_.data()) : feed_;
}

// Brings more of the file into the buffer, which grows when one line fills it. False at the end of the file. What the
// buffer held may have moved to its front either way.
bool LineReader::Fill() {
  if (begin_ > 0) {
    std::memmove(buffer_.data(), buffer_.data() + begin_, filled_ - begin_);
    base_ += begin_;
    filled_ -= begin_;
    begin_ = 0;
  } else if (filled_ == buffer_.size()) {
    if (filled_ >= kLongestLine) {
      throw LineTooLong(run_time::kOverflow,
                        "The line at byte " + std::to_string(Position()) + " is longer than 64 MB");
    }
    buffer_.resize(buffer_.size() * 2);
  }
  feedKnown_ = false;
  const std::size_t read = file_.ReadAt(base_ + filled_, std::span(buffer_).subspan(filled_));
  filled_ += read;
  return read > 0;
}

// What stands behind the last line end. False when that is nothing, or nothing but Ctrl-Z.
bool LineReader::GiveLast(Line& line) {
  std::size_t end = filled_;
  while (end > begin_ && buffer_[end - 1] == kCtrlZ) --end;
  if (end == begin_) return false;
  const bool ended = end < filled_;
  Give(line, end - begin_, end);
  line.ended = ended;
  return true;
}

bool LineReader::Give(Line& line, std::size_t length, std::size_t end) {
  line.position = Position();
  line.text = {buffer_.data() + begin_, length};
  line.raw = {buffer_.data() + begin_, end - begin_};
  line.ended = true;
  if (line.text.starts_with(kCtrlZ)) line.text.remove_prefix(std::min(line.text.find_first_not_of(kCtrlZ), length));
  begin_ = end;
  return true;
}

}  // namespace partnerkit

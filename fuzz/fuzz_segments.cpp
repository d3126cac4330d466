// The input is a file of segments. However it is cut into blocks, the reader must give what a reader gives that takes
// one character at a time, and the elements of each segment what n searches for a separator find.
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "edi/elements.h"
#include "edi/segment_reader.h"

namespace {

using namespace partnerkit;

void Check(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "does not hold: %s\n", what);
  std::abort();
}

class Bytes : public InputFile {
 public:
  explicit Bytes(std::string_view bytes) : bytes_(bytes) {}
  std::size_t ReadAt(std::uint64_t offset, std::span<char> into) override {
    if (offset >= bytes_.size()) return 0;
    return bytes_.copy(into.data(), into.size(), static_cast<std::size_t>(offset));
  }
  std::uint64_t Length() override { return bytes_.size(); }
  bool StillNamed(const std::string&) override { return true; }
  std::string Identity() override { return "1"; }

 private:
  std::string_view bytes_;
};

struct Slow {
  std::string text;
  std::size_t end = 0;
  bool terminated = false;
};

// One character at a time, from `at`.
Slow ReadSlowly(std::string_view bytes, std::size_t at, const SegmentSyntax& syntax) {
  Slow slow;
  bool ended = false;
  while (at < bytes.size()) {
    const char c = bytes[at++];
    if (c == '\x1A' && slow.text.empty()) continue;
    if (c == '\r' || c == '\n') {
      if (slow.text.empty()) continue;
      ended = true;
      if (syntax.wholeLines && c == '\r' && at < bytes.size() && bytes[at] == '\n') ++at;
      break;
    }
    slow.terminated = syntax.terminator != '\0' && c == syntax.terminator;
    ended = slow.terminated || (syntax.otherEnd != '\0' && c == syntax.otherEnd);
    if (ended) break;
    slow.text += c;
  }
  while (!ended && slow.text.ends_with('\x1A')) slow.text.pop_back();  // Ctrl-Z ends a file
  if (!slow.terminated && slow.text.find_first_not_of(' ') == std::string::npos) slow.text.clear();
  slow.end = at;
  return slow;
}

std::vector<Slow> CheckReader(std::string_view bytes, const SegmentSyntax& syntax, std::size_t block) {
  std::vector<Slow> segments;
  Bytes file(bytes);
  SegmentReader reader(file, syntax, block);
  std::size_t at = 0;
  while (!reader.AtEnd()) {
    const Slow wanted = ReadSlowly(bytes, at, syntax);
    const Segment given = reader.Read();
    Check(given.text == wanted.text, "the text");
    Check(given.terminated == wanted.terminated, "the terminator");
    Check(given.end == wanted.end + 1 && reader.Position() == given.end, "the position behind");
    Check(given.begin >= at + 1 && given.begin <= given.end, "the position in front");
    at = wanted.end;
    segments.push_back(wanted);
  }
  Check(at == bytes.size(), "the end of the file");
  return segments;
}

// The contract in its own words, one search after the other.
int SlowPosition(std::string_view segment, int searches) {
  std::size_t position = 0;
  for (int search = 0; search < searches; ++search) {
    const std::size_t found = segment.find('*', position);
    position = found == std::string_view::npos ? 0 : found + 1;
  }
  return static_cast<int>(position);
}

void CheckElements(std::string_view segment) {
  if (segment.size() > 32'000) return;
  Elements elements('*');
  elements.Take(segment);
  for (int n = 1; n < 24; ++n) {
    const int begin = SlowPosition(segment, n), behind = SlowPosition(segment, n + 1);
    const int first = begin == 0 ? 0 : begin + 1;
    Check(elements.PosBeg(n) == first, "where an element begins");
    Check(elements.PosEnd(n) == (behind == 0 ? 0 : behind - first), "how long an element is");
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view bytes(reinterpret_cast<const char*>(data), size);
  const SegmentSyntax syntaxes[] = {{'~', '\0', false}, {'~', '\'', false}, {'\'', '\0', false}, {'\0', '\0', true}};
  for (const SegmentSyntax& syntax : syntaxes) {
    for (const std::size_t block : std::initializer_list<std::size_t>{1, 2, 7, 4096}) {
      for (const Slow& segment : CheckReader(bytes, syntax, block)) {
        if (block == 4096) CheckElements(segment.text);
      }
    }
  }
  return 0;
}

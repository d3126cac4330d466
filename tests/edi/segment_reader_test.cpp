#include "edi/segment_reader.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>

namespace partnerkit {
namespace {

using namespace std::string_literals;

// A file that is not on any disk: a front, so many "x", and a tail.
struct MadeFile : InputFile {
  explicit MadeFile(std::string first, std::uint64_t fill = 0, std::string last = {})
      : front(std::move(first)), filling(fill), tail(std::move(last)) {}

  std::size_t ReadAt(std::uint64_t offset, std::span<char> into) override {
    largest = std::max(largest, into.size());
    if (offset >= failsFrom) {
      failsFrom = Length();
      throw RunTimeError(run_time::kDeviceError, "It failed");
    }
    std::size_t read = 0;
    for (; read < into.size() && offset + read < Length(); ++read) into[read] = At(offset + read);
    return read;
  }
  std::uint64_t Length() override { return front.size() + filling + tail.size(); }
  bool StillNamed(const std::string&) override { return true; }
  std::string Identity() override { return {}; }

  char At(std::uint64_t offset) const {
    if (offset < front.size()) return front[offset];
    offset -= front.size();
    return offset < filling ? 'x' : tail[offset - filling];
  }

  std::string front;
  std::uint64_t filling;
  std::string tail;
  std::uint64_t failsFrom = UINT64_MAX;  // once
  std::size_t largest = 0;               // buffer handed in
};

constexpr SegmentSyntax kTilde;
constexpr SegmentSyntax kOrApostrophe{.otherEnd = '\''};
constexpr SegmentSyntax kWholeLines{.terminator = '\0', .wholeLines = true};

// "begin:text" of each segment that is left, "~" behind a terminated one.
std::vector<std::string> Segments(SegmentReader& reader) {
  std::vector<std::string> segments;
  while (!reader.AtEnd()) {
    const Segment segment = reader.Read();
    EXPECT_EQ(segment.end, reader.Position());
    EXPECT_FALSE(segment.Overlong());
    segments.push_back(std::to_string(segment.begin) + ":" + std::string(segment.text) +
                       (segment.terminated ? "~" : ""));
  }
  return segments;
}

TEST(SegmentReaderTest, EndsSegmentsAlikeWhereverABlockEnds) {
  const struct {
    SegmentSyntax syntax;
    std::string bytes;
    std::vector<std::string> segments;
  } cases[] = {
      // clang-format off
      {kTilde, "", {}},
      {kTilde, "ST*850", {"1:ST*850"}},
      // Line ends behind the last segment are one more, empty one.
      {kTilde, "ST~\r\nBEG~\r\n", {"1:ST~", "6:BEG~", "12:"}},
      {kTilde, "ST\r\nBEG\rN1\nCTT", {"1:ST", "5:BEG", "9:N1", "12:CTT"}},
      {kTilde, "\r\n\n\r\nST~\r\r\n\nBEG\r\n\r\n", {"6:ST~", "13:BEG", "20:"}},
      {kTilde, "  ~ ~~", {"1:  ~", "4: ~", "6:~"}},
      {kTilde, "N1*O'X'~\0*1~"s, {"1:N1*O'X'~", "9:\0*1~"s}},
      {kOrApostrophe, "N1*ST*X'N2~''CTT'", {"1:N1*ST*X", "9:N2~", "12:", "13:", "14:CTT"}},
      {kWholeLines, "ST~'\r\nBEG\r\rN1\n\nCTT\r\n", {"1:ST~'", "7:BEG", "12:N1", "16:CTT"}},
      {kWholeLines, "\r\n   \r\nCTT", {"3:", "8:CTT"}},
      // Ctrl-Z ends a file, and whatever is appended to it; within a segment it is a character.
      {kTilde, "ST*1\x1A" "0~\r\n\x1A" "BEG~\x1A", {"1:ST*1\x1A" "0~", "11:BEG~", "16:"}},
      {kTilde, "\x1AST~IEA*1\x1A\x1A", {"2:ST~", "5:IEA*1"}},
      // clang-format on
  };
  for (const auto& c : cases) {
    for (const std::size_t block : std::initializer_list<std::size_t>{1, 2, 3, 5, 8, 4096}) {
      SCOPED_TRACE(::testing::PrintToString(c.bytes) + " in blocks of " + std::to_string(block));
      MadeFile file(c.bytes);
      SegmentReader reader(file, c.syntax, block);
      EXPECT_EQ(Segments(reader), c.segments);
    }
  }
}

TEST(SegmentReaderTest, ReadsAgainFromAnyPosition) {
  MadeFile file("ISA~\r\nGS~ST~");
  SegmentReader reader(file, kTilde, 4);
  Segments(reader);
  const struct {
    std::uint64_t position;
    std::vector<std::string> segments;
  } cases[] = {
      {10, {"10:ST~"}}, {1, {"1:ISA~", "7:GS~", "10:ST~"}}, {5, {"7:GS~", "10:ST~"}}, {8, {"8:S~", "10:ST~"}}, {13, {}},
      {99, {}},
  };
  for (const auto& c : cases) {
    reader.Seek(c.position);
    EXPECT_EQ(reader.Position(), c.position);
    EXPECT_EQ(Segments(reader), c.segments) << "from " << c.position;
  }
}

TEST(SegmentReaderTest, PassesOverASegmentThatIsTooLongToHold) {
  constexpr std::uint64_t kFilling = 16 * 1024 * 1024;
  const std::string front = "ISA~N1*" + std::string(253, 'y');
  for (const auto& [syntax, end, terminated] :
       {std::tuple(kTilde, "~CTT~"s, true), std::tuple(kTilde, "\r\nCTT~"s, false),
        std::tuple(kWholeLines, ""s, false)}) {
    MadeFile file(front, kFilling, end);
    SegmentReader reader(file, syntax);
    reader.Seek(5);
    const Segment segment = reader.Read();
    EXPECT_TRUE(segment.Overlong());
    EXPECT_EQ(segment.text, front.substr(4));
    EXPECT_EQ(segment.begin, 5U);
    EXPECT_EQ(segment.terminated, terminated);
    EXPECT_EQ(segment.end, front.size() + kFilling + (end.empty() ? 1 : 2));
    EXPECT_LE(file.largest, 2 * SegmentReader::kLongestText);
    if (end.empty()) {
      EXPECT_TRUE(reader.AtEnd());
    } else {
      EXPECT_EQ(reader.Read().text, "CTT");
    }
  }
}

TEST(SegmentReaderTest, HoldsAnyOtherSegmentWhole) {
  MadeFile file("ISA~", SegmentReader::kLongestText - 1, "~CTT~");
  SegmentReader reader(file, kTilde);
  reader.Read();
  const Segment segment = reader.Read();
  EXPECT_FALSE(segment.Overlong());
  EXPECT_EQ(segment.text.size(), SegmentReader::kLongestText - 1);
  EXPECT_EQ(segment.length, SegmentReader::kLongestText - 1);
  EXPECT_EQ(reader.Read().text, "CTT");
}

TEST(SegmentReaderTest, StaysWhereItWasWhenReadingFails) {
  const struct { std::uint64_t filling, failsFrom; } cases[] = {{0, 8}, {3'000'000, 8}, {3'000'000, 2'000'000}};
  for (const auto& c : cases) {
    MadeFile file("ISA~GS*PO", c.filling, "~ST~");
    SegmentReader reader(file, kTilde, 8);
    reader.Read();
    file.failsFrom = c.failsFrom;
    EXPECT_THROW(reader.Read(), RunTimeError);
    EXPECT_EQ(reader.Position(), 5U);
    const Segment again = reader.Read();
    EXPECT_TRUE(again.text.starts_with("GS*PO"));
    EXPECT_EQ(again.end, 11U + c.filling);
    EXPECT_EQ(reader.Read().text, "ST");
  }
}

}  // namespace
}  // namespace partnerkit

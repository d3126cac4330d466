#include "files/line_reader.h"

#include <gtest/gtest.h>

#include "platform/posix_files.h"
#include "support/faulty_files.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

using namespace std::string_literals;

class LineReaderTest : public ::testing::Test {
 protected:
  InputFile& File(const std::string& bytes) {
    file_.reset();
    folder_.Write("lines.txt", bytes);
    file_ = faulty_.OpenInput(folder_ / "lines.txt", Share::kExclusive);
    return *file_;
  }

  testing::TempFolder folder_;
  platform::PosixFiles files_;
  testing::FaultyFiles faulty_{files_};
  std::unique_ptr<InputFile> file_;
};

// "position:text" of each line.
std::vector<std::string> Lines(LineReader& reader, std::string* raw = nullptr) {
  std::vector<std::string> lines;
  for (Line line; reader.Read(line);) {
    lines.push_back(std::to_string(line.position) + ":" + std::string(line.text));
    EXPECT_EQ(line.End(), reader.Position());
    if (raw) *raw += line.raw;
  }
  return lines;
}

TEST_F(LineReaderTest, EndsLinesAlikeWhereverABlockEnds) {
  const struct {
    std::string bytes;
    std::vector<std::string> lines;
  } cases[] = {
      {"", {}},
      {"a\r\n", {"1:a"}},
      {"ab\ncd\nef", {"1:ab", "4:cd", "7:ef"}},
      {"ab\rcd\ref", {"1:ab", "4:cd", "7:ef"}},
      {"\r\r\n\n", {"1:", "2:", "4:"}},
      {"a\r\n\r\nb\rc\n", {"1:a", "4:", "6:b", "8:c"}},
      {"a\0b\n\0\n"s, {"1:a\0b"s, "5:\0"s}},
      {"twelve bytes\r\nand more than that\r\n", {"1:twelve bytes", "15:and more than that"}},
  };
  for (const auto& c : cases) {
    for (const std::size_t block : std::initializer_list<std::size_t>{1, 2, 3, 5, 13, 14, 4096}) {
      SCOPED_TRACE(::testing::PrintToString(c.bytes) + " in blocks of " + std::to_string(block));
      LineReader reader(File(c.bytes), block);
      std::string raw;
      EXPECT_EQ(Lines(reader, &raw), c.lines);
      EXPECT_EQ(raw, c.bytes);
    }
  }
}

TEST_F(LineReaderTest, ReadsAgainFromAnyPosition) {
  LineReader reader(File("one\r\ntwo\r\nthree\r\n"), 4);
  Lines(reader);
  const struct {
    std::uint64_t position;
    std::vector<std::string> lines;
  } cases[] = {
      {6, {"6:two", "11:three"}},       {11, {"11:three"}}, {100, {}}, {7, {"7:wo", "11:three"}},
      {5, {"5:", "6:two", "11:three"}},
  };
  for (const auto& c : cases) {
    reader.Seek(c.position);
    EXPECT_EQ(reader.Position(), c.position);
    EXPECT_EQ(Lines(reader), c.lines) << "from " << c.position;
  }
}

TEST_F(LineReaderTest, ReadsALineLargerThanEveryBlock) {
  std::string large = "a\n";
  large.resize(10'000'002, 'x');
  LineReader reader(File(large + "\r\nb\n"));
  std::vector<std::pair<std::uint64_t, std::size_t>> lines;
  for (Line line; reader.Read(line);) lines.emplace_back(line.position, line.text.size());
  EXPECT_EQ(lines, (std::vector<std::pair<std::uint64_t, std::size_t>>{{1, 1}, {3, 10'000'000}, {10'000'005, 1}}));
}

TEST_F(LineReaderTest, EndsAtCtrlZAndKnowsALineWithoutAnEnd) {
  const struct {
    std::string bytes, lines;
    std::uint64_t position;
  } cases[] = {
      {"a\nb", "a b?", 4},
      {"a\nb\x1A", "a b", 4},
      {"a\nb\r\n\x1A\x1A", "a b", 6},
      {"a\x1A\n\x1A"
       "b\n",
       "a\x1A b", 7},
      {"\x1A", "", 1},
  };
  for (const auto& c : cases) {
    for (const std::size_t block : {1, 3, 100}) {
      LineReader reader(File(c.bytes), block);
      std::string lines;
      for (Line line; reader.Read(line);) {
        lines.append(lines.empty() ? "" : " ").append(line.text).append(line.ended ? "" : "?");
      }
      EXPECT_EQ(lines, c.lines);
      EXPECT_EQ(reader.Position(), c.position);
    }
  }
}

// Takes minutes when each line is searched for beyond its own end.
TEST_F(LineReaderTest, ReadsAFileOfLoneCarriageReturnsInOnePass) {
  std::string bytes;
  for (int n = 0; n < 1'000'000; ++n) bytes += "ab\r";
  LineReader reader(File(bytes));
  int count = 0;
  for (Line line; reader.Read(line);) count += line.text == "ab";
  EXPECT_EQ(count, 1'000'000);
}

TEST_F(LineReaderTest, StaysWhereItWasWhenReadingFails) {
  LineReader reader(File("one\ntwo\nthree"), 4);
  Line line;
  ASSERT_TRUE(reader.Read(line));
  faulty_.Fail("Read", "lines.txt", 57);
  EXPECT_THROW(reader.Read(line), RunTimeError);
  EXPECT_EQ(reader.Position(), 5U);
  EXPECT_EQ(Lines(reader), (std::vector<std::string>{"5:two", "9:three"}));
}

}  // namespace
}  // namespace partnerkit

#include "frame/work_queue.h"

#include "frame/line_reader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/posix_files.h"
#include "support/error_of.h"
#include "support/faulty_files.h"
#include "support/other_program.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

TEST(TemporaryNameTest, TakesTheLastExtensionsPlace) {
  EXPECT_EQ(TemporaryName("orders.2004.txt"), "orders.2004.tmp");
  EXPECT_EQ(TemporaryName("/in.box/orders"), "/in.box/orders.tmp");
  EXPECT_EQ(TemporaryName("c:\\in.box\\orders"), "c:\\in.box\\orders.tmp");
  EXPECT_EQ(TemporaryName("orders.tmp"), "orders.tmp.tmp");
}

using testing::ErrorOf;
using ::testing::StartsWith;

class WorkQueueTest : public ::testing::Test {
 protected:
  void Open(const std::string& bytes) {
    folder_.Write("orders.txt", bytes);
    queue_.Open(folder_ / "orders.txt");
  }
  // Keeps the lines that don't begin with "-", and what `finish` does is done before the rewrite is let go.
  void Deal(const std::function<void(WorkQueue::Rewrite&)>& finish) {
    WorkQueue::Rewrite rewrite(queue_);
    rewrite.Begin();
    LineReader lines(queue_.File());
    for (Line line; lines.Read(line);) {
      if (!line.text.starts_with("-")) rewrite.Keep(line.raw);
    }
    rewrite.Finish();
    finish(rewrite);
  }

  testing::TempFolder folder_;
  platform::PosixFiles posix_;
  testing::FaultyFiles files_{posix_};
  WorkQueue queue_{files_};
};

TEST_F(WorkQueueTest, KeepsWhatStaysByteForByte) {
  folder_.Write("orders.tmp", "left by a run that died");
  Open("a \r\n-b\n\nc\r-d\r\n\"e,f");
  Deal([](WorkQueue::Rewrite&) {});
  EXPECT_EQ(folder_.Read("orders.txt"), "a \r\n-b\n\nc\r-d\r\n\"e,f");
  EXPECT_FALSE(folder_.Has("orders.tmp"));
  Deal([](WorkQueue::Rewrite& rewrite) {
    rewrite.Claim();
    rewrite.Replace();
  });
  EXPECT_EQ(folder_.Read("orders.txt"), "a \r\n\nc\r\"e,f");
  EXPECT_FALSE(folder_.Has("orders.tmp"));
  Deal([](WorkQueue::Rewrite& rewrite) {
    EXPECT_THAT(ErrorOf([&] { rewrite.Claim(); }), StartsWith("53 ")) << "another file took the name";
  });
  EXPECT_EQ(folder_.Read("orders.txt.kept"), "a \r\n\nc\r\"e,f");
}

TEST_F(WorkQueueTest, KeepsRangesAndRemovesAFinishedFile) {
  for (const bool withTemporary : {true, false}) {
    Open("a~b~" + std::string(300'000, 'c') + "~d");
    WorkQueue::Rewrite rewrite(queue_);
    rewrite.Begin();
    rewrite.KeepRange({3, 300'006});
    rewrite.KeepRange({1, 1});
    EXPECT_THAT(ErrorOf([&] { rewrite.KeepRange({300'006, 300'008}); }), StartsWith("62 "));
    rewrite.Claim();
    rewrite.Remove(withTemporary);
    EXPECT_FALSE(folder_.Has("orders.txt"));
    EXPECT_EQ(folder_.Has("orders.tmp"), !withTemporary);
    EXPECT_EQ(folder_.Read("orders.tmp"), withTemporary ? "" : "b~" + std::string(300'000, 'c') + "~d");
    queue_.Close();
  }
}

// What is appended in these tests: the lines "-b" and "-d" of "a\r\n-b\r\nc\r\n-d".
class BackupFileTest : public WorkQueueTest {
 protected:
  static constexpr const char* kWhole = "old\r\n-b\r\n-d\r\n";

  void Append(BackupFile& backup) {
    folder_.Write("backup.txt", "old\r\n");
    backup.Open(folder_ / "backup.txt");
    Open("a\r\n-b\r\nc\r\n-d");
    backup.Append(queue_.File(), queue_.Path(), {{4, 8}, {11, 13}});
  }
  std::string Reopen() {
    queue_.Close();
    return ErrorOf([&] { BackupFile(files_).Open(folder_ / "backup.txt"); });
  }
  // A run that died with the lines appended, or half of them, and the note still there.
  void DieAppending(std::size_t written) {
    {
      BackupFile backup(files_);
      Append(backup);
    }
    queue_.Close();
    std::filesystem::resize_file(folder_ / "backup.txt", 5 + written);
    ASSERT_TRUE(folder_.Has("backup.txt.pending"));
  }
};

TEST_F(BackupFileTest, AppendsWholeLinesAndDropsItsNoteOnceSettled) {
  BackupFile backup(files_);
  Append(backup);
  EXPECT_TRUE(folder_.Has("backup.txt.pending"));
  backup.Settle();
  EXPECT_FALSE(folder_.Has("backup.txt.pending"));
  EXPECT_EQ(folder_.Read("backup.txt"), kWhole);
  EXPECT_THAT(Reopen(), StartsWith("70 "));
  backup.Close();
  EXPECT_EQ(Reopen(), "");
  EXPECT_EQ(folder_.Read("backup.txt"), kWhole);
}

TEST_F(BackupFileTest, FinishesWhatARunThatDiedHadNoted) {
  const auto replaced = [this] {
    folder_.Write("new.txt", "a\r\nc\r\n");
    std::filesystem::rename(folder_ / "new.txt", folder_ / "orders.txt");
  };
  const auto gone = [this] { std::filesystem::remove(folder_ / "orders.txt"); };
  const auto same = [] {};
  const auto torn = [this](std::string_view note) {
    return [this, note] { folder_.Write("backup.txt.pending", note); };
  };
  const struct {
    std::string_view what;
    std::size_t written;
    std::function<void()> meanwhile;
    std::string backup;
  } cases[] = {
      {"nothing appended", 0, same, kWhole},
      {"a line and a half", 5, same, kWhole},
      {"replaced, whole", 8, replaced, kWhole},
      {"replaced, torn", 5, replaced, "old\r\n"},
      {"gone, whole", 8, gone, kWhole},
      {"gone, torn", 2, gone, "old\r\n"},
      {"a note of nothing", 0, torn(""), "old\r\n"},
      {"a note that ends early", 0, torn("partnerkit backup 1\n5\norders.txt\n"), "old\r\n"},
      {"a note of something else", 0, torn("dear diary\n"), "old\r\n"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    DieAppending(c.written);
    c.meanwhile();
    EXPECT_EQ(Reopen(), "");
    EXPECT_EQ(folder_.Read("backup.txt"), c.backup);
    EXPECT_FALSE(folder_.Has("backup.txt.pending"));
  }
}

TEST_F(BackupFileTest, KeepsItsNoteWhileTheOrderFileIsHeld) {
  DieAppending(3);
  {
    const testing::OtherProgram other(folder_ / "orders.txt");
    EXPECT_THAT(Reopen(), StartsWith("70 "));
    EXPECT_TRUE(folder_.Has("backup.txt.pending"));
  }
  EXPECT_EQ(Reopen(), "");
  EXPECT_EQ(folder_.Read("backup.txt"), kWhole);
}

TEST_F(BackupFileTest, CutsBackWhatTheDiskHadNoRoomFor) {
  BackupFile backup(files_);
  files_.Fail("Write", "backup.txt", 61, 1, 1);
  EXPECT_THAT(ErrorOf([&] { Append(backup); }), StartsWith("61 "));
  backup.Close();
  EXPECT_EQ(folder_.Read("backup.txt"), "old\r\n");
  EXPECT_EQ(Reopen(), "");
  EXPECT_EQ(folder_.Read("backup.txt"), kWhole);
}

}  // namespace
}  // namespace partnerkit

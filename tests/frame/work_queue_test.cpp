#include "frame/work_queue.h"

#include "frame/line_reader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "platform/posix_files.h"
#include "support/faulty_files.h"
#include "support/other_program.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

TEST(TemporaryNameTest, TakesTheLastExtensionsPlace) {
  const struct {
    std::string path, temporary;
  } cases[] = {
      {"orders.2004.txt", "orders.2004.tmp"},
      {"orders", "orders.tmp"},
      {"/in/orders.txt", "/in/orders.tmp"},
      {"/in.box/orders", "/in.box/orders.tmp"},
      {"c:\\in.box\\orders", "c:\\in.box\\orders.tmp"},
      {"orders.", "orders.tmp"},
      {"orders.tmp", "orders.tmp.tmp"},
  };
  for (const auto& c : cases) EXPECT_EQ(TemporaryName(c.path), c.temporary) << c.path;
}

class WorkQueueTest : public ::testing::Test {
 protected:
  static std::int32_t NumberRaised(const std::function<void()>& call) {
    try {
      call();
    } catch (const RunTimeError& error) {
      return error.Number();
    }
    return 0;
  }

  void Open(const std::string& bytes) {
    folder_.Write("orders.txt", bytes);
    queue_.Open(folder_ / "orders.txt");
  }
  // Keeps the lines that don't begin with "-".
  void Deal(WorkQueue::Rewrite& rewrite) {
    rewrite.Begin();
    LineReader lines(queue_.File());
    for (Line line; lines.Read(line);) {
      if (!line.text.starts_with("-")) rewrite.Keep(line.raw);
    }
    rewrite.Finish();
  }

  testing::TempFolder folder_;
  platform::PosixFiles posix_;
  testing::FaultyFiles files_{posix_};
  WorkQueue queue_{files_};
};

TEST_F(WorkQueueTest, KeepsWhatStaysByteForByte) {
  folder_.Write("orders.tmp", "left by a run that died");
  Open("a \r\n-b\n\nc\r-d\r\n\"e,f");
  {
    WorkQueue::Rewrite rewrite(queue_);
    Deal(rewrite);
    rewrite.Claim();
    rewrite.Replace();
  }
  EXPECT_EQ(folder_.Read("orders.txt"), "a \r\n\nc\r\"e,f");
  EXPECT_FALSE(folder_.Has("orders.tmp"));
}

TEST_F(WorkQueueTest, GivesUpARewriteWithoutATrace) {
  Open("a\n-b\n");
  {
    WorkQueue::Rewrite rewrite(queue_);
    Deal(rewrite);
  }
  EXPECT_EQ(folder_.Read("orders.txt"), "a\n-b\n");
  EXPECT_FALSE(folder_.Has("orders.tmp"));
}

TEST_F(WorkQueueTest, LeavesAFileThatTookTheOrderFilesPlace) {
  Open("a\n-b\n");
  folder_.Write("new.txt", "c\n");
  {
    WorkQueue::Rewrite rewrite(queue_);
    Deal(rewrite);
    std::filesystem::rename(folder_ / "new.txt", folder_ / "orders.txt");
    EXPECT_EQ(NumberRaised([&] { rewrite.Claim(); }), 53);
  }
  EXPECT_EQ(folder_.Read("orders.txt"), "c\n");
  EXPECT_EQ(folder_.Read("orders.txt.kept"), "a\n");
}

TEST_F(WorkQueueTest, KeepsRangesAndRemovesAFinishedFile) {
  for (const bool withTemporary : {true, false}) {
    Open("a~b~" + std::string(300'000, 'c') + "~d");
    WorkQueue::Rewrite rewrite(queue_);
    rewrite.Begin();
    rewrite.KeepRange({3, 300'006});
    rewrite.KeepRange({1, 1});
    EXPECT_EQ(NumberRaised([&] { rewrite.KeepRange({300'006, 300'008}); }), 62);
    rewrite.Claim();
    rewrite.Remove(withTemporary);
    EXPECT_FALSE(folder_.Has("orders.txt"));
    EXPECT_EQ(folder_.Has("orders.tmp"), !withTemporary);
    EXPECT_EQ(folder_.Read("orders.tmp"), withTemporary ? "" : "b~" + std::string(300'000, 'c') + "~d");
    queue_.Close();
  }
}

TEST_F(WorkQueueTest, IsHeldAgainstOtherPrograms) {
  folder_.Write("orders.txt", "a\n");
  {
    const testing::OtherProgram other(folder_ / "orders.txt");
    EXPECT_EQ(NumberRaised([&] { queue_.Open(folder_ / "orders.txt"); }), 70);
    EXPECT_FALSE(queue_.IsOpen());
  }
  queue_.Open(folder_ / "orders.txt");
  EXPECT_EQ(NumberRaised([&] { WorkQueue(files_).Open(folder_ / "orders.txt"); }), 70);
  queue_.Close();
  EXPECT_EQ(NumberRaised([&] { queue_.File(); }), 52);
}

// What is appended in these tests: the lines "-b" and "-d" of "a\r\n-b\r\nc\r\n-d".
class BackupFileTest : public WorkQueueTest {
 protected:
  void Append(BackupFile& backup) {
    Open("a\r\n-b\r\nc\r\n-d");
    backup.Append(queue_.File(), queue_.Path(), {{4, 8}, {11, 13}});
  }
  std::int32_t Reopen() {
    queue_.Close();
    return NumberRaised([&] { BackupFile(files_).Open(folder_ / "backup.txt"); });
  }
  // A run that died with the lines appended, or half of them, and the note still there.
  void DieAppending(std::size_t written) {
    folder_.Write("backup.txt", "old\r\n");
    {
      BackupFile backup(files_);
      backup.Open(folder_ / "backup.txt");
      Append(backup);
    }
    queue_.Close();
    std::filesystem::resize_file(folder_ / "backup.txt", 5 + written);
    ASSERT_TRUE(folder_.Has("backup.txt.pending"));
  }
};

TEST_F(BackupFileTest, AppendsWholeLinesAndDropsItsNoteOnceSettled) {
  folder_.Write("backup.txt", "old\r\n");
  BackupFile backup(files_);
  backup.Open(folder_ / "backup.txt");
  Append(backup);
  EXPECT_TRUE(folder_.Has("backup.txt.pending"));
  backup.Settle();
  EXPECT_FALSE(folder_.Has("backup.txt.pending"));
  EXPECT_EQ(folder_.Read("backup.txt"), "old\r\n-b\r\n-d\r\n");
  EXPECT_EQ(NumberRaised([&] { BackupFile(files_).Open(folder_ / "backup.txt"); }), 70);
  backup.Close();
  EXPECT_EQ(Reopen(), 0);
  EXPECT_EQ(folder_.Read("backup.txt"), "old\r\n-b\r\n-d\r\n");
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
      {"nothing appended", 0, same, "old\r\n-b\r\n-d\r\n"},
      {"a line and a half", 5, same, "old\r\n-b\r\n-d\r\n"},
      {"all appended", 8, same, "old\r\n-b\r\n-d\r\n"},
      {"replaced, whole", 8, replaced, "old\r\n-b\r\n-d\r\n"},
      {"replaced, torn", 5, replaced, "old\r\n"},
      {"gone, whole", 8, gone, "old\r\n-b\r\n-d\r\n"},
      {"gone, torn", 2, gone, "old\r\n"},
      {"a note of nothing", 0, torn(""), "old\r\n"},
      {"a note that ends early", 0, torn("partnerkit backup 1\n5\norders.txt\n"), "old\r\n"},
      {"a note of something else", 0, torn("dear diary\n"), "old\r\n"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    DieAppending(c.written);
    c.meanwhile();
    EXPECT_EQ(Reopen(), 0);
    EXPECT_EQ(folder_.Read("backup.txt"), c.backup);
    EXPECT_FALSE(folder_.Has("backup.txt.pending"));
    EXPECT_EQ(Reopen(), 0);
    EXPECT_EQ(folder_.Read("backup.txt"), c.backup);
  }
}

TEST_F(BackupFileTest, KeepsItsNoteWhileTheOrderFileIsHeld) {
  DieAppending(3);
  {
    const testing::OtherProgram other(folder_ / "orders.txt");
    EXPECT_EQ(Reopen(), 70);
    EXPECT_TRUE(folder_.Has("backup.txt.pending"));
  }
  EXPECT_EQ(Reopen(), 0);
  EXPECT_EQ(folder_.Read("backup.txt"), "old\r\n-b\r\n-d\r\n");
}

TEST_F(BackupFileTest, CutsBackWhatTheDiskHadNoRoomFor) {
  folder_.Write("backup.txt", "old\r\n");
  BackupFile backup(files_);
  backup.Open(folder_ / "backup.txt");
  files_.Fail("Write", "backup.txt", 61, 1, 1);
  EXPECT_EQ(NumberRaised([&] { Append(backup); }), 61);
  backup.Close();
  EXPECT_EQ(folder_.Read("backup.txt"), "old\r\n");
  EXPECT_EQ(Reopen(), 0);
  EXPECT_EQ(folder_.Read("backup.txt"), "old\r\n-b\r\n-d\r\n");
}

}  // namespace
}  // namespace partnerkit

#include "files/work_queue.h"

#include "files/line_reader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>

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

using ::testing::ElementsAre;
using testing::ErrorOf;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using ::testing::StartsWith;

class WorkQueueTest : public ::testing::Test {
 protected:
  void Open(const std::string& bytes) {
    folder_.Write("orders.txt", bytes);
    queue_.Open(folder_ / "orders.txt");
  }
  // Keeps the lines that don't begin with "-", and what `finish` does is done before the rewrite is let go.
  void Deal(const std::function<void(WorkQueue::Rewrite&)>& finish) {
    WorkQueue::Rewrite rewrite(queue_, Tell());
    rewrite.Begin();
    LineReader lines(queue_.File());
    for (Line line; lines.Read(line);) {
      if (!line.text.starts_with("-")) rewrite.Keep(line.raw);
    }
    rewrite.Finish(queue_.File().Length());
    finish(rewrite);
  }

  WorkQueue::Rewrite::Tell Tell() {
    return [this](const std::string& sentence) { told_.push_back(sentence); };
  }
  // The names in the folder, each with what the file holds: "orders.txt=a".
  std::vector<std::string> Files() {
    std::vector<std::string> all;
    for (const auto& entry : std::filesystem::directory_iterator(folder_ / "")) {
      const std::string name = entry.path().filename();
      all.push_back(name + (entry.is_symlink() ? "->" : "=") + folder_.Read(name));
    }
    std::ranges::sort(all);
    return all;
  }

  std::vector<std::string> told_;
  testing::TempFolder folder_;
  platform::PosixFiles posix_;
  testing::FaultyFiles files_{posix_};
  WorkQueue queue_{files_};
};

const auto kReplace = [](WorkQueue::Rewrite& rewrite) {
  rewrite.Claim();
  rewrite.Replace();
};

TEST_F(WorkQueueTest, KeepsWhatStaysByteForByte) {
  Open("a \r\n-b\n\nc\r-d\r\n\"e,f");
  Deal([](WorkQueue::Rewrite&) {});
  EXPECT_THAT(Files(), ElementsAre("orders.txt=a \r\n-b\n\nc\r-d\r\n\"e,f"));
  Deal(kReplace);
  EXPECT_THAT(Files(), ElementsAre("orders.txt=a \r\n\nc\r\"e,f"));
  for (const char* const kept : {"orders.txt.kept", "orders.txt.kept.1"}) {
    Deal([](WorkQueue::Rewrite& rewrite) {
      EXPECT_THAT(ErrorOf([&] { rewrite.Claim(); }), StartsWith("53 ")) << "another file took the name";
    });
    EXPECT_EQ(folder_.Read(kept), "a \r\n\nc\r\"e,f");
  }
  EXPECT_THAT(told_, IsEmpty());
}

// The temporary name is somebody else's until the order file cannot be replaced.
TEST_F(WorkQueueTest, MovesFilesOfOthersAsideAndDeletesNone) {
  const struct {
    std::string what, temporary;
    bool fails;
    std::vector<std::string> files;
    std::size_t told;
  } cases[] = {
      {"none", "", false, {"orders.tmp=", "orders.txt=a\n"}, 0},
      {"an upload", "half of", false, {"orders.tmp.1=half of", "orders.txt=a\n"}, 1},
      {"envelopes of nothing",
       "ISA*0~GS*PO~\r\n\r\nST*850~ ~",
       false,
       {"orders.tmp=ISA*0~GS*PO~\r\n\r\nST*850~ ~", "orders.txt=a\n"},
       0},
      {"an upload, and it cannot be replaced",
       "half of",
       true,
       {"orders.tmp.1=half of", "orders.tmp=a\n", "orders.txt=a\n-b"},
       1},
      {"nothing, and it cannot be replaced", "", true, {"orders.tmp.1=a\n", "orders.tmp=", "orders.txt=a\n-b"}, 0},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    told_.clear();
    for (const char* name : {"orders.tmp", "orders.tmp.1"}) std::filesystem::remove(folder_ / name);
    folder_.Write("orders.tmp", c.temporary);
    Open("a\n-b");
    if (c.fails) files_.Fail("Rename", "orders.txt", 75);
    Deal([&](WorkQueue::Rewrite& rewrite) {
      rewrite.Claim();
      EXPECT_THAT(ErrorOf([&] { rewrite.Replace(); }), StartsWith(c.fails ? "75 The file " : ""));
    });
    EXPECT_EQ(Files(), c.files);
    EXPECT_THAT(told_, SizeIs(c.told));
    queue_.Close();
  }
}

// A mailbox that holds the file open, or opens it in the last moment, has its lines behind what stays.
TEST_F(WorkQueueTest, KeepsWhatIsAppendedWhileTheFileIsReplaced) {
  for (const bool nothingStays : {false, true}) {
    Open(nothingStays ? "-b\n" : "a\n-b\n");
    std::ofstream mailbox(folder_ / "orders.txt", std::ios::app);
    Deal([&](WorkQueue::Rewrite& rewrite) {
      rewrite.Claim();
      mailbox << "late\n" << std::flush;
      if (nothingStays) rewrite.Remove(true);
      else rewrite.Replace();
    });
    EXPECT_THAT(Files(), ElementsAre(nothingStays ? "orders.txt=late\n" : "orders.txt=a\nlate\n"));
    queue_.Close();
  }
}

TEST_F(WorkQueueTest, RewritesTheFileThatALinkLeadsTo) {
  std::filesystem::create_directory(folder_ / "real");
  folder_.Write("real/po.txt", "a\n-b");
  std::filesystem::create_symlink("real/po.txt", folder_ / "orders.txt");
  queue_.Open(folder_ / "orders.txt");
  Deal(kReplace);
  EXPECT_TRUE(std::filesystem::is_symlink(folder_ / "orders.txt"));
  EXPECT_EQ(folder_.Read("real/po.txt"), "a\n");
}

// Of a mailbox's file, and of what is made of it.
TEST_F(WorkQueueTest, KeepsOwnerGroupAndMode) {
  Open("a\n-b");
  const bool root = geteuid() == 0;
  ASSERT_TRUE(!root || chown((folder_ / "orders.txt").c_str(), 1234, 4321) == 0);
  ASSERT_EQ(chmod((folder_ / "orders.txt").c_str(), 0640), 0);
  folder_.Write("old.txt", "old\n");
  ASSERT_EQ(chmod((folder_ / "old.txt").c_str(), 0666), 0);
  const auto status = [&](const char* name) {
    struct stat status {};
    EXPECT_EQ(stat((folder_ / name).c_str(), &status), 0);
    return status;
  };
  for (const auto& [name, mode] : {std::pair("old.txt", 0640U), std::pair("new.txt", 0640U)}) {
    BackupFile backup(files_);
    backup.Open(folder_ / name);
    backup.Append(queue_.File(), queue_.Path(), {{3, 5}});
    backup.Settle();
    EXPECT_EQ(status(name).st_mode & 0777, mode);
  }
  Deal(kReplace);
  EXPECT_EQ(status("orders.txt").st_mode & 0777, 0640U);
  EXPECT_TRUE(!root || (status("orders.txt").st_uid == 1234 && status("orders.txt").st_gid == 4321));
  EXPECT_THAT(told_, IsEmpty());
}

TEST_F(WorkQueueTest, KeepsRangesAndRemovesAFinishedFile) {
  for (const bool withTemporary : {true, false}) {
    Open("a~b~" + std::string(300'000, 'c') + "~d");
    WorkQueue::Rewrite rewrite(queue_, Tell());
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
    backup.Append(queue_.File(), queue_.Path(), {{4, 8}, {11, 13}}, {7, 9});
  }
  std::string Reopen() {
    queue_.Close();
    return ErrorOf([&] {
      BackupFile backup(files_);
      backup.Open(folder_ / "backup.txt");
      finished_ = backup.Finished();
      backup.Settle();
    });
  }
  std::vector<std::int32_t> finished_;
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
    EXPECT_THAT(finished_, SizeIs(c.backup == kWhole ? 2 : 0));
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

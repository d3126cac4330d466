#include "platform/posix_files.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/file.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <filesystem>
#include <iterator>

#include "support/error_of.h"
#include "support/trading_fixture.h"

namespace partnerkit::platform {
namespace {

constexpr int kUnprivilegedUser = 65534;

using testing::ErrorOf;

class PosixFilesTest : public ::testing::Test {
 protected:
  PosixFilesTest() { std::filesystem::permissions(Path(""), std::filesystem::perms::all); }

  std::string Path(const std::string& name) const { return folder_ / name; }
  std::string Put(const std::string& name, const std::string& bytes) const {
    folder_.Write(name, bytes);
    return Path(name);
  }
  std::string Bytes(const std::string& path) const { return folder_.Read(path); }

  // The number that `operation` raises, 0 for none.
  static int NumberOf(const std::function<void()>& operation) {
    const std::string error = ErrorOf(operation);
    return error.empty() ? 0 : std::stoi(error);
  }

  // What `run` gives in another process, -1 when that process died.
  template <class F>
  static int InChild(F run) {
    const pid_t child = fork();
    if (child == 0) _exit(run());
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  // Whether another program may share and have the file, first by flock, then by a lock of a byte: "-" for each that it
  // may not.
  static std::string Locks(const std::string& path) {
    std::string locks;
    for (const int kind : {LOCK_SH, LOCK_EX}) {
      const bool free = InChild([&] { return flock(open(path.c_str(), O_RDWR), kind | LOCK_NB); }) == 0;
      locks += free ? 'f' : '-';
    }
    for (const bool alone : {false, true}) {
      struct flock oneByte {};
      oneByte.l_type = alone ? F_WRLCK : F_RDLCK;
      oneByte.l_start = 3;
      oneByte.l_len = 1;
      const bool free = InChild([&] { return fcntl(open(path.c_str(), O_RDWR), F_SETLK, &oneByte); }) == 0;
      locks += free ? 'b' : '-';
    }
    return locks;
  }

  testing::TempFolder folder_;
  PosixFiles files_;
};

TEST_F(PosixFilesTest, TurnsProgramsOfEitherLockCustomAwayWhileAFileIsHeld) {
  const std::string path = Put("held.csv", "12345");
  {
    const auto file = files_.OpenInput(path, Share::kExclusive);
    EXPECT_EQ(Locks(path), "----");
  }
  {
    const auto file = files_.OpenInput(path, Share::kDenyWrite);
    EXPECT_EQ(Locks(path), "f-b-");
  }
  {
    const auto file = files_.OpenOutput(path, OutputMode::kAppend);
    EXPECT_EQ(Locks(path), "----");
  }
  EXPECT_EQ(Locks(path), "ffbb");
}

TEST_F(PosixFilesTest, RefusesAFileThatAnotherProgramHoldsAndLeavesItsBytes) {
  const std::string path = Put("theirs.csv", "their bytes");
  for (const bool byFlock : {true, false}) {
    SCOPED_TRACE(byFlock);
    const int theirs = open(path.c_str(), O_RDWR);
    struct flock whole {};
    whole.l_type = F_WRLCK;
    ASSERT_EQ(byFlock ? flock(theirs, LOCK_EX) : fcntl(theirs, F_SETLK, &whole), 0);
    EXPECT_EQ(InChild([&] {
                const std::string inUse = ErrorOf([&] { files_.OpenInput(path, Share::kExclusive); });
                if (inUse != "70 Permission denied: " + path + ": The file is in use") return 1;
                if (NumberOf([&] { files_.OpenInput(path, Share::kDenyWrite); }) != 70) return 2;
                if (NumberOf([&] { files_.OpenOutput(path, OutputMode::kAppend); }) != 70) return 3;
                return NumberOf([&] { files_.OpenOutput(path, OutputMode::kReplace); }) == 70 ? 0 : 4;
              }),
              0);
    EXPECT_EQ(Bytes(path), "their bytes");
    close(theirs);
    EXPECT_EQ(NumberOf([&] { files_.OpenInput(path, Share::kExclusive); }), 0);
  }
}

TEST_F(PosixFilesTest, NoticesThatTheHeldFileWasReplaced) {
  const std::string path = Put("orders.csv", "old");
  const auto held = files_.OpenInput(path, Share::kExclusive);
  const std::string identity = held->Identity();
  EXPECT_TRUE(held->StillNamed(path));
  std::ofstream(path, std::ios::app) << " grown";
  EXPECT_TRUE(held->StillNamed(path));
  EXPECT_EQ(held->Identity(), identity);
  EXPECT_EQ(identity.find_first_of(" \r\n"), std::string::npos);

  files_.Rename(Put("new.csv", "new"), path);
  EXPECT_FALSE(held->StillNamed(path));
  EXPECT_NE(files_.OpenInput(path, Share::kExclusive)->Identity(), identity);
  files_.Delete(path);
  EXPECT_FALSE(held->StillNamed(path));
  std::array<char, 16> read{};
  EXPECT_EQ(std::string(read.data(), held->ReadAt(2, read)), "d grown");
}

// A file whose name goes to another one each time it is opened must never be handed out as held.
TEST_F(PosixFilesTest, HoldsTheFileThatBearsTheNameWhileAnotherProgramReplacesIt) {
  const std::string path = Put("busy.csv", "0");
  const pid_t replacer = fork();
  if (replacer == 0) {
    // A replacer that keeps to the custom: it holds what it replaces, so a name can't move away from a held file.
    for (;;) {
      const int held = open(path.c_str(), O_RDWR);
      const int made = open(Path("busy.tmp").c_str(), O_CREAT | O_RDWR, 0666);
      if (flock(held, LOCK_EX) == 0) rename(Path("busy.tmp").c_str(), path.c_str());
      close(made);
      close(held);
    }
  }
  int opened = 0;
  for (int i = 0; i < 2000; ++i) {
    NumberOf([&] {
      const auto file = files_.OpenInput(path, Share::kExclusive);
      usleep(20);
      EXPECT_TRUE(file->StillNamed(path));
      ++opened;
    });
  }
  kill(replacer, SIGKILL);
  waitpid(replacer, nullptr, 0);
  EXPECT_GT(opened, 0);
}

TEST_F(PosixFilesTest, ReadsAnywhereInAFile) {
  const auto file = files_.OpenInput(Put("abc.csv", "abcdefgh"), Share::kDenyWrite);
  std::array<char, 3> read{};
  EXPECT_EQ(file->Length(), 8u);
  EXPECT_EQ(std::string(read.data(), file->ReadAt(4, read)), "efg");
  EXPECT_EQ(std::string(read.data(), file->ReadAt(7, read)), "h");
  EXPECT_EQ(file->ReadAt(0xFFFFFFFFFFFFFFFF, read), 0u);
}

TEST_F(PosixFilesTest, AppendsReplacesAndCutsBack) {
  const std::string path = Put("out.csv", "earlier ");
  auto file = files_.OpenOutput(path, OutputMode::kAppend);
  EXPECT_EQ(file->Length(), 8u);
  file->Write("one two");
  file->Truncate(11);  // in what is still in memory
  EXPECT_EQ(file->Length(), 11u);
  EXPECT_EQ(Bytes(path), "earlier ");
  file->Sync();
  EXPECT_EQ(Bytes(path), "earlier one");
  file->Write(" three");
  file->Truncate(4);  // in what is on the disk
  file->Truncate(400);
  file->Write("ier");
  file->Close();
  EXPECT_EQ(Bytes(path), "earlier");
  EXPECT_EQ(NumberOf([&] { file->Write("late"); }), 52);

  files_.OpenOutput(path, OutputMode::kReplace)->Write("let go without Close");
  EXPECT_EQ(Bytes(path), "let go without Close");
  files_.OpenOutput(path, OutputMode::kReplace)->Close();
  EXPECT_EQ(files_.Length(path), 0u);
}

TEST_F(PosixFilesTest, TellsWhatIsWrongWithAPath) {
  std::filesystem::create_directory(Path("folder"));
  mkfifo(Path("pipe").c_str(), 0666);
  const std::string file = Put("plain.csv", "x");
  const std::string nul = Path(std::string("a\0b", 3));
  const std::string tooLong = Path(std::string(300, 'n'));
  struct Case {
    std::string path;
    int length, input, output, remove, rename;
  };
  for (const Case& c : {Case{Path("none.csv"), 53, 53, 0, 0, 53}, Case{Path("none/x.csv"), 76, 76, 76, 76, 76},
                        Case{file + "/x.csv", 76, 76, 76, 76, 76}, Case{Path("folder"), 75, 75, 75, 75, 0},
                        Case{nul, 52, 52, 52, 52, 52}, Case{tooLong, 52, 52, 52, 52, 52},
                        Case{Path("pipe"), 0, 75, 57, 0, 53}, Case{"", 53, 53, 53, 53, 53}}) {
    SCOPED_TRACE(c.path);
    EXPECT_EQ(NumberOf([&] { files_.Length(c.path); }), c.length);
    EXPECT_EQ(NumberOf([&] { files_.OpenInput(c.path, Share::kExclusive); }), c.input);
    EXPECT_EQ(NumberOf([&] { files_.OpenOutput(c.path, OutputMode::kReplace); }), c.output);
    EXPECT_EQ(NumberOf([&] { files_.Delete(c.path); }), c.remove);
    EXPECT_EQ(NumberOf([&] { files_.Rename(c.path, Path("renamed")); }), c.rename);
    EXPECT_FALSE(files_.Exists(c.path));
  }
  EXPECT_TRUE(files_.Exists(file));
  EXPECT_EQ(ErrorOf([&] { files_.OpenInput(Path("none/x.csv"), Share::kExclusive); }),
            "76 Path not found: " + Path("none/x.csv") + ": No such file or directory");
  EXPECT_EQ(ErrorOf([&] { files_.OpenInput(nul, Share::kExclusive); }),
            "52 Bad file name or number: " + Path("a?b") + ": A name cannot hold a NUL byte");
}

TEST_F(PosixFilesTest, HoldsAFileThatItMayOnlyReadAndSaysThatItMayNotWrite) {
  const std::string readable = Put("readable.csv", "r");
  const std::string secret = Put("secret.csv", "s");
  chmod(readable.c_str(), 0444);
  chmod(secret.c_str(), 0000);
  EXPECT_EQ(InChild([&] {
              if (geteuid() == 0 && setuid(kUnprivilegedUser) != 0) return 1;
              const auto held = files_.OpenInput(readable, Share::kExclusive);
              if (NumberOf([&] { files_.OpenInput(readable, Share::kExclusive); }) != 70) return 2;
              if (NumberOf([&] { files_.OpenOutput(readable, OutputMode::kAppend); }) != 75) return 3;
              if (NumberOf([&] { files_.OpenInput(secret, Share::kDenyWrite); }) != 75) return 4;
              const std::string denied = ErrorOf([&] { files_.OpenOutput("/etc/none.csv", OutputMode::kReplace); });
              return denied == "75 Path/File access error: /etc/none.csv: Permission denied" ? 0 : 5;
            }),
            0);
}

TEST_F(PosixFilesTest, TellsAFullDiskAndGoesOnWhereItStoodOnceThereIsRoom) {
  const auto full = files_.OpenOutput("/dev/full", OutputMode::kReplace);
  full->Write("lost");
  EXPECT_EQ(ErrorOf([&] { full->Close(); }), "61 Disk full: /dev/full: No space left on device");

  const std::string path = Path("limited.csv");
  EXPECT_EQ(InChild([&] {
              std::signal(SIGXFSZ, SIG_IGN);
              rlimit limit{};
              getrlimit(RLIMIT_FSIZE, &limit);
              limit.rlim_cur = 300'000;
              setrlimit(RLIMIT_FSIZE, &limit);
              const auto file = files_.OpenOutput(path, OutputMode::kReplace);
              file->Write(std::string(262'000, 'a'));
              file->Write(std::string(100'000, 'b'));
              if (NumberOf([&] { file->Write(std::string(200'000, 'c')); }) != 61) return 1;
              if (NumberOf([&] { file->Close(); }) != 61) return 2;
              limit.rlim_cur = limit.rlim_max;
              setrlimit(RLIMIT_FSIZE, &limit);
              file->Write(std::string(200'000, 'd'));
              file->Close();
              return 0;
            }),
            0);
  EXPECT_EQ(Bytes(path), std::string(262'000, 'a') + std::string(100'000, 'b') + std::string(200'000, 'd'));
}

TEST_F(PosixFilesTest, TellsThatTooManyFilesAreOpenBeforeItRenames) {
  const std::string from = Put("from.csv", "f");
  EXPECT_EQ(InChild([&] {
              // A first error while files can be opened: the sanitizers open some to learn its type.
              if (NumberOf([&] { files_.Length(Path("none.csv")); }) != 53) return 4;
              const rlimit none{3, 3};
              setrlimit(RLIMIT_NOFILE, &none);
              if (NumberOf([&] { files_.OpenInput(from, Share::kExclusive); }) != 67) return 1;
              if (NumberOf([&] { files_.Rename(from, Path("to.csv")); }) != 67) return 2;
              return files_.Exists(from) ? 0 : 3;
            }),
            0);
}

TEST_F(PosixFilesTest, RenamesInThePlaceOfAFileThatSomebodyReads) {
  const std::string to = Put("to.csv", "old");
  std::ifstream reader(to);
  files_.Rename(Put("from.csv", "new"), to);
  EXPECT_EQ(Bytes(to), "new");
  EXPECT_FALSE(files_.Exists(Path("from.csv")));
  EXPECT_EQ(std::string(std::istreambuf_iterator<char>(reader), {}), "old");

  std::filesystem::create_directory(Path("folder"));
  EXPECT_EQ(NumberOf([&] { files_.Rename(to, Path("folder")); }), 75);
  EXPECT_EQ(ErrorOf([&] { files_.Rename(to, Path("none/to.csv")); }),
            "76 Path not found: " + Path("none/to.csv") + ": No such file or directory");
  files_.Rename(to, Path("folder/moved.csv"));
  EXPECT_EQ(Bytes(Path("folder/moved.csv")), "new");
}

TEST_F(PosixFilesTest, CopiesIntoThePlaceOfAnOlderFile) {
  files_.CreateFolder(Path("archive"));
  EXPECT_EQ(NumberOf([&] { files_.CreateFolder(Path("archive")); }), 75);
  EXPECT_EQ(NumberOf([&] { files_.CreateFolder(Path("gone/archive")); }), 76);
  const std::string from = Put("orders.txt", std::string(300'000, 'o')), to = Put("archive/orders.txt", "older");
  const auto held = files_.OpenInput(from, Share::kExclusive);
  files_.Copy(from, to);
  EXPECT_EQ(Bytes(to), std::string(300'000, 'o'));
  const auto expectError = [&](const std::string& source, const std::string& target, int number) {
    EXPECT_EQ(NumberOf([&] { files_.Copy(Path(source), Path(target)); }), number) << source << " to " << target;
  };
  expectError("none.txt", "archive/orders.txt", 53);
  expectError("archive", "copy", 75);
  expectError("orders.txt", "gone/orders.txt", 76);
  expectError("orders.txt", "archive", 75);
  expectError("orders.txt", "orders.txt", 75);
  EXPECT_EQ(Bytes(to), std::string(300'000, 'o'));
  EXPECT_EQ(Bytes(from), Bytes(to));
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(Path("")), {}), 2);
}

// Under every name that somebody can guess.
TEST_F(PosixFilesTest, MakesNoFileThroughALinkThatSomebodyHasPutThere) {
  const std::string outside = Put("outside", "theirs"), orders = Put("orders.txt", "ours");
  const auto plant = [&](const std::string& name, const std::string& target) {
    std::filesystem::remove(Path(name));
    std::filesystem::create_symlink(target, Path(name));
  };
  std::filesystem::create_directory(Path("archive"));
  plant("archive/.orders.txt.partnerkit-1", outside);
  plant("archive/orders.txt", outside);
  files_.Copy(orders, Path("archive/orders.txt"));
  EXPECT_EQ(Bytes(Path("archive/orders.txt")), "ours");
  for (const std::string& target : {outside, Path("none")}) {
    plant("ack.txt", target);
    EXPECT_EQ(NumberOf([&] { files_.OpenOutput(Path("ack.txt"), OutputMode::kAppendOwn); }), 75) << target;
  }
  EXPECT_EQ(NumberOf([&] { files_.OpenOutput(Path("ack.txt"), OutputMode::kAppend); }), 75) << "leads nowhere";
  EXPECT_FALSE(files_.Exists(Path("none")));
  EXPECT_EQ(Bytes(outside), "theirs");
}

TEST_F(PosixFilesTest, GivesEachDraftANameOfItsOwn) {
  const std::string path = Put("orders.txt", "orders");
  std::string first, second, next;
  auto held = files_.OpenDraft(path, first);
  held->Write("of the first");
  held->Close();
  Put(".orders.txt.partnerkit-3", "left by a program that died");
  EXPECT_EQ(InChild([&] {
              held = files_.OpenDraft(path, first);
              return files_.OpenDraft(path, second) != nullptr && second == Path(".orders.txt.partnerkit-2") ? 0 : 1;
            }),
            0);
  EXPECT_EQ(first, Path(".orders.txt.partnerkit-1"));
  EXPECT_FALSE(files_.Exists(Path(".orders.txt.partnerkit-3")));
  // What the child left is nobody's now.
  const auto again = files_.OpenDraft(path, first), another = files_.OpenDraft(path, second),
             third = files_.OpenDraft(path, next);
  EXPECT_EQ(first, Path(".orders.txt.partnerkit-1"));
  EXPECT_EQ(next, Path(".orders.txt.partnerkit-3"));
  EXPECT_EQ(again->Length() + third->Length(), 0U);
  EXPECT_EQ(Bytes(next), "");
  std::string ofLong;
  EXPECT_NE(files_.OpenDraft(Path(std::string(250, 'n')), ofLong), nullptr);
}

TEST_F(PosixFilesTest, CopiesTheMode) {
  const std::string from = Put("secret.txt", "s"), to = Path("copy.txt");
  for (const mode_t mode : {0600U, 0666U}) {
    ASSERT_EQ(chmod(from.c_str(), mode), 0);
    files_.Copy(from, to);
    struct stat status {};
    ASSERT_EQ(stat(to.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, mode);
  }
}

TEST_F(PosixFilesTest, RenamesAnewButNeverInThePlaceOfAFile) {
  Put("taken.prn", "theirs");
  std::filesystem::create_directory(Path("folder.prn"));
  const std::string draft = Put("draft", "ours");
  EXPECT_FALSE(files_.RenameNew(draft, Path("taken.prn")));
  EXPECT_FALSE(files_.RenameNew(draft, Path("folder.prn")));
  EXPECT_EQ(NumberOf([&] { files_.RenameNew(draft, Path("none/1.prn")); }), 76);
  EXPECT_TRUE(files_.RenameNew(draft, Path("free.prn")));
  EXPECT_EQ(Bytes(Path("taken.prn")), "theirs");
  EXPECT_EQ(Bytes(Path("free.prn")), "ours");
  EXPECT_FALSE(files_.Exists(draft));
}

TEST_F(PosixFilesTest, TakesABackslashForASeparatorUnlessAFileBearsThatName) {
  std::filesystem::create_directory(Path("in"));
  std::filesystem::create_directory(Path("od\\d"));
  Put("in/po.csv", "separator");
  Put("by\\name.csv", "name");
  EXPECT_EQ(files_.Length(Path("in\\po.csv")), 9u);
  EXPECT_EQ(files_.Length(Path("by\\name.csv")), 4u);
  EXPECT_EQ(NativePath(Path("new\\po.csv")), Path("new/po.csv"));
  EXPECT_EQ(NativePath(Path("od\\d/in\\po.csv")), Path("od\\d/in/po.csv"));
  EXPECT_EQ(NativePath("\\tmp\\"), "/tmp/");
  files_.OpenOutput(Path("in\\new.csv"), OutputMode::kReplace)->Close();
  EXPECT_TRUE(std::filesystem::exists(Path("in/new.csv")));
  EXPECT_EQ(NumberOf([&] { files_.OpenOutput(Path("none\\po.csv"), OutputMode::kReplace); }), 76);
}

}  // namespace
}  // namespace partnerkit::platform

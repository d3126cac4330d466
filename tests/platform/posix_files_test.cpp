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
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>

namespace partnerkit::platform {
namespace {

constexpr int kFree = 0;
constexpr int kHeld = 1;
constexpr int kUnprivilegedUser = 65534;

class PosixFilesTest : public testing::Test {
 protected:
  PosixFilesTest() {
    std::string name = (std::filesystem::temp_directory_path() / "posix_files.XXXXXX").string();
    folder_ = mkdtemp(name.data());
    std::filesystem::permissions(folder_, std::filesystem::perms::all);
  }
  ~PosixFilesTest() override { std::filesystem::remove_all(folder_); }

  std::string Path(const std::string& name) const { return folder_ + "/" + name; }
  std::string Put(const std::string& name, const std::string& bytes) const {
    std::ofstream(Path(name), std::ios::binary) << bytes;
    return Path(name);
  }
  static std::string Bytes(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
  }

  // The number that `operation` raises, 0 for none; its description goes to `said_`.
  template <class F>
  int NumberOf(F operation) {
    try {
      operation();
      return 0;
    } catch (const RunTimeError& error) {
      said_ = error.Description();
      return error.Number();
    }
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

  static int TryFlock(const std::string& path, int kind) {
    return InChild([&] { return flock(open(path.c_str(), O_RDWR), kind | LOCK_NB) == 0 ? kFree : kHeld; });
  }
  static int TryByteLock(const std::string& path, short kind) {
    return InChild([&] {
      struct flock oneByte {};
      oneByte.l_type = kind;
      oneByte.l_start = 3;
      oneByte.l_len = 1;
      return fcntl(open(path.c_str(), O_RDWR), F_SETLK, &oneByte) == 0 ? kFree : kHeld;
    });
  }

  std::string folder_;
  std::string said_;
  PosixFiles files_;
};

TEST_F(PosixFilesTest, TurnsProgramsOfEitherLockCustomAwayWhileAFileIsHeld) {
  struct Case {
    const char* name;
    bool output;
    Share share;
    int toRead, toWrite;
  };
  for (const Case& c : {Case{"exclusive", false, Share::kExclusive, kHeld, kHeld},
                        Case{"deny write", false, Share::kDenyWrite, kFree, kHeld},
                        Case{"output", true, Share::kExclusive, kHeld, kHeld}}) {
    SCOPED_TRACE(c.name);
    const std::string path = Put("held.csv", "12345");
    std::unique_ptr<InputFile> input;
    std::unique_ptr<OutputFile> output;
    if (c.output) {
      output = files_.OpenOutput(path, OutputMode::kAppend);
    } else {
      input = files_.OpenInput(path, c.share);
    }
    EXPECT_EQ(TryFlock(path, LOCK_SH), c.toRead);
    EXPECT_EQ(TryFlock(path, LOCK_EX), c.toWrite);
    EXPECT_EQ(TryByteLock(path, F_RDLCK), c.toRead);
    EXPECT_EQ(TryByteLock(path, F_WRLCK), c.toWrite);
    input.reset();
    output.reset();
    EXPECT_EQ(TryFlock(path, LOCK_EX), kFree);
    EXPECT_EQ(TryByteLock(path, F_WRLCK), kFree);
  }
}

TEST_F(PosixFilesTest, RefusesAFileThatAnotherProgramHoldsAndLeavesItsBytes) {
  const std::string path = Put("theirs.csv", "their bytes");
  for (const bool byFlock : {true, false}) {
    SCOPED_TRACE(byFlock);
    std::array<int, 2> ready{}, done{};
    ASSERT_EQ(pipe(ready.data()) + pipe(done.data()), 0);
    const pid_t holder = fork();
    if (holder == 0) {
      close(done[1]);
      const int held = open(path.c_str(), O_RDWR);
      struct flock whole {};
      whole.l_type = F_WRLCK;
      const bool ok = byFlock ? flock(held, LOCK_EX) == 0 : fcntl(held, F_SETLK, &whole) == 0;
      char sign = ok ? 'h' : 'x';
      _exit(write(ready[1], &sign, 1) == 1 && read(done[0], &sign, 1) == 0 ? 0 : 1);
    }
    char sign = ' ';
    ASSERT_EQ(read(ready[0], &sign, 1), 1);
    ASSERT_EQ(sign, 'h');
    EXPECT_EQ(NumberOf([&] { files_.OpenInput(path, Share::kExclusive); }), 70);
    EXPECT_EQ(said_, "Permission denied: " + path + ": The file is in use");
    EXPECT_EQ(NumberOf([&] { files_.OpenInput(path, Share::kDenyWrite); }), 70);
    EXPECT_EQ(NumberOf([&] { files_.OpenOutput(path, OutputMode::kAppend); }), 70);
    EXPECT_EQ(NumberOf([&] { files_.OpenOutput(path, OutputMode::kReplace); }), 70);
    EXPECT_EQ(Bytes(path), "their bytes");
    for (const int end : {done[1], done[0], ready[0], ready[1]}) close(end);
    waitpid(holder, nullptr, 0);
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
  EXPECT_EQ(file->ReadAt(8, read), 0u);
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

TEST_F(PosixFilesTest, WritesMoreThanItsBufferHolds) {
  const std::string path = Path("large.csv");
  const auto file = files_.OpenOutput(path, OutputMode::kReplace);
  std::string expected;
  for (const std::size_t size : {1000u, 262'144u, 3u, 700'000u}) {
    const std::string piece(size, static_cast<char>('a' + size % 26));
    file->Write(piece);
    expected += piece;
  }
  file->Close();
  EXPECT_EQ(Bytes(path), expected);
}

TEST_F(PosixFilesTest, TellsWhatIsWrongWithAPath) {
  std::filesystem::create_directory(Path("folder"));
  mkfifo(Path("pipe").c_str(), 0666);
  const std::string file = Put("plain.csv", "x");
  const std::string nul = Path(std::string("a\0b", 3));
  const std::string tooLong = Path(std::string(300, 'n'));
  const auto input = [&](const std::string& path) {
    return NumberOf([&] { files_.OpenInput(path, Share::kExclusive); });
  };
  const auto output = [&](const std::string& path) {
    return NumberOf([&] { files_.OpenOutput(path, OutputMode::kReplace); });
  };
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
    EXPECT_EQ(input(c.path), c.input);
    EXPECT_EQ(output(c.path), c.output);
    EXPECT_EQ(NumberOf([&] { files_.Delete(c.path); }), c.remove);
    EXPECT_EQ(NumberOf([&] { files_.Rename(c.path, Path("renamed")); }), c.rename);
    EXPECT_FALSE(files_.Exists(c.path));
  }
  EXPECT_TRUE(files_.Exists(file));
  EXPECT_EQ(input(Path("none/x.csv")), 76);
  EXPECT_EQ(said_, "Path not found: " + Path("none/x.csv") + ": No such file or directory");
  EXPECT_EQ(input(nul), 52);
  EXPECT_EQ(said_, "Bad file name or number: " + Path("a?b") + ": A name cannot hold a NUL byte");
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
              if (NumberOf([&] { files_.OpenOutput("/etc/none.csv", OutputMode::kReplace); }) != 75) return 5;
              return said_ == "Path/File access error: /etc/none.csv: Permission denied" ? 0 : 6;
            }),
            0);
}

TEST_F(PosixFilesTest, TellsAFullDiskAndGoesOnWhereItStoodOnceThereIsRoom) {
  const auto full = files_.OpenOutput("/dev/full", OutputMode::kReplace);
  full->Write("lost");
  EXPECT_EQ(NumberOf([&] { full->Close(); }), 61);
  EXPECT_EQ(said_, "Disk full: /dev/full: No space left on device");

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
  EXPECT_EQ(NumberOf([&] { files_.Rename(to, Path("none/to.csv")); }), 76);
  EXPECT_EQ(said_, "Path not found: " + Path("none/to.csv") + ": No such file or directory");
  files_.Rename(to, Path("folder/moved.csv"));
  EXPECT_EQ(Bytes(Path("folder/moved.csv")), "new");
}

TEST_F(PosixFilesTest, CopiesIntoThePlaceOfAnOlderFile) {
  PosixFiles files;
  files.CreateFolder(Path("archive"));
  EXPECT_EQ(NumberOf([&] { files.CreateFolder(Path("archive")); }), run_time::kPathAccess);
  EXPECT_EQ(NumberOf([&] { files.CreateFolder(Path("gone/archive")); }), run_time::kPathNotFound);
  const std::string from = Put("orders.txt", std::string(300'000, 'o')), to = Put("archive/orders.txt", "older");
  const auto held = files.OpenInput(from, Share::kExclusive);
  files.Copy(from, to);
  EXPECT_EQ(Bytes(to), std::string(300'000, 'o'));
  const struct {
    std::string from, to;
    int number;
  } cases[] = {
      {"none.txt", "archive/orders.txt", run_time::kFileNotFound}, {"archive", "copy", run_time::kPathAccess},
      {"orders.txt", "gone/orders.txt", run_time::kPathNotFound},  {"orders.txt", "archive", run_time::kPathAccess},
      {"orders.txt", "orders.txt", run_time::kPathAccess},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(NumberOf([&] { files.Copy(Path(c.from), Path(c.to)); }), c.number) << c.from << " to " << c.to;
  }
  EXPECT_EQ(Bytes(to), std::string(300'000, 'o'));
  EXPECT_EQ(Bytes(from), Bytes(to));
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder_), {}), 2);
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

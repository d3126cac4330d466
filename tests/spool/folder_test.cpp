#include <fcntl.h>
#include <sys/file.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <set>

#include "spool/spool_test.h"

namespace partnerkit::spool {
namespace {

namespace fs = std::filesystem;

class FolderTest : public ::testing::Test {
 protected:
  std::string Deliver(std::string_view bytes) {
    return fs::path(MakeFolder(folder / "", kShort)->Deliver(bytes, Content::kRaw, "job")).filename();
  }
  std::set<std::string> Names() {
    std::set<std::string> names;
    for (const auto& file : fs::directory_iterator(folder / "")) names.insert(file.path().filename());
    return names;
  }
  // What `deliver` raises in a process of its own that first does `prepare`.
  std::string ErrorInChild(const std::function<void()>& prepare, const std::function<void()>& deliver) {
    TempFolder told;
    const pid_t child = fork();
    if (child == 0) {
      const int out = open((told / "error").c_str(), O_WRONLY | O_CREAT, 0666);
      prepare();
      const std::string error = ErrorOf(deliver);
      _exit(write(out, error.data(), error.size()) == static_cast<ssize_t>(error.size()) ? 0 : 1);
    }
    waitpid(child, nullptr, 0);
    return told.Read("error");
  }

  TempFolder folder;
};

TEST_F(FolderTest, NumbersGoOnFromTheHighestOfEitherKindAndBehindTheFilesOfOthers) {
  const auto destination = MakeFolder(folder / "", kShort);
  const auto deliver = [&](std::string_view bytes, Content content = Content::kRaw) {
    return fs::path(destination->Deliver(bytes, content, "PartnerKit.clsCMLSCM")).filename();
  };
  EXPECT_EQ(deliver("first"), "0001.prn");
  EXPECT_EQ(deliver("second"), "0002.prn");
  for (const char* name :
       {"0003.prn", "12.pdf", "0100.txt", "99999999999999999.prn", "x13.prn", "14.prn.old", ".prn"}) {
    folder.Write(name, "not ours");
  }
  EXPECT_EQ(deliver("%PDF-", Content::kPdf), "0013.pdf");
  EXPECT_EQ(Deliver("another program's"), "0014.prn");
  EXPECT_EQ(deliver("third"), "0015.prn");
  fs::remove(folder / "0015.prn");
  EXPECT_EQ(deliver("third"), "0015.prn");
  folder.Write("9999.prn", "not ours");
  EXPECT_EQ(deliver(std::string("^XA\0^XZ", 7)), "10000.prn");
  EXPECT_EQ(folder.Read("0001.prn"), "first");
  EXPECT_EQ(folder.Read("0003.prn"), "not ours");
  EXPECT_EQ(folder.Read("0013.pdf"), "%PDF-");
  EXPECT_EQ(folder.Read("10000.prn"), std::string("^XA\0^XZ", 7));
  EXPECT_EQ(Names().size(), 14U);
}

TEST_F(FolderTest, ProgramsThatSpoolAtOnceShareTheNumbers) {
  constexpr int kPrograms = 4, kJobs = 25;
  for (int program = 0; program < kPrograms; ++program) {
    if (fork() != 0) continue;
    alarm(60);
    const auto destination = MakeFolder(folder / "", {});
    for (int job = 0; job < kJobs; ++job) {
      const std::string bytes = std::string(20'000, 'x') + std::to_string(program) + "/" + std::to_string(job);
      destination->Deliver(bytes, job % 3 == 0 ? Content::kPdf : Content::kRaw, "job");
    }
    _exit(0);
  }
  for (int program = 0; program < kPrograms; ++program) {
    int status = -1;
    wait(&status);
    EXPECT_EQ(status, 0);
  }
  std::set<std::string> numbers, endings;
  for (const std::string& name : Names()) {
    numbers.insert(name.substr(0, 4));
    endings.insert(folder.Read(name).substr(20'000));
  }
  EXPECT_EQ(Names().size(), 100U);
  EXPECT_EQ(numbers.size(), 100U);
  EXPECT_EQ(*numbers.rbegin(), "0100");
  EXPECT_EQ(endings.size(), 100U);
}

TEST_F(FolderTest, AFailedJobLeavesNothing) {
  const std::string path = folder / "";
  EXPECT_EQ(ErrorOf([&] { MakeFolder(path + "gone", kShort)->Deliver("job", Content::kRaw, "job"); }),
            "76 Path not found: " + path + "gone: No such file or directory");
  folder.Write("plain", "no folder");
  EXPECT_EQ(ErrorOf([&] { MakeFolder(path + "plain", kShort)->Deliver("job", Content::kRaw, "job"); }),
            "76 Path not found: " + path + "plain: Not a directory");
  EXPECT_THAT(ErrorInChild(
                  [] {
                    std::signal(SIGXFSZ, SIG_IGN);
                    const rlimit limit = {600'000, 600'000};
                    setrlimit(RLIMIT_FSIZE, &limit);
                  },
                  [&] { Deliver(std::string(1'000'000, 'x')); }),
              HasSubstr("61 Disk full: " + path));
  fs::permissions(path,
                  fs::perms::owner_read | fs::perms::owner_exec | fs::perms::others_read | fs::perms::others_exec);
  const auto unprivileged = [] {
    if (geteuid() == 0 && setuid(65534) != 0) std::abort();
  };
  EXPECT_THAT(ErrorInChild(unprivileged, [&] { Deliver("job"); }), HasSubstr("75 Path/File access error: " + path));
  EXPECT_THAT(ErrorInChild(unprivileged, [&] { MakeFolder(path, kShort)->Check(); }),
              HasSubstr("75 Path/File access error: " + path));
  fs::permissions(path, fs::perms::owner_all);
  EXPECT_THAT(Names(), ElementsAre("plain"));
}

TEST_F(FolderTest, WaitsForAnotherProgramAndTidiesUpAfterAKilledOne) {
  const int held = open((folder / "").c_str(), O_RDONLY);
  flock(held, LOCK_EX);
  EXPECT_EQ(ErrorOf([&] { Deliver("job"); }),
            "70 Permission denied: " + folder / "" + ": Another program has held the folder for 0.3 s");
  folder.Write(".job.partnerkit-1", "half a j");
  flock(held, LOCK_UN);
  close(held);
  EXPECT_EQ(Deliver("job"), "0001.prn");
  EXPECT_THAT(Names(), ElementsAre("0001.prn"));
}

}  // namespace
}  // namespace partnerkit::spool

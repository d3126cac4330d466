#include <cups/cups.h>
#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>

#include "spool/fake_printer.h"
#include "spool/spool_test.h"

namespace partnerkit::spool {
namespace {

namespace fs = std::filesystem;

constexpr const char* kDaemon = "/usr/sbin/cupsd";

// Keeps each job, and what it was told of it, in a file named after the job.
constexpr std::string_view kBackend = R"(#!/bin/sh
[ $# -gt 0 ] || exit 0
folder=${DEVICE_URI#keep:}
echo "$3|$CONTENT_TYPE" >"$folder/$1.about"
cat ${6+"$6"} >"$folder/$1.part"
mv "$folder/$1.part" "$folder/$1"
)";

// A print server of this test's own, with queues that print, are stopped and take nothing.
class CupsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    if (access(kDaemon, X_OK) != 0) GTEST_SKIP() << "no CUPS server is installed (package cups-daemon)";
    for (const char* name : {"bin/backend", "spool", "cache", "state", "tmp", "out"})
      fs::create_directories(folder / name);
    fs::create_symlink("/usr/lib/cups/daemon", folder / "bin/daemon");
    folder.Write("bin/backend/keep", kBackend);
    // Whoever runs the test runs the backend.
    fs::permissions(folder / "bin/backend/keep", fs::perms::owner_all);
    const std::string root = folder / "";
    std::string places = "ServerRoot " + root + "\nServerBin " + root + "bin\nPrintcap\nFatalErrors none\n";
    for (const auto& [directive, name] : {std::pair("RequestRoot", "spool"),
                                          {"CacheDir", "cache"},
                                          {"StateDir", "state"},
                                          {"TempDir", "tmp"},
                                          {"ErrorLog", "errors"},
                                          {"AccessLog", "accesses"},
                                          {"PageLog", "pages"}}) {
      places += std::string(directive) + " " + root + name + "\n";
    }
    folder.Write("cups-files.conf", places);
    folder.Write("cupsd.conf",
                 "Listen " + root + "socket\nBrowsing Off\nWebInterface No\nMaxJobs 0\nDefaultAuthType None\n" +
                     "<Location />\nAllow all\n</Location>\n<Policy default>\n<Limit All>\n</Limit>\n</Policy>\n");
    std::string queues;
    for (const auto& [name, state] : {std::pair("label", "State Idle\nAccepting Yes"),
                                      {"stopped", "State Stopped\nStateMessage Out of labels\nAccepting Yes"},
                                      {"closed", "State Idle\nAccepting No"}}) {
      queues += "<Printer " + std::string(name) + ">\nDeviceURI keep:" + root + "out\n" + state + "\n</Printer>\n";
    }
    folder.Write("printers.conf", queues);
    Start();
  }
  void TearDown() override { Stop(); }

  void Start() {
    daemon_ = fork();
    if (daemon_ == 0) {
      const int nowhere = open("/dev/null", O_RDWR);
      for (const int stream : {0, 1, 2}) dup2(nowhere, stream);
      const std::string settings = folder / "cupsd.conf", places = folder / "cups-files.conf";
      execl(kDaemon, kDaemon, "-f", "-c", settings.c_str(), "-s", places.c_str(), nullptr);
      _exit(127);
    }
    cupsSetServer((folder / "socket").c_str());
    Await([&] { return ErrorOf([&] { Queue("label")->Check(); }).empty(); });
  }
  void Stop() {
    if (daemon_ <= 0) return;
    kill(daemon_, SIGKILL);
    waitpid(daemon_, nullptr, 0);
    daemon_ = 0;
  }
  template <class F>
  void Await(F condition) {
    for (int i = 0; i < 500 && !condition(); ++i) std::this_thread::sleep_for(20ms);
    ASSERT_TRUE(condition()) << folder.Read("errors");
  }
  static std::unique_ptr<Destination> Queue(const std::string& name) {
    return MakeCupsQueue(name, {.connect = 2s, .stall = 5s, .closing = 1s});
  }

  TempFolder folder;
  pid_t daemon_ = 0;
};

TEST_F(CupsTest, PrintsBytesAsTheyAre) {
  std::string everyByte;
  for (int byte = 0; byte < 200'000; ++byte) everyByte += static_cast<char>(byte);
  EXPECT_EQ(Queue("label")->Deliver(everyByte, Content::kRaw, "PartnerKit.clsCMLSCM"), "cups:label/1");
  EXPECT_EQ(Queue("label")->Deliver("%PDF-1.5\n%%EOF\n", Content::kPdf, "PartnerKit.clsMYERSCM"), "cups:label/2");
  Await([&] { return folder.Has("out/1") && folder.Has("out/2"); });
  EXPECT_TRUE(folder.Read("out/1") == everyByte);
  EXPECT_EQ(folder.Read("out/1.about"), "PartnerKit.clsCMLSCM|application/vnd.cups-raw\n");
  EXPECT_EQ(folder.Read("out/2"), "%PDF-1.5\n%%EOF\n");
  EXPECT_EQ(folder.Read("out/2.about"), "PartnerKit.clsMYERSCM|application/pdf\n");
}

TEST_F(CupsTest, CountsTheJobsThatWait) {
  EXPECT_EQ(Queue("stopped")->JobCount(), 0);
  for (int job = 0; job < 998; ++job) Queue("stopped")->Deliver("^XA^XZ", Content::kRaw, "job");
  EXPECT_EQ(Queue("stopped")->JobCount(), 998);
  for (int job = 0; job < 3; ++job) Queue("stopped")->Deliver("^XA^XZ", Content::kRaw, "job");
  EXPECT_EQ(Queue("stopped")->JobCount(), 999);
  EXPECT_EQ(Queue("label")->JobCount(), 0);
}

TEST_F(CupsTest, SaysWhyAJobCannotBeDelivered) {
  const auto errorOf = [](const std::string& queue) {
    return ErrorOf([&] { Queue(queue)->Deliver("^XA^XZ", Content::kRaw, "job"); });
  };
  const auto troubleOf = [](const std::string& queue) { return ErrorOf([&] { Queue(queue)->Check(); }); };
  EXPECT_EQ(troubleOf("stopped"), "482 Printer error: cups:stopped: The queue is stopped: Out of labels");
  EXPECT_EQ(errorOf("closed"), "482 Printer error: cups:closed: Destination \"closed\" is not accepting jobs.");
  EXPECT_EQ(troubleOf("closed"), "482 Printer error: cups:closed: The queue takes no jobs");
  EXPECT_EQ(errorOf("none"), "482 Printer error: cups:none: The printer or class does not exist.");
  EXPECT_EQ(errorOf("no/such #"), "482 Printer error: cups:no/such #: The printer or class does not exist.");
  Stop();
  EXPECT_EQ(errorOf("label"), "482 Printer error: cups:label: No connection to the print server " + folder / "socket");
}

TEST(CupsServer, IsGivenUpWhenItDoesNotAnswer) {
  FakePrinter silent;
  cupsSetServer(silent.Target().c_str());
  const auto start = std::chrono::steady_clock::now();
  for (const std::size_t size : {10U, 30'000'000U}) {
    EXPECT_EQ(ErrorOf([&] { MakeCupsQueue("label", kShort)->Deliver(std::string(size, 'x'), Content::kRaw, "job"); }),
              "482 Printer error: cups:label: The print server gave no answer for 0.3 s");
  }
  EXPECT_LT(std::chrono::steady_clock::now() - start, 5s);
}

}  // namespace
}  // namespace partnerkit::spool

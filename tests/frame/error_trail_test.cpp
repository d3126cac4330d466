#include "frame/error_trail.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <vector>

#include "platform/posix_files.h"

namespace partnerkit {
namespace {

constexpr const char* kReport =
    "TLE error - program error #61 (Disk full) occured in module cMGB850csv, Function Load, line 0.";

// Runs in a folder of its own, for the trail's files lie in the current one.
class ErrorTrailTest : public testing::Test {
 protected:
  ErrorTrailTest() : before_(std::filesystem::current_path()) {
    std::string name = (std::filesystem::temp_directory_path() / "error_trail.XXXXXX").string();
    folder_ = mkdtemp(name.data());
    std::filesystem::current_path(folder_);
    outlets_.applicationName = "TradeDesk";
    outlets_.libraryPath = "/opt/lib/pk.so";
    outlets_.dialog = [this](const ErrorReport& report, const std::string& title) {
      shown_.push_back(title + "|" + report.report);
      last_ = report;
      return button_;
    };
  }

  ~ErrorTrailTest() override {
    std::filesystem::current_path(before_);
    std::filesystem::remove_all(folder_);
  }

  static std::string Bytes(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
  }

  Answer Put(const RunTimeError& error) {
    return ErrorTrail(outlets_, settings_, files_)("cMGB850csv", "Function Load", error);
  }

  ErrorOutlets outlets_;
  ErrorSettings settings_;
  platform::PosixFiles files_;
  std::filesystem::path before_, folder_;
  Button button_ = Button::kAbort;
  std::vector<std::string> shown_;
  ErrorReport last_;
};

TEST_F(ErrorTrailTest, ShowsTheReportAndGivesTheUsersAnswer) {
  const RunTimeError error(61, "Disk full");
  for (const auto& [button, answer] :
       {std::pair(Button::kAbort, 3), std::pair(Button::kRetry, 1), std::pair(Button::kIgnore, 2)}) {
    button_ = button;
    EXPECT_EQ(static_cast<int>(Put(error)), answer);
  }
  EXPECT_EQ(shown_, std::vector<std::string>(3, std::string("Unexpected Error|") + kReport));
  EXPECT_EQ(last_.number, 61);
  EXPECT_EQ(last_.description, "Disk full");
  EXPECT_EQ(last_.module, "cMGB850csv");
  EXPECT_EQ(last_.procedure, "Function Load");
  EXPECT_TRUE(std::filesystem::is_empty(folder_));
}

TEST_F(ErrorTrailTest, NamesTheComponentThatAnErrorCameFrom) {
  const std::string before = "TLE error - program error #5 (Odd) occured in module cMGB850csv, Function Load, line 0";
  struct Case {
    const char* source;
    const char* suffix;
  };
  for (const Case& c : {
           Case{"", "."},
           Case{"PartnerKit.clsMGB850csv", "."},
           Case{"0/opt/lib/other.so!a!b", "."},
           Case{"1/opt/lib/ship.so!cShip!Sub Send!0!53",
                ". This error was generated remotely by /opt/lib/ship.so, a component of /opt/lib/pk.so."},
           Case{"2/a.so!cA!Sub A!0!53!/b.so!cB!Sub B!0!53",
                ". This error was generated remotely by /a.so, a component of /opt/lib/pk.so."},
           Case{"1!Carrier.Client!Book",
                ". This error was generated remotely by Carrier.Client, a component of /opt/lib/pk.so."},
           Case{"7 without a mark", ""},
           Case{"1E999!a!b", ""},
       }) {
    SCOPED_TRACE(c.source);
    Put(RunTimeError(5, "Odd", c.source));
    EXPECT_EQ(last_.report, before + c.suffix);
  }
}

TEST_F(ErrorTrailTest, LeavesWithoutAskingWhenSilentOrWithoutADialog) {
  button_ = Button::kRetry;
  settings_.silent = true;
  settings_.passUpward = true;
  EXPECT_EQ(Put(RunTimeError(61, "Disk full")), Answer::kLeave);
  EXPECT_TRUE(shown_.empty());
  settings_ = {};
  outlets_.dialog = nullptr;
  EXPECT_EQ(Put(RunTimeError(61, "Disk full")), Answer::kLeave);
}

TEST_F(ErrorTrailTest, SendsEachErrorToTheMonitorWindow) {
  std::vector<std::string> sent;
  outlets_.monitor = [&](std::uint64_t window, const std::string& text) {
    sent.push_back(std::to_string(window) + text);
  };
  Put(RunTimeError(61, "Disk full"));
  settings_.monitorWindow = 4711;
  Put(RunTimeError(-5, "Bad"));
  EXPECT_EQ(sent, std::vector<std::string>{"4711[TradeDesk] ERROR -5 \"Bad\" at cMGB850csv : Function Load : 0\r\n"});
}

TEST_F(ErrorTrailTest, AppendsEachReportToTheLogFile) {
  const std::string line = std::string(kReport) + "\r\n";
  settings_.logToFile = true;
  Put(RunTimeError(61, "Disk full"));
  Put(RunTimeError(61, "Disk full"));
  settings_.logFileName = folder_ / "pk.log";
  Put(RunTimeError(61, "Disk full"));
  EXPECT_EQ(Bytes("error.log"), line + line);
  EXPECT_EQ(Bytes("pk.log"), line);
}

TEST_F(ErrorTrailTest, MailsEachReportWithItsLogFileAndDeletesTheFile) {
  std::vector<Mail> sent;
  std::string attached;
  outlets_.mail = [&](const Mail& mail) {
    sent.push_back(mail);
    attached = Bytes("!error!.log");
  };
  Put(RunTimeError(61, "Disk full"));
  EXPECT_TRUE(sent.empty());
  std::ofstream("!error!.log") << std::string(500, 'x');
  settings_.mailRecipient = "help@example.com";
  Put(RunTimeError(61, "Disk full"));
  ASSERT_EQ(sent.size(), 1u);
  EXPECT_EQ(sent[0].recipient, "help@example.com");
  EXPECT_EQ(sent[0].subject, "Remote Error Report From /opt/lib/pk.so");
  EXPECT_EQ(sent[0].note,
            "TLE error 61 (Disk full) occured in /opt/lib/pk.so. The attached log file has complete details.");
  EXPECT_EQ(sent[0].type, "IPM.");
  EXPECT_EQ(sent[0].attachmentPath, "!error!.log");
  EXPECT_EQ(sent[0].attachmentName, "fserror.log");
  EXPECT_EQ(attached, std::string(kReport) + "\r\n");
  EXPECT_FALSE(files_.Exists("!error!.log"));
}

TEST_F(ErrorTrailTest, PassesAnErrorUpwardWithOneMoreHop) {
  settings_.passUpward = true;
  struct Case {
    const char* source;
    const char* hop;
  };
  for (const Case& c :
       {Case{"", "1/opt/lib/pk.so!cMGB850csv!Function Load!0!61"},
        Case{"named", "1/opt/lib/pk.so!cMGB850csv!Function Load!0!61"},
        Case{"1/a.so!cA!Sub A!0!53", "2/a.so!cA!Sub A!0!53!/opt/lib/pk.so!cMGB850csv!Function Load!0!61"}}) {
    SCOPED_TRACE(c.source);
    try {
      Put(RunTimeError(61, "Disk full", c.source));
      FAIL() << "kept the error to itself";
    } catch (const RunTimeError& error) {
      EXPECT_EQ(error.Number(), 61);
      EXPECT_EQ(error.Description(),
                "Disk full in cMGB850csv, Function Load at line number 0\r\n(handled remotely by NuMega FailSafe)");
      EXPECT_EQ(error.Source(), c.hop);
    }
  }
  EXPECT_TRUE(shown_.empty());
}

TEST_F(ErrorTrailTest, PassesOverOutletsThatFail) {
  int mails = 0;
  settings_.monitorWindow = 1;
  settings_.logToFile = true;
  settings_.mailRecipient = "help@example.com";
  std::filesystem::create_directory("error.log");
  std::filesystem::create_directory("!error!.log");
  outlets_.monitor = [](std::uint64_t, const std::string&) { throw std::runtime_error("monitor"); };
  outlets_.mail = [&](const Mail&) {
    ++mails;
    throw RunTimeError(57, "mail");
  };
  button_ = Button::kIgnore;
  EXPECT_EQ(Put(RunTimeError(61, "Disk full")), Answer::kNext);
  EXPECT_EQ(mails, 1);
  EXPECT_EQ(shown_.size(), 1u);
  outlets_.dialog = [](const ErrorReport&, const std::string&) -> Button { throw std::runtime_error("dialog"); };
  EXPECT_EQ(Put(RunTimeError(61, "Disk full")), Answer::kLeave);
}

}  // namespace
}  // namespace partnerkit

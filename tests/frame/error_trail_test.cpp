#include "frame/error_trail.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <vector>

#include "platform/posix_files.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

const RunTimeError kFull(61, "Disk full");
const std::string kReport =
    "TLE error - program error #61 (Disk full) occured in module cMGB850csv, Function Load, line 0.";

// Runs in a folder of its own, for the trail's files lie in the current one.
class ErrorTrailTest : public ::testing::Test {
 protected:
  ErrorTrailTest() {
    std::filesystem::current_path(folder_ / "");
    outlets_.applicationName = "TradeDesk";
    outlets_.libraryPath = "/opt/lib/pk.so";
    outlets_.dialog = [this](const ErrorReport& report, const std::string& title) {
      shown_.push_back(title + "|" + report.report);
      last_ = report;
      return button_;
    };
  }
  ~ErrorTrailTest() override { std::filesystem::current_path(before_); }

  Answer Put(const RunTimeError& error) {
    return ErrorTrail(outlets_, settings_, files_)("cMGB850csv", "Function Load", error);
  }

  std::filesystem::path before_ = std::filesystem::current_path();
  testing::TempFolder folder_;
  ErrorOutlets outlets_;
  ErrorSettings settings_;
  platform::PosixFiles files_;
  Button button_ = Button::kAbort;
  std::vector<std::string> shown_;
  ErrorReport last_;
};

TEST_F(ErrorTrailTest, ShowsTheReportAndGivesTheUsersAnswerUnlessSilent) {
  for (const auto& [button, answer] :
       {std::pair(Button::kAbort, 3), std::pair(Button::kRetry, 1), std::pair(Button::kIgnore, 2)}) {
    button_ = button;
    EXPECT_EQ(static_cast<int>(Put(kFull)), answer);
  }
  EXPECT_EQ(shown_, std::vector<std::string>(3, "Unexpected Error|" + kReport));
  EXPECT_EQ(last_.number, 61);
  EXPECT_EQ(last_.description, "Disk full");
  EXPECT_EQ(last_.module, "cMGB850csv");
  EXPECT_EQ(last_.procedure, "Function Load");
  EXPECT_TRUE(std::filesystem::is_empty(folder_ / ""));

  settings_.silent = settings_.passUpward = true;
  EXPECT_EQ(Put(kFull), Answer::kLeave);
  EXPECT_EQ(shown_.size(), 3U);
  settings_ = {};
  outlets_.dialog = nullptr;
  EXPECT_EQ(Put(kFull), Answer::kLeave);
}

TEST_F(ErrorTrailTest, NamesTheComponentThatAnErrorCameFrom) {
  const std::string before = "TLE error - program error #5 (Odd) occured in module cMGB850csv, Function Load, line 0";
  const auto remote = [](const std::string& component) {
    return ". This error was generated remotely by " + component + ", a component of /opt/lib/pk.so.";
  };
  for (const auto& [source, suffix] : std::vector<std::pair<std::string, std::string>>{
           {"", "."},
           {"0/opt/lib/other.so!a!b", "."},
           {"2/a.so!cA!Sub A!0!53!/b.so!cB!Sub B!0!53", remote("/a.so")},
           {"1!Carrier.Client!Book", remote("Carrier.Client")},
           {"7 without a mark", ""},
           {"1E999!a!b", ""},
       }) {
    Put(RunTimeError(5, "Odd", source));
    EXPECT_EQ(last_.report, before + suffix) << source;
  }
}

TEST_F(ErrorTrailTest, TellsTheMonitorWindowAndTheLogFileOnceTheyAreSet) {
  std::vector<std::string> sent;
  outlets_.monitor = [&](std::uint64_t window, const std::string& text) {
    sent.push_back(std::to_string(window) + text);
  };
  Put(kFull);
  settings_.monitorWindow = 4711;
  settings_.logToFile = true;
  Put(kFull);
  Put(kFull);
  const std::string told = "4711[TradeDesk] ERROR 61 \"Disk full\" at cMGB850csv : Function Load : 0\r\n";
  EXPECT_EQ(sent, (std::vector<std::string>{told, told}));
  settings_.logFileName = folder_ / "pk.log";
  Put(kFull);
  EXPECT_EQ(folder_.Read("error.log"), kReport + "\r\n" + kReport + "\r\n");
  EXPECT_EQ(folder_.Read("pk.log"), kReport + "\r\n");
}

TEST_F(ErrorTrailTest, MailsEachReportWithItsLogFileAndDeletesTheFile) {
  std::vector<Mail> sent;
  std::string attached;
  outlets_.mail = [&](const Mail& mail) {
    sent.push_back(mail);
    attached = folder_.Read("!error!.log");
  };
  Put(kFull);
  EXPECT_TRUE(sent.empty());
  folder_.Write("!error!.log", std::string(500, 'x'));
  settings_.mailRecipient = "help@example.com";
  Put(kFull);
  ASSERT_EQ(sent.size(), 1u);
  EXPECT_EQ(sent[0].recipient, "help@example.com");
  EXPECT_EQ(sent[0].subject, "Remote Error Report From /opt/lib/pk.so");
  EXPECT_EQ(sent[0].note,
            "TLE error 61 (Disk full) occured in /opt/lib/pk.so. The attached log file has complete details.");
  EXPECT_EQ(sent[0].type, "IPM.");
  EXPECT_EQ(sent[0].attachmentPath, "!error!.log");
  EXPECT_EQ(sent[0].attachmentName, "fserror.log");
  EXPECT_EQ(attached, kReport + "\r\n");
  EXPECT_FALSE(folder_.Has("!error!.log"));
}

TEST_F(ErrorTrailTest, PassesAnErrorUpwardWithOneMoreHop) {
  settings_.passUpward = true;
  const std::string hop = "/opt/lib/pk.so!cMGB850csv!Function Load!0!61";
  for (const auto& [source, passed] : std::vector<std::pair<std::string, std::string>>{
           {"named", "1" + hop}, {"1/a.so!cA!Sub A!0!53", "2/a.so!cA!Sub A!0!53!" + hop}}) {
    try {
      Put(RunTimeError(61, "Disk full", source));
      FAIL() << "kept the error to itself";
    } catch (const RunTimeError& error) {
      EXPECT_EQ(error.Number(), 61);
      EXPECT_EQ(error.Description(),
                "Disk full in cMGB850csv, Function Load at line number 0\r\n(handled remotely by NuMega FailSafe)");
      EXPECT_EQ(error.Source(), passed);
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
  EXPECT_EQ(Put(kFull), Answer::kNext);
  EXPECT_EQ(mails, 1);
  EXPECT_EQ(shown_.size(), 1u);
  outlets_.dialog = [](const ErrorReport&, const std::string&) -> Button { throw std::runtime_error("dialog"); };
  EXPECT_EQ(Put(kFull), Answer::kLeave);
}

}  // namespace
}  // namespace partnerkit

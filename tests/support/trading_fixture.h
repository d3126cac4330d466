// A supplier's host for tests: a real database and real files in a temporary folder, at a fixed time.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "frame/translator_base.h"
#include "host/sql_host.h"
#include "partnerkit/catalogue.h"
#include "partnerkit/platform.h"
#include "platform/clocks.h"

namespace partnerkit::testing {

// A folder of its own, gone with the object.
class TempFolder {
 public:
  TempFolder() {
    std::string name = std::filesystem::temp_directory_path() / "partnerkit-XXXXXX";
    if (mkdtemp(name.data()) == nullptr) std::abort();
    path_ = name;
  }
  ~TempFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  TempFolder(const TempFolder&) = delete;
  TempFolder& operator=(const TempFolder&) = delete;

  std::string operator/(std::string_view name) const { return (path_ / name).string(); }

  void Write(std::string_view name, std::string_view bytes) const {
    std::ofstream(*this / name, std::ios::binary) << bytes;
  }
  std::string Read(std::string_view name) const {
    std::ostringstream bytes;
    bytes << std::ifstream(*this / name, std::ios::binary).rdbuf();
    return bytes.str();
  }
  bool Has(std::string_view name) const { return std::filesystem::exists(*this / name); }

 private:
  std::filesystem::path path_;
};

struct TradingHost {
  TempFolder folder;
  std::unique_ptr<host::SqlHost> system = host::SqlHost::Open(folder / "store.db");
  platform::FixedClock clock{*DateTime::FromYmdHms(2006, 3, 8, 10, 15, 0)};
  std::vector<std::string> reports;  // of the error trail
  Button answer = Button::kAbort;    // to each of them
  Ports ports = MakePorts();

  std::unique_ptr<Translator> Create(std::string_view className) {
    return CreateTranslator("PartnerKit." + std::string(className), ports);
  }

  template <class R>
  R Stored(R record) {
    EXPECT_TRUE(system->Records().Add(R::kType, &record)) << R::kType.kind;
    return record;
  }

  // Every record of a kind that fits the probe.
  template <class R>
  std::vector<std::shared_ptr<R>> All(const Lookup& lookup, const R& probe) {
    return Select(system->Records(), lookup, probe);
  }

  // The run log from behind `since`: "number procedure: message", the number as 0, W, R or the run-time error.
  std::vector<std::string> LogLines(std::int32_t since = 0) {
    std::vector<std::string> lines;
    Log log;
    for (log.LogId = since + 1; Load(system->Records(), log); ++log.LogId) {
      const std::string number = log.ErrorNumber == kWarning     ? "W"
                                 : log.ErrorNumber == kRejection ? "R"
                                                                 : std::to_string(log.ErrorNumber);
      lines.push_back(number + " " + log.Procedure.value_or("") + ": " + log.Message.value_or(""));
    }
    return lines;
  }

  // One call of a translator's `Process`: its result, and what its error list names.
  struct Outcome {
    std::int32_t result = 0;
    std::vector<std::string> told;
  };
  Outcome Process(Translator& translator, std::int32_t row = 0) {
    ErrorList ids;
    Outcome outcome;
    outcome.result = translator.Process(row, ids);
    for (const std::int32_t id : ids.value_or(std::vector<std::int32_t>())) {
      outcome.told.push_back(LogLines(id - 1).front());
    }
    return outcome;
  }

 private:
  Ports MakePorts() {
    Ports made = platform::DefaultPorts();
    made.clock = &clock;
    made.computerName = [] { return std::optional<std::string>("WAREHOUSE1"); };
    made.errorOutlets.dialog = [this](const ErrorReport& report, const std::string&) {
      reports.push_back(report.report);
      return answer;
    };
    return made;
  }
};

}  // namespace partnerkit::testing

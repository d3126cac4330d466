// Real databases in a temporary folder, with record kinds of the tests' own beside the trading records.
#pragma once

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "host/soci.h"
#include "host/sql_options.h"
#include "partnerkit/record_type.h"
#include "partnerkit/values.h"
#include "support/error_of.h"
#include "support/trading_fixture.h"

namespace partnerkit::host {

// A record with every kind of member.
struct Sample {
  static const RecordType kType;
  static const Lookup kByCode;
  static const Lookup kByNote;

  std::int32_t SampleId = 0;
  std::string Code = {};
  Text Note = {};
  std::int32_t Whole = 0;
  std::int64_t Long = 0;
  bool Flag = false;
  double Real = 0;
  std::optional<double> Number = {};
  std::optional<DateTime> Date = {};
};

// A record that goes by a key of two members.
struct Keyed {
  static const RecordType kType;
  static const Lookup kByOwner;

  std::string OwnerId = {};
  std::int32_t Position = 0;
  Text Value = {};
};

inline constexpr std::string_view kCode[] = {"Code"};
inline constexpr std::string_view kNote[] = {"Note"};
inline constexpr std::string_view kOwnerId[] = {"OwnerId"};

inline constexpr Member kSampleMembers[] = {
    Id<&Sample::SampleId>("SampleId"), Field<&Sample::Code>("Code"),     Field<&Sample::Note>("Note"),
    Field<&Sample::Whole>("Whole"),    Field<&Sample::Long>("Long"),     Field<&Sample::Flag>("Flag"),
    Field<&Sample::Real>("Real"),      Field<&Sample::Number>("Number"), Field<&Sample::Date>("Date"),
};
constexpr Lookup Sample::kByCode = {"ByCode", kCode, true};
constexpr Lookup Sample::kByNote = {"ByNote", kNote};
inline constexpr Lookup kSampleLookups[] = {Sample::kByCode, Sample::kByNote};
constexpr RecordType Sample::kType = {"Sample", "tbSample", kSampleMembers, kSampleLookups, ""};

inline constexpr Member kKeyedMembers[] = {Key<&Keyed::OwnerId>("OwnerId"), Key<&Keyed::Position>("Position"),
                                           Field<&Keyed::Value>("Value")};
constexpr Lookup Keyed::kByOwner = {"ByOwner", kOwnerId};
inline constexpr Lookup kKeyedLookups[] = {Keyed::kByOwner};
constexpr RecordType Keyed::kType = {"Keyed", "tbKeyed", kKeyedMembers, kKeyedLookups, ""};

inline constexpr std::array<const RecordType*, 2> kTestTypes = {&Sample::kType, &Keyed::kType};

// Samples put into a store and taken out of it.
class SampleRecords {
 protected:
  ~SampleRecords() = default;
  virtual RecordStore& Samples() = 0;

  std::int32_t Added(Sample sample) {
    EXPECT_TRUE(Add(Samples(), sample)) << sample.Code;
    return sample.SampleId;
  }
  void AddKeyed(const std::string& owner, std::int32_t position, Text value) {
    Keyed keyed{owner, position, std::move(value)};
    EXPECT_TRUE(Add(Samples(), keyed));
  }
  Sample Stored(std::int32_t id) {
    Sample sample;
    sample.SampleId = id;
    EXPECT_TRUE(Load(Samples(), sample)) << id;
    return sample;
  }
};

class StoreTest : public ::testing::Test {
 protected:
  std::string Path(std::string_view name = "store.db") const { return folder_ / name; }

  // The first column of the last row as another program sees it, or the error it gets.
  static std::string Ask(const std::string& path, const std::string& sql) {
    using namespace sqlite_api;
    sqlite_api::sqlite3* database = nullptr;
    sqlite3_open(path.c_str(), &database);
    std::string answer = "no row";
    const auto take = [](void* text, int, char** values, char**) {
      *static_cast<std::string*>(text) = values[0] ? values[0] : "null";
      return 0;
    };
    if (sqlite3_exec(database, sql.c_str(), take, &answer, nullptr) != SQLITE_OK) answer = sqlite3_errmsg(database);
    sqlite3_close(database);
    return answer;
  }

  // What the work raises, without the number when it is the database's.
  static std::string ErrorOf(const std::function<void()>& work) {
    const std::string error = testing::ErrorOf(work);
    return error.starts_with("40002 ") ? error.substr(6) : error;
  }

  // Runs the work in a process of its own, which ends without closing anything. Its connections have to be opened
  // there.
  static pid_t Fork(const std::function<void()>& work) {
    const pid_t child = fork();
    if (child != 0) return child;
    try {
      work();
    } catch (const RunTimeError& error) {
      fprintf(stderr, "child: %s\n", error.what());
      _exit(1);
    }
    _exit(0);
  }

  static int Wait(pid_t child) {
    int status = 0;
    waitpid(child, &status, 0);
    return status;
  }

  testing::TempFolder folder_;
};

}  // namespace partnerkit::host

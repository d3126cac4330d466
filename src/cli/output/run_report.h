// What a run on a file has to show.
#pragma once

#include <cstdint>
#include <string>
#include <variant>
#include <vector>

#include "cli/output/command.h"
#include "partnerkit/store.h"
#include "partnerkit/values.h"

namespace partnerkit::cli {

enum class Outcome { kPosted, kChanged, kCancelled, kDeleted, kStoredEarlier, kTurnedAway };

struct RowResult {
  std::int64_t row;
  std::variant<std::int32_t, bool> result;  // of `Process`, of `Delete`
  ErrorList errorLog;
  Outcome outcome = Outcome::kTurnedAway;
};

struct RunReport {
  ColumnTable columns;
  RowTable rows;
  bool withResults = false;
  bool outbound = false;  // a row is compiled, not posted
  std::vector<RowResult> results;
  std::size_t untried = 0;           // rows behind a failing store
  std::vector<std::int32_t> logIds;  // every log record of the run
};

void PrintRun(const Command& command, const RunReport& report, RecordStore& store);

}  // namespace partnerkit::cli

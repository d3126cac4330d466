// The log records that one command wrote.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cli/output/json_writer.h"
#include "partnerkit/records.h"
#include "partnerkit/store.h"

namespace partnerkit::cli {

// The record's message on one line, what kind it is before it unless it is information: "rejection: ...", "error 482:
// ...".
std::string LogLine(const Log& log);

// The member "log" of a command's JSON.
void WriteLogRecords(JsonWriter& json, const std::vector<std::int32_t>& logIds, RecordStore& store);

// A line for each: "rejection: Cannot process ...".
std::vector<std::string> LogMessages(const std::vector<std::int32_t>& logIds, RecordStore& store);

}  // namespace partnerkit::cli

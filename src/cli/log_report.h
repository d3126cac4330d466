// The log records that one command wrote.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cli/json_writer.h"
#include "partnerkit/store.h"

namespace partnerkit::cli {

// The member "log" of a command's JSON.
void WriteLogRecords(JsonWriter& json, const std::vector<std::int32_t>& logIds, RecordStore& store);

// A line for each: "rejection: Cannot process ...".
std::vector<std::string> LogMessages(const std::vector<std::int32_t>& logIds, RecordStore& store);

}  // namespace partnerkit::cli

#include "cli/log_report.h"

#include <string_view>

#include "cli/listings.h"
#include "cli/record_json.h"
#include "partnerkit/records.h"

namespace partnerkit::cli {

namespace {

// What scripts are promised of a log record; `log` shows the whole.
constexpr std::string_view kLogMembers[] = {"LogId", "Source", "Procedure", "ErrorNumber", "NativeError", "Message"};

}  // namespace

void WriteLogRecords(JsonWriter& json, const std::vector<std::int32_t>& logIds, RecordStore& store) {
  json.Name("log");
  json.BeginArray();
  for (const std::int32_t logId : logIds) {
    Log log;
    log.LogId = logId;
    if (!store.Load(Log::kType, &log)) continue;
    json.BeginObject();
    for (const std::string_view name : kLogMembers) {
      const Member& member = *FindMember(Log::kType, name);
      json.Name(name);
      WriteValue(json, member.kind, At(member, &log));
    }
    json.EndObject();
  }
  json.EndArray();
}

std::vector<std::string> LogMessages(const std::vector<std::int32_t>& logIds, RecordStore& store) {
  std::vector<std::string> messages;
  for (const std::int32_t logId : logIds) {
    Log log;
    log.LogId = logId;
    if (!store.Load(Log::kType, &log)) continue;
    messages.push_back(LogLine(log));
  }
  return messages;
}

}  // namespace partnerkit::cli

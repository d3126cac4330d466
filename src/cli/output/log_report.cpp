#include "cli/output/log_report.h"

#include <string_view>

#include "cli/output/record_json.h"
#include "cli/output/text.h"
#include "frame/hosted_class.h"
#include "partnerkit/records.h"

namespace partnerkit::cli {

namespace {

// What scripts are promised of a log record; `log` shows the whole.
constexpr std::string_view kLogMembers[] = {"LogId", "Source", "Procedure", "ErrorNumber", "NativeError", "Message"};

// "warning", "rejection", "" for information, else the number.
std::string KindOf(std::int32_t number) {
  if (number == kInformation) return {};
  if (number == kWarning) return "warning";
  if (number == kRejection) return "rejection";
  return "error " + std::to_string(number);
}

}  // namespace

std::string LogLine(const Log& log) {
  const std::string kind = KindOf(log.ErrorNumber);
  std::string message = OneLine(Str(log.Message));
  // Those of a printer begin with the number, and the next word right behind it.
  const std::string own = "Error " + std::to_string(log.ErrorNumber);
  if (log.ErrorNumber > 0 && message.starts_with(own)) message.erase(0, own.size());
  return (kind.empty() ? "" : kind + ": ") + message;
}

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

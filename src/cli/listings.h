// The verbs that list what there is: classes, document definitions, the run log.
#pragma once

#include <cstdint>
#include <string>

#include "cli/command.h"
#include "cli/json_writer.h"
#include "partnerkit/records.h"

namespace partnerkit::cli {

int ListClasses(const Command& command);
int ListDocuments(const Command& command);
// The log records with ids above `since`.
int ListLog(const Command& command, std::int32_t since);

// The record's message on one line, what kind it is before it unless it is information: "rejection: ...", "error 482:
// ...".
std::string LogLine(const Log& log);

}  // namespace partnerkit::cli

// The verbs that list what there is: classes, document definitions, the run log.
#pragma once

#include <cstdint>
#include <optional>

#include "cli/command.h"
#include "cli/json_writer.h"
#include "partnerkit/records.h"

namespace partnerkit::cli {

int ListClasses(const Command& command);
int ListDocuments(const Command& command);
// The log records with ids above `since`.
int ListLog(const Command& command, std::int32_t since);

// "warning", "rejection", "" for information, else the number.
std::string ErrorNumberText(std::int32_t number);

}  // namespace partnerkit::cli

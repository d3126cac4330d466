// The verbs that list what there is: classes, document definitions, the run log.
#pragma once

#include <cstdint>
#include <string>

#include "cli/output/command.h"
#include "cli/output/json_writer.h"
#include "partnerkit/records.h"

namespace partnerkit::cli {

int ListClasses(const Command& command);
int ListDocuments(const Command& command);
// The log records with ids above `since`.
int ListLog(const Command& command, std::int32_t since);

}  // namespace partnerkit::cli

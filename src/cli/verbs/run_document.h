// `rows`, `process` and `delete`: one run of a document's class on one file.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cli/output/command.h"

namespace partnerkit::cli {

// `document` is an EDIDocId as typed; `file` is handed to the class as it stands.
int ShowRows(const Command& command, const std::string& document, const std::string& file);
// Carries out the rows named, in that order; all of them when none is.
int ProcessRows(const Command& command, const std::string& document, const std::string& file,
                const std::vector<std::int64_t>& rows);
int DeleteRow(const Command& command, const std::string& document, const std::string& file, std::int64_t row);

}  // namespace partnerkit::cli

// Reading a data file: one JSON object, its syntax faults told by line and column.
#pragma once

#include <nlohmann/json_fwd.hpp>
#include <string>

namespace partnerkit::cli {

// Raises Refusal for a file that cannot be read, is no JSON, holds no object or gives a name twice in one object.
nlohmann::json ReadDataFile(const std::string& path);

}  // namespace partnerkit::cli

// Reading a data file: JSON of any size in one pass, its syntax faults told by line and column.
#pragma once

#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>

namespace partnerkit::cli {

// A fault that is told by the place in the file where reading has come to.
class SyntaxFault : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

using JsonEvents = nlohmann::json_sax<nlohmann::json>;

// Hands the file's JSON to `events` as it is read; what they raise passes through, a SyntaxFault as a Refusal. Raises
// Refusal for a file that cannot be read or is no JSON; `events` have had what came before the fault.
void ReadDataFile(const std::string& path, JsonEvents& events);

}  // namespace partnerkit::cli

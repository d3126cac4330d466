// The built program, run as a child the way a script runs it.
#pragma once

#include <string>
#include <vector>

namespace partnerkit::testing {

struct Ran {
  int status;  // 128 and the signal's number when one ended it
  std::string out;
  std::string err;
};

// Runs `partnerkit` with the arguments in the folder. The environment names no workspace but `environmentWorkspace`.
Ran RunPartnerkit(const std::string& folder, const std::vector<std::string>& arguments,
                  const std::string& environmentWorkspace = {});

}  // namespace partnerkit::testing

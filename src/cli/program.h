// The program: its verbs, options and help.
#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace partnerkit::cli {

// Runs one command line, without the program's own name. Gives the exit status and raises nothing.
int RunProgram(const std::vector<std::string>& arguments, std::ostream& out, std::ostream& err);

}  // namespace partnerkit::cli

#include <csignal>
#include <iostream>

#include "cli/program.h"
#include "host/sql_host.h"

int main(int count, char** arguments) {
  // A reader that goes away (`| head`) is an output that fails, not a reason to die half way.
  std::signal(SIGPIPE, SIG_IGN);
  // So is a file that may not grow any more: it counts as a full disk.
  std::signal(SIGXFSZ, SIG_IGN);
  partnerkit::host::DropThreadGuards();
  std::ios::sync_with_stdio(false);
  return partnerkit::cli::RunProgram({arguments + 1, arguments + count}, std::cout, std::cerr);
}

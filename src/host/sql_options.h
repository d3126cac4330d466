#pragma once

#include <chrono>

namespace partnerkit::host {

struct SqlOptions {
  // How long a statement waits for another program that holds the database.
  std::chrono::milliseconds lockTimeout{30000};
  // False: a database that isn't there is an error instead of a new, empty one.
  bool create = true;
  // Texts that are paths below the database's own folder are kept relative to it, and read as absolute ones: the folder
  // may be moved or copied as a whole.
  bool relativePaths = false;
};

}  // namespace partnerkit::host

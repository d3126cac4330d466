#pragma once

#include <chrono>

namespace partnerkit::host {

struct SqlOptions {
  // How long a statement waits for another program that holds the database.
  std::chrono::milliseconds lockTimeout{30000};
  // False: a database that isn't there is an error instead of a new, empty one.
  bool create = true;
};

}  // namespace partnerkit::host

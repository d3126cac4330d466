// What every verb of the command line has in common.
#pragma once

#include <optional>
#include <ostream>
#include <stdexcept>
#include <string>

#include "partnerkit/values.h"

namespace partnerkit::cli {

// Exit statuses, which scripts rely on.
inline constexpr int kDone = 0;
inline constexpr int kTurnedAway = 1;  // the command ran, but something was turned away, failed or found nothing
inline constexpr int kCannotRun = 2;   // bad usage, no workspace, unknown document or class, unreadable data file

// The command cannot run. The text names the thing and the cause.
class Refusal : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The command ran and failed on the way.
class Failure : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The options that stand before the verb.
struct Options {
  std::string workspace;  // empty: PARTNERKIT_WORKSPACE, else the current folder
  std::string database;   // empty: the workspace's own
  bool json = false;
  std::optional<DateTime> now;
};

struct Command {
  Options options;
  std::ostream& out;
  std::ostream& err;

  // One line on standard error, in the program's name.
  void Say(std::string_view message) const;
};

}  // namespace partnerkit::cli

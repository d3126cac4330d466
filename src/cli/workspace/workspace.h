// A workspace: the folder with the database and the files of one supplier.
#pragma once

#include <filesystem>
#include <string>

#include "cli/output/command.h"
#include "host/sql_host.h"
#include "partnerkit/ports.h"
#include "platform/clocks.h"

namespace partnerkit::cli {

inline constexpr std::string_view kDatabaseFile = "partnerkit.db";

// The absolute path, without a separator at its end.
std::filesystem::path AbsolutePath(const std::filesystem::path& path);

// Makes an empty workspace and gives its path. Refused where one is already; what a refused one has made is taken away
// again.
std::filesystem::path MakeWorkspace(const std::filesystem::path& folder, const std::string& database);

// An open workspace: its store, and the ports for the classes that work on it.
class Workspace {
 public:
  // The workspace of the options, the environment or the current folder. Raises Refusal.
  explicit Workspace(const Command& command);
  // Says how often the last error came up again.
  ~Workspace();
  Workspace(const Workspace&) = delete;
  Workspace& operator=(const Workspace&) = delete;

  const std::filesystem::path& Folder() const { return folder_; }
  host::SqlHost& Host() { return *host_; }
  // Closes the store. False when the log has not got all that was written to it, which is said. Raises RunTimeError.
  bool CloseStore();
  const Ports& ClassPorts() const { return ports_; }
  // An error reached the error trail; it is on standard error.
  bool HadFault() const { return hadFault_; }

 private:
  void Tell(const std::string& report);
  void TellRepeats();

  const Command& command_;
  std::filesystem::path folder_;
  std::unique_ptr<host::SqlHost> host_;
  std::optional<platform::FixedClock> fixedClock_;
  Ports ports_;
  bool hadFault_ = false;
  std::string lastReport_;
  int repeats_ = 0;
};

}  // namespace partnerkit::cli

#include "cli/workspace/workspace.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "cli/output/table.h"
#include "cli/output/text.h"
#include "partnerkit/platform.h"
#include "partnerkit/run_time_error.h"

namespace partnerkit::cli {

namespace fs = std::filesystem;

namespace {

// maps: column-name maps. inbox: what partners sent. outbox: what goes to them. backup: lines of posted orders.
// spool: print jobs.
constexpr std::string_view kFolders[] = {"maps", "inbox", "outbox", "backup", "spool"};

// None for others: a supplier's prices and orders are in there.
constexpr mode_t kFolderRights = S_IRWXU | S_IRWXG;

fs::path ChosenFolder(const Options& options) {
  if (!options.workspace.empty()) return AbsolutePath(options.workspace);
  const char* named = std::getenv("PARTNERKIT_WORKSPACE");
  return AbsolutePath(named != nullptr && *named != '\0' ? named : ".");
}

std::unique_ptr<host::SqlHost> OpenStore(const std::string& url, bool create) {
  try {
    host::SqlOptions options;
    options.create = create;
    options.relativePaths = true;
    return host::SqlHost::Open(url, options);
  } catch (const RunTimeError& error) {
    throw Refusal(error.Description());
  }
}

fs::path CheckedFolder(const Options& options) {
  fs::path folder = ChosenFolder(options);
  std::error_code failure;
  if (!fs::is_directory(folder, failure)) throw Refusal(folder.string() + ": no such workspace folder");
  if (options.database.empty() && !fs::is_regular_file(folder / kDatabaseFile, failure)) {
    throw Refusal(folder.string() + ": not a workspace, it holds no " + std::string(kDatabaseFile) +
                  " (`partnerkit new " + folder.string() + "` makes one)");
  }
  return folder;
}

// Folders made so far, taken away again unless all went well. Only empty ones go.
class MadeFolders {
 public:
  ~MadeFolders() {
    std::error_code ignored;
    for (auto folder = made_.rbegin(); folder != made_.rend(); ++folder) fs::remove(*folder, ignored);
  }
  void Make(const fs::path& folder, mode_t rights = kFolderRights) {
    std::error_code failure;
    if (fs::is_directory(folder, failure)) return;
    if (folder.has_parent_path() && folder.parent_path() != folder) Make(folder.parent_path(), ACCESSPERMS);
    if (::mkdir(folder.c_str(), rights) != 0) {
      throw Refusal(folder.string() + ": cannot be made: " + std::strerror(errno));
    }
    made_.push_back(folder);
  }
  void Keep() { made_.clear(); }

 private:
  std::vector<fs::path> made_;
};

}  // namespace

void Command::Say(std::string_view message) const { err << "partnerkit: " << OneLine(message) << std::endl; }

fs::path AbsolutePath(const fs::path& path) {
  fs::path absolute = fs::absolute(path).lexically_normal();
  if (!absolute.has_filename() && absolute.has_relative_path()) absolute = absolute.parent_path();
  return absolute;
}

fs::path MakeWorkspace(const fs::path& folder, const std::string& database) {
  fs::path workspace = AbsolutePath(folder);
  const fs::path databaseFile = workspace / kDatabaseFile;
  std::error_code failure;
  if (fs::exists(databaseFile, failure)) throw Refusal(workspace.string() + ": is a workspace already");
  MadeFolders made;
  made.Make(workspace);
  for (const std::string_view name : kFolders) made.Make(workspace / name);
  if (database.empty()) {
    try {
      OpenStore(databaseFile.string(), true)->Close();
    } catch (...) {
      fs::remove(databaseFile, failure);
      throw;
    }
  } else {
    OpenStore(database, true)->Close();
  }
  made.Keep();
  return workspace;
}

Workspace::Workspace(const Command& command) : command_(command), folder_(CheckedFolder(command.options)) {
  const Options& options = command.options;
  const bool own = options.database.empty();
  host_ = OpenStore(own ? (folder_ / kDatabaseFile).string() : options.database, !own);
  ports_ = platform::DefaultPorts();
  ports_.errorOutlets.applicationName = "partnerkit";
  ports_.errorOutlets.dialog = [this](const ErrorReport& report, const std::string&) {
    Tell(report.report);
    return Button::kAbort;
  };
  ports_.tell = [this](Told kind, const std::string& sentence) {
    if (kind == Told::kFailed) hadFault_ = true;
    command_.Say(sentence);
  };
  if (options.now) {
    fixedClock_.emplace(*options.now);
    ports_.clock = &*fixedClock_;
  }
}

Workspace::~Workspace() { TellRepeats(); }

bool Workspace::CloseStore() {
  host_->Close();
  const std::size_t unstored = host_->UnstoredLogRecords();
  if (unstored == 0) return true;
  const std::string& fault = host_->LastFault();
  command_.Say(Counted(unstored, "log record", "log records") + " could not be stored" +
               (fault.empty() ? "" : ": " + fault));
  return false;
}

// A store that fails does so for every record; it is said once, and counted.
void Workspace::Tell(const std::string& report) {
  hadFault_ = true;
  if (report == lastReport_) {
    ++repeats_;
    return;
  }
  TellRepeats();
  command_.Say(report);
  lastReport_ = report;
}

void Workspace::TellRepeats() {
  if (repeats_ > 0) command_.Say("the error before this one came up " + std::to_string(repeats_) + " more times");
  repeats_ = 0;
}

}  // namespace partnerkit::cli

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <charconv>
#include <filesystem>
#include <optional>
#include <thread>
#include <utility>

#include "platform/posix_calls.h"
#include "platform/posix_files.h"
#include "spool/destination.h"

namespace partnerkit::spool {

namespace fs = std::filesystem;
using platform::Descriptor, platform::RaiseCause, platform::Uninterrupted;

namespace {

// Far above any number that counting reaches, so that a stray file's name cannot exhaust them.
constexpr std::size_t kMostDigits = 15;

// A folder that jobs are numbered in, by one program at a time. Where the file system has no locks, that no file is
// ever replaced has to do.
class HeldFolder {
 public:
  HeldFolder(const std::string& path, std::chrono::milliseconds patience)
      : path_(path), folder_(Uninterrupted([&] { return open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC); })) {
    if (!folder_.IsOpen() && errno == ENOENT) {
      platform::Raise(run_time::kPathNotFound, path, platform::CauseText(ENOENT));
    }
    if (!folder_.IsOpen()) RaiseCause(errno, path, run_time::kPathAccess);
    const auto deadline = std::chrono::steady_clock::now() + patience;
    while (Uninterrupted([&] { return flock(folder_.Number(), LOCK_EX | LOCK_NB); }) != 0) {
      if (errno != EWOULDBLOCK) return;
      if (std::chrono::steady_clock::now() > deadline) {
        platform::Raise(run_time::kPermissionDenied, path,
                        "Another program has held the folder for " + InSeconds(patience));
      }
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
  }

  // Another time after each file that comes or goes.
  std::pair<time_t, long> Changed() const {
    struct stat state {};
    if (fstat(folder_.Number(), &state) != 0) RaiseCause(errno, path_, run_time::kPathAccess);
    return {state.st_mtim.tv_sec, state.st_mtim.tv_nsec};
  }

  // The highest number of a job; 0 when there is none.
  std::uint64_t LastNumber() const {
    std::uint64_t last = 0;
    std::error_code failure;
    for (fs::directory_iterator file(path_, failure), end; !failure && file != end; file.increment(failure)) {
      const std::string name = file->path().filename().string();
      last = std::max(last, NumberOf(name));
    }
    if (failure) RaiseCause(failure.value(), path_, run_time::kPathAccess);
    return last;
  }

 private:
  static std::uint64_t NumberOf(std::string_view name) {
    if (!name.ends_with(".prn") && !name.ends_with(".pdf")) return 0;
    name.remove_suffix(4);
    std::uint64_t number = 0;
    const auto read = std::from_chars(name.data(), name.data() + name.size(), number);
    return read.ptr == name.data() + name.size() && name.size() <= kMostDigits ? number : 0;
  }

  std::string path_;
  Descriptor folder_;
};

std::string FileName(std::uint64_t number, Content content) {
  const std::string digits = std::to_string(number);
  return std::string(4 - std::min<std::size_t>(4, digits.size()), '0') + digits +
         (content == Content::kPdf ? ".pdf" : ".prn");
}

class FolderDestination : public Destination {
 public:
  FolderDestination(const std::string& folder, const TimeOuts& timeOuts)
      : folder_(platform::NativePath(folder)), timeOuts_(timeOuts) {}

  std::string Deliver(std::string_view bytes, Content content, const std::string&) override {
    const HeldFolder held(folder_, timeOuts_.stall);
    // Looking through the folder for each job would make a thousand of them cost a million.
    std::uint64_t number = last_ && last_->changed == held.Changed() ? last_->number : held.LastNumber();
    std::string draft;
    const std::unique_ptr<OutputFile> file = files_.OpenDraft(InFolder("job"), draft);
    try {
      file->Write(bytes);
      file->Sync();
      std::string name;
      do name = InFolder(FileName(++number, content));
      while (!files_.RenameNew(draft, name));
      file->Close();
      last_ = {held.Changed(), number};
      return name;
    } catch (...) {
      unlink(draft.c_str());
      throw;
    }
  }

  void Check() override {
    const HeldFolder held(folder_, timeOuts_.stall);
    if (faccessat(AT_FDCWD, folder_.c_str(), W_OK | X_OK, AT_EACCESS) != 0) {
      RaiseCause(errno, folder_, run_time::kPathAccess);
    }
  }

 private:
  std::string InFolder(const std::string& name) const { return (fs::path(folder_) / name).string(); }

  // The job that this object left last, and the folder as it was then.
  struct Last {
    std::pair<time_t, long> changed;
    std::uint64_t number;
  };

  std::string folder_;
  TimeOuts timeOuts_;
  std::optional<Last> last_;
  platform::PosixFiles files_;
};

}  // namespace

std::unique_ptr<Destination> MakeFolder(const std::string& folder, const TimeOuts& timeOuts) {
  return std::make_unique<FolderDestination>(folder, timeOuts);
}

}  // namespace partnerkit::spool

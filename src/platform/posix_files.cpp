#include "platform/posix_files.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <limits>
#include <string_view>
#include <system_error>
#include <utility>

#include "platform/posix_calls.h"
#include "platform/posix_opening.h"

namespace partnerkit::platform {

namespace {

static_assert(sizeof(off_t) == 8, "files above 2 GiB need 64-bit offsets");

// Enough for the disk to run at its speed, little enough to hold one for each open file.
constexpr std::size_t kWriteBuffer = 256 * 1024;

// After so many bytes the disk is set to work, so that a later Sync finds most of it done.
constexpr std::uint64_t kWriteBehind = 8 * 1024 * 1024;

// The native form of a path that a call of the system may be given.
std::string Checked(const std::string& path) {
  if (path.find('\0') != std::string::npos) Raise(run_time::kBadFileName, path, "A name cannot hold a NUL byte");
  return NativePath(path);
}

// A folder open for making its names durable. One that may be written but not read cannot be opened.
class FolderOf {
 public:
  explicit FolderOf(const std::string& native)
      : path_(Folder(native)),
        opened_(Uninterrupted([&] { return ::open(path_.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC); })) {
    if (!opened_.IsOpen() && (errno == EMFILE || errno == ENFILE)) RaiseCause(errno, path_, run_time::kTooManyFiles);
  }

  const std::string& Path() const { return path_; }
  void Sync() const {
    if (!opened_.IsOpen()) {
      ::sync();
    } else if (Uninterrupted([&] { return fsync(opened_.Number()); }) != 0 && errno != EINVAL) {
      RaiseCause(errno, path_, run_time::kDeviceError);
    }
  }

 private:
  std::string path_;
  Descriptor opened_;
};

// Gives `from` the name `to` by `rename`, durable when it returns: 0, or EEXIST for a name that `rename` finds taken.
template <class F>
int RenameBy(F rename, const std::string& from, const std::string& to) {
  const std::string nativeFrom = Checked(from);
  const std::string nativeTo = Checked(to);
  // Opened first: an error that came after the renaming could not be answered by doing it again.
  const FolderOf oldFolder(nativeFrom);
  const FolderOf newFolder(nativeTo);
  if (rename(nativeFrom.c_str(), nativeTo.c_str()) != 0) {
    const int cause = errno;
    if (cause == EEXIST) return cause;
    const bool targetFailed = cause == EISDIR || (cause == ENOENT && FolderMissing(nativeTo));
    RaiseCause(cause, targetFailed ? nativeTo : nativeFrom, run_time::kPathAccess);
  }
  newFolder.Sync();
  if (oldFolder.Path() != newFolder.Path()) oldFolder.Sync();
  return 0;
}

int RenameUnlessTaken(const char* from, const char* to) {
  if (renameat2(AT_FDCWD, from, AT_FDCWD, to, RENAME_NOREPLACE) == 0) return 0;
  if (errno != EINVAL && errno != ENOSYS) return -1;
  // Network file systems that lack the call have links.
  return link(from, to) == 0 ? unlink(from) : -1;
}

// Inside the system as far as the file systems allow. The cause of a failure, 0 when there is none.
int CopyBytes(int from, int to) {
  for (;;) {
    const ssize_t count =
        Uninterrupted([&] { return copy_file_range(from, nullptr, to, nullptr, std::size_t{1} << 30, 0); });
    if (count == 0) return 0;
    if (count > 0) continue;
    if (errno != EXDEV && errno != ENOSYS && errno != EINVAL && errno != EOPNOTSUPP) return errno;
    break;
  }
  std::string block(kWriteBuffer, '\0');
  for (;;) {
    const ssize_t count = Uninterrupted([&] { return ::read(from, block.data(), block.size()); });
    if (count <= 0) return count == 0 ? 0 : errno;
    for (ssize_t done = 0; done < count;) {
      const ssize_t written =
          Uninterrupted([&] { return ::write(to, block.data() + done, static_cast<std::size_t>(count - done)); });
      if (written <= 0) return written == 0 ? EIO : errno;
      done += written;
    }
  }
}

class PosixInput : public InputFile {
 public:
  PosixInput(Descriptor descriptor, std::string native)
      : descriptor_(std::move(descriptor)), native_(std::move(native)) {}

  std::size_t ReadAt(std::uint64_t offset, std::span<char> into) override {
    if (offset > static_cast<std::uint64_t>(std::numeric_limits<off_t>::max())) return 0;
    const ssize_t count = Uninterrupted(
        [&] { return pread(descriptor_.Number(), into.data(), into.size(), static_cast<off_t>(offset)); });
    if (count < 0) RaiseCause(errno, native_, run_time::kDeviceError);
    return static_cast<std::size_t>(count);
  }

  std::uint64_t Length() override {
    return static_cast<std::uint64_t>(StatusOf(descriptor_.Number(), native_).st_size);
  }

  bool StillNamed(const std::string& path) override {
    return Names(Checked(path), StatusOf(descriptor_.Number(), native_));
  }

  FileRights Rights() override {
    const struct stat status = StatusOf(descriptor_.Number(), native_);
    return {true, status.st_mode & 07777, status.st_uid, status.st_gid};
  }

  // The file's number alone would not do: it goes to the next file made once this one is deleted. The device's number
  // may change with a restart. Where the file system keeps no time of birth, the file's number has to do.
  std::string Identity() override {
    struct statx status {};
    if (statx(descriptor_.Number(), "", AT_EMPTY_PATH, STATX_INO | STATX_BTIME, &status) != 0) {
      RaiseCause(errno, native_, run_time::kDeviceError);
    }
    return std::to_string(status.stx_ino) + "-" + std::to_string(status.stx_btime.tv_sec) + "-" +
           std::to_string(status.stx_btime.tv_nsec);
  }

 private:
  Descriptor descriptor_;
  std::string native_;
};

class PosixOutput : public OutputFile {
 public:
  PosixOutput(Descriptor descriptor, std::string native, std::uint64_t length)
      : descriptor_(std::move(descriptor)), native_(std::move(native)), written_(length), nameUnsynced_(length == 0) {}

  ~PosixOutput() override {
    try {
      if (descriptor_.IsOpen()) Flush();
    } catch (...) {
      // Let go without Close: nobody is there to be told.
    }
  }

  // Takes all of `bytes` or, when it raises, none, so that a repeated call writes them once.
  void Write(std::string_view bytes) override {
    CheckOpen();
    if (buffer_.size() + bytes.size() > kWriteBuffer) Flush();
    if (buffer_.capacity() < kWriteBuffer) buffer_.reserve(kWriteBuffer);
    buffer_.append(bytes);
  }

  void Sync() override {
    CheckOpen();
    Flush();
    // After a failure the system forgets the bytes it could not write, and a second call would falsely succeed.
    if (syncFailure_ == 0 && Uninterrupted([&] { return fdatasync(descriptor_.Number()); }) != 0 && errno != EINVAL) {
      syncFailure_ = errno;
    }
    if (syncFailure_ != 0) RaiseCause(syncFailure_, native_, run_time::kDeviceError);
    if (nameUnsynced_) FolderOf(native_).Sync();
    nameUnsynced_ = false;
  }

  std::uint64_t Length() override { return written_ + buffer_.size(); }

  void Truncate(std::uint64_t length) override {
    CheckOpen();
    if (length >= Length()) return;
    if (length < written_) {
      if (Uninterrupted([&] { return ftruncate(descriptor_.Number(), static_cast<off_t>(length)); }) != 0) {
        RaiseCause(errno, native_, run_time::kDeviceError);
      }
      written_ = length;
    }
    buffer_.resize(length - written_);
  }

  void Close() override {
    CheckOpen();
    Flush();
    const int failure = descriptor_.Close();
    if (failure != 0) RaiseCause(failure, native_, run_time::kDeviceError);
  }

  bool TakeRights(const FileRights& rights, Take what) override {
    CheckOpen();
    if (!rights.known) return true;
    const int number = descriptor_.Number();
    const struct stat own = StatusOf(number, native_);
    if (what == Take::kNoMore) {
      constexpr std::uint32_t kOthers = S_IRWXG | S_IRWXO;
      SetMode(own.st_mode & 07777 & (~kOthers | rights.mode));
      return true;
    }
    bool taken = true;
    std::uint32_t mode = rights.mode;
    if (what == Take::kAll && fchown(number, static_cast<uid_t>(-1), rights.group) != 0) {
      // It would be another group that gets the rights.
      mode &= ~static_cast<std::uint32_t>(S_IRWXG);
      taken = false;
    }
    if (what == Take::kAll && own.st_uid != rights.owner) {
      taken = fchown(number, rights.owner, static_cast<gid_t>(-1)) == 0 && taken;
    }
    SetMode(mode);
    return taken;
  }

 private:
  void CheckOpen() const {
    if (!descriptor_.IsOpen()) Raise(run_time::kBadFileName, native_, "The file is closed");
  }

  void SetMode(std::uint32_t mode) const {
    if (fchmod(descriptor_.Number(), mode) != 0) RaiseCause(errno, native_, run_time::kPathAccess);
  }

  // What could not be written stays in the buffer.
  void Flush() {
    std::size_t done = 0;
    int failure = 0;
    while (done < buffer_.size() && failure == 0) {
      const ssize_t count =
          Uninterrupted([&] { return ::write(descriptor_.Number(), buffer_.data() + done, buffer_.size() - done); });
      if (count > 0) done += static_cast<std::size_t>(count);
      else failure = count == 0 ? EIO : errno;
    }
    written_ += done;
    buffer_.erase(0, done);
    if (failure != 0) RaiseCause(failure, native_, run_time::kDeviceError);
    if (written_ < begun_ + kWriteBehind) return;
    // A hint only: a file system that ignores it writes as well, and failures come up in Sync.
    static_cast<void>(sync_file_range(descriptor_.Number(), static_cast<off_t>(begun_),
                                      static_cast<off_t>(written_ - begun_), SYNC_FILE_RANGE_WRITE));
    begun_ = written_;
  }

  Descriptor descriptor_;
  std::string native_;
  std::string buffer_;
  std::uint64_t written_;
  std::uint64_t begun_ = written_;
  bool nameUnsynced_;
  int syncFailure_ = 0;
};

}  // namespace

std::string NativePath(const std::string& path) {
  if (path.find('\\') == std::string::npos) return path;
  std::string native;
  for (std::size_t begin = 0; begin < path.size();) {
    const std::size_t end = std::min(path.find('/', begin), path.size());
    std::string name = path.substr(begin, end - begin);
    struct stat status {};
    if (name.find('\\') != std::string::npos && lstat((native + name).c_str(), &status) != 0) {
      std::ranges::replace(name, '\\', '/');
    }
    native += name;
    if (end < path.size()) native += '/';
    begin = end + 1;
  }
  return native;
}

std::uint64_t PosixFiles::Length(const std::string& path) {
  const std::string native = Checked(path);
  struct stat status {};
  if (stat(native.c_str(), &status) != 0) RaiseCause(errno, native, run_time::kPathAccess);
  if (S_ISDIR(status.st_mode)) RaiseCause(EISDIR, native, run_time::kPathAccess);
  return static_cast<std::uint64_t>(status.st_size);
}

bool PosixFiles::Exists(const std::string& path) {
  if (path.find('\0') != std::string::npos) return false;
  struct stat status {};
  return stat(NativePath(path).c_str(), &status) == 0 && !S_ISDIR(status.st_mode);
}

std::string PosixFiles::FullName(const std::string& path) {
  std::error_code failure;
  const std::string native = NativePath(path);
  const std::filesystem::path full = std::filesystem::absolute(native, failure);
  return failure ? native : full.string();
}

std::string PosixFiles::Resolved(const std::string& path) {
  std::error_code failure;
  const std::string native = NativePath(path);
  if (!std::filesystem::is_symlink(native, failure)) return path;
  const std::filesystem::path target = std::filesystem::canonical(native, failure);
  return failure ? path : target.string();
}

std::unique_ptr<InputFile> PosixFiles::OpenInput(const std::string& path, Share share) {
  std::string native = Checked(path);
  const bool exclusive = share == Share::kExclusive;
  auto [descriptor, status] = OpenInputHeld(native, exclusive);
  if (!S_ISREG(status.st_mode)) Raise(run_time::kPathAccess, native, "Not a file whose bytes can be addressed");
  // A hint only: a file system that ignores it reads as well.
  static_cast<void>(posix_fadvise(descriptor.Number(), 0, 0, POSIX_FADV_SEQUENTIAL));
  return std::make_unique<PosixInput>(std::move(descriptor), std::move(native));
}

std::unique_ptr<OutputFile> PosixFiles::OpenOutput(const std::string& path, OutputMode mode) {
  std::string native = Checked(path);
  auto [descriptor, status] = OpenOutputHeld(native, mode != OutputMode::kAppendOwn);
  const int number = descriptor.Number();
  std::uint64_t length = 0;
  if (!S_ISREG(status.st_mode)) {
    // A device takes bytes at its own speed.
    fcntl(number, F_SETFL, O_APPEND);
  } else if (mode != OutputMode::kReplace) {
    // Measured under the hold: the file may have grown since it was opened.
    length = static_cast<std::uint64_t>(StatusOf(number, native).st_size);
  } else if (Uninterrupted([number] { return ftruncate(number, 0); }) != 0) {
    RaiseCause(errno, native, run_time::kPathAccess);
  }
  return std::make_unique<PosixOutput>(std::move(descriptor), std::move(native), length);
}

std::unique_ptr<OutputFile> PosixFiles::OpenDraft(const std::string& path, std::string& name) {
  Draft draft = MakeDraft(Checked(path));
  name = draft.name;
  return std::make_unique<PosixOutput>(std::move(draft.descriptor), std::move(draft.name), 0);
}

void PosixFiles::Delete(const std::string& path) {
  const std::string native = Checked(path);
  if (::unlink(native.c_str()) != 0) RaiseCause(errno, native, run_time::kPathAccess);
}

void PosixFiles::Rename(const std::string& from, const std::string& to) {
  const auto replace = [](const char* old, const char* chosen) { return std::rename(old, chosen); };
  // A folder that holds something.
  if (RenameBy(replace, from, to) == EEXIST) RaiseCause(EEXIST, to, run_time::kPathAccess);
}

bool PosixFiles::RenameNew(const std::string& from, const std::string& to) {
  return RenameBy(RenameUnlessTaken, from, to) != EEXIST;
}

void PosixFiles::CreateFolder(const std::string& path) {
  const std::string native = Checked(path);
  if (::mkdir(native.c_str(), 0777) != 0) RaiseCause(errno, native, run_time::kPathAccess);
}

void PosixFiles::Copy(const std::string& from, const std::string& to) {
  const std::string source = Checked(from), target = Checked(to);
  const Descriptor in = OpenWith(source, O_RDONLY);
  if (!in.IsOpen()) RaiseCause(errno, source, run_time::kPathAccess);
  const struct stat status = StatusOf(in.Number(), source);
  if (!S_ISREG(status.st_mode)) RaiseCause(EISDIR, source, run_time::kPathAccess);
  if (FileIs(target, status)) Raise(run_time::kPathAccess, target, "A file cannot be copied onto itself");
  Draft draft = MakeDraft(target);
  const int out = draft.descriptor.Number();
  // Ranges are never copied behind the end.
  fcntl(out, F_SETFL, 0);
  int failure = fchmod(out, status.st_mode & 0777) == 0 ? CopyBytes(in.Number(), out) : errno;
  if (failure == 0 && std::rename(draft.name.c_str(), target.c_str()) != 0) failure = errno;
  if (const int cause = draft.descriptor.Close(); failure == 0) failure = cause;
  if (failure == 0) return;
  ::unlink(draft.name.c_str());
  RaiseCause(failure, target, run_time::kDeviceError);
}

}  // namespace partnerkit::platform

#include "platform/posix_opening.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <cerrno>
#include <optional>
#include <utility>

#include "partnerkit/run_time_error.h"

namespace partnerkit::platform {

namespace {

// Without O_NONBLOCK the opening of a pipe would wait for its other end. Regular files don't heed it.
constexpr int kOpenFlags = O_CLOEXEC | O_NOCTTY | O_NONBLOCK;

constexpr int kMake = O_CREAT | O_EXCL | O_NOFOLLOW;

}  // namespace

struct stat StatusOf(int descriptor, const std::string& native) {
  struct stat status {};
  if (fstat(descriptor, &status) != 0) RaiseCause(errno, native, run_time::kDeviceError);
  return status;
}

bool FileIs(const std::string& native, const struct stat& held) {
  struct stat named {};
  return stat(native.c_str(), &named) == 0 && named.st_dev == held.st_dev && named.st_ino == held.st_ino;
}

bool Names(const std::string& native, const struct stat& held) {
  if (FileIs(native, held)) return true;
  struct stat named {};
  if (stat(native.c_str(), &named) == 0 || errno == ENOENT || errno == ENOTDIR) return false;
  RaiseCause(errno, native, run_time::kPathAccess);
}

Descriptor OpenWith(const std::string& native, int flags) {
  return Descriptor(Uninterrupted([&] { return ::open(native.c_str(), flags | kOpenFlags, 0666); }));
}

namespace {

// How often a file that is replaced while it is being opened is tried again.
constexpr int kOpenAttempts = 5;

bool LocksUnknown(int cause) { return cause == ENOLCK || cause == ENOSYS || cause == EOPNOTSUPP || cause == EINVAL; }

// Takes both kinds of lock. A file system may know one kind only, which then has to do.
void Hold(int descriptor, bool exclusive, bool writable, const std::string& native) {
  int failures = 0;
  const auto judge = [&](int result) {
    if (result == 0) return;
    if (errno == EWOULDBLOCK || errno == EACCES) {
      Raise(run_time::kPermissionDenied, native, "The file is in use");
    }
    if (!LocksUnknown(errno) || ++failures == 2) RaiseCause(errno, native, run_time::kPathAccess);
  };
  judge(Uninterrupted([&] { return flock(descriptor, (exclusive ? LOCK_EX : LOCK_SH) | LOCK_NB); }));
  struct flock wholeFile {};
  // A write lock is refused on a descriptor that cannot write; a read lock then still turns writers away.
  wholeFile.l_type = exclusive && writable ? F_WRLCK : F_RDLCK;
  wholeFile.l_whence = SEEK_SET;
  judge(Uninterrupted([&] { return fcntl(descriptor, F_OFD_SETLK, &wholeFile); }));
}

struct Opened {
  Descriptor descriptor;
  bool writable;
};

// Gives what `open` opens, held.
template <class F>
HeldFile OpenHeld(const std::string& native, bool exclusive, F open) {
  for (int attempt = 0; attempt < kOpenAttempts; ++attempt) {
    Opened opened = open();
    const struct stat status = StatusOf(opened.descriptor.Number(), native);
    if (S_ISDIR(status.st_mode)) RaiseCause(EISDIR, native, run_time::kPathAccess);
    Hold(opened.descriptor.Number(), exclusive, opened.writable, native);
    if (Names(native, status)) return {std::move(opened.descriptor), status};
  }
  Raise(run_time::kPermissionDenied, native, "Another program keeps replacing the file");
}

Opened OpenToRead(const std::string& native, bool preferWritable) {
  const auto open = [&](int access) {
    return Descriptor(Uninterrupted([&] { return ::open(native.c_str(), access | kOpenFlags); }));
  };
  if (preferWritable) {
    Descriptor writable = open(O_RDWR);
    if (writable.IsOpen()) return {std::move(writable), true};
    if (errno != EACCES && errno != EPERM && errno != EROFS && errno != ETXTBSY) {
      RaiseCause(errno, native, run_time::kPathAccess);
    }
  }
  Descriptor readable = open(O_RDONLY);
  if (!readable.IsOpen()) RaiseCause(errno, native, run_time::kPathAccess);
  return {std::move(readable), false};
}

// No O_TRUNC: another program's file must not be emptied before it is known to be free.
Opened OpenToWrite(const std::string& native, bool followLinks) {
  constexpr int kAppend = O_WRONLY | O_APPEND;
  for (int attempt = 0; attempt < kOpenAttempts; ++attempt) {
    Descriptor opened = OpenWith(native, kAppend | (followLinks ? 0 : O_NOFOLLOW));
    if (!opened.IsOpen() && errno == ENOENT) opened = OpenWith(native, kAppend | kMake);
    if (opened.IsOpen()) return {std::move(opened), true};
    // There after all: another program has just made it, or a link leads nowhere.
    if (errno != EEXIST) RaiseCause(errno, native, run_time::kPathAccess);
  }
  Raise(run_time::kPathAccess, native, "The name is a link that leads nowhere");
}

constexpr int kMostDrafts = 100;

// Takes away what a killed program left under the name. False when it may be somebody's.
bool ClearDraft(const std::string& name) {
  const Descriptor old = OpenWith(name, O_WRONLY | O_NOFOLLOW);
  if (!old.IsOpen()) return errno == ENOENT;
  try {
    const struct stat status = StatusOf(old.Number(), name);
    if (!S_ISREG(status.st_mode)) return false;
    Hold(old.Number(), true, true, name);
    return !Names(name, status) || ::unlink(name.c_str()) == 0;
  } catch (const RunTimeError&) {
    return false;
  }
}

// Nothing when the name is another's. What goes wrong is told of the file that it is to be a draft of.
std::optional<Draft> MakeDraftNamed(const std::string& name, const std::string& native) {
  for (int attempt = 0; attempt < kOpenAttempts; ++attempt) {
    Descriptor made = OpenWith(name, O_RDWR | O_APPEND | kMake);
    if (!made.IsOpen()) {
      if (errno != EEXIST) RaiseCause(errno, native, run_time::kPathAccess);
      if (!ClearDraft(name)) return std::nullopt;
      continue;
    }
    const struct stat status = StatusOf(made.Number(), name);
    try {
      Hold(made.Number(), true, true, name);
    } catch (const RunTimeError& error) {
      // Another program takes it for left over, and looks.
      if (error.Number() != run_time::kPermissionDenied) throw;
      return std::nullopt;
    }
    if (Names(name, status)) return Draft{name, std::move(made)};
  }
  return std::nullopt;
}

}  // namespace

HeldFile OpenInputHeld(const std::string& native, bool exclusive) {
  return OpenHeld(native, exclusive, [&] { return OpenToRead(native, exclusive); });
}

HeldFile OpenOutputHeld(const std::string& native, bool followLinks) {
  return OpenHeld(native, true, [&] { return OpenToWrite(native, followLinks); });
}

// The hold tells a draft in the making from one that was left, so that the name needs no chance in it.
Draft MakeDraft(const std::string& native) {
  // Room for the rest of the name where names may have 255 bytes.
  constexpr std::size_t kLongestPart = 200;
  const std::size_t slash = native.find_last_of('/');
  const std::size_t begin = slash == std::string::npos ? 0 : slash + 1;
  const std::string stem = native.substr(0, begin) + "." + native.substr(begin, kLongestPart) + ".partnerkit-";
  for (int number = 1; number <= kMostDrafts; ++number) {
    auto draft = MakeDraftNamed(stem + std::to_string(number), native);
    if (!draft) continue;
    // Several programs at once may have left several.
    struct stat left {};
    while (lstat((stem + std::to_string(++number)).c_str(), &left) == 0) ClearDraft(stem + std::to_string(number));
    return *std::move(draft);
  }
  Raise(run_time::kPermissionDenied, native, "Every name for a draft of the file is in use");
}

}  // namespace partnerkit::platform

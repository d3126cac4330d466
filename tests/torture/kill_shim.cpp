// Preloaded into the program under torture: strikes at the N-th operation of a kind that changes what a crash would
// leave behind. PARTNERKIT_STRIKE is "ACTION KIND N [ERRNO]":
//
//   kill-before, kill-after   SIGKILL round the operation
//   kill-half                 SIGKILL once half of the bytes are written
//   stop-after                SIGSTOP behind it, for the harness to act meanwhile
//   fail-once, fail-on        the operation fails with ERRNO; with fail-on so does every later one of its kind
//
// Kinds are rename, unlink, sync, truncate, write and commit. With PARTNERKIT_STRIKE_TRACE each operation is noted in
// the file of that name, as its kind and the name of the file it goes to.
#include <dlfcn.h>
#include <fcntl.h>
#include <signal.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>

namespace {

struct Strike {
  std::string action, kind;
  long number = 0;
  int cause = 0;
  long seen = 0;
  bool struck = false;
  std::string trace;

  Strike() {
    std::array<char, 32> actionText{}, kindText{};
    const char* wanted = std::getenv("PARTNERKIT_STRIKE");
    if (wanted != nullptr &&
        std::sscanf(wanted, "%31s %31s %ld %d", actionText.data(), kindText.data(), &number, &cause) >= 3) {
      action = actionText.data();
      kind = kindText.data();
    }
    if (const char* path = std::getenv("PARTNERKIT_STRIKE_TRACE")) trace = path;
  }
};

Strike& TheStrike() {
  static Strike strike;
  return strike;
}

template <class F>
F* Real(const char* name) {
  return reinterpret_cast<F*>(dlsym(RTLD_NEXT, name));
}

void Trace(std::string_view kind, const std::string& path) {
  const int file = ::open(TheStrike().trace.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0666);
  const std::string line = std::string(kind) + " " + path.substr(path.rfind('/') + 1) + "\n";
  [[maybe_unused]] const ssize_t written =
      Real<ssize_t(int, const void*, size_t)>("write")(file, line.data(), line.size());
  ::close(file);
}

std::string PathOf(int descriptor) {
  std::array<char, 4096> path{};
  const ssize_t length = readlink(("/proc/self/fd/" + std::to_string(descriptor)).c_str(), path.data(), path.size());
  return length < 0 ? std::string() : std::string(path.data(), static_cast<std::size_t>(length));
}

bool IsOnDisk(int descriptor) {
  struct stat status {};
  return fstat(descriptor, &status) == 0 && (S_ISREG(status.st_mode) || S_ISDIR(status.st_mode));
}

// Runs one operation, or what the strike makes of it. `half` does as much of it as a crash in its midst would.
template <class Path, class Whole, class Half>
auto Operation(std::string_view kind, Path path, Whole whole, Half half) -> decltype(whole()) {
  Strike& strike = TheStrike();
  if (!strike.trace.empty()) Trace(kind, path());
  if (strike.kind != kind) return whole();
  const bool hit = ++strike.seen == strike.number;
  strike.struck = strike.struck || hit;
  if ((hit && strike.action == "fail-once") || (strike.struck && strike.action == "fail-on")) {
    errno = strike.cause;
    return -1;
  }
  if (!hit) return whole();
  if (strike.action == "kill-half") half();
  if (strike.action == "kill-before" || strike.action == "kill-half") kill(getpid(), SIGKILL);
  const auto result = whole();
  if (strike.action == "kill-after") kill(getpid(), SIGKILL);
  if (strike.action == "stop-after") kill(getpid(), SIGSTOP);
  return result;
}

template <class F, class... Arguments>
int OnDescriptor(std::string_view kind, const char* name, int descriptor, Arguments... arguments) {
  const auto whole = [&] { return Real<F>(name)(descriptor, arguments...); };
  if (!IsOnDisk(descriptor)) return whole();
  return Operation(
      kind, [&] { return PathOf(descriptor); }, whole, [] {});
}

ssize_t WriteAt(const char* name, int descriptor, const void* bytes, std::size_t count, off_t offset) {
  const auto write = [&](std::size_t part) {
    return Real<ssize_t(int, const void*, std::size_t, off_t)>(name)(descriptor, bytes, part, offset);
  };
  if (!IsOnDisk(descriptor)) return write(count);
  return Operation(
      "write", [&] { return PathOf(descriptor); }, [&] { return write(count); }, [&] { write(count / 2); });
}

}  // namespace

extern "C" {

struct sqlite3_stmt;

int rename(const char* from, const char* to) noexcept {
  return Operation(
      "rename", [&] { return std::string(to); },
      [&] { return Real<int(const char*, const char*)>("rename")(from, to); }, [] {});
}

int renameat2(int fromFolder, const char* from, int toFolder, const char* to, unsigned flags) noexcept {
  return Operation(
      "rename", [&] { return std::string(to); },
      [&] {
        return Real<int(int, const char*, int, const char*, unsigned)>("renameat2")(fromFolder, from, toFolder, to,
                                                                                    flags);
      },
      [] {});
}

int unlink(const char* path) noexcept {
  return Operation(
      "unlink", [&] { return std::string(path); }, [&] { return Real<int(const char*)>("unlink")(path); }, [] {});
}

int fsync(int descriptor) { return OnDescriptor<int(int)>("sync", "fsync", descriptor); }
int fdatasync(int descriptor) { return OnDescriptor<int(int)>("sync", "fdatasync", descriptor); }

int ftruncate(int descriptor, off_t length) noexcept {
  return OnDescriptor<int(int, off_t)>("truncate", "ftruncate", descriptor, length);
}
int ftruncate64(int descriptor, off64_t length) noexcept {
  return OnDescriptor<int(int, off64_t)>("truncate", "ftruncate64", descriptor, length);
}

ssize_t write(int descriptor, const void* bytes, std::size_t count) {
  const auto some = [&](std::size_t part) {
    return Real<ssize_t(int, const void*, std::size_t)>("write")(descriptor, bytes, part);
  };
  if (!IsOnDisk(descriptor)) return some(count);
  return Operation(
      "write", [&] { return PathOf(descriptor); }, [&] { return some(count); }, [&] { some(count / 2); });
}

ssize_t pwrite(int descriptor, const void* bytes, std::size_t count, off_t offset) {
  return WriteAt("pwrite", descriptor, bytes, count, offset);
}
ssize_t pwrite64(int descriptor, const void* bytes, std::size_t count, off64_t offset) {
  return WriteAt("pwrite64", descriptor, bytes, count, offset);
}

// A commit of the store: everything that SQLite does under it, checkpoints included.
int sqlite3_step(sqlite3_stmt* statement) {
  const auto step = [&] { return Real<int(sqlite3_stmt*)>("sqlite3_step")(statement); };
  const char* sql = Real<const char*(sqlite3_stmt*)>("sqlite3_sql")(statement);
  if (sql == nullptr || std::strcmp(sql, "COMMIT") != 0) return step();
  return Operation(
      "commit", [] { return std::string(); }, step, [] {});
}

}  // extern "C"

#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <ctime>
#include <filesystem>
#include <optional>
#include <string>

#include "partnerkit/platform.h"
#include "platform/clocks.h"
#include "platform/posix_files.h"

namespace partnerkit::platform {

namespace {

// What the run log has room for, and what other programs on the same log write.
constexpr std::size_t kLongestComputerName = 30;

// The log of a computer with a longer path has always shown this much of it.
constexpr std::size_t kLongestProgramPath = 255;

std::optional<std::string> ReadComputerName() {
  std::array<char, 256> name{};  // gethostname leaves a name that fills the room without an end
  if (gethostname(name.data(), name.size() - 1) != 0 || name[0] == '\0') return std::nullopt;
  return std::string(name.data(), std::min(std::strlen(name.data()), kLongestComputerName));
}

// Every log record has it.
std::optional<std::string> ComputerName() {
  static const std::optional<std::string> name = ReadComputerName();
  return name;
}

std::string ProgramPath() {
  std::error_code failure;
  return std::filesystem::read_symlink("/proc/self/exe", failure).string().substr(0, kLongestProgramPath);
}

}  // namespace

DateTime SystemClock::Now() {
  const std::time_t now = std::time(nullptr);
  std::tm local{};
  if (localtime_r(&now, &local) == nullptr) return DateTime::FromSeconds(now);
  // A leap second is 60 on machines that count them.
  return DateTime::FromYmdHms(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, local.tm_hour, local.tm_min,
                              std::min(local.tm_sec, 59))
      .value_or(DateTime::FromSeconds(now));
}

Ports DefaultPorts() {
  static PosixFiles files;
  static SystemClock clock;
  Ports ports;
  ports.files = &files;
  ports.clock = &clock;
  ports.computerName = ComputerName;
  ports.errorOutlets.libraryPath = ProgramPath();
  ports.errorOutlets.applicationName = std::filesystem::path(ports.errorOutlets.libraryPath).filename().string();
  return ports;
}

}  // namespace partnerkit::platform

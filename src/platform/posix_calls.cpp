#include "platform/posix_calls.h"

#include <sys/stat.h>

#include <algorithm>
#include <cstring>

namespace partnerkit::platform {

namespace {

// clang-format off
constexpr std::pair<std::int32_t, std::string_view> kWordings[] = {
    {run_time::kOutOfMemory,      "Out of memory"},
    {run_time::kBadFileName,      "Bad file name or number"},
    {run_time::kFileNotFound,     "File not found"},
    {run_time::kDeviceError,      "Device I/O error"},
    {run_time::kDiskFull,         "Disk full"},
    {run_time::kTooManyFiles,     "Too many files"},
    {run_time::kPermissionDenied, "Permission denied"},
    {run_time::kPathAccess,       "Path/File access error"},
    {run_time::kPathNotFound,     "Path not found"},
    {run_time::kPrinter,          "Printer error"},
};

constexpr std::pair<int, std::int32_t> kNumbers[] = {
    {ENOENT,       run_time::kFileNotFound},
    {ENOTDIR,      run_time::kPathNotFound},
    {ENAMETOOLONG, run_time::kBadFileName},
    {EACCES,       run_time::kPathAccess},
    {EPERM,        run_time::kPathAccess},
    {EROFS,        run_time::kPathAccess},
    {EISDIR,       run_time::kPathAccess},
    {EBUSY,        run_time::kPermissionDenied},
    {ETXTBSY,      run_time::kPermissionDenied},
    {EWOULDBLOCK,  run_time::kPermissionDenied},
    {ENOSPC,       run_time::kDiskFull},
    {EDQUOT,       run_time::kDiskFull},
    {EFBIG,        run_time::kDiskFull},
    {EMFILE,       run_time::kTooManyFiles},
    {ENFILE,       run_time::kTooManyFiles},
    {ENOMEM,       run_time::kOutOfMemory},
    {EIO,          run_time::kDeviceError},
    {ENXIO,        run_time::kDeviceError},
    {ENODEV,       run_time::kDeviceError},
};
// clang-format on

// The row of a table of pairs, or `otherwise` where there is none.
template <class Table, class Value>
Value LookUp(const Table& table, int key, Value otherwise) {
  for (const auto& [known, value] : table) {
    if (known == key) return value;
  }
  return otherwise;
}

}  // namespace

void Raise(std::int32_t number, std::string path, std::string_view cause) {
  // The description goes into one-line logs.
  std::ranges::replace_if(
      path, [](unsigned char c) { return c < ' ' || c == 0x7F; }, '?');
  throw RunTimeError(
      number, std::string(LookUp(kWordings, number, std::string_view())) + ": " + path + ": " + std::string(cause));
}

std::string_view CauseText(int cause) {
  // Never in the language of the process locale, unlike strerror.
  const char* words = strerrordesc_np(cause);
  return words == nullptr ? "unknown cause" : words;
}

std::string Folder(const std::string& native) {
  const std::size_t slash = native.find_last_of('/');
  if (slash == std::string::npos) return ".";
  return slash == 0 ? "/" : native.substr(0, slash);
}

bool FolderMissing(const std::string& native) {
  struct stat folder {};
  return stat(Folder(native).c_str(), &folder) != 0 && (errno == ENOENT || errno == ENOTDIR);
}

void RaiseCause(int cause, const std::string& native, std::int32_t otherwise) {
  const std::int32_t number =
      cause == ENOENT && FolderMissing(native) ? run_time::kPathNotFound : LookUp(kNumbers, cause, otherwise);
  Raise(number, native, CauseText(cause));
}

}  // namespace partnerkit::platform

// The error that a failing file, host or conversion operation raises inside the library.
#pragma once

#include <cstdint>
#include <exception>
#include <string>
#include <utility>

namespace partnerkit {

// Numbers of run-time errors, those that Basic programs of the trade have always logged, so that a supplier's notes and
// scripts keep their meaning.
namespace run_time {
inline constexpr std::int32_t kNone = 0;
inline constexpr std::int32_t kInvalidCall = 5;
inline constexpr std::int32_t kOverflow = 6;
inline constexpr std::int32_t kOutOfMemory = 7;
inline constexpr std::int32_t kSubscript = 9;
inline constexpr std::int32_t kDivisionByZero = 11;
inline constexpr std::int32_t kTypeMismatch = 13;
inline constexpr std::int32_t kInternal = 51;
inline constexpr std::int32_t kBadFileName = 52;
inline constexpr std::int32_t kFileNotFound = 53;
inline constexpr std::int32_t kAlreadyOpen = 55;
inline constexpr std::int32_t kDeviceError = 57;
inline constexpr std::int32_t kFileExists = 58;
inline constexpr std::int32_t kDiskFull = 61;
inline constexpr std::int32_t kPastEnd = 62;
inline constexpr std::int32_t kTooManyFiles = 67;
inline constexpr std::int32_t kPermissionDenied = 70;
inline constexpr std::int32_t kPathAccess = 75;
inline constexpr std::int32_t kPathNotFound = 76;
inline constexpr std::int32_t kNotSet = 91;
inline constexpr std::int32_t kCannotCreate = 429;
inline constexpr std::int32_t kKeyInUse = 457;
inline constexpr std::int32_t kPrinter = 482;
inline constexpr std::int32_t kDatabase = 40002;  // the database layer's error; the database's own number is beside it
}  // namespace run_time

class RunTimeError : public std::exception {
 public:
  RunTimeError(std::int32_t number, std::string description, std::string source = {})
      : number_(number), description_(std::move(description)), source_(std::move(source)) {}

  std::int32_t Number() const { return number_; }
  const std::string& Description() const { return description_; }
  // Empty for an error of this library; a hop text when it came up through another component.
  const std::string& Source() const { return source_; }
  const char* what() const noexcept override { return description_.c_str(); }

 private:
  std::int32_t number_;
  std::string description_;
  std::string source_;
};

}  // namespace partnerkit

// What calls of the system have in common: descriptors, interruptions, and their failures as run-time errors.
#pragma once

#include <unistd.h>

#include <cerrno>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

#include "partnerkit/run_time_error.h"

namespace partnerkit::platform {

// Raises an error described as "Disk full: PATH: CAUSE", the first words by the number. Control characters in the path
// become "?".
[[noreturn]] void Raise(std::int32_t number, std::string path, std::string_view cause);

// The same for an `errno`. `otherwise` is the number of a cause that has none of its own.
[[noreturn]] void RaiseCause(int cause, const std::string& native, std::int32_t otherwise);

// What an `errno` means, never in the language of the process locale.
std::string_view CauseText(int cause);

// The folder that a path's last name stands in.
std::string Folder(const std::string& native);
bool FolderMissing(const std::string& native);

template <class F>
auto Uninterrupted(F call) {
  for (;;) {
    const auto result = call();
    if (result != -1 || errno != EINTR) return result;
  }
}

class Descriptor {
 public:
  Descriptor() = default;
  explicit Descriptor(int number) : number_(number) {}
  Descriptor(Descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(number_, other.number_);
    return *this;
  }
  ~Descriptor() {
    if (number_ != -1) ::close(number_);
  }

  int Number() const { return number_; }
  bool IsOpen() const { return number_ != -1; }
  // The descriptor is gone whatever the answer, an interrupted call included: another file may have its number by now.
  int Close() { return ::close(std::exchange(number_, -1)) == 0 || errno == EINTR ? 0 : errno; }

 private:
  int number_ = -1;
};

}  // namespace partnerkit::platform

// Another program that holds a file while this object lives.
#pragma once

#include <fcntl.h>
#include <sys/file.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <string>

namespace partnerkit::testing {

class OtherProgram {
 public:
  explicit OtherProgram(const std::string& held) {
    int ready[2];
    if (pipe(ready) != 0) std::abort();
    child_ = fork();
    if (child_ == 0) {
      const int file = open(held.c_str(), O_RDWR);
      const bool holds = file != -1 && flock(file, LOCK_EX) == 0;
      if (!holds || write(ready[1], "1", 1) != 1) _exit(1);
      for (;;) pause();
    }
    char told = 0;
    if (read(ready[0], &told, 1) != 1) std::abort();
    close(ready[0]);
    close(ready[1]);
  }
  ~OtherProgram() {
    kill(child_, SIGKILL);
    waitpid(child_, nullptr, 0);
  }
  OtherProgram(const OtherProgram&) = delete;
  OtherProgram& operator=(const OtherProgram&) = delete;

 private:
  pid_t child_;
};

}  // namespace partnerkit::testing

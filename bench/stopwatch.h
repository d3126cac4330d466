// Elapsed time and the time that this process kept a processor busy.
#pragma once

#include <ctime>

class Stopwatch {
 public:
  double Elapsed() const { return Now(CLOCK_MONOTONIC) - start_; }
  double Busy() const { return Now(CLOCK_PROCESS_CPUTIME_ID) - startBusy_; }

 private:
  static double Now(clockid_t clock) {
    timespec now{};
    clock_gettime(clock, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
  }

  double start_ = Now(CLOCK_MONOTONIC);
  double startBusy_ = Now(CLOCK_PROCESS_CPUTIME_ID);
};

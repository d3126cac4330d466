// The system's clock, and one that stands still.
#pragma once

#include "partnerkit/ports.h"

namespace partnerkit::platform {

// Local time of the machine.
class SystemClock : public Clock {
 public:
  DateTime Now() override;
};

// Always the same time: a run as of another moment, repeatable to the second.
class FixedClock : public Clock {
 public:
  explicit FixedClock(DateTime now) : now_(now) {}
  DateTime Now() override { return now_; }

 private:
  DateTime now_;
};

}  // namespace partnerkit::platform

// What an operation raises, as text.
#pragma once

#include <functional>
#include <string>

#include "partnerkit/run_time_error.h"

namespace partnerkit::testing {

// The number and the description of the error that the operation raises; "" when it raises none.
inline std::string ErrorOf(const std::function<void()>& operation) {
  try {
    operation();
    return "";
  } catch (const RunTimeError& error) {
    return std::to_string(error.Number()) + " " + error.Description();
  }
}

}  // namespace partnerkit::testing

// What the tests of the destinations share.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <string>

#include "partnerkit/run_time_error.h"
#include "spool/destination.h"
#include "support/trading_fixture.h"

namespace partnerkit::spool {

using namespace std::chrono_literals;
using partnerkit::testing::TempFolder;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

inline constexpr TimeOuts kShort = {.connect = 500ms, .stall = 300ms, .closing = 200ms};

// The number and the description of the error that the operation raises; "" when it raises none.
inline std::string ErrorOf(const std::function<void()>& operation) {
  try {
    operation();
    return "";
  } catch (const RunTimeError& error) {
    return std::to_string(error.Number()) + " " + error.Description();
  }
}

}  // namespace partnerkit::spool

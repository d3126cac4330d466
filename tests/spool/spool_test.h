// What the tests of the destinations share.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>

#include "spool/destination.h"
#include "support/error_of.h"
#include "support/trading_fixture.h"

namespace partnerkit::spool {

using namespace std::chrono_literals;
using partnerkit::testing::ErrorOf;
using partnerkit::testing::TempFolder;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

inline constexpr TimeOuts kShort = {.connect = 500ms, .stall = 300ms, .closing = 200ms};

}  // namespace partnerkit::spool

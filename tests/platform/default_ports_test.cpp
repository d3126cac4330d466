#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <cstdlib>
#include <ctime>

#include "partnerkit/platform.h"

namespace partnerkit::platform {
namespace {

TEST(DefaultPorts, ReadTheLocalClock) {
  setenv("TZ", "XXX-10", 1);
  tzset();
  const std::int64_t before = std::time(nullptr) + 10 * 3600;
  const std::int64_t told = DefaultPorts().clock->Now().Seconds();
  EXPECT_GE(told, before);
  EXPECT_LE(told, before + 5);
  unsetenv("TZ");
  tzset();
}

TEST(DefaultPorts, NameTheComputerAndTheProgramAndAskNobody) {
  const Ports ports = DefaultPorts();
  std::array<char, 256> name{};
  ASSERT_EQ(gethostname(name.data(), name.size() - 1), 0);
  EXPECT_EQ(ports.computerName(), std::string(name.data()).substr(0, 30));
  EXPECT_EQ(ports.errorOutlets.libraryPath.front(), '/');
  EXPECT_TRUE(ports.errorOutlets.libraryPath.ends_with("/" + ports.errorOutlets.applicationName));
  EXPECT_FALSE(ports.errorOutlets.dialog);
  EXPECT_TRUE(ports.files->Exists("/dev/null"));
}

}  // namespace
}  // namespace partnerkit::platform

#include "frame/elements.h"

#include <gtest/gtest.h>

#include <string>

#include "partnerkit/run_time_error.h"

namespace partnerkit {
namespace {

TEST(ElementsTest, GoesRoundInACycleBehindTheLastElement) {
  const struct {
    std::string segment;
    int n;
    std::int16_t begin, length;
  } cases[] = {
      // clang-format off
      {"A*B", 0, 0, 2},      {"A*B", 1, 3, 0},    {"A*B", 2, 0, 2},    {"A*B", 3, 3, 0},
      {"A*BB*C", 1, 3, 2},   {"A*BB*C", 2, 6, 0}, {"A*BB*C", 3, 0, 2}, {"A*BB*C", 4, 3, 2}, {"A*BB*C", 22, 3, 2},
      {"N1*ST", 1, 4, 0},    {"N1**ST", 1, 4, 0}, {"N1**ST", 2, 5, 0}, {"N1*", 1, 4, 0},
      {"N1", 0, 0, 0},       {"N1", 1, 0, 0},     {"N1", 7, 0, 0},     {"", 3, 0, 0},
      // clang-format on
  };
  for (const auto& c : cases) {
    Elements elements('*');
    elements.Take("X*Y*Z*of another segment");
    elements.Take(c.segment);
    EXPECT_EQ(elements.PosBeg(c.n), c.begin) << c.segment << " " << c.n;
    EXPECT_EQ(elements.PosEnd(c.n), c.length) << c.segment << " " << c.n;
  }
}

TEST(ElementsTest, HasPositionsOfSixteenBits) {
  const auto taken = [](const std::string& segment) {
    Elements elements('+');
    elements.Take(segment);
    return elements;
  };
  const auto numberRaised = [](auto call) {
    try {
      call();
    } catch (const RunTimeError& error) {
      return error.Number();
    }
    return std::int32_t{0};
  };
  const std::string inside = std::string(32'765, 'x') + "+", outside = "x" + inside;
  EXPECT_EQ(taken(inside).PosBeg(1), 32'767);
  const std::string beyond = outside, farElement = "A+" + std::string(32'768, 'x') + "+";
  EXPECT_EQ(numberRaised([&] { taken(beyond).PosBeg(1); }), run_time::kOverflow);
  EXPECT_EQ(numberRaised([&] { taken(farElement).PosEnd(1); }), run_time::kOverflow);
  const std::string separators(32'768, '+');
  EXPECT_EQ(taken(separators.substr(1)).Count(), 32'767);
  EXPECT_EQ(numberRaised([&] { taken(separators).Count(); }), run_time::kOverflow);
}

}  // namespace
}  // namespace partnerkit

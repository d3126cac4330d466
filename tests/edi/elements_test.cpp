#include "edi/elements.h"

#include <gtest/gtest.h>

#include <string>

#include "support/error_of.h"

namespace partnerkit {
namespace {

TEST(ElementsTest, GoesRoundInACycleBehindTheLastElement) {
  const struct {
    std::string segment;
    int n;
    std::int16_t begin, length;
  } cases[] = {
      // clang-format off
      {"A*BB*C", 0, 0, 2},   {"A*BB*C", 1, 3, 2}, {"A*BB*C", 2, 6, 0}, {"A*BB*C", 3, 0, 2}, {"A*BB*C", 22, 3, 2},
      {"N1**ST", 1, 4, 0},   {"N1*", 1, 4, 0},    {"N1", 1, 0, 0},     {"", 3, 0, 0},
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
  const std::string inside = std::string(32'765, 'x') + "+";
  EXPECT_EQ(taken(inside).PosBeg(1), 32'767);
  const std::string beyond = "x" + inside, farElement = "A+" + std::string(32'768, 'x') + "+";
  EXPECT_EQ(testing::ErrorOf([&] { taken(beyond).PosBeg(1); }), "6 Overflow");
  EXPECT_EQ(testing::ErrorOf([&] { taken(farElement).PosEnd(1); }), "6 Overflow");
  const std::string separators(32'768, '+');
  EXPECT_EQ(taken(separators.substr(1)).Count(), 32'767);
  EXPECT_EQ(testing::ErrorOf([&] { taken(separators).Count(); }), "6 Overflow");
}

}  // namespace
}  // namespace partnerkit

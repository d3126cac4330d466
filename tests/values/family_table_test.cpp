#include "values/family_table.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>

namespace partnerkit {
namespace {

struct Step {
  std::string_view name = {};
  int minutes = 0;
  constexpr std::string_view Key() const { return name; }
};

constexpr FamilyTable<Step> kNorm{{"pick", 10}, {"pack", 20}, {"load", 30}};

std::string Told(std::span<const Step> steps) {
  std::string text;
  for (const Step& step : steps) text += std::string(step.name) + std::to_string(step.minutes) + " ";
  return text;
}

TEST(FamilyTableTest, ClassesDepartFromItByName) {
  constexpr auto kOwn =
      kNorm.Without("pack").Replacing(Step{"load", 5}).Before("load", Step{"weigh", 1}, Step{"wrap", 2});
  constexpr auto kMore = kOwn.With(Step{"pack", 3}, Step{"sign", 4});
  EXPECT_EQ(Told(kNorm), "pick10 pack20 load30 ");
  EXPECT_EQ(Told(kOwn), "pick10 weigh1 wrap2 load5 ");
  EXPECT_EQ(Told(kMore), "pick10 weigh1 wrap2 load5 pack3 sign4 ");
  EXPECT_EQ(kMore.Find("wrap")->minutes, 2);
  EXPECT_EQ(kOwn.Find("pack"), nullptr);
  constexpr FamilyTable<int> kPlain{7, 8, 9};
  EXPECT_THAT(kPlain.Without(8).With(1), ::testing::ElementsAre(7, 9, 1));
}

}  // namespace
}  // namespace partnerkit

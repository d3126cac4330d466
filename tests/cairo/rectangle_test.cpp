#include <climits>

#include "cairo/drawn.h"

namespace partnerkit::cairo {
namespace {

TEST(CairoRectangleTest, CoversTheOutermostPixelsWithItsPen) {
  const struct {
    PixelRect rect;
    int pen;
    const char* art;
  } cases[] = {
      {{2, 1, 6, 5}, 0, "........\n..####..\n..#..#..\n..#..#..\n..####..\n........\n"},
      {{2, 1, 6, 5}, 1, "........\n..####..\n..#..#..\n..#..#..\n..####..\n........\n"},
      {{6, 5, 2, 1}, 1, "........\n..####..\n..#..#..\n..#..#..\n..####..\n........\n"},
      {{2, 1, 7, 6}, 2, ".######.\n.######.\n.##..##.\n.##..##.\n.######.\n.######.\n"},
      {{2, 2, 7, 5}, 2, "........\n.######.\n.######.\n.######.\n.######.\n........\n"},
      {{3, 3, 4, 4}, 3, "........\n........\n..###...\n..###...\n..###...\n........\n"},
      // A pixel wider than the pen: two pens side by side.
      {{2, 2, 6, 3}, 3, "........\n.######.\n.######.\n.######.\n........\n........\n"},
      {{2, 1, 2, 5}, 3, "........\n........\n........\n........\n........\n........\n"},
      {{2, 5, 6, 5}, 3, "........\n........\n........\n........\n........\n........\n"},
      {{-2, -2, 4, 4}, 1, "...#....\n...#....\n...#....\n####....\n........\n........\n"},
      {{6, 4, 20, 20}, 2, "........\n........\n........\n.....###\n.....###\n.....##.\n"},
      {{INT_MIN, 2, INT_MAX, 3}, 1, "........\n........\n########\n........\n........\n........\n"},
      {{INT_MIN, INT_MIN, INT_MAX, INT_MAX}, 1, "........\n........\n........\n........\n........\n........\n"},
      {{1, 1, 0, 0}, INT_MAX, "########\n########\n########\n########\n########\n########\n"},
  };
  for (const auto& test : cases) {
    const Picture picture = Drawn(8, 6, [&](DrawingDevice& device) { device.Rectangle(test.rect, test.pen); });
    EXPECT_EQ(picture.Art(), test.art) << test.rect.left << ' ' << test.rect.top << ' ' << test.rect.right << ' '
                                       << test.rect.bottom << " pen " << test.pen;
  }
}

TEST(CairoRectangleTest, LeavesWhatIsInsideAndBeside) {
  EXPECT_EQ(Drawn(8, 6,
                  [](DrawingDevice& device) {
                    device.Rectangle({3, 2, 4, 3}, 1);
                    device.Rectangle({0, 5, 8, 6}, 1);
                    device.Rectangle({1, 0, 7, 5}, 1);
                    for (int x = 2; x < 6; ++x) device.Rectangle({x, 3, x + 1, 4}, 1);
                  })
                .Art(),
            ".######.\n.#....#.\n.#.#..#.\n.######.\n.######.\n########\n");
}

TEST(CairoRectangleTest, DrawsMoreBarsThanItKeeps) {
  const Picture picture = Drawn(5000, 2, [](DrawingDevice& device) {
    for (int x = 0; x < 5000; x += 2) device.Rectangle({x, 0, x + 1, 1}, 1);
  });
  for (int x = 0; x < 5000; ++x) {
    ASSERT_EQ(picture.At(x, 0), x % 2 == 0 ? 0 : 255) << x;
    ASSERT_EQ(picture.At(x, 1), 255) << x;
  }
}

}  // namespace
}  // namespace partnerkit::cairo

#include "ulk_tools/test_pattern.h"

#include <gtest/gtest.h>

using namespace ulk_tools;

TEST(TestPattern, DeterministicBarsWithTheFrameNumberInThePixels) {
    Frame a(64, 36), b(64, 36), c(64, 36);
    FillTestPattern(&a, 12);
    FillTestPattern(&b, 12);
    FillTestPattern(&c, 13);
    EXPECT_TRUE(a.SamePixels(b));
    EXPECT_FALSE(a.SamePixels(c));
    EXPECT_EQ(TestPatternFrameNumber(a), 12);
    EXPECT_EQ(TestPatternFrameNumber(c), 13);

    // Bars in order: white at the left, yellow next, black at the right; opaque everywhere.
    EXPECT_EQ(std::vector<int>(a.Pixel(0, 0), a.Pixel(0, 0) + 4),
              (std::vector<int>{255, 255, 255, 255}));
    EXPECT_EQ(std::vector<int>(a.Pixel(9, 5), a.Pixel(9, 5) + 4),
              (std::vector<int>{255, 255, 0, 255}));
    EXPECT_EQ(std::vector<int>(a.Pixel(63, 0), a.Pixel(63, 0) + 4),
              (std::vector<int>{0, 0, 0, 255}));
    // The ramp moves with the frame number.
    EXPECT_EQ(c.Pixel(40, 30)[0], static_cast<uint8_t>(a.Pixel(40, 30)[0] + 1));

    Frame big(16, 16);
    FillTestPattern(&big, 1000);
    EXPECT_EQ(TestPatternFrameNumber(big), 1000);
    // Tiny and negative frames must not fault.
    Frame tiny(1, 1);
    FillTestPattern(&tiny, -7);
    EXPECT_EQ(tiny.Pixel(0, 0)[3], 255);
}

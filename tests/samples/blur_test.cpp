// The blur sample: flat pictures stay flat, an impulse spreads into a
// symmetric bell of the requested width with its energy kept, a region comes
// out as in the full frame, and the host learns how far the blur reads.
#include "sample_host.h"

namespace {

using BlurTest = SampleTest;

TEST_F(BlurTest, FlatPictureStaysFlatInEveryOrderAndAtAnyRadius) {
    for (ulkImgFormat format : kSampleFormats) {
        for (const char* radius : {"1", "6.5", "120"}) {
            SCOPED_TRACE(::testing::Message() << format << " radius " << radius);
            SampleEffect blur("blur");
            ASSERT_TRUE(blur.ok()) << blur.model().GetErrorString();
            ASSERT_TRUE(blur.Set("radius", radius));
            HostImage in(format, 37, 23, 8, 9), out(format, 37, 23, 8, 5);
            in.Fill({17, 128, 250, 99});
            ASSERT_TRUE(blur.Run(in, out)) << blur.instance()->GetErrorString();
            ExpectPixels(out, [](int, int) { return Rgba{17, 128, 250, 99}; });
        }
    }
}

// Red alone carries an impulse; the sum, centre and variance of the bell along
// the line through it, and its mirror (and for a square, diagonal) symmetry.
TEST_F(BlurTest, ImpulseSpreadsSymmetricallyAndKeepsItsEnergy) {
    const struct {
        double sigma;
        int w, h;
        double tolerance;  // of the variance, relative
    } cases[] = {{3.0, 41, 41, 0.15}, {40.0, 401, 1, 0.05}, {40.0, 1, 401, 0.05}};
    for (const auto& c : cases) {
        SCOPED_TRACE(::testing::Message() << "sigma " << c.sigma << ", " << c.w << "x" << c.h);
        SampleEffect blur("blur");
        ASSERT_TRUE(blur.ok());
        blur.Param<ulkPNumber>("radius")->SetValue(0.0, c.sigma);
        HostImage in(kImgFormatBGRA, c.w, c.h, 16, 10), out(kImgFormatBGRA, c.w, c.h, 16, 2);
        const int cx = c.w / 2, cy = c.h / 2;
        const bool across = c.w > 1;  // the measured line: the row through the impulse
        const int centre = across ? cx : cy;
        in.Fill({0, 0, 0, 65535});
        in.Put(cx, cy, {65535, 0, 0, 65535});
        ASSERT_TRUE(blur.Run(in, out)) << blur.instance()->GetErrorString();

        double total = 0, line = 0, mean = 0, variance = 0;
        for (int y = 0; y < c.h; ++y)
            for (int x = 0; x < c.w; ++x) {
                const Rgba v = out.Get(x, y);
                total += v[0];
                ASSERT_EQ(v[0], out.Get(c.w - 1 - x, y)[0]) << x << "," << y;
                ASSERT_EQ(v[0], out.Get(x, c.h - 1 - y)[0]) << x << "," << y;
                if (c.w == c.h) {
                    ASSERT_EQ(v[0], out.Get(y, x)[0]) << x << "," << y;
                }
                ASSERT_EQ(v[1], 0);  // other channels untouched by red's impulse
                ASSERT_EQ(v[3], 65535);
                if (across ? y == cy : x == cx) {
                    const int i = across ? x : y;
                    line += v[0], mean += i * v[0], variance += (i - centre) * (i - centre) * v[0];
                }
            }
        EXPECT_NEAR(total, 65535.0, 65535.0 * 0.01);
        EXPECT_NEAR(mean / line, centre, 1e-6);
        EXPECT_NEAR(variance / line, c.sigma * c.sigma, c.sigma * c.sigma * c.tolerance);
        EXPECT_TRUE(out.PaddingIntact());
    }
}

TEST_F(BlurTest, RegionMatchesTheFullFrameAndMemoryComesFromTheHost) {
    SampleEffect blur("blur");
    ASSERT_TRUE(blur.ok());
    ASSERT_TRUE(blur.Set("radius", "4"));
    HostImage in(kImgFormatRGBA, 60, 40, 8, 4), full(kImgFormatRGBA, 60, 40),
        part(kImgFormatRGBA, 60, 40, 8, 8);
    in.Paint([](int x, int y) { return Rgba{(x * 7 + y * 3) % 256, x * 4, y * 6, 255}; });
    ASSERT_TRUE(blur.Run(in, full));

    part.Fill({1, 2, 3, 4});
    const ulkBounds region = {20, 10, 44, 29};
    ASSERT_TRUE(blur.Run({&in}, part, &region));
    for (int y = 0; y < 40; ++y)
        for (int x = 0; x < 60; ++x) {
            const Rgba got = part.Get(x, y);
            if (!(x >= 20 && x <= 44 && y >= 10 && y <= 29)) {
                ASSERT_EQ(got, (Rgba{1, 2, 3, 4})) << x << "," << y;
                continue;
            }
            // The sums start elsewhere, so allow for a rounding step.
            for (int c = 0; c < 4; ++c) ASSERT_NEAR(got[c], full.Get(x, y)[c], 1) << x << "," << y;
        }
    EXPECT_TRUE(part.PaddingIntact());

    // The host learns how far around the region the blur reads: two to four sigma.
    ulkBounds needed = region;
    blur.instance()->GetInputSize(&needed);
    const int grow = region.left - needed.left;
    EXPECT_GE(grow, 8);
    EXPECT_LE(grow, 16);
    EXPECT_EQ(needed.top, region.top - grow);
    EXPECT_EQ(needed.right, region.right + grow);
    EXPECT_EQ(needed.bottom, region.bottom + grow);

    // Below half a pixel there is nothing to do: the host copies the input.
    ASSERT_TRUE(blur.Set("radius", "0.4"));
    ASSERT_TRUE(blur.Run(in, full));
    EXPECT_FALSE(blur.instance()->HasEffect());

    // Working memory comes from the host: none offered, none taken.
    ASSERT_TRUE(blur.Set("radius", "4"));
    ulkHostInstance::SetAllocCallback(nullptr);
    EXPECT_FALSE(blur.Run(in, full));
    EXPECT_EQ(blur.instance()->GetError(), kErrorNullCallback);
}

}  // namespace

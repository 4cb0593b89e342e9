// The blur sample: flat pictures stay flat, an impulse spreads into a
// symmetric bell of the requested width with its energy kept, regions and
// the animated radius behave as a host expects.
#include <cmath>

#include "sample_host.h"

namespace {

class BlurTest : public SampleTest {};

/// Sum, centre of mass and variance of one channel along a row or column.
struct Spread {
    double total = 0, mean = 0, variance = 0;
};

template <typename Sample>
Spread Measure(int count, Sample sample) {
    Spread s;
    for (int i = 0; i < count; ++i) {
        s.total += sample(i);
        s.mean += i * sample(i);
    }
    s.mean /= s.total;
    for (int i = 0; i < count; ++i) s.variance += (i - s.mean) * (i - s.mean) * sample(i);
    s.variance /= s.total;
    return s;
}

TEST_F(BlurTest, FlatPictureStaysFlatInEveryOrderAndAtAnyRadius) {
    for (ulkImgFormat format : kSampleFormats) {
        for (double radius : {1.0, 6.5, 120.0}) {
            SCOPED_TRACE(::testing::Message() << format << " radius " << radius);
            SampleEffect blur("blur");
            ASSERT_TRUE(blur.ok()) << blur.model().GetErrorString();
            blur.Param<ulkPNumber>("radius")->SetValue(0.0, radius);
            HostImage in(format, 37, 23, 8, 9), out(format, 37, 23, 8, 5);
            in.Fill({17, 128, 250, 99});
            ASSERT_TRUE(blur.Run(in, out)) << blur.instance()->GetErrorString();
            for (int y = 0; y < 23; ++y)
                for (int x = 0; x < 37; ++x) ASSERT_EQ(out.Get(x, y), (Rgba{17, 128, 250, 99}));
            EXPECT_TRUE(out.PaddingIntact());
        }
    }
}

TEST_F(BlurTest, ImpulseSpreadsSymmetricallyAndKeepsItsEnergy) {
    SampleEffect blur("blur");
    ASSERT_TRUE(blur.ok());
    const double sigma = 3.0;
    blur.Param<ulkPNumber>("radius")->SetValue(0.0, sigma);
    const int size = 41, c = 20;
    HostImage in(kImgFormatBGRA, size, size, 16, 10), out(kImgFormatBGRA, size, size, 16);
    in.Fill({0, 0, 0, 65535});
    in.Put(c, c, {65535, 0, 0, 65535});
    ASSERT_TRUE(blur.Run(in, out)) << blur.instance()->GetErrorString();

    double total = 0;
    for (int y = 0; y < size; ++y)
        for (int x = 0; x < size; ++x) total += out.Get(x, y)[0];
    EXPECT_NEAR(total, 65535.0, 65535.0 * 0.01);

    // Mirror and diagonal symmetry; the peak is the centre and falls off outwards.
    for (int dy = 0; dy <= 8; ++dy)
        for (int dx = 0; dx <= 8; ++dx) {
            const int v = out.Get(c + dx, c + dy)[0];
            EXPECT_EQ(v, out.Get(c - dx, c + dy)[0]);
            EXPECT_EQ(v, out.Get(c + dx, c - dy)[0]);
            EXPECT_EQ(v, out.Get(c + dy, c + dx)[0]);
            if (dx < 8) {
                EXPECT_GE(v, out.Get(c + dx + 1, c + dy)[0]);
            }
        }
    EXPECT_GT(out.Get(c + 3, c)[0], 0);
    EXPECT_EQ(out.Get(c, c)[1], 0);      // other channels untouched by red's impulse
    EXPECT_EQ(out.Get(c, c)[3], 65535);  // a flat alpha stays flat

    // Along the centre row the bell has the width asked for: variance sigma^2.
    const Spread row = Measure(size, [&](int x) { return double(out.Get(x, c)[0]); });
    EXPECT_NEAR(row.mean, c, 1e-6);
    EXPECT_NEAR(row.variance, sigma * sigma, sigma * sigma * 0.15);
}

TEST_F(BlurTest, LargeRadiusKeepsItsShapeInBothDirections) {
    const double sigma = 40.0;
    const int length = 401, c = 200;
    for (bool horizontal : {true, false}) {
        SCOPED_TRACE(horizontal ? "row" : "column");
        SampleEffect blur("blur");
        ASSERT_TRUE(blur.ok());
        blur.Param<ulkPNumber>("radius")->SetValue(0.0, sigma);
        const int w = horizontal ? length : 1, h = horizontal ? 1 : length;
        HostImage in(kImgFormatRGBA, w, h, 16, 6), out(kImgFormatRGBA, w, h, 16, 2);
        in.Put(horizontal ? c : 0, horizontal ? 0 : c, {65535, 65535, 65535, 65535});
        ASSERT_TRUE(blur.Run(in, out));
        const Spread s = Measure(length, [&](int i) {
            return double(out.Get(horizontal ? i : 0, horizontal ? 0 : i)[2]);
        });
        EXPECT_NEAR(s.total, 65535.0, 65535.0 * 0.01);
        EXPECT_NEAR(s.mean, c, 0.01);
        EXPECT_NEAR(s.variance, sigma * sigma, sigma * sigma * 0.05);
        EXPECT_TRUE(out.PaddingIntact());
    }
}

TEST_F(BlurTest, RegionRenderMatchesTheFullFrameInsideAndTouchesNothingOutside) {
    SampleEffect blur("blur");
    ASSERT_TRUE(blur.ok());
    blur.Param<ulkPNumber>("radius")->SetValue(0.0, 4.0);
    HostImage in(kImgFormatRGBA, 60, 40, 8, 4), full(kImgFormatRGBA, 60, 40),
        part(kImgFormatRGBA, 60, 40, 8, 8);
    for (int y = 0; y < 40; ++y)
        for (int x = 0; x < 60; ++x) in.Put(x, y, {(x * 7 + y * 3) % 256, x * 4, y * 6, 255});
    ASSERT_TRUE(blur.Run(in, full));

    part.Fill({1, 2, 3, 4});
    const ulkBounds region = {20, 10, 44, 29};
    ASSERT_TRUE(blur.instance()->SetOutput(0, part.get()));
    ASSERT_TRUE(blur.instance()->Execute(&region));
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

    // The host learns how far around the region the blur reads.
    ulkBounds needed = region;
    blur.instance()->GetInputSize(&needed);
    const int grow = region.left - needed.left;
    EXPECT_GE(grow, 8);   // at least two sigma
    EXPECT_LE(grow, 16);  // about three sigma, the reach of the three boxes
    EXPECT_EQ(needed.top, region.top - grow);
    EXPECT_EQ(needed.right, region.right + grow);
    EXPECT_EQ(needed.bottom, region.bottom + grow);
}

TEST_F(BlurTest, AnimatedRadiusStartsSharpAndEndsBlurred) {
    SampleEffect blur("blur");
    ASSERT_TRUE(blur.ok());
    ulkPNumber* radius = blur.Param<ulkPNumber>("radius");
    radius->SetValue(0.0, 0.0);
    radius->SetValue(1.0, 6.0);
    HostImage in(kImgFormatARGB, 31, 31, 16, 3), out(kImgFormatARGB, 31, 31, 16, 1);
    in.Fill({0, 0, 0, 65535});
    in.Put(15, 15, {65535, 65535, 65535, 65535});

    blur.SetFrame(0, 3);  // radius 0: nothing to do, so the host copies the input
    ASSERT_TRUE(blur.Run(in, out));
    EXPECT_FALSE(blur.instance()->HasEffect());
    EXPECT_EQ(out.Get(15, 15), (Rgba{65535, 65535, 65535, 65535}));
    EXPECT_EQ(out.Get(16, 15), (Rgba{0, 0, 0, 65535}));

    blur.SetFrame(1, 3);  // radius 3
    ASSERT_TRUE(blur.Run(in, out));
    const int mid = out.Get(15, 15)[0];
    EXPECT_LT(mid, 65535);
    EXPECT_GT(out.Get(16, 15)[0], 0);

    blur.SetFrame(2, 3);  // radius 6: flatter still
    ASSERT_TRUE(blur.Run(in, out));
    EXPECT_LT(out.Get(15, 15)[0], mid);
    EXPECT_GT(out.Get(21, 15)[0], 0);
}

TEST_F(BlurTest, WorkingMemoryComesFromTheHost) {
    SampleEffect blur("blur");
    ASSERT_TRUE(blur.ok());
    HostImage in(kImgFormatRGBA, 8, 8), out(kImgFormatRGBA, 8, 8);
    ulkHostInstance::SetAllocCallback(nullptr);  // a host that offers no memory
    EXPECT_FALSE(blur.Run(in, out));
    EXPECT_EQ(blur.instance()->GetError(), kErrorNullCallback);
}

}  // namespace

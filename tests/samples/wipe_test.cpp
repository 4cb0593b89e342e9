// The wipe sample: a compositor from foreground (progress 0) to background
// (progress 1), checked pixel by pixel for each transition.
#include <algorithm>
#include <cmath>

#include "sample_host.h"

namespace {

const Rgba kFore = {200, 40, 10, 255};
const Rgba kBack = {0, 120, 240, 128};

class WipeTest : public SampleTest {
  protected:
    /// Runs the wipe from a flat foreground and background into out.
    static bool Run(SampleEffect& wipe, HostImage& fore, HostImage& back, HostImage& out) {
        fore.Fill(kFore);
        back.Fill(kBack);
        ulkHostInstance* instance = wipe.instance();
        return instance->SetInput(0, fore.get()) && instance->SetInput(1, back.get()) &&
               instance->SetOutput(0, out.get()) && instance->Execute(nullptr);
    }
    static void Set(SampleEffect& wipe, const char* transition, double progress, double softness) {
        ASSERT_TRUE(wipe.Param<ulkPList>("transition")->ParseValue(0.0, transition));
        wipe.Param<ulkPNumber>("progress")->SetValue(0.0, progress);
        wipe.Param<ulkPNumber>("softness")->SetValue(0.0, softness);
    }
};

TEST_F(WipeTest, IsACompositorOfTwoInputs) {
    SampleEffect wipe("wipe");
    ASSERT_TRUE(wipe.ok()) << wipe.model().GetErrorString();
    EXPECT_STREQ(wipe.model().GetIdentifier(), "com.ulk.samples.wipe");
    EXPECT_EQ(wipe.model().GetType(), kPluginTypeCompositor);
    EXPECT_EQ(wipe.model().GetNumInputs(), 2);
}

TEST_F(WipeTest, EndsShowOneInputUntouchedForEveryTransitionAndOrder) {
    for (ulkImgFormat format : kSampleFormats) {
        for (const char* transition : {"Dissolve", "Wipe Left", "Wipe Right", "Circle"}) {
            SCOPED_TRACE(::testing::Message() << format << " " << transition);
            SampleEffect wipe("wipe");
            ASSERT_TRUE(wipe.ok());
            HostImage fore(format, 9, 6, 8, 4), back(format, 9, 6, 8, 4), out(format, 9, 6, 8, 4);
            for (double progress : {0.0, 1.0}) {
                Set(wipe, transition, progress, 0.3);
                out.Fill({7, 7, 7, 7});
                ASSERT_TRUE(Run(wipe, fore, back, out)) << wipe.instance()->GetErrorString();
                for (int y = 0; y < 6; ++y)
                    for (int x = 0; x < 9; ++x)
                        ASSERT_EQ(out.Get(x, y), progress == 0.0 ? kFore : kBack) << x << "," << y;
                EXPECT_TRUE(out.PaddingIntact());
            }
        }
    }
}

TEST_F(WipeTest, HalfwayWipesSplitThePictureDownTheMiddle) {
    SampleEffect wipe("wipe");
    ASSERT_TRUE(wipe.ok());
    HostImage fore(kImgFormatBGRA, 10, 4, 8, 3), back(kImgFormatBGRA, 10, 4),
        out(kImgFormatBGRA, 10, 4, 8, 5);

    Set(wipe, "Wipe Left", 0.5, 0.0);  // the background comes in from the right
    ASSERT_TRUE(Run(wipe, fore, back, out));
    for (int y = 0; y < 4; ++y)
        for (int x = 0; x < 10; ++x) ASSERT_EQ(out.Get(x, y), x < 5 ? kFore : kBack) << x;

    Set(wipe, "Wipe Right", 0.5, 0.0);  // ... and here from the left
    ASSERT_TRUE(Run(wipe, fore, back, out));
    for (int y = 0; y < 4; ++y)
        for (int x = 0; x < 10; ++x) ASSERT_EQ(out.Get(x, y), x < 5 ? kBack : kFore) << x;
    EXPECT_TRUE(out.PaddingIntact());
}

TEST_F(WipeTest, SoftEdgeRampsMonotonicallyBetweenThePictures) {
    SampleEffect wipe("wipe");
    ASSERT_TRUE(wipe.ok());
    HostImage fore(kImgFormatRGBA, 40, 1), back(kImgFormatRGBA, 40, 1), out(kImgFormatRGBA, 40, 1);
    Set(wipe, "Wipe Right", 0.5, 0.4);
    ASSERT_TRUE(Run(wipe, fore, back, out));
    EXPECT_EQ(out.Get(0, 0), kBack);
    EXPECT_EQ(out.Get(39, 0), kFore);
    int between = 0;
    for (int x = 1; x < 40; ++x) {
        // Red rises from the background's 0 on the left to the foreground's 200.
        EXPECT_GE(out.Get(x, 0)[0], out.Get(x - 1, 0)[0]);
        if (out.Get(x, 0)[0] > 0 && out.Get(x, 0)[0] < 200) ++between;
    }
    EXPECT_GE(between, 8);  // a ramp of several pixels, not a hard edge
}

TEST_F(WipeTest, DissolveMixesByProgressAndFollowsKeys) {
    SampleEffect wipe("wipe");
    ASSERT_TRUE(wipe.ok());
    HostImage fore(kImgFormatARGB, 3, 3, 16, 2), back(kImgFormatARGB, 3, 3, 16),
        out(kImgFormatARGB, 3, 3, 16, 6);
    ASSERT_TRUE(wipe.Param<ulkPList>("transition")->ParseValue(0.0, "Dissolve"));
    ulkPNumber* progress = wipe.Param<ulkPNumber>("progress");
    progress->SetValue(0.0, 0.0);
    progress->SetValue(1.0, 1.0);
    wipe.SetFrame(1, 5);  // time 0.25
    fore.Fill({40000, 0, 65535, 65535});
    back.Fill({0, 40000, 65535, 0});
    ASSERT_TRUE(wipe.instance()->SetInput(0, fore.get()) &&
                wipe.instance()->SetInput(1, back.get()) &&
                wipe.instance()->SetOutput(0, out.get()));
    ASSERT_TRUE(wipe.instance()->Execute(nullptr));
    EXPECT_EQ(out.Get(2, 2), (Rgba{30000, 10000, 65535, 49151}));  // 65535 * 0.75 = 49151.25
    EXPECT_TRUE(out.PaddingIntact());
}

TEST_F(WipeTest, CircleGrowsFromItsCentre) {
    SampleEffect wipe("wipe");
    ASSERT_TRUE(wipe.ok());
    const int w = 40, h = 30;
    HostImage fore(kImgFormatRGBA, w, h, 8, 8), back(kImgFormatRGBA, w, h),
        out(kImgFormatRGBA, w, h, 8, 8);
    Set(wipe, "Circle", 0.5, 0.0);
    wipe.Param<ulkPPoint2D>("centre")->SetValue(0.0, {0.25, 0.5});
    wipe.instance()->SetPixelAspect(1.0);
    ASSERT_TRUE(Run(wipe, fore, back, out));

    // Inside half the distance to the farthest corner: background; beyond: foreground.
    const double cx = 10.0, cy = 15.0, farthest = std::hypot(30.0, 15.0);
    int inside = 0;
    for (int y = 0; y < h; ++y)
        for (int x = 0; x < w; ++x) {
            const double d = std::hypot(x + 0.5 - cx, y + 0.5 - cy) / farthest;
            if (std::abs(d - 0.5) < 0.02) continue;  // right on the edge
            ASSERT_EQ(out.Get(x, y), d < 0.5 ? kBack : kFore) << x << "," << y;
            inside += d < 0.5;
        }
    EXPECT_GT(inside, 100);
}

}  // namespace

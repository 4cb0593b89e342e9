// The wipe sample: a compositor from foreground (progress 0) to background
// (progress 1), checked pixel by pixel for each transition. (ulk_render_test
// renders a dissolve through the tool.)
#include <cmath>

#include "sample_host.h"

namespace {

const Rgba kFore = {200, 40, 10, 255};
const Rgba kBack = {0, 120, 240, 128};

class WipeTest : public SampleTest {
  protected:
    /// Runs the wipe from a flat foreground and background into out.
    static bool Run(SampleEffect& wipe, HostImage& out) {
        HostImage fore(out.format(), out.width(), out.height(), 8, 4),
            back(out.format(), out.width(), out.height(), 8, 3);
        fore.Fill(kFore);
        back.Fill(kBack);
        return wipe.Run({&fore, &back}, out);
    }
};

TEST_F(WipeTest, EndsShowOneInputUntouchedForEveryTransitionAndOrder) {
    for (ulkImgFormat format : kSampleFormats) {
        for (const char* transition : {"Dissolve", "Wipe Left", "Wipe Right", "Circle"}) {
            SCOPED_TRACE(::testing::Message() << format << " " << transition);
            SampleEffect wipe("wipe");
            ASSERT_TRUE(wipe.ok()) << wipe.model().GetErrorString();
            HostImage out(format, 9, 6, 8, 4);
            for (const char* progress : {"0", "1"}) {
                ASSERT_TRUE(wipe.Set(
                    {{"transition", transition}, {"progress", progress}, {"softness", "0.3"}}));
                out.Fill({7, 7, 7, 7});
                ASSERT_TRUE(Run(wipe, out)) << wipe.instance()->GetErrorString();
                // At 0 the plug-in has nothing to do and the host copies the foreground.
                EXPECT_EQ(wipe.instance()->HasEffect(), *progress == '1');
                ExpectPixels(out, [&](int, int) { return *progress == '0' ? kFore : kBack; });
            }
        }
    }
}

// Half way the background covers the right half (Wipe Left), the left half
// (Wipe Right), or a circle half way to the farthest corner around the centre.
TEST_F(WipeTest, HalfwayTransitionsSplitThePicture) {
    const int w = 40, h = 30;
    constexpr double cx = 10.0, cy = 15.0;  // the centre (0.25, 0.5)
    const struct {
        const char* transition;
        int (*background)(int x, int y);  // 1: background, 0: foreground, -1: on the edge
    } cases[] = {
        {"Wipe Left", [](int x, int) { return int(x >= 20); }},
        {"Wipe Right", [](int x, int) { return int(x < 20); }},
        {"Circle",
         [](int x, int y) {
             const double d = std::hypot(x + 0.5 - cx, y + 0.5 - cy) / std::hypot(30.0, 15.0);
             return std::abs(d - 0.5) < 0.02 ? -1 : int(d < 0.5);
         }},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.transition);
        SampleEffect wipe("wipe");
        ASSERT_TRUE(wipe.ok());
        ASSERT_TRUE(wipe.Set({{"transition", c.transition},
                              {"progress", "0.5"},
                              {"softness", "0"},
                              {"centre", "0.25,0.5"}}));
        wipe.instance()->SetPixelAspect(1.0);
        HostImage out(kImgFormatBGRA, w, h, 8, 5);
        ASSERT_TRUE(Run(wipe, out));
        ExpectPixels(out, [&](int x, int y) {
            const int side = c.background(x, y);
            return side < 0 ? out.Get(x, y) : side ? kBack : kFore;
        });
    }

    // A soft edge ramps over several pixels from the background on the left.
    SampleEffect wipe("wipe");
    ASSERT_TRUE(wipe.ok());
    ASSERT_TRUE(wipe.Set({{"transition", "Wipe Right"}, {"progress", "0.5"}, {"softness", "0.4"}}));
    HostImage out(kImgFormatRGBA, w, 1);
    ASSERT_TRUE(Run(wipe, out));
    EXPECT_EQ(out.Get(0, 0), kBack);
    EXPECT_EQ(out.Get(w - 1, 0), kFore);
    int between = 0;
    for (int x = 1; x < w; ++x) {
        EXPECT_GE(out.Get(x, 0)[0], out.Get(x - 1, 0)[0]);  // red rises from 0 to 200
        between += out.Get(x, 0)[0] > 0 && out.Get(x, 0)[0] < 200;
    }
    EXPECT_GE(between, 8);
}

}  // namespace

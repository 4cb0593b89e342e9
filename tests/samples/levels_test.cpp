// The levels sample: each part of its formula in every accepted order and
// depth over padded rows, values worked out by hand, and the answers that let
// a host skip the frame. (ulk_render_test renders gain, a one-channel invert
// and keyed gain through the tool.)
#include "sample_host.h"

namespace {

using LevelsTest = SampleTest;

struct LevelsCase {
    const char* settings[3][2];  // parameter, value
    int bits;
    Rgba in, expected;
};

TEST_F(LevelsTest, FormulaInEveryOrderAndDepth) {
    const LevelsCase cases[] = {
        {{{"gain", "2"}}, 8, {60, 100, 200, 10}, {120, 200, 255, 10}},  // white clips, alpha kept
        {{{"gain", "2"}}, 16, {1000, 30001, 40000, 65535}, {2000, 60002, 65535, 65535}},
        // 255 * (v / 255) ^ (1 / 2): 127.75, 159.69, 225.83.
        {{{"gamma", "2"}}, 8, {64, 100, 200, 255}, {128, 160, 226, 255}},
        // The tint halves red first (32), then 0.2 * 255 = 51 comes off every colour.
        {{{"tint", "0.5,1,1"}, {"offset", "-0.2"}}, 8, {64, 100, 200, 255}, {0, 49, 149, 255}},
        {{{"invert", "true"}}, 16, {0, 1000, 65535, 300}, {65535, 64535, 0, 300}},
        {{{"channels", "Green"}, {"gain", "0.5"}}, 8, {100, 80, 60, 200}, {100, 40, 60, 200}},
        // The tint is for colour only.
        {{{"channels", "Alpha"}, {"gain", "0.5"}, {"tint", "0,0,0"}},
         8,
         {100, 80, 60, 200},
         {100, 80, 60, 100}},
    };
    for (const LevelsCase& c : cases) {
        for (ulkImgFormat format : kSampleFormats) {
            SCOPED_TRACE(::testing::Message() << c.settings[0][0] << " " << c.bits << " bits, "
                                              << "format " << format);
            SampleEffect levels("levels");
            ASSERT_TRUE(levels.ok()) << levels.model().GetErrorString();
            for (const auto& setting : c.settings)
                if (setting[0]) {
                    ASSERT_TRUE(levels.Set(setting[0], setting[1]));
                }
            HostImage in(format, 5, 3, c.bits, 12), out(format, 5, 3, c.bits, 7);
            in.Fill(c.in);
            ASSERT_TRUE(levels.Run(in, out)) << levels.instance()->GetErrorString();
            EXPECT_TRUE(levels.instance()->HasEffect());
            ExpectPixels(out, [&](int, int) { return c.expected; });
        }
    }
}

TEST_F(LevelsTest, NeutralSettingsSkipTheFrameAndOneImageServesBothSlots) {
    SampleEffect levels("levels");
    ASSERT_TRUE(levels.ok());
    HostImage in(kImgFormatRGBA, 4, 2), out(kImgFormatRGBA, 4, 2);
    in.Fill({10, 20, 30, 40});
    out.Fill({1, 2, 3, 4});
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_FALSE(levels.instance()->HasEffect());
    EXPECT_TRUE(levels.instance()->InPlace());
    EXPECT_EQ(out.Get(3, 1), (Rgba{1, 2, 3, 4}));  // the host was told it need not copy

    // In place: the same image as input and output.
    ASSERT_TRUE(levels.Set("invert", "true"));
    ASSERT_TRUE(levels.Run(in, in));
    EXPECT_TRUE(levels.instance()->HasEffect());
    EXPECT_EQ(in.Get(0, 0), (Rgba{245, 235, 225, 40}));
}

}  // namespace

// The generator sample: a title with no input whose bars, checkerboard,
// gradient and bitmap text are checked pixel by pixel. (ulk_render_test
// renders a checkerboard through the tool.)
#include "sample_host.h"

namespace {

using GeneratorTest = SampleTest;

TEST_F(GeneratorTest, ColourBarsInEveryOrderAndDepthNeedNoInput) {
    const Rgba bars[7] = {{3, 3, 3, 4}, {3, 3, 0, 4}, {0, 3, 3, 4}, {0, 3, 0, 4},
                          {3, 0, 3, 4}, {3, 0, 0, 4}, {0, 0, 3, 4}};  // quarters
    for (int bits : {8, 16}) {
        for (ulkImgFormat format : kSampleFormats) {
            SCOPED_TRACE(::testing::Message() << format << " " << bits);
            SampleEffect generator("generator");
            ASSERT_TRUE(generator.ok()) << generator.model().GetErrorString();
            HostImage out(format, 70, 5, bits, 6);
            ASSERT_TRUE(generator.Run({}, out)) << generator.instance()->GetErrorString();
            const double quarter = (bits == 8 ? 255 : 65535) / 4.0;
            ExpectPixels(out, [&](int x, int) {
                Rgba expected;
                for (int c = 0; c < 4; ++c)
                    expected[c] = static_cast<int>(bars[x / 10][c] * quarter + 0.5);
                return expected;
            });
            ulkBounds needed = {0, 0, 69, 4};
            generator.instance()->GetInputSize(&needed);
            EXPECT_LT(needed.right, needed.left);  // nothing
        }
    }
}

TEST_F(GeneratorTest, CheckerboardGradientAndText) {
    SampleEffect generator("generator");
    ASSERT_TRUE(generator.ok());
    ASSERT_TRUE(generator.Set({{"pattern", "Checkerboard"},
                               {"colour_a", "1,0,0"},
                               {"colour_b", "0,0,1"},
                               {"cell_size", "4"}}));
    const Rgba red = {255, 0, 0, 255}, blue = {0, 0, 255, 255};
    HostImage out(kImgFormatBGRA, 19, 13, 8, 5);
    ASSERT_TRUE(generator.Run({}, out));
    ExpectPixels(out, [&](int x, int y) { return (x / 4 + y / 4) % 2 == 0 ? red : blue; });

    // Black to white, left to right at angle 0, top to bottom at 90.
    ASSERT_TRUE(
        generator.Set({{"pattern", "Gradient"}, {"colour_a", "0,0,0"}, {"colour_b", "1,1,1"}}));
    HostImage ramp(kImgFormatRGBA, 51, 21, 8, 2);
    ASSERT_TRUE(generator.Run({}, ramp));
    EXPECT_LE(ramp.Get(0, 10)[0], 5);
    EXPECT_GE(ramp.Get(50, 10)[0], 250);
    EXPECT_NEAR(ramp.Get(25, 10)[1], 128, 1);
    EXPECT_EQ(ramp.Get(17, 0), ramp.Get(17, 20));
    ASSERT_TRUE(generator.Set("angle", "90"));
    ASSERT_TRUE(generator.Run({}, ramp));
    EXPECT_EQ(ramp.Get(0, 7), ramp.Get(50, 7));
    EXPECT_LT(ramp.Get(10, 0)[0], ramp.Get(10, 20)[0]);

    // "H" in 5 x 7 dots of 2 x 2 pixels over black, centred: its 10 x 14 pixels
    // start at (15, 8); its dots are the two outer columns and the middle row.
    ASSERT_TRUE(generator.Set(
        {{"colour_b", "0,0,0"}, {"text", "H"}, {"text_colour", "0,1,0"}, {"text_size", "2"}}));
    HostImage text(kImgFormatARGB, 40, 30, 8, 7);
    ASSERT_TRUE(generator.Run({}, text));
    const Rgba lit = {0, 255, 0, 255}, dark = {0, 0, 0, 255};
    ExpectPixels(text, [&](int x, int y) {
        const int col = (x - 15) / 2, row = (y - 8) / 2;
        const bool inGlyph = x >= 15 && x < 25 && y >= 8 && y < 22;
        return inGlyph && (col == 0 || col == 4 || row == 3) ? lit : dark;
    });
}

}  // namespace

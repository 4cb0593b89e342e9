// The generator sample: a title with no input whose bars, checkerboard,
// gradient and bitmap text are checked pixel by pixel.
#include "sample_host.h"

namespace {

class GeneratorTest : public SampleTest {
  protected:
    static bool Render(SampleEffect& generator, HostImage& out, const ulkBounds* region = nullptr) {
        return generator.instance()->SetOutput(0, out.get()) &&
               generator.instance()->Execute(region);
    }
};

TEST_F(GeneratorTest, IsATitleWithOneOutputAndNoInput) {
    SampleEffect generator("generator");
    ASSERT_TRUE(generator.ok()) << generator.model().GetErrorString();
    EXPECT_STREQ(generator.model().GetIdentifier(), "com.ulk.samples.generator");
    EXPECT_EQ(generator.model().GetType(), kPluginTypeTitle);
    EXPECT_EQ(generator.model().GetNumInputs(), 0);
    EXPECT_EQ(generator.model().GetNumOutputs(), 1);
    // The text settings are grouped.
    ulkParameter* group = generator.instance()->FindParameter("text_group");
    ASSERT_NE(group, nullptr);
    EXPECT_TRUE(group->IsGroup());
    EXPECT_EQ(generator.instance()->FindParameter("text")->GetGroup(), group);
    EXPECT_TRUE(generator.instance()->FindParameter("pattern")->IsAtTopLevel());
}

TEST_F(GeneratorTest, ColourBarsAreSeventyFivePercentBarsInEveryOrderAndDepth) {
    const Rgba bars[7] = {{3, 3, 3, 4}, {3, 3, 0, 4}, {0, 3, 3, 4}, {0, 3, 0, 4},
                          {3, 0, 3, 4}, {3, 0, 0, 4}, {0, 0, 3, 4}};  // quarters
    for (int bits : {8, 16}) {
        for (ulkImgFormat format : kSampleFormats) {
            SCOPED_TRACE(::testing::Message() << format << " " << bits);
            SampleEffect generator("generator");
            ASSERT_TRUE(generator.ok());
            HostImage out(format, 70, 5, bits, 6);
            ASSERT_TRUE(Render(generator, out)) << generator.instance()->GetErrorString();
            const double quarter = out.maxValue() / 4.0;
            for (int bar = 0; bar < 7; ++bar)
                for (int x : {bar * 10, bar * 10 + 9}) {  // both ends of each bar
                    Rgba expected;
                    for (int c = 0; c < 4; ++c)
                        expected[c] = static_cast<int>(bars[bar][c] * quarter + 0.5);
                    EXPECT_EQ(out.Get(x, 4), expected) << "bar " << bar << " x " << x;
                }
            EXPECT_TRUE(out.PaddingIntact());
        }
    }
}

TEST_F(GeneratorTest, CheckerboardCellsAlternateAndRegionsStayInside) {
    SampleEffect generator("generator");
    ASSERT_TRUE(generator.ok());
    ASSERT_TRUE(generator.Param<ulkPList>("pattern")->ParseValue(0.0, "Checkerboard"));
    generator.Param<ulkPColorRGB>("colour_a")->SetValue(0.0, {1.0, 0.0, 0.0});
    generator.Param<ulkPColorRGB>("colour_b")->SetValue(0.0, {0.0, 0.0, 1.0});
    generator.Param<ulkPNumber>("cell_size")->SetValue(0.0, 4);
    const Rgba red = {255, 0, 0, 255}, blue = {0, 0, 255, 255};

    HostImage out(kImgFormatBGRA, 19, 13, 8, 5);
    ASSERT_TRUE(Render(generator, out));
    for (int y = 0; y < 13; ++y)
        for (int x = 0; x < 19; ++x)
            ASSERT_EQ(out.Get(x, y), (x / 4 + y / 4) % 2 == 0 ? red : blue) << x << "," << y;
    EXPECT_TRUE(out.PaddingIntact());

    // Only the region asked for is drawn.
    HostImage part(kImgFormatRGBA, 19, 13, 8, 3);
    part.Fill({9, 9, 9, 9});
    const ulkBounds region = {5, 2, 11, 6};
    ASSERT_TRUE(Render(generator, part, &region));
    for (int y = 0; y < 13; ++y)
        for (int x = 0; x < 19; ++x) {
            const bool inside = x >= 5 && x <= 11 && y >= 2 && y <= 6;
            ASSERT_EQ(part.Get(x, y), inside ? out.Get(x, y) : (Rgba{9, 9, 9, 9}));
        }
}

TEST_F(GeneratorTest, GradientRunsFromColourAToColourBAlongTheAngle) {
    SampleEffect generator("generator");
    ASSERT_TRUE(generator.ok());
    ASSERT_TRUE(generator.Param<ulkPList>("pattern")->ParseValue(0.0, "Gradient"));
    generator.Param<ulkPColorRGB>("colour_a")->SetValue(0.0, {0.0, 0.0, 0.0});
    generator.Param<ulkPColorRGB>("colour_b")->SetValue(0.0, {1.0, 1.0, 1.0});
    HostImage out(kImgFormatRGBA, 51, 21, 8, 2);

    ASSERT_TRUE(Render(generator, out));  // angle 0: left to right
    EXPECT_LE(out.Get(0, 10)[0], 5);
    EXPECT_GE(out.Get(50, 10)[0], 250);
    EXPECT_NEAR(out.Get(25, 10)[1], 128, 1);
    for (int x = 1; x < 51; ++x) EXPECT_GT(out.Get(x, 3)[2], out.Get(x - 1, 3)[2]);
    EXPECT_EQ(out.Get(17, 0), out.Get(17, 20));  // no change down a column

    generator.Param<ulkPNumber>("angle")->SetValue(0.0, 90.0);  // top to bottom
    ASSERT_TRUE(Render(generator, out));
    EXPECT_EQ(out.Get(0, 7), out.Get(50, 7));
    EXPECT_LT(out.Get(10, 0)[0], out.Get(10, 20)[0]);
    EXPECT_EQ(out.Get(10, 20)[3], 255);
}

TEST_F(GeneratorTest, TextIsDrawnWithTheFiveBySevenFont) {
    SampleEffect generator("generator");
    ASSERT_TRUE(generator.ok());
    ASSERT_TRUE(generator.Param<ulkPList>("pattern")->ParseValue(0.0, "Checkerboard"));
    generator.Param<ulkPColorRGB>("colour_a")->SetValue(0.0, {0.0, 0.0, 0.0});
    generator.Param<ulkPColorRGB>("colour_b")->SetValue(0.0, {0.0, 0.0, 0.0});
    generator.Param<ulkPString>("text")->SetValue(0.0, "H");
    generator.Param<ulkPColorRGB>("text_colour")->SetValue(0.0, {0.0, 1.0, 0.0});
    generator.Param<ulkPNumber>("text_size")->SetValue(0.0, 2);
    HostImage out(kImgFormatARGB, 40, 30, 8, 7);
    ASSERT_TRUE(Render(generator, out));

    // "H" is 5 x 7 dots of 2 x 2 pixels, centred: its 10 x 14 pixels start at (15, 8).
    // Its dots: the two outer columns and the middle row.
    const Rgba lit = {0, 255, 0, 255}, dark = {0, 0, 0, 255};
    for (int y = 0; y < 30; ++y)
        for (int x = 0; x < 40; ++x) {
            const int col = (x - 15) / 2, row = (y - 8) / 2;
            const bool inGlyph = x >= 15 && x < 25 && y >= 8 && y < 22;
            const bool on = inGlyph && (col == 0 || col == 4 || row == 3);
            ASSERT_EQ(out.Get(x, y), on ? lit : dark) << x << "," << y;
        }
    EXPECT_TRUE(out.PaddingIntact());

    // Each character advances six dots; characters outside the font still draw ('?').
    generator.Param<ulkPString>("text")->SetValue(0.0, "H\x01H");
    generator.Param<ulkPNumber>("text_size")->SetValue(0.0, 1);
    ASSERT_TRUE(Render(generator, out));
    // 17 x 7 dots centred on (20, 15): the block starts at (12, 12), the last H at x 24.
    for (int y = 12; y < 19; ++y) {
        EXPECT_EQ(out.Get(12, y), lit) << y;
        EXPECT_EQ(out.Get(28, y), lit) << y;
    }
    int middle = 0;
    for (int y = 12; y < 19; ++y)
        for (int x = 18; x < 23; ++x) middle += out.Get(x, y) == lit;
    EXPECT_GT(middle, 0);
}

}  // namespace

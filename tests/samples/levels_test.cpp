// The levels sample, driven as a host drives it: parameters set by key,
// images over padded rows in every accepted order, pixels checked against
// values worked out by hand.
#include <cmath>

#include "sample_host.h"

namespace {

class LevelsTest : public SampleTest {};

TEST_F(LevelsTest, OpensAsAFilterOverTheSampleFormats) {
    SampleEffect levels("levels");
    ASSERT_TRUE(levels.ok()) << levels.model().GetErrorString();
    EXPECT_STREQ(levels.model().GetIdentifier(), "com.ulk.samples.levels");
    EXPECT_EQ(levels.model().GetType(), kPluginTypeFilter);
    for (ulkImgFormat format : kSampleFormats) EXPECT_TRUE(levels.model().AcceptsFormat(format));
    EXPECT_FALSE(levels.model().AcceptsFormat(kImgFormatUYVY));
    EXPECT_GT(levels.Param<ulkPNumber>("gamma")->GetMinimum(), 0.0);  // 1 / gamma stays finite
}

TEST_F(LevelsTest, GainDoublesColourAndKeepsAlphaInEveryOrder) {
    for (ulkImgFormat format : kSampleFormats) {
        SCOPED_TRACE(format);
        SampleEffect levels("levels");
        ASSERT_TRUE(levels.ok());
        levels.Param<ulkPNumber>("gain")->SetValue(0.0, 2.0);

        HostImage in(format, 5, 3, 8, 12), out(format, 5, 3, 8, 7);
        in.Fill({60, 100, 20, 200});
        in.Put(4, 2, {200, 128, 0, 10});
        ASSERT_TRUE(levels.Run(in, out)) << levels.instance()->GetErrorString();
        EXPECT_EQ(out.Get(0, 0), (Rgba{120, 200, 40, 200}));
        EXPECT_EQ(out.Get(3, 2), (Rgba{120, 200, 40, 200}));
        EXPECT_EQ(out.Get(4, 2), (Rgba{255, 255, 0, 10}));  // clipped at white
        EXPECT_TRUE(out.PaddingIntact());
    }
}

TEST_F(LevelsTest, GammaOffsetTintAndInvertFollowTheFormula) {
    SampleEffect levels("levels");
    ASSERT_TRUE(levels.ok());
    HostImage in(kImgFormatBGRA, 2, 2, 8, 4), out(kImgFormatBGRA, 2, 2);
    in.Fill({64, 100, 200, 255});

    // Gamma 2: 255 * (64 / 255) ^ (1 / 2) = 127.75.
    levels.Param<ulkPNumber>("gamma")->SetValue(0.0, 2.0);
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_EQ(out.Get(1, 1)[0], 128);
    EXPECT_EQ(out.Get(1, 1)[2], static_cast<int>(std::lround(255 * std::sqrt(200 / 255.0))));

    // Offset -0.2 removes 51 from every colour; the tint scales red by half first.
    levels.Param<ulkPNumber>("gamma")->SetValue(0.0, 1.0);
    levels.Param<ulkPNumber>("offset")->SetValue(0.0, -0.2);
    levels.Param<ulkPColorRGB>("tint")->SetValue(0.0, {0.5, 1.0, 1.0});
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_EQ(out.Get(0, 0), (Rgba{0, 49, 149, 255}));  // 32 - 51 clips at 0

    // Invert comes last: 255 - each of those.
    levels.Param<ulkPBoolean>("invert")->SetValue(0.0, true);
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_EQ(out.Get(0, 1), (Rgba{255, 206, 106, 255}));
}

TEST_F(LevelsTest, ChannelListLimitsTheChannelsTouched) {
    SampleEffect levels("levels");
    ASSERT_TRUE(levels.ok());
    levels.Param<ulkPNumber>("gain")->SetValue(0.0, 0.5);
    HostImage in(kImgFormatARGB, 3, 1, 8, 3), out(kImgFormatARGB, 3, 1, 8, 3);
    in.Fill({100, 80, 60, 200});

    ASSERT_TRUE(levels.Param<ulkPList>("channels")->ParseValue(0.0, "Green"));
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_EQ(out.Get(2, 0), (Rgba{100, 40, 60, 200}));

    ASSERT_TRUE(levels.Param<ulkPList>("channels")->ParseValue(0.0, "Alpha"));
    levels.Param<ulkPColorRGB>("tint")->SetValue(0.0, {0.0, 0.0, 0.0});  // colour only
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_EQ(out.Get(2, 0), (Rgba{100, 80, 60, 100}));
    EXPECT_TRUE(out.PaddingIntact());
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
    levels.Param<ulkPBoolean>("invert")->SetValue(0.0, true);
    ASSERT_TRUE(levels.Run(in, in));
    EXPECT_TRUE(levels.instance()->HasEffect());
    EXPECT_EQ(in.Get(0, 0), (Rgba{245, 235, 225, 40}));
}

TEST_F(LevelsTest, SixteenBitSamplesKeepTheirPrecision) {
    SampleEffect levels("levels");
    ASSERT_TRUE(levels.ok());
    levels.Param<ulkPNumber>("gain")->SetValue(0.0, 2.0);
    HostImage in(kImgFormatRGBA, 3, 2, 16, 6), out(kImgFormatRGBA, 3, 2, 16, 2);
    in.Fill({1000, 30001, 40000, 65535});
    ASSERT_TRUE(levels.Run(in, out)) << levels.instance()->GetErrorString();
    EXPECT_EQ(out.Get(2, 1), (Rgba{2000, 60002, 65535, 65535}));
    EXPECT_TRUE(out.PaddingIntact());
}

TEST_F(LevelsTest, KeyedGainIsInterpolatedAtTheFrameRendered) {
    SampleEffect levels("levels");
    ASSERT_TRUE(levels.ok());
    ulkPNumber* gain = levels.Param<ulkPNumber>("gain");
    gain->SetValue(0.0, 1.0);
    gain->SetValue(1.0, 3.0);
    HostImage in(kImgFormatRGBA, 1, 1), out(kImgFormatRGBA, 1, 1);
    in.Fill({50, 50, 50, 255});

    levels.SetFrame(2, 5);  // time 0.5: gain 2
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_EQ(out.Get(0, 0)[0], 100);
    levels.SetFrame(4, 5);  // time 1: gain 3
    ASSERT_TRUE(levels.Run(in, out));
    EXPECT_EQ(out.Get(0, 0)[0], 150);
}

TEST_F(LevelsTest, RefusesAnImageItCannotAddress) {
    SampleEffect levels("levels");
    ASSERT_TRUE(levels.ok());
    levels.Param<ulkPNumber>("gain")->SetValue(0.0, 2.0);
    HostImage out(kImgFormatRGBA, 2, 2);
    ulkImage* yuv = ulkImage::New();
    ulkImageFormat format;
    format.SetFormat(kImgFormatUYVY);
    yuv->SetFormat(&format);
    yuv->SetSize(2, 2);
    void* buffer = yuv->CreateBuffer();
    ASSERT_TRUE(levels.instance()->SetInput(0, yuv));
    ASSERT_TRUE(levels.instance()->SetOutput(0, out.get()));
    EXPECT_FALSE(levels.instance()->Execute(nullptr));
    EXPECT_EQ(levels.instance()->GetError(), kErrorPlugin);
    yuv->FreeBuffer(buffer);
    ulkImage::Delete(yuv);
}

}  // namespace

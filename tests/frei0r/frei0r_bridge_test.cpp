// Rendering through the bridge against the real thing: the same frames through
// ffmpeg's frei0r filter must come out byte for byte the same. ffmpeg hands an
// effect RGBA frames here (its colour model, or RGBA for PACKED32) and sets
// filter_params in order, a double read as a number. It runs no mixers, so
// those are checked against the effects' own formulas.
#include "frei0r_host.h"

namespace {

constexpr int kWidth = 64, kHeight = 48, kFrames = 3;
constexpr size_t kFrameBytes = static_cast<size_t>(kWidth) * kHeight * 4;

struct Case {
    const char* effect;  // file name without .so
    const char* param;   // ULK identifier ("" for none)
    const char* value;   // its text, and ffmpeg's filter_params
};
void PrintTo(const Case& c, std::ostream* os) {
    *os << c.effect << " " << c.param << "=" << c.value;
}
const Case kCases[] = {
    {"invert0r", "", ""},
    {"brightness", "brightness", "0.7"},
    {"contrast0r", "contrast", "0.3"},
    {"saturat0r", "saturation", "0.2"},
    {"gamma", "gamma", "0.3"},
    {"posterize", "levels", "0.15"},
    {"squareblur", "kernel_size", "0.1"},
};

class Frei0rVsFfmpeg : public Frei0rTest, public ::testing::WithParamInterface<Case> {
  protected:
    static void SetUpTestSuite() {
        sDir = new ScratchDir;
        ASSERT_TRUE(RunFfmpeg(
            "-f lavfi -i testsrc2=size=64x48:rate=25 -frames:v 3 -pix_fmt rgba -f rawvideo " +
            Input().string()));
    }
    static void TearDownTestSuite() { delete sDir; }
    static fs::path Input() { return sDir->path / "in.rgba"; }

    /// ffmpeg's output for the 64x48 frames in the file.
    static Bytes Ffmpeg(const Case& c, const fs::path& input) {
        std::string filter = std::string("frei0r=filter_name=") + c.effect;
        if (*c.value) filter += std::string(":filter_params=") + c.value;
        const fs::path output = sDir->path / "out.rgba";
        EXPECT_TRUE(RunFfmpeg("-f rawvideo -pix_fmt rgba -s 64x48 -i " + input.string() + " -vf " +
                              filter + " -f rawvideo -pix_fmt rgba " + output.string()));
        return ReadFile(output);
    }

    /// The bridge's output for the frames, one Execute per frame; padding
    /// bytes after each row of the host's images.
    static Bytes Bridge(const Case& c, const Bytes& in, int width, int height, int padding) {
        BridgeEffect effect(std::string("frei0r.") + c.effect);
        if (!effect.ok() || (*c.param && !effect.Set(c.param, c.value))) {
            ADD_FAILURE() << "cannot set up " << c.effect;
            return {};
        }
        HostImage source(kImgFormatRGBA, width, height, 8, padding),
            out(kImgFormatRGBA, width, height, 8, padding);
        const size_t frameBytes = static_cast<size_t>(width) * height * 4;
        Bytes result;
        for (int frame = 0; frame * frameBytes < in.size(); ++frame) {
            LoadFrame(&in[frame * frameBytes], source);
            effect.SetFrame(frame, kFrames);
            EXPECT_TRUE(effect.Run({&source}, out)) << effect.instance()->GetErrorString();
            EXPECT_TRUE(out.PaddingIntact());
            AppendFrame(out, &result);
        }
        return result;
    }

    static ScratchDir* sDir;
};
ScratchDir* Frei0rVsFfmpeg::sDir = nullptr;

// Tight aligned rows: frei0r works on the host's own pixels. Padded rows: on
// the bridge's scratch frames. Both must give ffmpeg's bytes. 61x45 is no
// multiple of 8: the bridge pads to 64x48 by repeating the last column and
// row, and ffmpeg given that padded frame must agree on the visible part.
TEST_P(Frei0rVsFfmpeg, SameBytesAsFfmpeg) {
    const Bytes input = ReadFile(Input()), expected = Ffmpeg(GetParam(), Input());
    ASSERT_EQ(expected.size(), kFrameBytes * kFrames);
    EXPECT_NE(expected, input);  // the setting does something visible
    EXPECT_TRUE(Bridge(GetParam(), input, kWidth, kHeight, 0) == expected) << "tight rows";
    EXPECT_TRUE(Bridge(GetParam(), input, kWidth, kHeight, 20) == expected) << "padded rows";

    constexpr int w = 61, h = 45;
    Bytes cropped, padded;
    for (int frame = 0; frame < kFrames; ++frame)
        for (int y = 0; y < kHeight; ++y)
            for (int x = 0; x < kWidth; ++x) {
                const size_t pixel =
                    static_cast<size_t>(std::min(y, h - 1)) * kWidth + std::min(x, w - 1);
                const unsigned char* p = &input[frame * kFrameBytes + pixel * 4];
                padded.insert(padded.end(), p, p + 4);
                if (x < w && y < h) cropped.insert(cropped.end(), p, p + 4);
            }
    WriteFile(sDir->path / "padded.rgba", padded);
    const Bytes ffmpeg = Ffmpeg(GetParam(), sDir->path / "padded.rgba");
    ASSERT_EQ(ffmpeg.size(), kFrameBytes * kFrames);
    Bytes visible;
    for (int frame = 0; frame < kFrames; ++frame)
        for (int y = 0; y < h; ++y) {
            const auto row = ffmpeg.begin() + frame * kFrameBytes + y * kWidth * 4;
            visible.insert(visible.end(), row, row + w * 4);
        }
    EXPECT_TRUE(Bridge(GetParam(), cropped, w, h, 0) == visible) << "odd size";
}

INSTANTIATE_TEST_SUITE_P(Effects, Frei0rVsFfmpeg, ::testing::ValuesIn(kCases),
                         [](const auto& info) { return std::string(info.param.effect); });

using Frei0rRender = Frei0rVsFfmpeg;

// Key frames animate frei0r parameters: each frame gets the value at its time.
TEST_F(Frei0rRender, KeyFramedValuesReachTheEffect) {
    const Bytes input = ReadFile(Input());
    BridgeEffect effect("frei0r.brightness");
    ASSERT_TRUE(effect.ok());
    auto* brightness = effect.Param<ulkPNumber>("brightness");
    brightness->SetValue(0.0, 0.25);
    brightness->SetValue(1.0, 0.75);
    HostImage source(kImgFormatRGBA, kWidth, kHeight), out(kImgFormatRGBA, kWidth, kHeight);
    for (int frame = 0; frame < kFrames; ++frame) {
        LoadFrame(&input[frame * kFrameBytes], source);
        effect.SetFrame(frame, kFrames);
        ASSERT_TRUE(effect.Run({&source}, out));
        char value[32];
        std::snprintf(value, sizeof value, "%.17g",
                      brightness->GetValue(effect.instance()->GetTime()));
        const Bytes expected = Ffmpeg({"brightness", "brightness", value}, Input());
        ASSERT_EQ(expected.size(), kFrameBytes * kFrames);
        Bytes rendered;
        AppendFrame(out, &rendered);
        EXPECT_TRUE(
            std::equal(rendered.begin(), rendered.end(), expected.begin() + frame * kFrameBytes))
            << "frame " << frame << ", brightness " << value;
    }
}

// blend: (a * (255 - b) + c * b) / 255 per byte, b = int(255 * blend);
// xfade0r: the same over 256 with its fader. Odd sizes with padded rows.
TEST_F(Frei0rRender, MixersCombineTheirInputs) {
    const struct {
        const char *effect, *param;
        double value;
        ulkImgFormat format;
        int divisor;
    } mixes[] = {{"blend", "blend", 0.3, kImgFormatRGBA, 255},
                 {"xfade0r", "fader", 0.6, kImgFormatBGRA, 256}};
    const Rgba a = {200, 100, 40, 255}, c = {20, 220, 160, 128};
    for (const auto& m : mixes) {
        BridgeEffect effect(std::string("frei0r.") + m.effect);
        SCOPED_TRACE(m.effect);
        ASSERT_TRUE(effect.ok());
        effect.Param<ulkPNumber>(m.param)->SetValue(0.0, m.value);
        HostImage first(m.format, 37, 21, 8, 12), second(m.format, 37, 21, 8, 12),
            out(m.format, 37, 21, 8, 12);
        first.Fill(a);
        second.Fill(c);
        ASSERT_TRUE(effect.Run({&first, &second}, out));
        const int b = static_cast<int>(255 * m.value);
        Rgba expected;
        for (int i = 0; i < 4; ++i) expected[i] = (a[i] * (255 - b) + c[i] * b) / m.divisor;
        ExpectPixels(out, [&](int, int) { return expected; });
    }
}

// onecol0r (BGRA8888) fills its frame with the colour parameter: no input.
TEST_F(Frei0rRender, SourceFillsTheOutput) {
    BridgeEffect effect("frei0r.onecol0r");
    ASSERT_TRUE(effect.ok());
    ASSERT_TRUE(effect.Set("color", "1,0.5,0"));
    HostImage out(kImgFormatBGRA, 13, 11, 8, 4);
    ASSERT_TRUE(effect.Run({}, out));
    const Rgba pixel = out.Get(12, 10);
    EXPECT_NEAR(pixel[1], 127, 1);
    ExpectPixels(out, [&](int, int) { return Rgba{255, pixel[1], 0, pixel[3]}; });
}

// One image as input and output (frei0r must not work in place), sizes that
// change between calls (a new frei0r instance), and a format the effect's
// colour model cannot take (refused, naming the effect).
TEST_F(Frei0rRender, InPlaceResizedAndRefusedFrames) {
    BridgeEffect effect("frei0r.invert0r");
    ASSERT_TRUE(effect.ok());
    for (int size : {16, 24, 7}) {
        HostImage image(kImgFormatRGBA, size, size);
        image.Fill({10, 20, 30, 40});
        image.Put(size - 1, 0, {250, 0, 100, 40});
        ASSERT_TRUE(effect.Run({&image}, image)) << size;
        EXPECT_EQ(image.Get(0, size - 1), (Rgba{245, 235, 225, 40})) << size;
        EXPECT_EQ(image.Get(size - 1, 0), (Rgba{5, 255, 155, 40})) << size;
    }
    HostImage in(kImgFormatBGRA, 8, 8), out(kImgFormatBGRA, 8, 8);  // invert0r is RGBA8888
    EXPECT_FALSE(effect.Run({&in}, out));
    EXPECT_NE(std::string(effect.instance()->GetErrorString()).find("frei0r.invert0r"),
              std::string::npos);
}

// An effect whose instance cannot be made: Execute fails and names it.
TEST_F(Frei0rTest, EffectThatFailsToConstructFailsExecute) {
    Frei0rPathGuard path(ULK_TEST_PLUGIN_DIR "/frei0r");  // holds unconstructible.so only
    SampleEffect effect(BridgePath(), 0);
    ASSERT_TRUE(effect.ok());
    EXPECT_STREQ(effect.model().GetIdentifier(), "frei0r.unconstructible");
    HostImage in(kImgFormatRGBA, 16, 16), out(kImgFormatRGBA, 16, 16);
    out.Fill({1, 2, 3, 4});
    EXPECT_FALSE(effect.Run(in, out));
    EXPECT_EQ(effect.instance()->GetError(), kErrorPlugin);
    EXPECT_NE(std::string(effect.instance()->GetErrorString()).find("frei0r.unconstructible"),
              std::string::npos);
    ExpectPixels(out, [](int, int) { return Rgba{1, 2, 3, 4}; });  // untouched
}

}  // namespace

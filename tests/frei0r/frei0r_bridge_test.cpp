// Rendering through the bridge against the real thing: the same frames run
// through ffmpeg's frei0r filter must come out byte for byte the same. ffmpeg
// cannot run mixers or sources here, so those are checked against values the
// test computes from the effects' documented formulas.
#include <cmath>

#include "frei0r_host.h"

namespace {

constexpr int kWidth = 64, kHeight = 48, kFrames = 3;
constexpr size_t kFrameBytes = static_cast<size_t>(kWidth) * kHeight * 4;

/// One effect with non-default settings: the parameter's text for the bridge
/// and ffmpeg's filter_params (ffmpeg maps its '|'-separated list to the
/// frei0r parameters in order; a double is read as a number).
struct Case {
    const char* effect;  // file name without .so
    const char* param;   // ULK identifier, or "" for none
    const char* value;
};
const Case kCases[] = {
    {"invert0r", "", ""},
    {"brightness", "brightness", "0.7"},
    {"contrast0r", "contrast", "0.3"},
    {"saturat0r", "saturation", "0.2"},
    {"gamma", "gamma", "0.3"},
    {"posterize", "levels", "0.15"},
    {"squareblur", "kernel_size", "0.1"},
};

void PrintTo(const Case& c, std::ostream* os) {
    *os << c.effect << " " << c.param << "=" << c.value;
}

class Frei0rVsFfmpeg : public Frei0rTest, public ::testing::WithParamInterface<Case> {
  protected:
    static void SetUpTestSuite() {
        sDir = new ScratchDir;
        sInput = sDir->path() / "in.rgba";
        ASSERT_TRUE(
            RunFfmpeg("-f lavfi -i testsrc2=size=64x48:rate=25 -frames:v 3 -pix_fmt rgba "
                      "-f rawvideo " +
                      sInput.string()));
        ASSERT_EQ(ReadFile(sInput).size(), kFrameBytes * kFrames);
    }
    static void TearDownTestSuite() { delete sDir; }

    /// ffmpeg's output for the frames in input (width x height RGBA).
    static std::vector<unsigned char> Ffmpeg(const Case& c, const fs::path& input, int width,
                                             int height) {
        std::string filter = std::string("frei0r=filter_name=") + c.effect;
        if (*c.value) filter += std::string(":filter_params=") + c.value;
        const fs::path output = sDir->path() / (std::string(c.effect) + ".out.rgba");
        const std::string size = std::to_string(width) + "x" + std::to_string(height);
        EXPECT_TRUE(RunFfmpeg("-f rawvideo -pix_fmt rgba -s " + size + " -i " + input.string() +
                              " -vf " + filter + " -f rawvideo -pix_fmt rgba " + output.string()));
        return ReadFile(output);
    }

    /// The bridge's output for the frames, one Execute per frame.
    static std::vector<unsigned char> Bridge(const Case& c, const std::vector<unsigned char>& in,
                                             int width, int height, int padding) {
        BridgeEffect effect(std::string("frei0r.") + c.effect);
        EXPECT_TRUE(effect.ok());
        if (!effect.ok()) return {};
        if (*c.param) {
            EXPECT_TRUE(effect.Set(c.param, c.value));
        }
        HostImage source(kImgFormatRGBA, width, height, 8, padding);
        HostImage out(kImgFormatRGBA, width, height, 8, padding);
        const size_t frameBytes = static_cast<size_t>(width) * height * 4;
        std::vector<unsigned char> result;
        for (int frame = 0; frame * frameBytes < in.size(); ++frame) {
            LoadFrame(&in[frame * frameBytes], source);
            effect.SetFrame(frame, kFrames);
            EXPECT_TRUE(effect.Run({&source}, out)) << effect.instance()->GetErrorString();
            EXPECT_TRUE(out.PaddingIntact());
            const auto bytes = SaveFrame(out);
            result.insert(result.end(), bytes.begin(), bytes.end());
        }
        return result;
    }

    static ScratchDir* sDir;
    static fs::path sInput;
};
ScratchDir* Frei0rVsFfmpeg::sDir = nullptr;
fs::path Frei0rVsFfmpeg::sInput;

// Tight, aligned rows: frei0r works on the host's own pixels. Padded rows:
// through the bridge's scratch frames. Both must match ffmpeg exactly.
TEST_P(Frei0rVsFfmpeg, SameBytesAsFfmpeg) {
    const Case& c = GetParam();
    const auto expected = Ffmpeg(c, sInput, kWidth, kHeight);
    ASSERT_EQ(expected.size(), kFrameBytes * kFrames);
    const auto input = ReadFile(sInput);
    EXPECT_NE(expected, input);  // the setting does something visible
    EXPECT_TRUE(Bridge(c, input, kWidth, kHeight, 0) == expected) << "tight rows";
    EXPECT_TRUE(Bridge(c, input, kWidth, kHeight, 20) == expected) << "padded rows";
}

// A size that is no multiple of 8: the bridge pads by repeating the last
// column and row. ffmpeg given that padded frame must agree on the visible part.
TEST_P(Frei0rVsFfmpeg, OddSizesArePaddedByRepeatingTheEdge) {
    const Case& c = GetParam();
    constexpr int w = 61, h = 45;
    const auto full = ReadFile(sInput);
    std::vector<unsigned char> cropped, padded;
    for (int frame = 0; frame < kFrames; ++frame)
        for (int y = 0; y < kHeight; ++y)
            for (int x = 0; x < kWidth; ++x) {
                const unsigned char* p =
                    &full[frame * kFrameBytes +
                          (static_cast<size_t>(std::min(y, h - 1)) * kWidth + std::min(x, w - 1)) *
                              4];
                padded.insert(padded.end(), p, p + 4);
                if (x < w && y < h) cropped.insert(cropped.end(), p, p + 4);
            }
    const fs::path paddedFile = sDir->path() / "padded.rgba";
    WriteFile(paddedFile, padded);
    const auto ffmpeg = Ffmpeg(c, paddedFile, kWidth, kHeight);
    ASSERT_EQ(ffmpeg.size(), kFrameBytes * kFrames);
    std::vector<unsigned char> expected;
    for (int frame = 0; frame < kFrames; ++frame)
        for (int y = 0; y < h; ++y) {
            const auto row = ffmpeg.begin() + frame * kFrameBytes + y * kWidth * 4;
            expected.insert(expected.end(), row, row + w * 4);
        }
    EXPECT_TRUE(Bridge(c, cropped, w, h, 0) == expected);
}

INSTANTIATE_TEST_SUITE_P(Effects, Frei0rVsFfmpeg, ::testing::ValuesIn(kCases),
                         [](const auto& info) { return std::string(info.param.effect); });

using Frei0rRender = Frei0rVsFfmpeg;

// Key frames animate frei0r parameters: each frame gets the value at its time.
TEST_F(Frei0rRender, KeyFramedValuesReachTheEffect) {
    const auto input = ReadFile(sInput);
    BridgeEffect effect("frei0r.brightness");
    ASSERT_TRUE(effect.ok());
    ulkPNumber* brightness = dynamic_cast<ulkPNumber*>(effect.Param("brightness"));
    brightness->SetValue(0.0, 0.25);
    brightness->SetValue(1.0, 0.75);
    HostImage source(kImgFormatRGBA, kWidth, kHeight), out(kImgFormatRGBA, kWidth, kHeight);
    for (int frame = 0; frame < kFrames; ++frame) {
        LoadFrame(&input[frame * kFrameBytes], source);
        effect.SetFrame(frame, kFrames);
        ASSERT_TRUE(effect.Run({&source}, out));
        const double value = brightness->GetValue(effect.instance()->GetTime());
        char text[32];
        std::snprintf(text, sizeof text, "%.17g", value);
        const Case fixed = {"brightness", "brightness", text};
        const auto expected = Ffmpeg(fixed, sInput, kWidth, kHeight);
        ASSERT_EQ(expected.size(), kFrameBytes * kFrames);
        EXPECT_TRUE(SaveFrame(out) ==
                    std::vector<unsigned char>(expected.begin() + frame * kFrameBytes,
                                               expected.begin() + (frame + 1) * kFrameBytes))
            << "frame " << frame << " value " << text;
    }
}

// blend: out = (a * (255 - b) + c * b) / 255 per byte, b = int(255 * blend).
// xfade0r: out = (a * (255 - f) + c * f) / 256, f = int(255 * fader).
TEST_F(Frei0rRender, MixersCombineTheirInputs) {
    struct Mix {
        const char* effect;
        const char* param;
        double value;
        ulkImgFormat format;
        int divisor;
    };
    const Mix mixes[] = {{"blend", "blend", 0.3, kImgFormatRGBA, 255},
                         {"xfade0r", "fader", 0.6, kImgFormatBGRA, 256}};
    const Rgba a = {200, 100, 40, 255}, c = {20, 220, 160, 128};
    for (const Mix& m : mixes) {
        BridgeEffect effect(std::string("frei0r.") + m.effect);
        ASSERT_TRUE(effect.ok()) << m.effect;
        dynamic_cast<ulkPNumber*>(effect.Param(m.param))->SetValue(0.0, m.value);
        HostImage first(m.format, 37, 21, 8, 12), second(m.format, 37, 21, 8, 12);
        HostImage out(m.format, 37, 21, 8, 12);
        first.Fill(a);
        second.Fill(c);
        ASSERT_TRUE(effect.Run({&first, &second}, out)) << m.effect;
        const int b = static_cast<int>(255 * m.value);
        Rgba expected;
        for (int i = 0; i < 4; ++i) expected[i] = (a[i] * (255 - b) + c[i] * b) / m.divisor;
        EXPECT_EQ(out.Get(0, 0), expected) << m.effect;
        EXPECT_EQ(out.Get(36, 20), expected) << m.effect;
        EXPECT_TRUE(out.PaddingIntact());
    }
}

// onecol0r fills the frame with its colour: no input, the colour parameter
// passed as frei0r floats.
TEST_F(Frei0rRender, SourceFillsTheOutput) {
    BridgeEffect effect("frei0r.onecol0r");
    ASSERT_TRUE(effect.ok());
    ASSERT_TRUE(effect.Set("color", "1,0.5,0"));
    HostImage out(kImgFormatBGRA, 13, 11, 8, 4);  // BGRA8888
    ASSERT_TRUE(effect.Run({}, out));
    const Rgba pixel = out.Get(12, 10);
    EXPECT_EQ(pixel[0], 255);
    EXPECT_NEAR(pixel[1], 127, 1);
    EXPECT_EQ(pixel[2], 0);
    EXPECT_EQ(out.Get(0, 0), pixel);
    EXPECT_TRUE(out.PaddingIntact());
}

// Rendering in place (the same image as input and output) and changing the
// frame size between calls, which makes the frei0r instance anew.
TEST_F(Frei0rRender, InPlaceAndResizedFrames) {
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
}

// An image the effect's colour model cannot take is refused with a reason.
TEST_F(Frei0rRender, RefusesFormatsOutsideTheColourModel) {
    BridgeEffect effect("frei0r.brightness");  // RGBA8888 only
    ASSERT_TRUE(effect.ok());
    HostImage in(kImgFormatBGRA, 8, 8), out(kImgFormatBGRA, 8, 8);
    EXPECT_FALSE(effect.Run({&in}, out));
    EXPECT_NE(std::string(effect.instance()->GetErrorString()).find("frei0r.brightness"),
              std::string::npos);
}

}  // namespace

namespace {

// An effect whose instance cannot be made: Execute fails and says which one.
TEST_F(Frei0rTest, EffectThatFailsToConstructFailsExecute) {
    Frei0rPathGuard path(ULK_TEST_PLUGIN_DIR "/frei0r");
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(BridgePath().c_str(), 0, nullptr));
    EXPECT_STREQ(model.GetIdentifier(), "frei0r.unconstructible");
    ulkHostInstance* instance = model.NewInstance();
    ASSERT_NE(instance, nullptr);
    HostImage in(kImgFormatRGBA, 16, 16), out(kImgFormatRGBA, 16, 16);
    out.Fill({1, 2, 3, 4});
    ASSERT_TRUE(instance->SetInput(0, in.get()) && instance->SetOutput(0, out.get()));
    EXPECT_FALSE(instance->Execute(nullptr));
    EXPECT_EQ(instance->GetError(), kErrorPlugin);
    EXPECT_NE(std::string(instance->GetErrorString()).find("frei0r.unconstructible"),
              std::string::npos);
    EXPECT_EQ(out.Get(5, 5), (Rgba{1, 2, 3, 4}));  // untouched
    model.DeleteInstance(instance);
    model.Close();
}

}  // namespace

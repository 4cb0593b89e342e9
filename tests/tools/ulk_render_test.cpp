// ulk-render run as a program: inputs written as PNG, frames rendered, read back and checked
// against values computed here from the effects' definitions.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>
#include <cstring>
#include <functional>

#include "scratch_folder.h"
#include "test_paths.h"
#include "tool_runner.h"
#include "ulk_tools/image_io.h"
#include "ulk_tools/raw_stream.h"
#include "ulk_tools/sequence.h"
#include "ulk_tools/test_pattern.h"

namespace {

using ulk_tools::Frame;

using PixelFunction = std::function<void(int x, int y, uint8_t* rgba)>;

class UlkRender : public ::testing::Test {
  protected:
    ToolResult Render(const std::vector<std::string>& arguments, const std::string& in = "") {
        return RunTool(ULK_RENDER_PATH, arguments, mFolder.Path(""), in);
    }

    // A picture whose pixels pixel gives, written as PNG; answers its path.
    std::string WriteInput(const std::string& name, int width, int height, PixelFunction pixel) {
        Frame frame(width, height);
        for (int y = 0; y < height; ++y)
            for (int x = 0; x < width; ++x) pixel(x, y, frame.Pixel(x, y));
        std::string error;
        EXPECT_TRUE(ulk_tools::WriteImage(Path(name), frame, &error)) << error;
        return Path(name);
    }

    std::string Solid(const std::string& name, uint8_t r, uint8_t g, uint8_t b, uint8_t a = 255) {
        return WriteInput(name, 8, 8,
                          [=](int, int, uint8_t* p) { p[0] = r, p[1] = g, p[2] = b, p[3] = a; });
    }

    Frame Read(const std::string& name) {
        Frame frame;
        std::string error;
        EXPECT_TRUE(ulk_tools::ReadImage(Path(name), &frame, &error)) << error;
        return frame;
    }

    // Every pixel of the picture in name within one step of what expected computes.
    void ExpectPixels(const std::string& name, PixelFunction expected) {
        const Frame frame = Read(name);
        ASSERT_FALSE(frame.Empty());
        int mismatches = 0;
        for (int y = 0; y < frame.Height(); ++y)
            for (int x = 0; x < frame.Width(); ++x) {
                uint8_t want[4];
                expected(x, y, want);
                for (int c = 0; c < 4; ++c)
                    if (std::abs(frame.Pixel(x, y)[c] - want[c]) > 1 && mismatches++ < 5)
                        ADD_FAILURE() << name << " (" << x << "," << y << ") channel " << c << ": "
                                      << int(frame.Pixel(x, y)[c]) << ", want " << int(want[c]);
            }
    }

    void ExpectSameFrames(const std::string& a, const std::string& b, int first, int last) {
        for (int f = first; f <= last; ++f) {
            const std::string nameA = ulk_tools::SequenceFramePath(a, f);
            const std::string nameB = ulk_tools::SequenceFramePath(b, f);
            EXPECT_TRUE(Read(nameA).SamePixels(Read(nameB))) << nameA << " vs " << nameB;
        }
    }

    // count frames of the moving test pattern (frame f shows frame f) as a raw RGBA stream,
    // followed by the first extra bytes of one more frame; answers its path.
    std::string WriteRawPatterns(const std::string& name, int count, int width, int height,
                                 size_t extra = 0) {
        std::FILE* stream = std::fopen(Path(name).c_str(), "wb");
        if (!stream) {
            ADD_FAILURE() << "cannot write " << Path(name);
            return "";
        }
        Frame pattern(width, height);
        std::string error;
        for (int f = 0; f < count; ++f) {
            ulk_tools::FillTestPattern(&pattern, f);
            EXPECT_TRUE(ulk_tools::WriteRawFrame(stream, pattern, &error)) << error;
        }
        EXPECT_EQ(std::fwrite(pattern.Data(), 1, extra, stream), extra);
        std::fclose(stream);
        return Path(name);
    }

    std::string Path(const std::string& name) const { return mFolder.Path(name); }

    static std::string Sample(const std::string& name) { return SamplePluginPath(name); }
    static std::string ToolEffects() { return TestPluginPath("tool_effects"); }

    void SetUp() override {
        if (access(Sample("levels").c_str(), R_OK) != 0 && NeedsSamples())
            GTEST_SKIP() << "sample plug-ins not built";
    }
    virtual bool NeedsSamples() const { return true; }

    ScratchFolder mFolder;
};

uint8_t Scale(uint8_t v, double factor) {
    return static_cast<uint8_t>(std::lround(std::min(255.0, v * factor)));
}

// A picture with different values in every channel, so a channel mix-up shows.
void Ramp(int x, int y, uint8_t* p) {
    p[0] = static_cast<uint8_t>(x * 16), p[1] = static_cast<uint8_t>(y * 30);
    p[2] = static_cast<uint8_t>(200 - x * 8), p[3] = static_cast<uint8_t>(255 - y * 10);
}

TEST_F(UlkRender, LevelsGainAndInvertFollowTheirFormulas) {
    const std::string in = WriteInput("in.png", 16, 8, Ramp);
    ToolResult result = Render({Sample("levels"), "--set", "gain=0.5", "-o", Path("half.png"), in});
    ASSERT_EQ(result.status, 0) << result.err;
    EXPECT_EQ(result.err, "");
    ExpectPixels("half.png", [](int x, int y, uint8_t* p) {
        Ramp(x, y, p);
        for (int c = 0; c < 3; ++c) p[c] = Scale(p[c], 0.5);  // alpha untouched
    });

    result = Render({Sample("levels"), "--set", "invert=true", "--set", "channels=Red", "-o",
                     Path("inverted.png"), in});
    ASSERT_EQ(result.status, 0) << result.err;
    ExpectPixels("inverted.png", [](int x, int y, uint8_t* p) {
        Ramp(x, y, p);
        p[0] = static_cast<uint8_t>(255 - p[0]);
    });
}

TEST_F(UlkRender, KeysAtFramesAnimateAndSaveAndLoadAlike) {
    const std::string in = Solid("grey.png", 100, 100, 100);
    // Gain 0 at frame 0 to 2 at frame 4, linear: frame f has gain f / 2.
    ToolResult result =
        Render({Sample("levels"), "--set", "gain@0=0", "--set", "gain@4=2", "--frames", "0-4",
                "--save-keys", Path("keys.txt"), "-o", Path("set.#.png"), in});
    ASSERT_EQ(result.status, 0) << result.err;
    for (int f = 0; f <= 4; ++f)
        ExpectPixels("set." + std::to_string(f) + ".png", [f](int, int, uint8_t* p) {
            p[0] = p[1] = p[2] = Scale(100, f / 2.0), p[3] = 255;
        });
    // The saved keys hold key times 0..1, and give the same frames when loaded.
    const std::string keys = ReadTextFile(Path("keys.txt"));
    EXPECT_NE(keys.find("gain 0 0\n"), std::string::npos) << keys;
    EXPECT_NE(keys.find("gain 1 2\n"), std::string::npos) << keys;
    result = Render({Sample("levels"), "--keys", Path("keys.txt"), "--frames", "0-4", "-o",
                     Path("loaded.#.png"), in});
    ASSERT_EQ(result.status, 0) << result.err;
    ExpectSameFrames("set.#.png", "loaded.#.png", 0, 4);
    // The clip's length decides the key times: frame 4 of 9 lies half-way.
    result = Render({Sample("levels"), "--keys", Path("keys.txt"), "--frames", "4",
                     "--total-frames", "9", "-o", Path("half-way.png"), in});
    ASSERT_EQ(result.status, 0) << result.err;
    ExpectPixels("half-way.png",
                 [](int, int, uint8_t* p) { p[0] = p[1] = p[2] = 100, p[3] = 255; });
}

TEST_F(UlkRender, WipeDissolvesTwoSequences) {
    for (int f = 1; f <= 2; ++f) {
        Solid("fg." + std::to_string(f) + ".png", 200, 0, 40);
        Solid("bg." + std::to_string(f) + ".png", 0, 100, 240);
    }
    const ToolResult result =
        Render({Sample("wipe"), "--set", "transition=Dissolve", "--set", "progress=0.25", "-o",
                Path("mix.%d.png"), Path("fg.%d.png"), Path("bg.%d.png")});
    ASSERT_EQ(result.status, 0) << result.err;
    for (int f = 1; f <= 2; ++f)
        ExpectPixels("mix." + std::to_string(f) + ".png",
                     [](int, int, uint8_t* p) { p[0] = 150, p[1] = 25, p[2] = 90, p[3] = 255; });
    EXPECT_NE(access(Path("mix.0.png").c_str(), F_OK), 0);  // only the frames on disk
}

TEST_F(UlkRender, BlurKeepsAFlatPictureAndCropClearsOutside) {
    const std::string flat = Solid("flat.png", 30, 60, 90);
    ToolResult result =
        Render({Sample("blur"), "--set", "radius=3", "-o", Path("blurred.png"), flat});
    ASSERT_EQ(result.status, 0) << result.err;
    ExpectPixels("blurred.png",
                 [](int, int, uint8_t* p) { p[0] = 30, p[1] = 60, p[2] = 90, p[3] = 255; });

    // An 8x8 picture cropped to 0.25..0.75 keeps the pixels whose centres lie inside: 2..5.
    const std::string in = WriteInput("crop-in.png", 8, 8, Ramp);
    result =
        Render({Sample("crop"), "--set", "rect=0.25,0.25,0.75,0.75", "-o", Path("crop.png"), in});
    ASSERT_EQ(result.status, 0) << result.err;
    ExpectPixels("crop.png", [](int x, int y, uint8_t* p) {
        Ramp(x, y, p);
        if (x < 2 || x > 5 || y < 2 || y > 5) p[0] = p[1] = p[2] = p[3] = 0;
    });
}

TEST_F(UlkRender, GeneratorMakesACheckerboardOfTheGivenSize) {
    const ToolResult result =
        Render({Sample("generator"), "--size", "16x12", "--set", "pattern=Checkerboard", "--set",
                "cell_size=4", "--set", "colour_a=1,0,0", "--set", "colour_b=0,0,1", "-o",
                Path("card.png")});
    ASSERT_EQ(result.status, 0) << result.err;
    EXPECT_EQ(Read("card.png").Width(), 16);
    ExpectPixels("card.png", [](int x, int y, uint8_t* p) {
        const bool a = (x / 4 + y / 4) % 2 == 0;
        p[0] = a ? 255 : 0, p[1] = 0, p[2] = a ? 0 : 255, p[3] = 255;
    });
}

TEST_F(UlkRender, ThreadsAndRawStreamsGiveTheSameFrames) {
    // An animated blur over the moving test pattern: every frame differs.
    const std::vector<std::string> common = {Sample("blur"), "--set",    "radius@0=0", "--set",
                                             "radius@11=6",  "--frames", "0-11",       "-q"};
    auto with = [&](std::vector<std::string> extra) {
        std::vector<std::string> all = common;
        all.insert(all.end(), extra.begin(), extra.end());
        return all;
    };
    ToolResult result = Render(with({"-o", Path("one.###.png"), "pattern:48x32"}));
    ASSERT_EQ(result.status, 0) << result.err;
    result = Render(with({"--threads", "3", "-o", Path("three.###.png"), "pattern:48x32"}));
    ASSERT_EQ(result.status, 0) << result.err;
    ExpectSameFrames("one.###.png", "three.###.png", 0, 11);
    EXPECT_FALSE(Read("one.000.png").SamePixels(Read("one.011.png")));

    // The same pattern frames as a raw stream in, raw frames out, on two threads.
    const std::string raw = WriteRawPatterns("in.rgba", 12, 48, 32);
    result = Render(with({"--threads", "2", "--raw", "48x32", "-o", "-", "-"}), raw);
    ASSERT_EQ(result.status, 0) << result.err;
    ASSERT_EQ(result.out.size(), 12u * 48 * 32 * 4);
    for (int f = 0; f <= 11; ++f) {
        const Frame expected = Read(ulk_tools::SequenceFramePath("one.###.png", f));
        EXPECT_EQ(0, std::memcmp(result.out.data() + f * 48 * 32 * 4, expected.Data(),
                                 expected.ByteSize()))
            << "raw frame " << f;
    }
}

TEST_F(UlkRender, ConvertsFramesForAnEffectThatTakesBGRAOnly) {
    const std::string in = WriteInput("in.png", 8, 4, Ramp);
    const ToolResult result = Render({ToolEffects() + ":Clear Red", "-o", Path("out.png"), in});
    ASSERT_EQ(result.status, 0) << result.err;
    EXPECT_NE(result.err.find("note: Clear Red does not take 8-bit RGBA; frames are converted to "
                              "BGRA and back"),
              std::string::npos)
        << result.err;
    ExpectPixels("out.png", [](int x, int y, uint8_t* p) {
        Ramp(x, y, p);
        p[0] = 0;
    });
}

TEST_F(UlkRender, RenderFarmChunksWithGnuParallelEqualOneRender) {
    if (std::system("parallel --version > /dev/null 2>&1") != 0)
        GTEST_SKIP() << "GNU parallel is not installed";
    // Every chunk must know the whole clip's length, or its key times would differ.
    const std::string job = std::string(ULK_RENDER_PATH) + " " + Sample("levels") +
                            " --set gain@0=0.2 --set gain@23=1.8 --total-frames 24 -q" +
                            " pattern:64x36 -o ";
    ASSERT_EQ(std::system((job + Path("whole.####.png") + " --frames 0-23").c_str()), 0);
    const std::string farm = "parallel --halt now,fail=1 -j4 " + job + Path("chunk.####.png") +
                             " --frames {} ::: 0-5 6-11 12-17 18-23";
    ASSERT_EQ(std::system(farm.c_str()), 0);
    ExpectSameFrames("whole.####.png", "chunk.####.png", 0, 23);
}

// ---------------------------------------------------------------- failures

class UlkRenderErrors : public UlkRender {
  protected:
    bool NeedsSamples() const override { return false; }

    // Runs (standard input from the file in, if given) and expects a failure whose one line
    // on stderr holds every text of needles.
    ToolResult ExpectFailure(const std::vector<std::string>& arguments,
                             const std::vector<std::string>& needles, int status = 1,
                             const std::string& in = "") {
        const ToolResult result = Render(arguments, in);
        EXPECT_EQ(result.status, status) << result.err;
        EXPECT_EQ(std::count(result.err.begin(), result.err.end(), '\n'), status == 2 ? 2 : 1)
            << result.err;
        for (const std::string& needle : needles)
            EXPECT_NE(result.err.find(needle), std::string::npos)
                << "'" << needle << "' not in: " << result.err;
        return result;
    }

    std::string FailAt() const { return ToolEffects() + ":org.ulk.tests.fail-at"; }
};

TEST_F(UlkRenderErrors, BadInputsAreNamed) {
    const std::string small = Solid("small.png", 1, 2, 3);
    const std::string wide = WriteInput("wide.png", 9, 8, Ramp);
    const std::string mix = TestPluginPath("effects") + ":Mix";
    ExpectFailure({FailAt(), "-o", Path("o.png"), Path("missing.png")}, {"missing.png"});
    ExpectFailure({mix, "-o", Path("o.png"), small, wide},
                  {"'" + wide + "' is 9x8", "'" + small + "' is 8x8"});
    ExpectFailure({mix, "-o", Path("o.png"), small}, {"Mix takes 2 inputs", "1 given"});
    ExpectFailure({FailAt(), "-o", Path("o.png"), Path("none.####.png")}, {"no files match"});
    ExpectFailure({FailAt(), "--frames", "0-2", "-o", Path("o.png"), small},
                  {"has no frame number", "3 frames"});
    ExpectFailure({FailAt(), "-o", Path("o.png"), "-"}, {"--raw"});
    ExpectFailure({ToolEffects() + ":YUV Only", "-o", Path("o.png"), small},
                  {"YUV Only takes none of the formats", "UYVY 8-bit"});
}

TEST_F(UlkRenderErrors, BadParametersAreNamed) {
    const std::string small = Solid("small.png", 1, 2, 3);
    ExpectFailure({FailAt(), "--set", "speed=2", "-o", Path("o.png"), small},
                  {"unknown parameter 'speed'", "fail_frame"});
    ExpectFailure({FailAt(), "--set", "fail_frame=soon", "-o", Path("o.png"), small},
                  {"parameter 'fail_frame'", "cannot read 'soon'"});
    ExpectFailure({FailAt(), "--set", "fail_frame@0.5=1", "-o", Path("o.png"), small},
                  {"frame number"});
    ASSERT_EQ(RunTool("/bin/sh",
                      {"-c", "printf '# keys\\nfail_frame 0 2\\nfail_frame 1 x\\n' > " +
                                 Path("bad.keys")},
                      Path(""))
                  .status,
              0);
    ExpectFailure({FailAt(), "--keys", Path("bad.keys"), "-o", Path("o.png"), small},
                  {Path("bad.keys") + ":3:", "cannot read 'x'"});
    EXPECT_EQ(mFolder.Names(), (std::vector<std::string>{"bad.keys", "small.png"}));
}

TEST_F(UlkRenderErrors, FailingModelsAndExecuteAreReported) {
    const std::string small = Solid("small.png", 1, 2, 3);
    ExpectFailure({TestPluginPath("model_faults") + ":4", "-o", Path("o.png"), small},
                  {"no licence for this model"});
    ExpectFailure({TestPluginPath("effects") + ":Nothing", "-o", Path("o.png"), small},
                  {"no model named 'Nothing'", "Invert"});
    // Frames before the failing one are complete; the failing one is never written.
    for (const char* threads : {"1", "3"}) {
        ExpectFailure({FailAt(), "--set", "fail_frame=3", "--frames", "0-5", "--threads", threads,
                       "-o", Path("t" + std::string(threads) + ".#.png"), small},
                      {"frame 3: Fail At failed: the disk of frames ran dry"});
        EXPECT_NE(access(Path("t" + std::string(threads) + ".3.png").c_str(), F_OK), 0);
    }
    for (int f = 0; f < 3; ++f)
        EXPECT_TRUE(Read("t1." + std::to_string(f) + ".png").SamePixels(Read("small.png")));
    for (const std::string& name : mFolder.Names())
        EXPECT_EQ(name.find("tmp"), std::string::npos) << name;  // no temporary file left
}

TEST_F(UlkRenderErrors, RawStreamsOnThreadsKeepFrameOrderUpToTheFirstFailure) {
    const int width = 24, height = 16;
    const size_t bytes = size_t{width} * height * 4;
    const std::string raw = WriteRawPatterns("in.rgba", 40, width, height);
    const std::string in = ReadTextFile(raw);
    const std::vector<std::string> stream = {"--raw", "24x16", "-q", "-o", "-", "-"};
    auto with = [&](std::vector<std::string> arguments) {
        arguments.insert(arguments.end(), stream.begin(), stream.end());
        return arguments;
    };

    // Converted to BGRA and back on three threads: every frame in its place, red cleared.
    ToolResult result = Render(with({ToolEffects() + ":Clear Red", "--threads", "3"}), raw);
    ASSERT_EQ(result.status, 0) << result.err;
    ASSERT_EQ(result.out.size(), 40 * bytes);
    for (int f = 0; f < 40; ++f) {
        Frame expected(width, height);
        ulk_tools::FillTestPattern(&expected, f);
        for (int y = 0; y < height; ++y)
            for (int x = 0; x < width; ++x) expected.Pixel(x, y)[0] = 0;
        EXPECT_EQ(0, std::memcmp(result.out.data() + f * bytes, expected.Data(), bytes))
            << "raw frame " << f;
    }

    // Frame 3 fails: frames 0 to 2 come out whole and in order, nothing after them.
    for (const char* threads : {"1", "3"}) {
        result = ExpectFailure(with({FailAt(), "--set", "fail_frame=3", "--threads", threads}),
                               {"frame 3: Fail At failed"}, 1, raw);
        EXPECT_EQ(result.out, in.substr(0, 3 * bytes)) << threads << " threads";
    }
    // A stream cut inside frame 5: frames 0 to 4 come out, the cut one is named.
    const std::string cut = WriteRawPatterns("cut.rgba", 5, width, height, 100);
    result = ExpectFailure(with({FailAt(), "--threads", "2"}),
                           {"standard input, frame 5", "ended inside a frame"}, 1, cut);
    EXPECT_EQ(result.out, in.substr(0, 5 * bytes));
}

TEST_F(UlkRenderErrors, UsageErrorsExitWithTwo) {
    ExpectFailure({}, {"no plug-in given"}, 2);
    ExpectFailure({FailAt(), "pattern"}, {"no output given"}, 2);
    ExpectFailure({FailAt(), "--frames", "5-2", "-o", Path("o.png"), "pattern"}, {}, 2);
    ExpectFailure({FailAt(), "--bogus", "1", "-o", Path("o.png"), "pattern"}, {"unknown option"},
                  2);
    const ToolResult help = Render({"--help"});
    EXPECT_EQ(help.status, 0);
    EXPECT_NE(help.out.find("--set ID@FRAME=TEXT"), std::string::npos);
}

}  // namespace

// ulkHostInstance: real effects rendering real pixels, the media slots, and
// the whole Execute algorithm as the probe module sees it.
#include <vector>

#include "probe_fixture.h"

namespace {

// ---------------------------------------------------------------- effects on real images

const ulkImgFormat kFormats[] = {kImgFormatRGBA, kImgFormatBGRA, kImgFormatRGB, kImgFormatUYVY};

// Whether byte i of a tight 8-bit buffer of the format is an alpha sample.
bool IsAlphaByte(ulkImgFormat format, size_t i) {
    return (format == kImgFormatRGBA || format == kImgFormatBGRA) && i % 4 == 3;
}

class EffectsTest : public ModelHostTest {
  protected:
    static std::string Effects() { return TestPluginPath("effects"); }
};

TEST_F(EffectsTest, InvertFilterInvertsColourAndKeepsAlpha) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    ASSERT_NE(instance, nullptr);
    for (ulkImgFormat format : kFormats) {
        TestImage in(format, 6, 3), out(format, 6, 3);
        in.FillPattern(11);
        out.Fill(0);
        ASSERT_TRUE(instance->SetInput(0, in.get()));
        ASSERT_TRUE(instance->SetOutput(0, out.get()));
        ASSERT_TRUE(instance->Execute(nullptr)) << format << instance->GetErrorString();
        const std::vector<unsigned char> src = in.Bytes(), dst = out.Bytes();
        for (size_t i = 0; i < dst.size(); ++i) {
            const int expected = IsAlphaByte(format, i) ? src[i] : 255 - src[i];
            ASSERT_EQ(dst[i], expected) << "format " << format << " byte " << i;
        }
    }
    model.DeleteInstance(instance);
}

TEST_F(EffectsTest, InvertFilterRendersOnlyTheRegion) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    TestImage in(kImgFormatRGB, 4, 4), out(kImgFormatRGB, 4, 4);
    in.Fill(10);
    out.Fill(0);
    instance->SetInput(0, in.get());
    instance->SetOutput(0, out.get());
    const ulkBounds region = {1, 2, 2, 3};
    ASSERT_TRUE(instance->Execute(&region));
    const unsigned char* bytes = out.bytes();
    for (int y = 0; y < 4; ++y)
        for (int x = 0; x < 4; ++x) {
            const bool inside = x >= 1 && x <= 2 && y >= 2;
            EXPECT_EQ(bytes[(y * 4 + x) * 3], inside ? 245 : 0) << x << "," << y;
        }
    model.DeleteInstance(instance);
}

TEST_F(EffectsTest, MixCompositorAveragesItsTwoInputs) {
    ulkHostModel model(1);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    ASSERT_NE(instance, nullptr);
    for (ulkImgFormat format : kFormats) {
        TestImage fg(format, 4, 2), bg(format, 4, 2), out(format, 4, 2);
        fg.FillPattern(1);
        bg.FillPattern(100);
        out.Fill(0);
        ASSERT_TRUE(instance->SetInput(0, fg.get()));
        ASSERT_TRUE(instance->SetInput(1, bg.get()));
        ASSERT_TRUE(instance->SetOutput(0, out.get()));
        EXPECT_FALSE(instance->SetInput(2, bg.get()));
        ASSERT_TRUE(instance->Execute(nullptr)) << format;
        const std::vector<unsigned char> a = fg.Bytes(), b = bg.Bytes(), dst = out.Bytes();
        for (size_t i = 0; i < dst.size(); ++i)
            ASSERT_EQ(dst[i], (a[i] + b[i] + 1) / 2) << "format " << format << " byte " << i;
    }
    model.DeleteInstance(instance);
}

TEST_F(EffectsTest, TitleFillsEachFormatInItsOwnChannelOrder) {
    ulkHostModel model(2);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    ASSERT_NE(instance, nullptr);
    struct Case {
        ulkImgFormat format;
        std::vector<unsigned char> pixel;  // the bytes of one pixel (a pair for UYVY)
    };
    const Case cases[] = {{kImgFormatRGBA, {200, 100, 50, 255}},
                          {kImgFormatBGRA, {50, 100, 200, 255}},
                          {kImgFormatRGB, {200, 100, 50}},
                          {kImgFormatUYVY, {128, 235, 128, 235}}};
    for (const Case& c : cases) {
        TestImage out(c.format, 4, 2);
        out.Fill(0);
        ASSERT_TRUE(instance->SetOutput(0, out.get()));  // no input: the matte is optional
        ASSERT_TRUE(instance->Execute(nullptr)) << c.format;
        const std::vector<unsigned char> dst = out.Bytes();
        for (size_t i = 0; i < dst.size(); ++i)
            ASSERT_EQ(dst[i], c.pixel[i % c.pixel.size()])
                << "format " << c.format << " byte " << i;
    }
    model.DeleteInstance(instance);
}

TEST_F(EffectsTest, SlotIndexesAreChecked) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    TestImage image(kImgFormatRGBA, 2, 2);
    EXPECT_EQ(instance->GetInput(0), nullptr);
    EXPECT_TRUE(instance->SetInput(0, image.get()));
    EXPECT_EQ(instance->GetInput(0), image.get());
    EXPECT_EQ(instance->GetPluginInstance()->GetInput(0), image.get());
    EXPECT_FALSE(instance->SetInput(1, image.get()));
    EXPECT_FALSE(instance->SetInput(-1, image.get()));
    EXPECT_FALSE(instance->SetOutput(1, image.get()));
    EXPECT_EQ(instance->GetInput(1), nullptr);
    EXPECT_EQ(instance->GetInput(-1), nullptr);
    EXPECT_EQ(instance->GetOutput(1), nullptr);
    EXPECT_EQ(instance->GetPluginInstance()->GetOutput(7), nullptr);
    model.DeleteInstance(instance);
}

// ---------------------------------------------------------------- Execute, step by step

// Media that is not an image.
class Sound : public ulkMediaObject {
  public:
    const char* ClassName() const override { return "Sound"; }
};

using ExecuteTest = ProbeTest;

TEST_F(ExecuteTest, WithoutEffectInPlaceTouchesNothing) {
    ulkSetPlayMode(kPlayModePlay);
    ASSERT_TRUE(mInstance->PreProcess());  // leaves the render flag at 0
    mInstance->PostProcess();
    TakeCalls();
    ASSERT_EQ(RenderFlag(), 0);

    mControl->hasEffect = false;
    mControl->inPlace = true;
    EXPECT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "HI");
    EXPECT_EQ(RenderFlag(), 0);
    for (unsigned char byte : mOut.Bytes()) ASSERT_EQ(byte, 0);
}

TEST_F(ExecuteTest, WithoutEffectCopiesTheInput) {
    mControl->hasEffect = false;
    EXPECT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "HI");
    EXPECT_EQ(mOut.Bytes(), mIn.Bytes());

    // Nothing to copy from, or to: false with "Execute failed", never a crash.
    Sound sound;
    TestImage other(kImgFormatRGB, 4, 2);
    mInstance->SetInput(0, nullptr);
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorExecute);
    mInstance->SetInput(0, &sound);
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorExecute);
    mInstance->SetInput(0, other.get());  // Copy refuses another format
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorExecute);
    EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: Execute failed");
    EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));
}

TEST_F(ExecuteTest, NullBoundsNeedAnOutputImage) {
    Sound sound;
    mInstance->SetOutput(0, nullptr);
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorExecute);
    mInstance->SetOutput(0, &sound);
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorExecute);
    EXPECT_EQ(TakeCalls(), "");  // the plug-in was never asked
    EXPECT_FALSE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
    EXPECT_EQ(TakeCalls(), "");

    // With explicit bounds the library needs no output; the plug-in gets them as given.
    const ulkBounds region = {1, 1, 2, 1};
    EXPECT_TRUE(mInstance->Execute(&region));
    EXPECT_EQ(mControl->bounds.left, 1);
    EXPECT_EQ(mControl->bounds.right, 2);
}

TEST_F(ExecuteTest, EachExecutePreProcessesAndPostProcessesInState4) {
    ulkSetPlayMode(kPlayModePlay);
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "HPEO");
    for (int i = 0; i < 4; ++i) EXPECT_EQ(mControl->events[i].state, ULKState::kStateExecute);
    EXPECT_EQ(mControl->events[1].renderFlag, 0);  // PreProcess under playback
    EXPECT_EQ(mControl->events[2].renderFlag, 1);  // Execute
    EXPECT_EQ(mControl->events[3].renderFlag, 1);  // PostProcess
    EXPECT_EQ(RenderFlag(), 1);
    EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));
    // The whole output was rendered: null bounds are output 0's rectangle.
    EXPECT_EQ(mControl->bounds.left, 0);
    EXPECT_EQ(mControl->bounds.top, 0);
    EXPECT_EQ(mControl->bounds.right, 3);
    EXPECT_EQ(mControl->bounds.bottom, 1);
    for (unsigned char byte : mOut.Bytes()) ASSERT_EQ(byte, 0x5A);

    ulkSetPlayMode(kPlayModeRender);
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "HPEO");                // the bit was cleared: pre-processed again
    EXPECT_EQ(mControl->events[1].renderFlag, 1);  // PreProcess under final rendering

    ulkSetPlayMode(static_cast<ulkPlayMode>(7));  // no meaning: Execute's own 0 stays
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(mControl->events[1].renderFlag, 0);
}

TEST_F(ExecuteTest, HostPreProcessingHoldsAcrossExecutes) {
    ulkSetPlayMode(kPlayModeRender);
    ASSERT_TRUE(mInstance->PreProcess());
    EXPECT_EQ(TakeCalls(), "P");
    EXPECT_EQ(mControl->events[0].state, ULKState::kStateIdle);
    EXPECT_TRUE(mInstance->PreProcess());  // already prepared: the plug-in is not asked
    for (int frame = 0; frame < 3; ++frame) {
        mInstance->SetCurrentFrame(frame);
        ASSERT_TRUE(mInstance->Execute(nullptr));
    }
    EXPECT_EQ(TakeCalls(), "HEHEHE");
    mInstance->CleanUp();
    mInstance->CleanUp();
    mInstance->PostProcess();
    EXPECT_EQ(TakeCalls(), "O");
}

TEST_F(ExecuteTest, PreProcessFailureStopsExecute) {
    mControl->preProcess = false;
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorPreProcess);
    EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: PreProcess failed");
    EXPECT_EQ(TakeCalls(), "HP");
    EXPECT_FALSE(mInstance->Execute(nullptr));  // the bit stayed clear: asked again
    EXPECT_EQ(TakeCalls(), "HP");

    // A warning the plug-in recorded is its reason, not "PreProcess failed".
    mControl->preProcessWarning = "no cache";
    EXPECT_FALSE(mInstance->PreProcess());
    EXPECT_EQ(mInstance->GetError(), kErrorPluginWarning);
    EXPECT_STREQ(mInstance->GetErrorString(), "no cache");
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorPluginWarning);
    EXPECT_STREQ(mInstance->GetErrorString(), "no cache");
}

TEST_F(ExecuteTest, ExecuteFailureKeepsThePluginsOwnStatus) {
    mControl->execute = false;
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorExecute);
    EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: Execute failed");
    EXPECT_EQ(TakeCalls(), "HPEO");

    mControl->executeError = "disk full";
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorPlugin);
    EXPECT_STREQ(mInstance->GetErrorString(), "disk full");

    // The next call starts from a reset record.
    mControl->execute = true;
    mControl->executeError = nullptr;
    EXPECT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
}

TEST_F(ExecuteTest, ExceptionIsCaughtPostProcessRunsStateIsRestored) {
    mControl->executeThrows = true;
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorUnhandledException);
    EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: Unhandled Exception caught from plug-in");
    EXPECT_EQ(TakeCalls(), "HPEO");
    EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));

    // Pre-processed by the host: the exception leaves the run prepared.
    ASSERT_TRUE(mInstance->PreProcess());
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "PHE");
    mInstance->CleanUp();
    EXPECT_EQ(TakeCalls(), "O");
}

TEST_F(ExecuteTest, ShowUIWindowRunsInState5AndCatchesEverything) {
    EXPECT_TRUE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(TakeCalls(), "U");
    EXPECT_EQ(mControl->events[0].state, ULKState::kStateShowUIWindow);
    EXPECT_EQ(mControl->bounds.right, 3);

    mControl->showUI = false;
    EXPECT_FALSE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorNone);  // a plain "no" is no error

    mControl->showUIThrows = true;
    EXPECT_FALSE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorUnhandledException);
    EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));
}

TEST_F(ExecuteTest, HostErrorOperations) {
    mInstance->SetPluginError("first");
    EXPECT_EQ(mInstance->GetErrorObj()->GetError(), kErrorPlugin);
    mInstance->SetError(kErrorExecute);
    mInstance->SetError(kErrorPlugin);  // the text was reset by the previous SetError
    EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: Plug-in Supplied Error");
    mInstance->GetPluginInstance()->SetPluginWarning("through the plug-in");
    EXPECT_STREQ(mInstance->GetErrorString(), "through the plug-in");
}

}  // namespace

// ulkHostInstance: real effects rendering real pixels, the media slots, and
// the whole Execute algorithm as the probe module sees it.
#include <string>
#include <vector>

#include "probe_fixture.h"

namespace {

// ---------------------------------------------------------------- effects on real images

using EffectsTest = ModelHostTest;

TEST_F(EffectsTest, FilterCompositorAndTitleRenderEveryFormat) {
    const ulkImgFormat formats[] = {kImgFormatRGBA, kImgFormatBGRA, kImgFormatRGB, kImgFormatUYVY};
    // The title's orange card, one pixel (a pair for UYVY) in each format's byte order.
    const std::vector<unsigned char> card[] = {
        {200, 100, 50, 255}, {50, 100, 200, 255}, {200, 100, 50}, {128, 235, 128, 235}};
    for (int index : {0, 1, 2}) {  // Invert, Mix, Title
        ulkHostModel model(static_cast<short>(index));
        ASSERT_TRUE(model.Open(TestPluginPath("effects").c_str(), 0, nullptr));
        ulkHostInstance* instance = model.NewInstance();
        ASSERT_NE(instance, nullptr);
        for (int f = 0; f < 4; ++f) {
            const ulkImgFormat format = formats[f];
            SCOPED_TRACE("model " + std::to_string(index) + " format " + std::to_string(format));
            TestImage a(format, 6, 3), b(format, 6, 3), out(format, 6, 3);
            a.FillPattern(11);
            b.FillPattern(100);
            out.Fill(0);
            if (index < 2) instance->SetInput(0, a.get());  // the title's matte is optional
            if (index == 1) instance->SetInput(1, b.get());
            ASSERT_TRUE(instance->SetOutput(0, out.get()));
            ASSERT_TRUE(instance->Execute(nullptr)) << instance->GetErrorString();
            const std::vector<unsigned char> x = a.Bytes(), y = b.Bytes(), dst = out.Bytes();
            for (size_t i = 0; i < dst.size(); ++i) {
                const bool alpha = f < 2 && i % 4 == 3;
                const int expected = index == 0   ? (alpha ? x[i] : 255 - x[i])
                                     : index == 1 ? (x[i] + y[i] + 1) / 2
                                                  : card[f][i % card[f].size()];
                ASSERT_EQ(dst[i], expected) << "byte " << i;
            }
        }
        model.DeleteInstance(instance);
    }
}

TEST_F(EffectsTest, FilterRendersOnlyTheRegionAndSlotIndexesAreChecked) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(TestPluginPath("effects").c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    TestImage in(kImgFormatRGB, 4, 4), out(kImgFormatRGB, 4, 4);
    in.Fill(10);
    out.Fill(0);
    EXPECT_TRUE(instance->SetInput(0, in.get()));
    EXPECT_TRUE(instance->SetOutput(0, out.get()));
    EXPECT_EQ(instance->GetPluginInstance()->GetInput(0), in.get());
    for (int bad : {1, -1}) {
        EXPECT_FALSE(instance->SetInput(bad, in.get()));
        EXPECT_FALSE(instance->SetOutput(bad, in.get()));
        EXPECT_EQ(instance->GetInput(bad), nullptr);
        EXPECT_EQ(instance->GetOutput(bad), nullptr);
    }
    const ulkBounds region = {1, 2, 2, 3};
    ASSERT_TRUE(instance->Execute(&region));
    for (int y = 0; y < 4; ++y)
        for (int x = 0; x < 4; ++x) {
            const bool inside = x >= 1 && x <= 2 && y >= 2;
            EXPECT_EQ(out.bytes()[(y * 4 + x) * 3], inside ? 245 : 0) << x << "," << y;
        }
    model.DeleteInstance(instance);
}

// ---------------------------------------------------------------- Execute, step by step

// Media that is not an image.
class Sound : public ulkMediaObject {
  public:
    const char* ClassName() const override { return "Sound"; }
};

using ExecuteTest = ProbeTest;

TEST_F(ExecuteTest, WithoutEffectOrMediaNothingIsRendered) {
    ulkSetPlayMode(kPlayModePlay);
    ASSERT_TRUE(mInstance->PreProcess());  // leaves the render flag at 0
    mInstance->PostProcess();
    TakeCalls();
    mControl->hasEffect = false;
    mControl->inPlace = true;
    EXPECT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "HI");
    EXPECT_EQ(RenderFlag(), 0);
    EXPECT_EQ(mOut.Bytes(), std::vector<unsigned char>(mOut.size(), 0));

    mControl->inPlace = false;
    EXPECT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "HI");
    EXPECT_EQ(mOut.Bytes(), mIn.Bytes());

    // Nothing to copy from, or a source Copy refuses: false with "Execute failed", no crash.
    Sound sound;
    TestImage other(kImgFormatRGB, 4, 2);
    for (ulkMediaObject* input :
         {static_cast<ulkMediaObject*>(nullptr), static_cast<ulkMediaObject*>(&sound),
          static_cast<ulkMediaObject*>(other.get())}) {
        mInstance->SetInput(0, input);
        EXPECT_FALSE(mInstance->Execute(nullptr));
        EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: Execute failed");
        EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));
    }
    *mControl = ProbeControl();
    // Null bounds need an output image; ShowUIWindow then answers false without a status.
    for (ulkMediaObject* output :
         {static_cast<ulkMediaObject*>(nullptr), static_cast<ulkMediaObject*>(&sound)}) {
        mInstance->SetOutput(0, output);
        EXPECT_FALSE(mInstance->Execute(nullptr));
        EXPECT_EQ(mInstance->GetError(), kErrorExecute);
        EXPECT_FALSE(mInstance->ShowUIWindow(nullptr));
        EXPECT_EQ(mInstance->GetError(), kErrorNone);
    }
    EXPECT_EQ(TakeCalls(), "");  // the plug-in was never asked
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
    EXPECT_EQ(mControl->bounds.top, 0);
    EXPECT_EQ(mControl->bounds.right, 3);
    EXPECT_EQ(mControl->bounds.bottom, 1);
    EXPECT_EQ(mOut.Bytes(), std::vector<unsigned char>(mOut.size(), 0x5A));

    ulkSetPlayMode(kPlayModeRender);
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "HPEO");                // the bit was cleared: pre-processed again
    EXPECT_EQ(mControl->events[1].renderFlag, 1);  // PreProcess under final rendering
    ulkSetPlayMode(static_cast<ulkPlayMode>(7));   // no meaning: Execute's own 0 stays
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(mControl->events[1].renderFlag, 0);
}

TEST_F(ExecuteTest, HostPreProcessingHoldsAcrossExecutes) {
    ulkSetPlayMode(kPlayModeRender);
    ASSERT_TRUE(mInstance->PreProcess());
    EXPECT_TRUE(mInstance->PreProcess());  // already prepared: the plug-in is not asked
    EXPECT_EQ(TakeCalls(), "P");
    EXPECT_EQ(mControl->events[0].state, ULKState::kStateIdle);
    for (int frame = 0; frame < 3; ++frame) {
        mInstance->SetCurrentFrame(frame);
        ASSERT_TRUE(mInstance->Execute(nullptr));
    }
    EXPECT_EQ(TakeCalls(), "HEHEHE");
    mInstance->CleanUp();
    mInstance->CleanUp();
    EXPECT_EQ(TakeCalls(), "O");

    // An exception leaves a run the host prepared prepared.
    mControl->executeThrows = true;
    ASSERT_TRUE(mInstance->PreProcess());
    EXPECT_FALSE(mInstance->Execute(nullptr));
    EXPECT_EQ(TakeCalls(), "PHE");
    mInstance->CleanUp();
    EXPECT_EQ(TakeCalls(), "O");
}

TEST_F(ExecuteTest, FailuresReportThePluginsStatusOrTheLibrarysAndPostProcessFollows) {
    struct Row {
        const char* name;
        void (*arrange)(ProbeControl&);
        ulkErrorStatus status;
        const char* text;
        const char* calls;
    };
    const Row rows[] = {
        {"PreProcess false", [](ProbeControl& c) { c.preProcess = false; }, kErrorPreProcess,
         "ULK_ERROR: PreProcess failed", "HP"},
        {"PreProcess warns",
         [](ProbeControl& c) {
             c.preProcess = false;
             c.preProcessWarning = "no cache";
         },
         kErrorPluginWarning, "no cache", "HP"},
        {"Execute false", [](ProbeControl& c) { c.execute = false; }, kErrorExecute,
         "ULK_ERROR: Execute failed", "HPEO"},
        {"Execute errs",
         [](ProbeControl& c) {
             c.execute = false;
             c.executeError = "disk full";
         },
         kErrorPlugin, "disk full", "HPEO"},
        {"Execute throws", [](ProbeControl& c) { c.executeThrows = true; },
         kErrorUnhandledException, "ULK_ERROR: Unhandled Exception caught from plug-in", "HPEO"},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.name);
        *mControl = ProbeControl();
        row.arrange(*mControl);
        for (int attempt = 0; attempt < 2; ++attempt) {  // nothing stays half prepared
            EXPECT_FALSE(mInstance->Execute(nullptr));
            EXPECT_EQ(mInstance->GetError(), row.status);
            EXPECT_STREQ(mInstance->GetErrorString(), row.text);
            EXPECT_EQ(TakeCalls(), row.calls);
            EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));
        }
    }
    *mControl = ProbeControl();
    EXPECT_TRUE(mInstance->Execute(nullptr));  // the next call starts from a reset record
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
}

TEST_F(ExecuteTest, ShowUIWindowRunsInState5AndCatchesEverything) {
    EXPECT_TRUE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(TakeCalls(), "U");
    EXPECT_EQ(mControl->events[0].state, ULKState::kStateShowUIWindow);
    EXPECT_EQ(mControl->bounds.right, 3);
    mControl->showUI = false;
    EXPECT_FALSE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorNone);  // a plain "no" is no error
    mControl->showUIThrows = true;                 // and not even a std::exception
    EXPECT_FALSE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(mInstance->GetError(), kErrorUnhandledException);
    EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));
}

}  // namespace

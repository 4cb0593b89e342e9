// Instances and overlays of modules that misbehave once they are open: the
// library catches what it documents, lets the rest reach this host, and in
// either case leaves no instance, parameter or block behind and the module
// free to unload.
#include <stdexcept>

#include "hardening_host.h"

namespace {

class BadInstanceTest : public HardeningTest {
  protected:
    // The plug-in model's block and the stored path.
    static constexpr int kModelBlocks = 2;
};

TEST_F(BadInstanceTest, FailedParameterDefinitionLeavesNoInstanceBehind) {
    {
        ulkHostModel model(kBadParamsThrow);
        ASSERT_TRUE(model.Open(Corpus().c_str(), 0, nullptr));
        ASSERT_EQ(LiveObjects(model), 1);
        for (int attempt = 0; attempt < 2; ++attempt) {
            try {
                model.NewInstance();
                ADD_FAILURE() << "the plug-in's int did not reach the host";
            } catch (int thrown) {
                EXPECT_EQ(thrown, 21);
            }
            EXPECT_EQ(model.GetInstanceRefCount(), 0);
            EXPECT_EQ(LiveObjects(model), 1);  // the plug-in model only
            EXPECT_EQ(LiveBlocks(), kModelBlocks);
            EXPECT_EQ(model.GetDLL()->GetRefCount(), 1);
            EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 1);
        }

        ulkHostModel refuses(kBadParamsFalse);
        ASSERT_TRUE(refuses.Open(Corpus().c_str(), 0, nullptr));
        EXPECT_EQ(refuses.NewInstance(), nullptr);
        EXPECT_EQ(refuses.GetError(), kErrorInvalidPluginMethod);
        EXPECT_EQ(refuses.GetInstanceRefCount(), 0);
        EXPECT_EQ(LiveObjects(refuses), 2);  // the two plug-in models
        EXPECT_EQ(LiveBlocks(), 2 * kModelBlocks);
        EXPECT_EQ(model.GetDLL()->GetRefCount(), 2);
    }
    ExpectReleased(Corpus());
}

TEST_F(BadInstanceTest, ExecuteFailuresAreRecordedAndTheInstanceRendersOn) {
    struct Row {
        BadModel index;
        ulkErrorStatus status;
        int executes;  // plug-in Execute calls per host Execute
    };
    const Row rows[] = {
        {kBadExecuteThrowsInt, kErrorUnhandledException, 1},
        {kBadExecuteThrowsStd, kErrorUnhandledException, 1},
        {kBadExecuteThrowsText, kErrorUnhandledException, 1},
        {kBadPreProcessFalse, kErrorPreProcess, 0},
    };
    for (const Row& row : rows) {
        ClearReports();
        {
            ulkHostModel model(static_cast<short>(row.index));
            ASSERT_TRUE(model.Open(Corpus().c_str(), 0, nullptr)) << row.index;
            ulkHostInstance* instance = model.NewInstance();
            ASSERT_NE(instance, nullptr) << row.index;
            TestImage in(kImgFormatRGBA, 4, 3), out(kImgFormatRGBA, 4, 3);
            instance->SetInput(0, in.get());
            instance->SetOutput(0, out.get());
            // Again and again: one failure does not spoil the next frame.
            for (int frame = 0; frame < 3; ++frame) {
                EXPECT_FALSE(instance->Execute(nullptr)) << row.index;
                EXPECT_EQ(instance->GetError(), row.status) << row.index;
                EXPECT_STREQ(instance->GetErrorString(), ulkError::GetMessage(row.status))
                    << row.index;
                EXPECT_TRUE(instance->IsState(ULKState::kStateIdle)) << row.index;
            }
            EXPECT_EQ(Reports(kBadReportPreProcess), 3) << row.index;
            EXPECT_EQ(Reports(kBadReportExecute), 3 * row.executes) << row.index;
            // PostProcess follows every PreProcess that succeeded, throw or not.
            EXPECT_EQ(Reports(kBadReportPostProcess), 3 * row.executes) << row.index;

            if (row.status == kErrorUnhandledException) {
                EXPECT_FALSE(instance->ShowUIWindow(nullptr)) << row.index;
                EXPECT_EQ(instance->GetError(), kErrorUnhandledException) << row.index;
                EXPECT_TRUE(instance->IsState(ULKState::kStateIdle)) << row.index;
            }
            model.DeleteInstance(instance);
            EXPECT_EQ(model.GetInstanceRefCount(), 0) << row.index;
            EXPECT_EQ(LiveObjects(model), 1) << row.index;
            EXPECT_EQ(LiveBlocks(), kModelBlocks) << row.index;
        }
        ExpectReleased(Corpus());
    }
}

TEST_F(BadInstanceTest, HasEffectExceptionReachesTheHostAndTheInstanceStaysSound) {
    {
        ulkHostModel model(kBadHasEffectThrows);
        ASSERT_TRUE(model.Open(Corpus().c_str(), 0, nullptr));
        ulkHostInstance* instance = model.NewInstance();
        ASSERT_NE(instance, nullptr);
        TestImage in(kImgFormatRGBA, 2, 2), out(kImgFormatRGBA, 2, 2);
        instance->SetInput(0, in.get());
        instance->SetOutput(0, out.get());
        for (int frame = 0; frame < 2; ++frame) {
            try {
                instance->Execute(nullptr);
                ADD_FAILURE() << "HasEffect's exception did not reach the host";
            } catch (const std::logic_error& error) {
                EXPECT_STREQ(error.what(), BAD_HAS_EFFECT_TEXT);
            }
            EXPECT_TRUE(instance->IsState(ULKState::kStateIdle));
            EXPECT_THROW(instance->HasEffect(), std::logic_error);
        }
        EXPECT_EQ(Reports(kBadReportPreProcess), 0);
        EXPECT_EQ(Reports(kBadReportExecute), 0);

        // The instance's other calls still work, and it is deleted without a PostProcess.
        EXPECT_TRUE(instance->PreProcess());
        instance->PostProcess();
        EXPECT_EQ(Reports(kBadReportPostProcess), 1);
        model.DeleteInstance(instance);
        EXPECT_EQ(Reports(kBadReportPostProcess), 1);
        EXPECT_EQ(model.GetInstanceRefCount(), 0);
        EXPECT_EQ(LiveObjects(model), 1);
        EXPECT_EQ(LiveBlocks(), kModelBlocks);
    }
    ExpectReleased(Corpus());
}

TEST_F(BadInstanceTest, OverlayWithoutModesAnswersEveryHostCall) {
    {
        ulkHostModel model(kBadOverlayNoMode);
        ASSERT_TRUE(model.Open(Corpus().c_str(), 0, nullptr));
        ulkHostInstance* instance = model.NewInstance();
        ASSERT_NE(instance, nullptr);
        ulkHostOverlay* overlay = model.NewOverlay();
        ASSERT_NE(overlay, nullptr);
        EXPECT_EQ(LiveObjects(model), 3);
        EXPECT_EQ(LiveBlocks(), kModelBlocks + 2);  // the instance's and the overlay's

        EXPECT_EQ(overlay->GetNumModes(), 0);
        char name[8] = "unset";
        overlay->GetModeName(0, name, sizeof name);
        overlay->GetModeName(-1, name, sizeof name);
        EXPECT_STREQ(name, "unset");
        EXPECT_EQ(overlay->GetMode(), 0);
        overlay->SetMode(2);
        EXPECT_EQ(overlay->GetMode(), 2);
        overlay->SetInstance(instance);
        EXPECT_EQ(overlay->GetInstance(), instance->GetPluginInstance());
        overlay->Draw(true);
        EXPECT_FALSE(overlay->OnMouseDown(1.0, 1.0, 0));
        EXPECT_FALSE(overlay->OnKeyDown('a', 0));
        EXPECT_EQ(overlay->GetOverlayBuffer(), nullptr);  // no context bound
        EXPECT_EQ(overlay->GetError(), kErrorNone);

        // A working overlay of the same module, for comparison: one default mode.
        ulkHostModel plain(kBadPlain);
        ASSERT_TRUE(plain.Open(Corpus().c_str(), 0, nullptr));
        ulkHostOverlay* withMode = plain.NewOverlay();
        ASSERT_NE(withMode, nullptr);
        EXPECT_EQ(withMode->GetNumModes(), 1);
        EXPECT_TRUE(withMode->OnMouseDown(1.0, 1.0, 0));
        plain.DeleteOverlay(withMode);

        model.DeleteOverlay(overlay);
        model.DeleteInstance(instance);
        EXPECT_EQ(LiveObjects(model), 2);  // the two plug-in models
        EXPECT_EQ(LiveBlocks(), 2 * kModelBlocks);
    }
    ExpectReleased(Corpus());
}

TEST_F(BadInstanceTest, ThrowingOverlayDefinitionLeavesNoOverlayBehind) {
    {
        ulkHostModel model(kBadOverlayThrows);
        ASSERT_TRUE(model.Open(Corpus().c_str(), 0, nullptr));
        for (int attempt = 0; attempt < 2; ++attempt) {
            try {
                model.NewOverlay();
                ADD_FAILURE() << "DefineOverlay's exception did not reach the host";
            } catch (const std::logic_error& error) {
                EXPECT_STREQ(error.what(), BAD_OVERLAY_TEXT);
            }
            // The host never saw the overlay, so the library must have deleted both halves.
            EXPECT_EQ(LiveObjects(model), 1);
            EXPECT_EQ(LiveBlocks(), kModelBlocks);
        }
    }
    ExpectReleased(Corpus());
}

}  // namespace

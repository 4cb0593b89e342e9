// A host holding one instance of the instance_probe module, with an RGBA
// input and output, and access to the probe's control block.
#ifndef ULK_TESTS_PROBE_FIXTURE_H
#define ULK_TESTS_PROBE_FIXTURE_H

#include <memory>
#include <string>

#include "../plugins/instance_probe/probe_control.h"
#include "model_host.h"

class ProbeTest : public ModelHostTest {
  protected:
    void SetUp() override {
        ModelHostTest::SetUp();
        ASSERT_TRUE(mModel->Open(TestPluginPath("instance_probe").c_str(), 0, nullptr));
        auto getControl = ModuleSymbol<ProbeGetControlProc>(*mModel, "ProbeGetControl");
        mRenderFlag = ModuleSymbol<ProbeRenderFlagProc>(*mModel, "ProbeRenderFlag");
        ASSERT_NE(getControl, nullptr);
        ASSERT_NE(mRenderFlag, nullptr);
        mControl = getControl();
        *mControl = ProbeControl();
        mInstance = mModel->NewInstance();
        ASSERT_NE(mInstance, nullptr);
        mIn.FillPattern(3);
        mOut.Fill(0);
        ASSERT_TRUE(mInstance->SetInput(0, mIn.get()));
        ASSERT_TRUE(mInstance->SetOutput(0, mOut.get()));
    }

    void TearDown() override {
        if (mInstance) mModel->DeleteInstance(mInstance);
        mModel.reset();
        ModelHostTest::TearDown();
    }

    /// The probe's calls so far, one letter each; the record is then cleared.
    std::string TakeCalls() {
        std::string calls;
        for (int i = 0; i < mControl->numEvents; ++i) calls += mControl->events[i].call;
        mControl->numEvents = 0;
        return calls;
    }

    /// The render flag the module reads right now.
    int32_t RenderFlag() const { return mRenderFlag(); }

    // Destroyed in TearDown, while the model's memory callbacks are still installed.
    std::unique_ptr<ulkHostModel> mModel = std::make_unique<ulkHostModel>(kProbeModel);
    ProbeControl* mControl = nullptr;
    ProbeRenderFlagProc mRenderFlag = nullptr;
    ulkHostInstance* mInstance = nullptr;
    TestImage mIn{kImgFormatRGBA, 4, 2};
    TestImage mOut{kImgFormatRGBA, 4, 2};
};

#endif  // ULK_TESTS_PROBE_FIXTURE_H

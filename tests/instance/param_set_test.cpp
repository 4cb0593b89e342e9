// The parameter set of an instance: what the "Levels" plug-in defines, how
// the host walks and keys it, and how Execute hands the plug-in its values.
#include <memory>

#include "../plugins/param_probe/param_probe.h"
#include "model_host.h"

namespace {

class ParamSetTest : public ModelHostTest {
  protected:
    void SetUp() override {
        ModelHostTest::SetUp();
        ASSERT_TRUE(mModel->Open(TestPluginPath("param_probe").c_str(), 0, nullptr));
        auto getRecord = ModuleSymbol<ParamProbeRecordProc>(*mModel, "ParamProbeGetRecord");
        ASSERT_NE(getRecord, nullptr);
        mRecord = getRecord();
        *mRecord = ParamProbeRecord();
        mInstance = mModel->NewInstance();
        ASSERT_NE(mInstance, nullptr) << mModel->GetErrorString();
    }

    void TearDown() override {
        if (mInstance) mModel->DeleteInstance(mInstance);
        mModel.reset();
        ModelHostTest::TearDown();
    }

    ulkParameter* Find(const char* id) const { return mInstance->FindParameter(id); }

    // Destroyed in TearDown, while the model's memory callbacks are still installed.
    std::unique_ptr<ulkHostModel> mModel = std::make_unique<ulkHostModel>(0);
    ParamProbeRecord* mRecord = nullptr;
    ulkHostInstance* mInstance = nullptr;
};

TEST_F(ParamSetTest, DefinedParametersAndGroupsAreWalkedInAddingOrder) {
    ASSERT_EQ(mInstance->GetNumParameters(), 5);
    EXPECT_EQ(mRecord->secondAdd, nullptr);  // the second add of "gain" was refused
    const char* ids[] = {"gain", "advanced", "steps", "enabled", "tint"};
    for (int i = 0; i < 5; ++i) EXPECT_STREQ(mInstance->GetParameter(i)->GetID(), ids[i]);
    auto* advanced = static_cast<ulkPGroup*>(Find("advanced"));
    EXPECT_EQ(advanced->GetNumParameters(), 2);
    EXPECT_EQ(Find("steps")->GetGroup(), advanced);
    EXPECT_EQ(mInstance->GetNumTopLevelParameters(), 3);
    EXPECT_EQ(mInstance->GetTopLevelParameter(1), advanced);
    EXPECT_EQ(mInstance->GetTopLevelParameter(2), Find("tint"));
    for (int bad : {5, -1}) EXPECT_EQ(mInstance->GetParameter(bad), nullptr);
    for (int bad : {3, -1}) EXPECT_EQ(mInstance->GetTopLevelParameter(bad), nullptr);
    EXPECT_EQ(Find("Gain"), nullptr);  // identifiers are compared exactly
    // gain 8, steps 8 (evaluated as a double), enabled 1, tint 24; the group has no value.
    EXPECT_EQ(mInstance->GetMaxParamSize(), 41u);
}

TEST_F(ParamSetTest, ExecuteHandsThePluginInterpolatedValues) {
    auto* gain = static_cast<ulkPNumber*>(Find("gain"));
    auto* steps = static_cast<ulkPNumber*>(Find("steps"));
    auto* enabled = static_cast<ulkPBoolean*>(Find("enabled"));
    auto* tint = static_cast<ulkPColorRGB*>(Find("tint"));
    gain->SetValue(0.0, 0.5);
    gain->SetValue(1.0, 2.0);
    steps->SetValue(0.0, 2);
    steps->SetValue(1.0, 8);
    enabled->SetValue(0.5, true);
    tint->SetValue(1.0, {1.0, 0.5, 0.25});

    TestImage in(kImgFormatRGBA, 2, 2), out(kImgFormatRGBA, 2, 2);
    in.Fill(100);
    mInstance->SetInput(0, in.get());
    mInstance->SetOutput(0, out.get());
    mInstance->SetTotalFrames(11);
    for (int frame : {0, 5, 10}) {
        mInstance->SetCurrentFrame(frame);
        out.Fill(0);
        ASSERT_TRUE(mInstance->Execute(nullptr)) << mInstance->GetErrorString();
        const double expectedGain = 0.5 + 1.5 * frame / 10.0;
        const unsigned char* bytes = out.bytes();
        EXPECT_EQ(bytes[0], static_cast<int>(100 * expectedGain + 0.5)) << frame;
        EXPECT_EQ(bytes[3], 100) << frame;  // alpha kept
    }
    ASSERT_EQ(mRecord->executes, 3);
    const struct {
        double gain;
        int steps;  // integers step at keys
        bool enabled;
        double tintGreen;
    } seen[] = {{0.5, 2, false, 0.0}, {1.25, 2, true, 0.25}, {2.0, 8, true, 0.5}};
    for (int i = 0; i < 3; ++i) {
        EXPECT_DOUBLE_EQ(mRecord->seen[i].gain, seen[i].gain) << i;
        EXPECT_EQ(mRecord->seen[i].steps, seen[i].steps) << i;
        EXPECT_EQ(mRecord->seen[i].enabled, seen[i].enabled) << i;
        EXPECT_DOUBLE_EQ(mRecord->seen[i].tint.green, seen[i].tintGreen) << i;
    }

    // Removing the last gain key: frame 10 renders with the first key's value.
    EXPECT_TRUE(mInstance->ClearKey(gain, 1));
    EXPECT_FALSE(mInstance->ClearKey(gain, 0));  // the last key stays
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_DOUBLE_EQ(mRecord->seen[3].gain, 0.5);

    // Evaluate writes the values at any time without rendering; ShowUIWindow evaluates too.
    mInstance->Evaluate(0.0);
    EXPECT_EQ(mRecord->live->steps, 2);
    mInstance->SetCurrentFrame(10);
    mInstance->Evaluate();
    EXPECT_EQ(mRecord->live->steps, 8);
    mInstance->Evaluate(0.0);
    mInstance->ShowUIWindow(nullptr);
    EXPECT_EQ(mRecord->live->steps, 8);
}

TEST_F(ParamSetTest, HostAddsParametersOnceAndTheInstanceOwnsThem) {
    double a = 0, b = 0;
    ulkParameter* first =
        ulkPNumber::New("A", "dup", &a, sizeof a, 0.0, 1.0, 0.1, kPNumberReal, false);
    ulkParameter* second =
        ulkPNumber::New("B", "dup", &b, sizeof b, 0.0, 1.0, 0.1, kPNumberReal, false);
    ulkPGroup* group = ulkPGroup::New("More", "more", true);
    ulkPGroup* nested = ulkPGroup::New("Nested", "nested", false);
    EXPECT_EQ(mInstance->AddParameter(group, nullptr), group);
    EXPECT_EQ(mInstance->AddParameter(first, group), first);
    EXPECT_EQ(mInstance->AddParameter(second, nullptr), second);
    EXPECT_EQ(mInstance->AddParameter(nested, group), nested);  // groups do not nest
    EXPECT_TRUE(nested->IsAtTopLevel());
    EXPECT_EQ(mInstance->AddParameter(nullptr, group), nullptr);
    EXPECT_EQ(mInstance->FindParameter("dup"), first);  // the first added wins

    // Adding again changes nothing: not listed twice, not grouped twice.
    EXPECT_EQ(mInstance->AddParameter(second, group), nullptr);
    EXPECT_EQ(mInstance->AddParameter(first, nullptr), nullptr);
    EXPECT_EQ(mInstance->GetNumParameters(), 9);
    EXPECT_EQ(group->GetNumParameters(), 1);
    EXPECT_TRUE(second->IsAtTopLevel());
    // The instance deletes all nine when it goes (the sanitizer run checks for leaks).
}

TEST_F(ParamSetTest, ModelWideCallbacksReceiveThePluginInstance) {
    EXPECT_TRUE(mInstance->HasUpdateParamsCallback());
    EXPECT_TRUE(mInstance->UpdateParams());
    EXPECT_EQ(mRecord->updates, 1);
    EXPECT_EQ(mRecord->updated, mInstance->GetPluginInstance());
    EXPECT_FALSE(mInstance->FlushInstanceData());
    mModel->SetUpdateParamsCallback(nullptr);
    EXPECT_FALSE(mInstance->UpdateParams());
    EXPECT_EQ(mRecord->updates, 1);
}

}  // namespace

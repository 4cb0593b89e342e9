// ulkInstance_v1: what the base class answers for a plug-in that overrides
// only Execute, reached through the host instance as a host reaches it.
#include "probe_fixture.h"

namespace {

using InstanceBaseTest = ModelHostTest;

TEST_F(InstanceBaseTest, OnlyExecuteOverriddenLeavesTheDefaults) {
    ulkHostModel model(kMinimalModel);
    ASSERT_TRUE(model.Open(TestPluginPath("instance_probe").c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();  // DefineParameters answered true
    ASSERT_NE(instance, nullptr);
    EXPECT_EQ(instance->GetNumParameters(), 0);
    EXPECT_TRUE(instance->DefineParameters());
    EXPECT_TRUE(instance->HasEffect());
    EXPECT_FALSE(instance->InPlace());
    EXPECT_TRUE(instance->PreProcess());
    instance->PostProcess();

    TestImage out(kImgFormatRGBA, 2, 2);
    instance->SetOutput(0, out.get());
    EXPECT_FALSE(instance->ShowUIWindow(nullptr));  // no user interface
    EXPECT_EQ(instance->GetError(), kErrorNone);

    ulkBounds bounds = {5, 6, 7, 8};
    instance->GetInputSize(&bounds);
    EXPECT_EQ(bounds.left, 0);
    EXPECT_EQ(bounds.bottom, 0);
    bounds = {5, 6, 7, 8};
    instance->GetOutputSize(&bounds);
    EXPECT_EQ(bounds.top, 0);
    EXPECT_EQ(bounds.right, 0);
    instance->GetInputSize(nullptr);
    instance->GetOutputSize(nullptr);

    ulkInstance_v1* plugin = instance->GetPluginInstance();
    ulkInstance_v1* copy = plugin;
    EXPECT_TRUE(plugin->CopyInstance(plugin, &copy));
    EXPECT_EQ(copy, nullptr);
    EXPECT_EQ(plugin->GetModel(), model.GetModel());
    model.DeleteInstance(instance);
}

TEST_F(InstanceBaseTest, ForwardersReadTheHostsContext) {
    ulkHostModel model(kMinimalModel);
    ASSERT_TRUE(model.Open(TestPluginPath("instance_probe").c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();
    ulkInstance_v1* plugin = instance->GetPluginInstance();
    instance->SetFrameRate(29.97);
    instance->SetQuality(0.5);
    instance->SetPixelAspect(0.9);
    instance->SetDisplayAspect(16.0 / 9.0);
    instance->SetTotalFrames(20);
    instance->SetCurrentFrame(4);
    instance->SetFieldDominance(kFieldTwo);
    instance->SetVideoType(kVideoTypeInterlaced);
    EXPECT_DOUBLE_EQ(plugin->GetFrameRate(), 29.97);
    EXPECT_DOUBLE_EQ(plugin->GetQuality(), 0.5);
    EXPECT_DOUBLE_EQ(plugin->GetPixelAspect(), 0.9);
    EXPECT_DOUBLE_EQ(plugin->GetDisplayAspect(), 16.0 / 9.0);
    EXPECT_EQ(plugin->GetTotalFrames(), 20);
    EXPECT_EQ(plugin->GetCurrentFrame(), 4);
    EXPECT_EQ(plugin->GetFieldDominance(), kFieldTwo);
    EXPECT_EQ(plugin->GetVideoType(), kVideoTypeInterlaced);
    EXPECT_EQ(plugin->GetFieldMode(), kFieldModeFrames);
    EXPECT_EQ(plugin->GetField(), kFieldOne);
    plugin->SetHostParametersModified(true);
    EXPECT_TRUE(instance->GetHostParametersModified());
    EXPECT_TRUE(plugin->GetHostParametersModified());
    plugin->SetError(kErrorNotImplemented);
    EXPECT_EQ(plugin->GetError(), kErrorNotImplemented);
    EXPECT_STREQ(plugin->GetErrorString(), "ULK_ERROR: Not Implemented");
    model.DeleteInstance(instance);
}

}  // namespace

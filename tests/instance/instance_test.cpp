// ulkInstance_v1: what the base class answers for a plug-in that overrides
// only Execute, and what it reads of the host's context.
#include "probe_fixture.h"

namespace {

using InstanceBaseTest = ModelHostTest;

TEST_F(InstanceBaseTest, OnlyExecuteOverriddenLeavesTheDefaultsAndForwardsTheContext) {
    ulkHostModel model(kMinimalModel);
    ASSERT_TRUE(model.Open(TestPluginPath("instance_probe").c_str(), 0, nullptr));
    ulkHostInstance* instance = model.NewInstance();  // DefineParameters answered true
    ASSERT_NE(instance, nullptr);
    EXPECT_TRUE(instance->HasEffect());
    EXPECT_FALSE(instance->InPlace());
    EXPECT_TRUE(instance->PreProcess());
    TestImage out(kImgFormatRGBA, 2, 2);
    instance->SetOutput(0, out.get());
    EXPECT_FALSE(instance->ShowUIWindow(nullptr));  // no user interface, no status
    EXPECT_EQ(instance->GetError(), kErrorNone);
    ulkBounds bounds = {5, 6, 7, 8};
    instance->GetOutputSize(&bounds);
    EXPECT_EQ(bounds.left + bounds.top + bounds.right + bounds.bottom, 0);
    instance->GetInputSize(nullptr);

    ulkInstance_v1* plugin = instance->GetPluginInstance();
    ulkInstance_v1* copy = plugin;
    EXPECT_TRUE(plugin->CopyInstance(plugin, &copy));
    EXPECT_EQ(copy, nullptr);

    instance->SetFrameRate(29.97);
    instance->SetQuality(0.5);
    instance->SetPixelAspect(0.9);
    instance->SetDisplayAspect(1.5);
    instance->SetTotalFrames(20);
    instance->SetCurrentFrame(4);
    instance->SetFieldDominance(kFieldTwo);
    instance->SetVideoType(kVideoTypeInterlaced);
    EXPECT_DOUBLE_EQ(plugin->GetFrameRate(), 29.97);
    EXPECT_DOUBLE_EQ(plugin->GetQuality(), 0.5);
    EXPECT_DOUBLE_EQ(plugin->GetPixelAspect(), 0.9);
    EXPECT_DOUBLE_EQ(plugin->GetDisplayAspect(), 1.5);
    EXPECT_EQ(plugin->GetTotalFrames(), 20);
    EXPECT_EQ(plugin->GetCurrentFrame(), 4);
    EXPECT_EQ(plugin->GetFieldDominance(), kFieldTwo);
    EXPECT_EQ(plugin->GetVideoType(), kVideoTypeInterlaced);
    plugin->SetHostParametersModified(true);
    EXPECT_TRUE(instance->GetHostParametersModified());
    model.DeleteInstance(instance);
}

}  // namespace

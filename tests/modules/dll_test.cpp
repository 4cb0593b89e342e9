// Loading one module: start-up, attributes, model count, shut-down, bad files.
#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <string>
#include <vector>

#include "../plugins/module_probe/module_probe.h"
#include "registry_guard.h"
#include "test_paths.h"
#include "ulk/ulk.h"

namespace {

class ModuleTest : public ::testing::Test {
  protected:
    void SetUp() override { ResetRegistry(); }
    void TearDown() override {
        ResetRegistry();
        InstallHostAttributeCallback(nullptr);
        ulkSetPlayMode(kPlayModePlay);
        ULKSetOpticalFlowMode(1);
    }
    static ulkDLL* Open(const std::string& path, ModuleProbe* probe, hostAppInfo* info = nullptr) {
        return ulkDLLMaker::Open(path.c_str(), reinterpret_cast<unsigned char*>(probe), info);
    }
};

unsigned char HostAttribute(ulkHostAttribute, void*) {
    return 1;
}

TEST_F(ModuleTest, StartUpSendsAttributesInOrderAndCountsModels) {
    for (bool host : {true, false}) {
        SCOPED_TRACE(host ? "with host callback and info" : "without");
        ModuleProbe probe;
        probe.numModels = 3;
        InstallHostAttributeCallback(host ? &HostAttribute : nullptr);
        auto* info = reinterpret_cast<hostAppInfo*>(&probe);  // any pointer: passed on unread
        ulkDLL* dll = Open(TestPluginPath("probe_a"), &probe, host ? info : nullptr);
        ASSERT_NE(dll, nullptr);
        EXPECT_EQ(probe.startUps, 1);
        EXPECT_EQ(dll->GetNumModels(), 3);
        // 15 only with a host callback, 1 only with host info.
        const std::vector<int> expected =
            host ? std::vector<int>{0, 3, 14, 15, 1} : std::vector<int>{0, 3, 14};
        EXPECT_EQ(std::vector<int>(probe.attributes, probe.attributes + probe.attributeCount),
                  expected);
        EXPECT_EQ(probe.hostInfo, host ? static_cast<void*>(&probe) : nullptr);
        EXPECT_EQ(probe.hostCallback, host ? reinterpret_cast<void*>(&HostAttribute) : nullptr);
        ResetRegistry();  // shuts the module down while its probe lives
    }
    // The mode functions read the value of the moment; host values pass through unchanged.
    ModuleProbe probe;
    ASSERT_NE(Open(TestPluginPath("probe_b"), &probe), nullptr);
    ASSERT_TRUE(probe.renderFlag && probe.opticalFlow && probe.playMode);
    ulkSetPlayMode(kPlayModeRender);
    ULKSetOpticalFlowMode(7);
    EXPECT_EQ(probe.playMode(), 0);
    EXPECT_EQ(probe.opticalFlow(), 7);
    ulkSetPlayMode(static_cast<ulkPlayMode>(42));
    EXPECT_EQ(probe.playMode(), 42);
    EXPECT_EQ(probe.renderFlag(), 1);  // no instance has rendered: its start value
    ResetRegistry();
}

TEST_F(ModuleTest, ModuleWithoutEntryPointsStartsWithOneModel) {
    ulkDLL* dll = Open(TestPluginPath("no_entry_points"), nullptr);
    ASSERT_NE(dll, nullptr);
    EXPECT_EQ(dll->GetNumModels(), 1);
    EXPECT_EQ(dll->GetSymbol("ulkNewModel_v1"), nullptr);
    EXPECT_NE(dll->GetSymbol("notAnEntryPoint"), nullptr);
}

TEST_F(ModuleTest, FailedStartUpIsShutDownAndUnloaded) {
    ModuleProbe probe;
    probe.startUpResult = false;
    const std::string path = TestPluginPath("probe_a");
    EXPECT_EQ(Open(path, &probe), nullptr);
    EXPECT_EQ(probe.shutDowns, 1);
    EXPECT_EQ(probe.attributeCount, 3);  // 0, 3 and 14 arrive whatever start-up answered
    EXPECT_EQ(probe.numModelsCalls, 0);
    EXPECT_FALSE(IsLoaded(path));
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
}

TEST_F(ModuleTest, BadFilesAreRefusedWithoutHarm) {
    const std::string dir = ::testing::TempDir();
    const std::string text = dir + "/ulk_not_a_module.so", empty = dir + "/ulk_empty.so";
    std::ofstream(text) << "this is not a shared object\n";
    std::ofstream{empty};
    for (const std::string& path : {std::string("/no/such/file.so"), text, empty, dir})
        EXPECT_EQ(Open(path, nullptr), nullptr) << path;
    EXPECT_EQ(ulkDLLMaker::Open(nullptr, nullptr, nullptr), nullptr);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
    EXPECT_NE(Open(TestPluginPath("probe_a"), nullptr), nullptr) << "the registry is usable";
    std::remove(text.c_str());
    std::remove(empty.c_str());
}

TEST_F(ModuleTest, PlatformModuleKeepsLongPathsAndClosesOnce) {
    const std::string longPath = "/" + std::string(300, 'x');
    ulkNTDLL missing(longPath.c_str());
    EXPECT_STREQ(missing.GetName(), longPath.c_str());
    EXPECT_FALSE(missing.Open());
    EXPECT_FALSE(missing.StartUp(nullptr));  // not loaded: nothing is called
    ulkNTDLL unnamed(nullptr);
    EXPECT_FALSE(unnamed.Open());

    const std::string path = TestPluginPath("probe_b");
    ulkNTDLL loaded(path.c_str());
    ASSERT_TRUE(loaded.Open());
    EXPECT_TRUE(IsLoaded(path));
    loaded.Close();
    loaded.Close();
    EXPECT_FALSE(loaded.IsOpen());
    EXPECT_FALSE(IsLoaded(path));
    EXPECT_EQ(loaded.GetSymbol("ulkStartUp_v1"), nullptr);
}

}  // namespace

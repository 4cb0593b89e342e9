// Loading one module: start-up, attributes, model count, shut-down, bad files.
#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <string>

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
    unsigned char* Arg(ModuleProbe& probe) { return reinterpret_cast<unsigned char*>(&probe); }
};

unsigned char HostAttribute(ulkHostAttribute, void*) {
    return 1;
}

TEST_F(ModuleTest, ModuleWithoutEntryPointsStartsWithOneModel) {
    ulkDLL* dll = ulkDLLMaker::Open(TestPluginPath("no_entry_points").c_str(), nullptr, nullptr);
    ASSERT_NE(dll, nullptr);
    EXPECT_TRUE(dll->IsOpen());
    EXPECT_EQ(dll->GetNumModels(), 1);
    EXPECT_EQ(dll->GetRefCount(), 1);
    EXPECT_EQ(dll->GetSymbol("ulkNewModel_v1"), nullptr);
    EXPECT_NE(dll->GetSymbol("notAnEntryPoint"), nullptr);
    EXPECT_STREQ(dll->GetErrorString(), "Not yet");
}

TEST_F(ModuleTest, StartUpSendsAttributesInOrderAndCountsModels) {
    ModuleProbe probe;
    probe.numModels = 3;
    InstallHostAttributeCallback(&HostAttribute);
    auto* info = reinterpret_cast<hostAppInfo*>(&probe);  // any pointer: passed on unread
    ulkDLL* dll = ulkDLLMaker::Open(TestPluginPath("probe_a").c_str(), Arg(probe), info);
    ASSERT_NE(dll, nullptr);

    EXPECT_EQ(probe.startUps, 1);
    EXPECT_EQ(dll->GetNumModels(), 3);
    EXPECT_EQ(dll->GetNumModels(12.5f), 3);
    ASSERT_EQ(probe.attributeCount, 5);
    const int expected[] = {0, 3, 14, 15, 1};
    for (int i = 0; i < 5; ++i) EXPECT_EQ(probe.attributes[i], expected[i]) << "attribute #" << i;
    EXPECT_EQ(probe.hostInfo, static_cast<void*>(&probe));
    EXPECT_EQ(probe.hostCallback, reinterpret_cast<void*>(&HostAttribute));
}

TEST_F(ModuleTest, ModeFunctionsReadTheValueOfTheMoment) {
    ModuleProbe probe;
    ASSERT_NE(ulkDLLMaker::Open(TestPluginPath("probe_a").c_str(), Arg(probe), nullptr), nullptr);
    ASSERT_NE(probe.renderFlag, nullptr);
    ASSERT_NE(probe.opticalFlow, nullptr);
    ASSERT_NE(probe.playMode, nullptr);
    // Without a host attribute callback, attribute 15 is not sent; no host info, no 1.
    EXPECT_EQ(probe.attributeCount, 3);

    ulkSetPlayMode(kPlayModeRender);
    ULKSetOpticalFlowMode(7);
    EXPECT_EQ(probe.playMode(), 0);
    EXPECT_EQ(probe.opticalFlow(), 7);
    ulkSetPlayMode(static_cast<ulkPlayMode>(42));  // host values pass through unchanged
    EXPECT_EQ(probe.playMode(), 42);
    EXPECT_EQ(probe.renderFlag(), 1);  // no instance has rendered: its start value
}

TEST_F(ModuleTest, FailedStartUpIsShutDownAndUnloaded) {
    ModuleProbe probe;
    probe.startUpResult = false;
    const std::string path = TestPluginPath("probe_a");
    EXPECT_EQ(ulkDLLMaker::Open(path.c_str(), Arg(probe), nullptr), nullptr);
    EXPECT_EQ(probe.startUps, 1);
    EXPECT_EQ(probe.shutDowns, 1);
    EXPECT_EQ(probe.attributeCount, 3);  // 0, 3 and 14 arrive whatever start-up answered
    EXPECT_EQ(probe.numModelsCalls, 0);
    EXPECT_FALSE(IsLoaded(path));
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
}

TEST_F(ModuleTest, BadFilesAreRefusedWithoutHarm) {
    const std::string dir = ::testing::TempDir();
    const std::string text = dir + "/ulk_not_a_module.so";
    const std::string empty = dir + "/ulk_empty.so";
    std::ofstream(text) << "this is not a shared object\n";
    std::ofstream{empty};

    for (const std::string& path : {std::string("/no/such/file.so"), text, empty, dir}) {
        EXPECT_EQ(ulkDLLMaker::Open(path.c_str(), nullptr, nullptr), nullptr) << path;
    }
    EXPECT_EQ(ulkDLLMaker::Open(nullptr, nullptr, nullptr), nullptr);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
    // The registry is left usable.
    EXPECT_NE(ulkDLLMaker::Open(TestPluginPath("probe_a").c_str(), nullptr, nullptr), nullptr);
    std::remove(text.c_str());
    std::remove(empty.c_str());
}

TEST_F(ModuleTest, PlatformModuleKeepsLongPathsAndClosesOnce) {
    std::string longPath(300, 'x');
    longPath.insert(0, "/");
    ulkNTDLL dll(longPath.c_str());
    EXPECT_STREQ(dll.GetName(), longPath.c_str());
    EXPECT_FALSE(dll.Open());
    EXPECT_FALSE(dll.StartUp(nullptr));  // not loaded: nothing is called

    const std::string path = TestPluginPath("probe_b");
    {
        ulkNTDLL loaded(path.c_str());
        ASSERT_TRUE(loaded.Open());
        EXPECT_TRUE(IsLoaded(path));
        loaded.Close();
        EXPECT_FALSE(loaded.IsOpen());
        EXPECT_FALSE(IsLoaded(path));
        loaded.Close();
        EXPECT_EQ(loaded.GetSymbol("ulkStartUp_v1"), nullptr);
    }
    ulkNTDLL unnamed(nullptr);
    EXPECT_FALSE(unnamed.Open());
}

}  // namespace

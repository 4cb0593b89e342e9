// The registry: sharing by path, reference counts, close modes, eviction.
#include <gtest/gtest.h>

#include <string>

#include "../plugins/module_probe/module_probe.h"
#include "registry_guard.h"
#include "test_paths.h"
#include "ulk/ulk.h"

namespace {

class RegistryTest : public ::testing::Test {
  protected:
    void SetUp() override { ResetRegistry(); }
    void TearDown() override { ResetRegistry(); }

    static ulkDLL* Open(const char* name, ModuleProbe* probe = nullptr) {
        return ulkDLLMaker::Open(TestPluginPath(name).c_str(),
                                 reinterpret_cast<unsigned char*>(probe), nullptr);
    }
    static bool Loaded(const char* name) { return IsLoaded(TestPluginPath(name)); }
};

TEST_F(RegistryTest, SharedModulesAreCountedAndUnloadedByTheLastClose) {
    ModuleProbe probe;
    ulkDLL* a = Open("probe_a", &probe);
    ASSERT_NE(a, nullptr);
    EXPECT_EQ(Open("probe_a"), a);
    EXPECT_EQ(a->GetRefCount(), 2);
    EXPECT_EQ(probe.startUps, 1);
    EXPECT_EQ(Open("probe_b"), nullptr);  // start bound 1, A in use

    ulkDLLMaker::Close(a, kCloseNow);
    EXPECT_TRUE(Loaded("probe_a"));
    ulkDLLMaker::Close(a, kCloseNow);
    EXPECT_EQ(probe.shutDowns, 1);
    EXPECT_FALSE(Loaded("probe_a"));
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
}

TEST_F(RegistryTest, KeptModulesAreReusedAndEvictedOldestFirst) {
    ModuleProbe probeA, probeB;
    ulkDLLMaker::SetDefaultCloseMode(kCloseKeep);
    ulkDLL* a = Open("probe_a", &probeA);
    ASSERT_NE(a, nullptr);
    ulkDLLMaker::Close(a, kCloseDefault);
    EXPECT_EQ(a->GetRefCount(), 0);
    EXPECT_EQ(Open("probe_a"), a);  // reused, not started again
    EXPECT_EQ(probeA.startUps, 1);
    ulkDLLMaker::Close(a, kCloseKeep);

    // Opening B at the bound evicts idle A: shut down and unloaded.
    ulkDLL* b = Open("probe_b", &probeB);
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(probeA.shutDowns, 1);
    EXPECT_FALSE(Loaded("probe_a"));
    // Any mode but 0 and 2 keeps; kCloseNow unloads an idle module.
    ulkDLLMaker::Close(b, static_cast<ulkCloseMode_t>(7));
    EXPECT_TRUE(Loaded("probe_b"));
    ulkDLLMaker::Close(b, kCloseNow);
    EXPECT_FALSE(Loaded("probe_b"));
}

TEST_F(RegistryTest, BoundIsRaisedAndLowered) {
    ASSERT_TRUE(ulkDLLMaker::SetActiveDLLs(3));
    ulkDLL* a = Open("probe_a");
    ulkDLL* b = Open("probe_b");
    ulkDLL* c = Open("probe_c");
    ASSERT_TRUE(a && b && c);
    EXPECT_EQ(Open("probe_d"), nullptr);  // all three held

    // Eviction takes the oldest idle module, not the most recently released.
    ulkDLLMaker::Close(c, kCloseKeep);
    ulkDLLMaker::Close(a, kCloseKeep);
    ASSERT_NE(Open("probe_d"), nullptr);
    EXPECT_FALSE(Loaded("probe_a"));
    EXPECT_TRUE(Loaded("probe_c"));

    // With a bound of 0 only an idle module makes room; a nonsense bound breaks nothing.
    ulkDLLMaker::SetActiveDLLs(0);
    EXPECT_NE(Open("probe_a"), nullptr);  // evicts idle C
    EXPECT_FALSE(Loaded("probe_c"));
    EXPECT_EQ(Open("probe_c"), nullptr);
    ulkDLLMaker::SetActiveDLLs(-3);
    EXPECT_EQ(Open("probe_c"), nullptr);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 3);
}

TEST_F(RegistryTest, ReuseIsByExactPathAndUnknownModulesAreIgnored) {
    ulkDLLMaker::SetActiveDLLs(2);
    const std::string path = TestPluginPath("probe_a");
    const std::string other = std::string(ULK_TEST_PLUGIN_DIR) + "/./probe_a.so";
    ulkDLL* a = ulkDLLMaker::Open(path.c_str(), nullptr, nullptr);
    ulkDLL* a2 = ulkDLLMaker::Open(other.c_str(), nullptr, nullptr);
    ASSERT_TRUE(a && a2);
    EXPECT_NE(a, a2);
    EXPECT_EQ(a->GetRefCount(), 1);

    ulkDLLMaker::Close(nullptr, kCloseNow);
    ulkNTDLL stranger(path.c_str());
    ulkDLLMaker::Close(&stranger, kCloseNow);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 2);
}

}  // namespace

// The host of the hardening suite: model_host's services, plus allocators for
// the three per-class memory pairs that count live blocks, and a host attribute
// callback that records what the bad modules report.
#ifndef ULK_TESTS_HARDENING_HOST_H
#define ULK_TESTS_HARDENING_HOST_H

#include <algorithm>
#include <cstdlib>
#include <string>
#include <vector>

#include "../plugins/bad/bad_plugin.h"
#include "model_host.h"
#include "registry_guard.h"

class HardeningTest : public ModelHostTest {
  protected:
    void SetUp() override {
        ModelHostTest::SetUp();
        sLiveBlocks = 0;
        sReports.clear();
        ulkHostModel::SetAllocCallback(&CountedAlloc);
        ulkHostModel::SetFreeCallback(&CountedFree);
        ulkHostInstance::SetAllocCallback(&CountedAlloc);
        ulkHostInstance::SetFreeCallback(&CountedFree);
        ulkHostOverlay::SetAllocCallback(&CountedAlloc);
        ulkHostOverlay::SetFreeCallback(&CountedFree);
        InstallHostAttributeCallback(&Record);
    }

    void TearDown() override {
        InstallHostAttributeCallback(nullptr);
        ulkHostOverlay::SetAllocCallback(nullptr);
        ulkHostOverlay::SetFreeCallback(nullptr);
        ModelHostTest::TearDown();
        // Every model, instance and overlay of the test is gone by now.
        EXPECT_EQ(sLiveBlocks, 0) << "blocks of the host's per-class allocators leaked";
    }

    static std::string Corpus() { return TestPluginPath("bad_corpus"); }

    /// Live blocks of the per-class allocators.
    static int LiveBlocks() { return sLiveBlocks; }

    /// How often a module reported the event since the test began.
    static int Reports(BadReport event) {
        return static_cast<int>(std::count(sReports.begin(), sReports.end(), event));
    }
    static const std::vector<int32_t>& AllReports() { return sReports; }
    static void ClearReports() { sReports.clear(); }

    /// Live plug-in objects of the model's module, or -1 without one.
    static int LiveObjects(const ulkHostModel& model) {
        auto counter = ModuleSymbol<BadLiveObjectsProc>(model, "BadLiveObjects");
        return counter ? counter() : -1;
    }

    /// The module at path was shut down as often as it was loaded and is
    /// unloaded, and the registry, bound to one module, still loads and
    /// releases another.
    static void ExpectReleased(const std::string& path, int loads = 1) {
        EXPECT_EQ(Reports(kBadReportShutDown), loads) << path;
        EXPECT_FALSE(IsLoaded(path)) << path;
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0) << path;
        ulkDLLMaker::SetActiveDLLs(1);
        ulkHostModel other(0);
        EXPECT_TRUE(other.Open(TestPluginPath("effects").c_str(), 0, nullptr)) << path;
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 1) << path;
        other.Close();
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0) << path;
        ulkDLLMaker::SetActiveDLLs(4);
    }

  private:
    static void* CountedAlloc(size_t size) {
        void* block = std::malloc(size ? size : 1);
        if (block) ++sLiveBlocks;
        return block;
    }
    static void CountedFree(void* block) {
        if (!block) return;
        --sLiveBlocks;
        std::free(block);
    }
    static unsigned char Record(ulkHostAttribute attribute, void*) {
        sReports.push_back(attribute);
        return 0;
    }

    static inline int sLiveBlocks = 0;
    static inline std::vector<int32_t> sReports;
};

#endif  // ULK_TESTS_HARDENING_HOST_H

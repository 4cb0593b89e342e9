// Modules that fail before a model is usable: the host survives, the module is
// shut down and unloaded, the plug-in model (if one was made) is deleted, and
// the registry goes on loading other modules.
#include "hardening_host.h"

namespace {

class BadModuleTest : public HardeningTest {};

TEST_F(BadModuleTest, FailedStartUpIsShutDownAndUnloaded) {
    const std::string path = TestPluginPath("bad_start_up");
    {
        ulkHostModel model(kBadPlain);
        EXPECT_FALSE(model.Open(path.c_str(), 0, nullptr));
        EXPECT_EQ(model.GetError(), kErrorNone);
        EXPECT_EQ(model.GetDLL(), nullptr);
        EXPECT_EQ(LiveBlocks(), 1);  // the stored path only
    }
    ExpectReleased(path);
}

TEST_F(BadModuleTest, ModuleWithoutFactoryIsShutDownAndUnloaded) {
    const std::string path = TestPluginPath("bad_no_factory");
    {
        ulkHostModel model(kBadPlain);
        EXPECT_FALSE(model.Open(path.c_str(), 0, nullptr));
        EXPECT_EQ(model.GetError(), kErrorNone);
        EXPECT_EQ(model.NewOverlay(), nullptr);
    }
    ExpectReleased(path);
}

TEST_F(BadModuleTest, NonsenseModelCountsKeepTheirLow16BitsAndTheFactoryStillDecides) {
    struct Row {
        const char* module;
        int count;
    };
    for (const Row& row : {Row{"bad_zero_models", 0}, Row{"bad_negative_models", 0xFFFD}}) {
        const std::string path = TestPluginPath(row.module);
        ClearReports();
        {
            ulkHostModel model(kBadPlain);
            ASSERT_TRUE(model.Open(path.c_str(), 0, nullptr)) << row.module;
            EXPECT_EQ(model.GetDLL()->GetNumModels(), row.count) << row.module;
            ulkHostInstance* instance = model.NewInstance();
            ASSERT_NE(instance, nullptr) << row.module;
            model.DeleteInstance(instance);
        }
        ExpectReleased(path);
    }
}

TEST_F(BadModuleTest, EveryFailedOpenDeletesThePluginModelAndReleasesTheModule) {
    struct Row {
        BadModel index;
        ulkErrorStatus status;
    };
    const Row rows[] = {
        {kBadFactoryNull, kErrorNone},         {kBadFactoryThrows, kErrorNone},
        {kBadNoName, kErrorDefineIdentity},    {kBadNoType, kErrorDefineIdentity},
        {kBadEffectFalse, kErrorDefineEffect},
    };
    for (const Row& row : rows) {
        ClearReports();
        {
            ulkHostModel model(static_cast<short>(row.index));
            EXPECT_FALSE(model.Open(Corpus().c_str(), 0, nullptr)) << row.index;
            EXPECT_EQ(model.GetError(), row.status) << row.index;
            EXPECT_STREQ(model.GetErrorString(), ulkError::GetMessage(row.status)) << row.index;
            EXPECT_EQ(model.GetNumFormats(), 0) << row.index;
            EXPECT_EQ(model.GetNumInputs(), 0) << row.index;
            // The plug-in model gave its block back: it was deleted before the unload.
            EXPECT_EQ(LiveBlocks(), 1) << row.index;

            // The closed model opens again from its stored path and fails the same way.
            EXPECT_FALSE(model.Open(0, nullptr)) << row.index;
            EXPECT_EQ(model.GetError(), row.status) << row.index;
            EXPECT_EQ(LiveBlocks(), 1) << row.index;
        }
        ExpectReleased(Corpus(), 2);
    }
}

}  // namespace

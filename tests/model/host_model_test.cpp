// ulkHostModel: opening real modules, every way an open or a new instance
// fails, and the model's life from open to close.
#include <stdexcept>
#include <string>

#include "../plugins/model_faults/model_faults.h"
#include "model_host.h"

namespace {

class HostModelTest : public ModelHostTest {
  protected:
    static std::string Faults() { return TestPluginPath("model_faults"); }
    static std::string Effects() { return TestPluginPath("effects"); }

    static int LiveInstances(const ulkHostModel& model) {
        auto counter = ModuleSymbol<FaultCounterProc>(model, "FaultLiveInstances");
        return counter ? counter() : -1;
    }
};

TEST_F(HostModelTest, EveryFailedOpenReportsItsStatusAndReleasesTheModule) {
    struct Row {
        std::string path;  // empty: no path at all
        int index;
        ulkErrorStatus status;
        const char* text;  // null: the status's own message
        bool registryFull = false;
        bool throws = false;
    };
    const Row rows[] = {
        {"", 0, kErrorNullDLLPathname, nullptr},
        {"/nonexistent/effects.so", 0, kErrorNone, nullptr},
        {Faults(), kFaultPlain, kErrorNone, nullptr, true},  // the registry refuses the module
        {TestPluginPath("bad_no_factory"), 0, kErrorNone, nullptr},
        {Faults(), kFaultFactoryNull, kErrorNone, nullptr},
        {Faults(), kFaultFactoryThrows, kErrorNone, nullptr},
        {Faults(), kFaultNoName, kErrorDefineIdentity, nullptr},
        {Faults(), kFaultNoType, kErrorDefineIdentity, nullptr},
        {Faults(), kFaultIdentityFalse, kErrorDefineIdentity, nullptr},
        {Faults(), kFaultIdentityError, kErrorPlugin, FAULT_IDENTITY_TEXT},
        {Faults(), kFaultDefaultTitle, kErrorDefineEffect, nullptr},
        {Faults(), kFaultEffectWarning, kErrorPluginWarning, FAULT_EFFECT_TEXT},
        {Faults(), kFaultEffectThrows, kErrorNone, nullptr, false, true},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.path + " model " + std::to_string(row.index));
        ulkHostModel held(0);
        if (row.registryFull) {
            ulkDLLMaker::SetActiveDLLs(1);
            ASSERT_TRUE(held.Open(Effects().c_str(), 0, nullptr));
        }
        ulkHostModel model(static_cast<short>(row.index));
        // The first open stores the path; the second reopens from it and fails the same way.
        for (const char* path : {row.path.empty() ? nullptr : row.path.c_str(), "-"}) {
            auto open = [&] {
                return path[0] == '-' ? model.Open(0, nullptr) : model.Open(path, 0, nullptr);
            };
            if (!path) {
                EXPECT_FALSE(model.Open(nullptr, 0, nullptr));
            } else if (row.throws) {
                EXPECT_THROW(open(), std::runtime_error);
            } else {
                EXPECT_FALSE(open());
            }
            if (row.throws) continue;
            EXPECT_EQ(model.GetError(), row.status);
            EXPECT_STREQ(model.GetErrorString(),
                         row.text ? row.text : ulkError::GetMessage(row.status));
        }
        EXPECT_EQ(model.GetModel(), nullptr);
        EXPECT_EQ(model.GetDLL(), nullptr);
        EXPECT_EQ(model.GetNumFormats(), 0);
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), row.registryFull ? 1 : 0);
        held.Close();
        ulkDLLMaker::SetActiveDLLs(4);
    }
}

TEST_F(HostModelTest, EveryFailedNewInstanceLeavesNoInstanceBehind) {
    struct Row {
        int index;
        ulkErrorStatus status;
        const char* text;
        bool throws = false;
    };
    const Row rows[] = {
        {kFaultNoInstance, kErrorNone, nullptr},
        {kFaultParamsFalse, kErrorInvalidPluginMethod, nullptr},
        {kFaultParamsError, kErrorPlugin, FAULT_PARAMS_TEXT},  // outlives its instance
        {kFaultParamsThrow, kErrorNone, nullptr, true},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.index);
        ulkHostModel model(static_cast<short>(row.index));
        ASSERT_TRUE(model.Open(Faults().c_str(), 0, nullptr));
        if (row.throws) {
            EXPECT_THROW(model.NewInstance(), std::runtime_error);
        } else {
            EXPECT_EQ(model.NewInstance(), nullptr);
            EXPECT_EQ(model.GetError(), row.status);
            EXPECT_STREQ(model.GetErrorString(),
                         row.text ? row.text : ulkError::GetMessage(row.status));
        }
        EXPECT_EQ(model.GetInstanceRefCount(), 0);
        EXPECT_EQ(LiveInstances(model), 0);
    }

    ulkHostModel plain(kFaultPlain);
    ASSERT_TRUE(plain.Open(Faults().c_str(), 0, nullptr));
    ulkHostInstance* a = plain.NewInstance();
    ulkHostInstance* b = plain.NewInstance();
    ASSERT_TRUE(a && b);
    EXPECT_EQ(plain.GetInstanceRefCount(), 2);
    EXPECT_EQ(LiveInstances(plain), 2);
    EXPECT_EQ(a->GetHostModel(), &plain);
    EXPECT_EQ(a->GetPluginInstance()->mHostInstance, a);
    plain.DeleteInstance(a);
    plain.DeleteInstance(b);
    EXPECT_EQ(plain.GetInstanceRefCount(), 0);
    EXPECT_EQ(LiveInstances(plain), 0);
}

TEST_F(HostModelTest, OpenDefinesTheModelAndKeepsItOpenUntilClose) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_FLOAT_EQ(model.GetULKVersion(), 1.0f);
    ASSERT_NE(model.GetModel(), nullptr);
    EXPECT_EQ(model.GetModel()->mHostModel, &model);
    ulkDLL* dll = model.GetDLL();
    ASSERT_NE(dll, nullptr);
    EXPECT_EQ(dll->GetNumModels(), 3);

    // Open on an open model changes nothing, even with another path.
    EXPECT_TRUE(model.Open(Faults().c_str(), 0, nullptr));
    EXPECT_EQ(model.GetDLL(), dll);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 1);

    // Two models of one module share it.
    ulkHostModel mix(1);
    ASSERT_TRUE(mix.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(mix.GetDLL(), dll);
    EXPECT_EQ(dll->GetRefCount(), 2);
    mix.Close();

    model.Close();
    EXPECT_EQ(model.GetDLL(), nullptr);
    EXPECT_EQ(model.GetModel(), nullptr);
    EXPECT_EQ(model.GetNumInputs(), 0);
    EXPECT_EQ(model.GetNumOutputs(), 0);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
    ASSERT_TRUE(model.Open(0, nullptr));  // reopened from the stored path
    EXPECT_EQ(model.GetNumInputs(), 1);

    // Each open tells the module a model was opened; UI and init string are the plug-in's.
    ulkHostModel plain(kFaultPlain), withUI(kFaultWithUI);
    ASSERT_TRUE(plain.Open(Faults().c_str(), 0, nullptr));
    auto opened = ModuleSymbol<FaultCounterProc>(plain, "FaultModelsOpened");
    ASSERT_NE(opened, nullptr);
    EXPECT_EQ(opened(), 1);
    ASSERT_TRUE(withUI.Open(Faults().c_str(), 0, nullptr));
    EXPECT_EQ(opened(), 2);
    EXPECT_FALSE(plain.HasUI());
    EXPECT_EQ(plain.GetInitString(), nullptr);
    EXPECT_TRUE(withUI.HasUI());
    EXPECT_STREQ(withUI.GetInitString(), "init:with-ui");
}

TEST_F(HostModelTest, TypeAndClassNamesAnswerNullOutsideTheirTables) {
    EXPECT_STREQ(ulkHostModel::GetTypeName(kPluginTypeFilter), "Filter");
    EXPECT_STREQ(ulkHostModel::GetTypeName(kPluginTypeTitle), "Title");
    EXPECT_STREQ(ulkHostModel::GetClassName(kPluginClassImage), "Image");
    for (int type : {-1, 3}) EXPECT_EQ(ulkHostModel::GetTypeName(ulkPluginType(type)), nullptr);
    for (int cls : {-1, 1}) EXPECT_EQ(ulkHostModel::GetClassName(ulkPluginClass(cls)), nullptr);
}

TEST_F(HostModelTest, MemoryAndThePathCopyReportMissingCallbacks) {
    ulkHostModel model(0);
    void* block = model.AllocMem(0);  // size 0 is passed on
    EXPECT_NE(block, nullptr);
    model.FreeMem(block);
    EXPECT_EQ(model.GetError(), kErrorNone);

    ulkHostModel::SetFreeCallback(nullptr);
    model.FreeMem(nullptr);
    EXPECT_EQ(model.GetError(), kErrorNullCallback);
    ulkHostModel::SetAllocCallback(nullptr);
    EXPECT_FALSE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(model.GetError(), kErrorNullCallback);
    ulkHostModel::SetAllocCallback([](size_t) -> void* { return nullptr; });
    EXPECT_FALSE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(model.GetError(), kErrorOutOfMemory);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);

    model.SetPluginError("kept");
    model.SetError(kErrorExecute);  // resets the texts first
    model.SetError(kErrorPlugin);
    EXPECT_STREQ(model.GetErrorString(), "ULK_ERROR: Plug-in Supplied Error");
}

}  // namespace

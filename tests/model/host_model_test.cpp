// ulkHostModel: opening real modules, every way an open or a new instance
// fails, and the model's life from construction to close.
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

TEST_F(HostModelTest, FreshModelHasTheLibraryDefaults) {
    ulkHostModel model(0);
    EXPECT_STREQ(model.GetCategory(), "ULK Plugins");
    EXPECT_STREQ(model.GetDescription(), "No Description");
    EXPECT_FLOAT_EQ(model.GetPluginVersion(), 1.0f);
    EXPECT_FLOAT_EQ(model.GetULKVersion(), 0.0f);
    EXPECT_EQ(model.GetType(), kPluginTypeNone);
    EXPECT_EQ(model.GetClass(), kPluginClassImage);
    EXPECT_EQ(model.GetName(), nullptr);
    EXPECT_EQ(model.GetNumFormats(), 0);
    EXPECT_EQ(model.GetNumInputs(), 0);
    EXPECT_EQ(model.GetNumOutputs(), 0);
    EXPECT_EQ(model.GetDLL(), nullptr);
    EXPECT_EQ(model.GetModel(), nullptr);
    EXPECT_EQ(model.GetInstanceRefCount(), 0);
    EXPECT_EQ(model.GetUpdateParamsCallback(), nullptr);
    EXPECT_FALSE(model.OpenEnv());
    EXPECT_FALSE(model.IsEnvOpen());
    EXPECT_EQ(model.GetError(), kErrorNone);
}

TEST_F(HostModelTest, TypeAndClassNamesAnswerNullOutsideTheirTables) {
    EXPECT_STREQ(ulkHostModel::GetTypeName(kPluginTypeFilter), "Filter");
    EXPECT_STREQ(ulkHostModel::GetTypeName(kPluginTypeCompositor), "Compositor");
    EXPECT_STREQ(ulkHostModel::GetTypeName(kPluginTypeTitle), "Title");
    EXPECT_EQ(ulkHostModel::GetTypeName(kPluginTypeNone), nullptr);
    EXPECT_EQ(ulkHostModel::GetTypeName(static_cast<ulkPluginType>(3)), nullptr);
    EXPECT_STREQ(ulkHostModel::GetClassName(kPluginClassImage), "Image");
    EXPECT_EQ(ulkHostModel::GetClassName(static_cast<ulkPluginClass>(1)), nullptr);
    EXPECT_EQ(ulkHostModel::GetClassName(static_cast<ulkPluginClass>(-1)), nullptr);
}

TEST_F(HostModelTest, OpenWithoutAPathFailsWithNullPathname) {
    ulkHostModel model(0);
    EXPECT_FALSE(model.Open(nullptr, 0, nullptr));
    EXPECT_EQ(model.GetError(), kErrorNullDLLPathname);
    EXPECT_STREQ(model.GetErrorString(), "ULK_ERROR: NULL DLL Pathname");

    ulkHostModel neverOpened(0);
    EXPECT_FALSE(neverOpened.Open(0, nullptr));
    EXPECT_EQ(neverOpened.GetError(), kErrorNullDLLPathname);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
}

TEST_F(HostModelTest, PathCopyNeedsTheModelsAllocator) {
    ulkHostModel::SetAllocCallback(nullptr);
    ulkHostModel model(0);
    EXPECT_FALSE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(model.GetError(), kErrorNullCallback);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);

    ulkHostModel::SetAllocCallback([](size_t) -> void* { return nullptr; });
    EXPECT_FALSE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(model.GetError(), kErrorOutOfMemory);
}

TEST_F(HostModelTest, ModuleFailuresLeaveNoStatusAndNoModule) {
    ulkHostModel missing(0);
    EXPECT_FALSE(missing.Open("/nonexistent/effects.so", 0, nullptr));
    EXPECT_EQ(missing.GetError(), kErrorNone);

    ulkHostModel noFactory(0);
    EXPECT_FALSE(noFactory.Open(TestPluginPath("no_factory").c_str(), 0, nullptr));
    EXPECT_EQ(noFactory.GetError(), kErrorNone);
    EXPECT_EQ(noFactory.GetDLL(), nullptr);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);

    for (int index : {kFaultFactoryNull, kFaultFactoryThrows}) {
        ulkHostModel model(static_cast<short>(index));
        EXPECT_FALSE(model.Open(Faults().c_str(), 0, nullptr)) << index;
        EXPECT_EQ(model.GetError(), kErrorNone) << index;
        EXPECT_EQ(model.GetModel(), nullptr) << index;
        EXPECT_FLOAT_EQ(model.GetULKVersion(), 0.0f) << index;
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0) << index;
    }
}

TEST_F(HostModelTest, RegistryRefusalFailsWithoutStatus) {
    ulkDLLMaker::SetActiveDLLs(1);
    ulkHostModel held(0);
    ASSERT_TRUE(held.Open(Effects().c_str(), 0, nullptr));
    ulkHostModel refused(0);
    EXPECT_FALSE(refused.Open(Faults().c_str(), 0, nullptr));
    EXPECT_EQ(refused.GetError(), kErrorNone);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 1);
    held.Close();
}

TEST_F(HostModelTest, IdentityFailuresReportThePluginsStatusOrDefineIdentity) {
    struct Row {
        int index;
        ulkErrorStatus status;
        const char* text;
    };
    const Row rows[] = {
        {kFaultNoName, kErrorDefineIdentity, "ULK_ERROR: DefineIdentity failed"},
        {kFaultNoType, kErrorDefineIdentity, "ULK_ERROR: DefineIdentity failed"},
        {kFaultIdentityFalse, kErrorDefineIdentity, "ULK_ERROR: DefineIdentity failed"},
        {kFaultIdentityError, kErrorPlugin, FAULT_IDENTITY_TEXT},
        {kFaultDefaultTitle, kErrorDefineEffect, "ULK_ERROR: DefineEffect failed"},
        {kFaultEffectWarning, kErrorPluginWarning, FAULT_EFFECT_TEXT},
    };
    for (const Row& row : rows) {
        ulkHostModel model(static_cast<short>(row.index));
        EXPECT_FALSE(model.Open(Faults().c_str(), 0, nullptr)) << row.index;
        EXPECT_EQ(model.GetError(), row.status) << row.index;
        EXPECT_STREQ(model.GetErrorString(), row.text) << row.index;
        // Cleaned up: no plug-in model, no description, the module released.
        EXPECT_EQ(model.GetModel(), nullptr) << row.index;
        EXPECT_EQ(model.GetDLL(), nullptr) << row.index;
        EXPECT_EQ(model.GetNumFormats(), 0) << row.index;
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0) << row.index;
    }
}

TEST_F(HostModelTest, ThrowingDefinitionPassesOnAndLeavesTheModelClosed) {
    ulkHostModel model(kFaultEffectThrows);
    EXPECT_THROW(model.Open(Faults().c_str(), 0, nullptr), std::runtime_error);
    EXPECT_EQ(model.GetModel(), nullptr);
    EXPECT_EQ(model.GetDLL(), nullptr);
    EXPECT_EQ(model.GetNumFormats(), 0);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
    // Not taken for open: the next Open defines the model again and fails the same way.
    EXPECT_THROW(model.Open(0, nullptr), std::runtime_error);
}

TEST_F(HostModelTest, OpenDefinesTheModelAndKeepsItOpen) {
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
    EXPECT_STREQ(model.GetName(), "Invert");
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 1);

    // Two models of one module share it.
    ulkHostModel mix(1);
    ASSERT_TRUE(mix.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(mix.GetDLL(), dll);
    EXPECT_EQ(dll->GetRefCount(), 2);
    mix.Close();

    const char* name = model.GetName();
    model.Close();
    EXPECT_EQ(model.GetDLL(), nullptr);
    EXPECT_EQ(model.GetModel(), nullptr);
    EXPECT_EQ(model.GetNumFormats(), 0);
    EXPECT_EQ(model.GetNumInputs(), 0);
    EXPECT_EQ(model.GetNumOutputs(), 0);
    EXPECT_EQ(model.GetName(), name);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);

    // Reopening uses the stored path.
    ASSERT_TRUE(model.Open(0, nullptr));
    EXPECT_EQ(model.GetNumInputs(), 1);
    EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 1);
}

TEST_F(HostModelTest, EachOpenTellsTheModuleAModelWasOpened) {
    ulkHostModel first(kFaultPlain);
    ASSERT_TRUE(first.Open(Faults().c_str(), 0, nullptr));
    auto opened = ModuleSymbol<FaultCounterProc>(first, "FaultModelsOpened");
    ASSERT_NE(opened, nullptr);
    EXPECT_EQ(opened(), 1);
    ulkHostModel second(kFaultWithUI);
    ASSERT_TRUE(second.Open(Faults().c_str(), 0, nullptr));
    EXPECT_EQ(opened(), 2);
}

TEST_F(HostModelTest, UserInterfaceAndInitStringComeFromThePlugin) {
    ulkHostModel plain(kFaultPlain);
    ASSERT_TRUE(plain.Open(Faults().c_str(), 0, nullptr));
    EXPECT_FALSE(plain.HasUI());
    EXPECT_EQ(plain.GetInitString(), nullptr);
    EXPECT_EQ(plain.GetModel()->UseHardwareList(), nullptr);
    EXPECT_EQ(plain.GetModel()->UseLibraryList(), nullptr);

    ulkHostModel withUI(kFaultWithUI);
    ASSERT_TRUE(withUI.Open(Faults().c_str(), 0, nullptr));
    EXPECT_TRUE(withUI.HasUI());
    EXPECT_STREQ(withUI.GetInitString(), "init:with-ui");
}

TEST_F(HostModelTest, InstancesAreCountedAndFailuresLeaveNoneBehind) {
    ulkHostModel plain(kFaultPlain);
    ASSERT_TRUE(plain.Open(Faults().c_str(), 0, nullptr));
    ulkHostInstance* a = plain.NewInstance();
    ulkHostInstance* b = plain.NewInstance();
    ASSERT_NE(a, nullptr);
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(plain.GetInstanceRefCount(), 2);
    EXPECT_EQ(LiveInstances(plain), 2);
    EXPECT_EQ(a->GetHostModel(), &plain);
    EXPECT_EQ(a->GetModel(), plain.GetModel());
    EXPECT_EQ(a->GetPluginInstance()->mHostInstance, a);
    plain.DeleteInstance(a);
    plain.DeleteInstance(b);
    EXPECT_EQ(plain.GetInstanceRefCount(), 0);
    EXPECT_EQ(LiveInstances(plain), 0);

    ulkHostModel noInstance(kFaultNoInstance);
    ASSERT_TRUE(noInstance.Open(Faults().c_str(), 0, nullptr));
    EXPECT_EQ(noInstance.NewInstance(), nullptr);
    EXPECT_EQ(noInstance.GetError(), kErrorNone);
    EXPECT_EQ(noInstance.GetInstanceRefCount(), 0);

    ulkHostModel paramsFalse(kFaultParamsFalse);
    ASSERT_TRUE(paramsFalse.Open(Faults().c_str(), 0, nullptr));
    EXPECT_EQ(paramsFalse.NewInstance(), nullptr);
    EXPECT_EQ(paramsFalse.GetError(), kErrorInvalidPluginMethod);
    EXPECT_STREQ(paramsFalse.GetErrorString(),
                 "ULK_ERROR: ULK Library Method called in invalid plug-in method");
    EXPECT_EQ(paramsFalse.GetInstanceRefCount(), 0);
    EXPECT_EQ(LiveInstances(paramsFalse), 0);

    // The plug-in's own reason outlives the instance it recorded it on.
    ulkHostModel paramsError(kFaultParamsError);
    ASSERT_TRUE(paramsError.Open(Faults().c_str(), 0, nullptr));
    EXPECT_EQ(paramsError.NewInstance(), nullptr);
    EXPECT_EQ(paramsError.GetError(), kErrorPlugin);
    EXPECT_STREQ(paramsError.GetErrorString(), FAULT_PARAMS_TEXT);
    EXPECT_EQ(LiveInstances(paramsError), 0);
}

TEST_F(HostModelTest, ThrowingDefineParametersDeletesTheInstanceAndPassesOn) {
    ulkHostModel model(kFaultParamsThrow);
    ASSERT_TRUE(model.Open(Faults().c_str(), 0, nullptr));
    EXPECT_THROW(model.NewInstance(), std::runtime_error);
    EXPECT_EQ(model.GetInstanceRefCount(), 0);
    EXPECT_EQ(LiveInstances(model), 0);
}

TEST_F(HostModelTest, ModelMemoryReportsMissingCallbacks) {
    ulkHostModel model(0);
    void* block = model.AllocMem(0);  // size 0 is passed on
    EXPECT_NE(block, nullptr);
    EXPECT_EQ(model.GetError(), kErrorNone);
    model.FreeMem(block);
    model.FreeMem(nullptr);
    EXPECT_EQ(model.GetError(), kErrorNone);

    ulkHostModel::SetFreeCallback(nullptr);
    model.FreeMem(nullptr);
    EXPECT_EQ(model.GetError(), kErrorNullCallback);
    ulkHostModel::SetAllocCallback(nullptr);
    model.ResetError();
    EXPECT_EQ(model.AllocMem(16), nullptr);
    EXPECT_EQ(model.GetError(), kErrorNullCallback);

    model.SetPluginError("kept");
    model.SetError(kErrorExecute);  // resets the texts first
    model.SetError(kErrorPlugin);
    EXPECT_STREQ(model.GetErrorString(), "ULK_ERROR: Plug-in Supplied Error");
}

}  // namespace

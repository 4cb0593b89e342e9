// ulkModel_v1: the plug-in model base as a module uses it and before it is attached.
#include "model_host.h"

namespace {

unsigned char UpdateParams(ulkInstance_v1*) {
    return 1;
}

unsigned char Flush(ulkInstance_v1*) {
    return 0;
}

// A plug-in model that was never handed to a host model.
class Detached : public ulkModel_v1 {
  public:
    bool DefineIdentity() override { return true; }
    ulkInstance_v1* NewInstance() override { return nullptr; }
};

using ModelTest = ModelHostTest;

TEST_F(ModelTest, DetachedModelRefusesCallbacksAndIgnoresNullInstances) {
    Detached model;
    EXPECT_EQ(model.mHostModel, nullptr);
    EXPECT_FALSE(model.SetUpdateParamsCallback(&UpdateParams));
    EXPECT_FALSE(model.SetFlushInstanceDataCallback(&Flush));
    model.DeleteInstance(nullptr);
    EXPECT_EQ(model.GetInitString(), nullptr);
    EXPECT_FALSE(model.HasUI());
}

TEST_F(ModelTest, AttachedModelForwardsToItsHostModel) {
    ulkHostModel host(0);
    ASSERT_TRUE(host.Open(TestPluginPath("effects").c_str(), 0, nullptr));
    ulkModel_v1* model = host.GetModel();
    EXPECT_TRUE(model->SetUpdateParamsCallback(&UpdateParams));
    EXPECT_TRUE(model->SetFlushInstanceDataCallback(&Flush));
    EXPECT_EQ(host.GetUpdateParamsCallback(), &UpdateParams);
    EXPECT_EQ(host.GetFlushInstanceDataCallback(), &Flush);

    model->SetPluginWarning("careful");
    EXPECT_EQ(host.GetError(), kErrorPluginWarning);
    EXPECT_STREQ(model->GetErrorString(), "careful");
    model->SetError(kErrorNotSupported);
    EXPECT_EQ(model->GetError(), kErrorNotSupported);

    // A copy refers to the same host model.
    Detached copy;
    static_cast<ulkModel_v1&>(copy) = *model;
    EXPECT_EQ(copy.mHostModel, &host);
}

}  // namespace

// ulkModel_v1: the plug-in model base before and after it is attached to a host model.
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

TEST_F(ModelTest, CallbacksNeedAHostModelAndReachIt) {
    Detached detached;
    EXPECT_EQ(detached.mHostModel, nullptr);
    EXPECT_FALSE(detached.SetUpdateParamsCallback(&UpdateParams));
    EXPECT_FALSE(detached.SetFlushInstanceDataCallback(&Flush));
    detached.DeleteInstance(nullptr);

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

    // A copy refers to the same host model.
    static_cast<ulkModel_v1&>(detached) = *model;
    EXPECT_EQ(detached.mHostModel, &host);
}

}  // namespace

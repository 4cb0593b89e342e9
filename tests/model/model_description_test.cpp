// The description a model gives of itself: identity, formats, inputs and
// outputs, as the default DefineEffect and an overriding title produce them,
// and as the host model stores what it is given.
#include <cstring>

#include "model_host.h"

namespace {

class ModelDescriptionTest : public ModelHostTest {
  protected:
    static std::string Effects() { return TestPluginPath("effects"); }

    static void ExpectInfo(const ulkObjectInfo* info, int number, const char* name, const char* id,
                           unsigned char optional) {
        ASSERT_NE(info, nullptr);
        EXPECT_EQ(info->GetNumber(), number);
        EXPECT_STREQ(info->GetName(), name);
        EXPECT_STREQ(info->GetID(), id);
        EXPECT_EQ(info->GetDataType(), kDataTypeDefault);
        EXPECT_EQ(info->IsOptional(), optional);
    }
};

TEST_F(ModelDescriptionTest, DefaultFilterDescription) {
    ulkHostModel model(0);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_STREQ(model.GetName(), "Invert");
    EXPECT_EQ(model.GetType(), kPluginTypeFilter);
    EXPECT_STREQ(model.GetVendor(), "ULK Tests");
    EXPECT_STREQ(model.GetCategory(), "Colour");
    EXPECT_STREQ(model.GetIdentifier(), "org.ulk.tests.invert");
    EXPECT_STREQ(model.GetDescription(), "Inverts every colour channel and keeps alpha");
    EXPECT_FLOAT_EQ(model.GetPluginVersion(), 2.5f);

    ASSERT_EQ(model.GetNumFormats(), 1);
    const ulkImageFormat* format = model.GetFormat(0);
    EXPECT_EQ(format->GetFormat(), kImgFormatAny);
    EXPECT_EQ(format->GetColorspace(), kColorspaceRGB);
    EXPECT_EQ(format->GetBitDepth(), 8);
    EXPECT_EQ(format->GetOrder(), nullptr);
    EXPECT_EQ(model.GetFormat(1), nullptr);
    EXPECT_TRUE(model.AcceptsFormat(kImgFormatUYVY));
    EXPECT_TRUE(model.AcceptsFormat(static_cast<ulkImgFormat>(77)));

    ASSERT_EQ(model.GetNumInputs(), 1);
    ExpectInfo(model.GetInputInfo(0), 0, "Input", "input", 0);
    ASSERT_EQ(model.GetNumOutputs(), 1);
    ExpectInfo(model.GetOutputInfo(0), 0, "Output", "output", 0);
    EXPECT_EQ(model.GetInputInfo(1), nullptr);
    EXPECT_EQ(model.GetInputInfo(-1), nullptr);
    EXPECT_EQ(model.GetOutputInfo(1), nullptr);
    EXPECT_EQ(model.GetRequiredInputs(), 1);
    EXPECT_EQ(model.GetOptionalInputs(), 0);
    EXPECT_EQ(model.GetRequiredOutputs(), 1);
}

TEST_F(ModelDescriptionTest, DefaultCompositorDescription) {
    ulkHostModel model(1);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(model.GetType(), kPluginTypeCompositor);
    EXPECT_STREQ(model.GetCategory(), "ULK Plugins");  // the plug-in set none
    ASSERT_EQ(model.GetNumInputs(), 2);
    ExpectInfo(model.GetInputInfo(0), 0, "Foreground", "foreground", 0);
    ExpectInfo(model.GetInputInfo(1), 1, "Background", "background", 0);
    EXPECT_EQ(model.GetInputInfoByID("background"), model.GetInputInfo(1));
    EXPECT_EQ(model.GetInputInfoByID("Background"), nullptr);
    EXPECT_EQ(model.GetInputInfoByID("output"), nullptr);  // outputs are not searched
    EXPECT_EQ(model.GetModel()->GetInputInfoByID("foreground"), model.GetInputInfo(0));
    EXPECT_EQ(model.GetRequiredInputs(), 2);
    ExpectInfo(model.GetOutputInfo(0), 0, "Output", "output", 0);
}

TEST_F(ModelDescriptionTest, TitleDescribesItsOwnFormatsAndOutputs) {
    ulkHostModel model(2);
    ASSERT_TRUE(model.Open(Effects().c_str(), 0, nullptr));
    EXPECT_EQ(model.GetType(), kPluginTypeTitle);
    ASSERT_EQ(model.GetNumFormats(), 4);
    EXPECT_EQ(model.GetFormat(0)->GetFormat(), kImgFormatRGBA);
    EXPECT_STREQ(model.GetFormat(0)->GetOrder(), "RGBA");
    EXPECT_EQ(model.GetFormat(3)->GetColorspace(), kColorspaceYUV);
    for (ulkImgFormat accepted : {kImgFormatRGBA, kImgFormatBGRA, kImgFormatRGB, kImgFormatUYVY})
        EXPECT_TRUE(model.AcceptsFormat(accepted)) << accepted;
    EXPECT_FALSE(model.AcceptsFormat(kImgFormatARGB));
    EXPECT_FALSE(model.AcceptsFormat(kImgFormatAny));

    ASSERT_EQ(model.GetNumInputs(), 1);
    ExpectInfo(model.GetInputInfo(0), 0, "Matte", "matte", 1);
    EXPECT_EQ(model.GetRequiredInputs(), 0);
    EXPECT_EQ(model.GetOptionalInputs(), 1);
    ExpectInfo(model.GetOutputInfo(0), 0, "Title", "title", 0);
}

TEST_F(ModelDescriptionTest, FormatsAreStoredAsGiven) {
    ulkHostModel model(0);
    EXPECT_FALSE(model.AcceptsFormat(kImgFormatAny));  // no formats: nothing accepted

    EXPECT_TRUE(model.AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatRGBA));
    EXPECT_TRUE(model.AddFormat(kColorspaceRGB, 16, "ARGB", kImgFormatARGB));
    EXPECT_TRUE(model.AddFormat(kColorspaceOther, 10, "XYZ", kImgFormatUYVY));
    EXPECT_TRUE(model.AcceptsFormat(kImgFormatRGBA));
    EXPECT_TRUE(model.AcceptsFormat(kImgFormatARGB));
    EXPECT_FALSE(model.AcceptsFormat(kImgFormatBGRA));
    EXPECT_EQ(model.GetFormat(1)->GetBitDepth(), 16);
    // The format code sets its own colour space and order, except "other".
    EXPECT_EQ(model.GetFormat(2)->GetColorspace(), kColorspaceOther);
    EXPECT_STREQ(model.GetFormat(2)->GetOrder(), "UYVY");
    EXPECT_EQ(model.GetError(), kErrorNone);
}

TEST_F(ModelDescriptionTest, InputTextsAreCopiedIdentityTextsAreNot) {
    ulkHostModel model(0);
    char name[16] = "Matte";
    char id[16] = "matte";
    EXPECT_TRUE(model.AddInput(4, name, id, kDataTypeDefault, 0));
    EXPECT_TRUE(model.AddInput(4, "Key", "key", kDataTypeDefault, 1));
    EXPECT_TRUE(model.AddInput(5, "Odd", "odd", kDataTypeNone, 7));  // neither kind
    EXPECT_TRUE(model.AddOutput(0, "Out", "out", kDataTypeDefault));
    std::strcpy(name, "Changed");
    std::strcpy(id, "changed");
    EXPECT_STREQ(model.GetInputInfo(0)->GetName(), "Matte");
    EXPECT_EQ(model.GetInputInfoByID("matte"), model.GetInputInfo(0));
    EXPECT_EQ(model.GetInputInfo(1)->GetNumber(), 4);  // numbers are not checked
    EXPECT_EQ(model.GetRequiredInputs(), 1);
    EXPECT_EQ(model.GetOptionalInputs(), 1);
    EXPECT_EQ(model.GetNumInputs(), 3);
    EXPECT_EQ(model.GetRequiredOutputs(), 1);

    model.SetName(name);
    EXPECT_EQ(model.GetName(), name);
    model.SetSubType("kept");
}

TEST_F(ModelDescriptionTest, ObjectInfoOwnsItsTexts) {
    ulkObjectInfo info;
    EXPECT_EQ(info.GetNumber(), 0);
    EXPECT_EQ(info.GetName(), nullptr);
    EXPECT_EQ(info.GetID(), nullptr);
    EXPECT_EQ(info.GetDataType(), kDataTypeNone);
    EXPECT_EQ(info.IsOptional(), 0);
    EXPECT_EQ(info.mList, nullptr);
    info.SetName("first");
    info.SetName("second");
    info.SetID(nullptr);
    EXPECT_STREQ(info.GetName(), "second");
    EXPECT_EQ(info.GetID(), nullptr);
}

}  // namespace

// The description a model gives of itself: formats, inputs and outputs as the
// default DefineEffect and an overriding title produce them, and as the host
// model stores what it is given.
#include <cstring>

#include "model_host.h"

namespace {

using ModelDescriptionTest = ModelHostTest;

void ExpectInfo(const ulkObjectInfo* info, int number, const char* name, const char* id,
                unsigned char optional) {
    ASSERT_NE(info, nullptr);
    EXPECT_EQ(info->GetNumber(), number);
    EXPECT_STREQ(info->GetName(), name);
    EXPECT_STREQ(info->GetID(), id);
    EXPECT_EQ(info->GetDataType(), kDataTypeDefault);
    EXPECT_EQ(info->IsOptional(), optional);
}

TEST_F(ModelDescriptionTest, FilterCompositorAndTitleDescribeThemselves) {
    const std::string path = TestPluginPath("effects");
    ulkHostModel filter(0), mix(1), title(2);
    for (ulkHostModel* model : {&filter, &mix, &title})
        ASSERT_TRUE(model->Open(path.c_str(), 0, nullptr)) << model->GetErrorString();

    // The default DefineEffect: any 8-bit RGB format, the inputs the type calls for, one output.
    for (ulkHostModel* model : {&filter, &mix}) {
        ASSERT_EQ(model->GetNumFormats(), 1);
        EXPECT_EQ(model->GetFormat(0)->GetFormat(), kImgFormatAny);
        EXPECT_EQ(model->GetFormat(0)->GetColorspace(), kColorspaceRGB);
        EXPECT_EQ(model->GetFormat(0)->GetBitDepth(), 8);
        EXPECT_EQ(model->GetFormat(1), nullptr);
        EXPECT_TRUE(model->AcceptsFormat(kImgFormatUYVY));
        ASSERT_EQ(model->GetNumOutputs(), 1);
        ExpectInfo(model->GetOutputInfo(0), 0, "Output", "output", 0);
        EXPECT_EQ(model->GetOutputInfo(1), nullptr);
        EXPECT_EQ(model->GetRequiredOutputs(), 1);
    }
    EXPECT_EQ(filter.GetType(), kPluginTypeFilter);
    EXPECT_STREQ(filter.GetCategory(), "Colour");
    EXPECT_FLOAT_EQ(filter.GetPluginVersion(), 2.5f);
    ASSERT_EQ(filter.GetNumInputs(), 1);
    ExpectInfo(filter.GetInputInfo(0), 0, "Input", "input", 0);
    EXPECT_EQ(filter.GetInputInfo(1), nullptr);
    EXPECT_EQ(filter.GetInputInfo(-1), nullptr);

    EXPECT_EQ(mix.GetType(), kPluginTypeCompositor);
    EXPECT_STREQ(mix.GetCategory(), "ULK Plugins");  // the plug-in set none
    ASSERT_EQ(mix.GetNumInputs(), 2);
    ExpectInfo(mix.GetInputInfo(0), 0, "Foreground", "foreground", 0);
    ExpectInfo(mix.GetInputInfo(1), 1, "Background", "background", 0);
    EXPECT_EQ(mix.GetRequiredInputs(), 2);
    EXPECT_EQ(mix.GetInputInfoByID("background"), mix.GetInputInfo(1));
    EXPECT_EQ(mix.GetInputInfoByID("Background"), nullptr);
    EXPECT_EQ(mix.GetInputInfoByID("output"), nullptr);  // outputs are not searched
    EXPECT_EQ(mix.GetModel()->GetInputInfoByID("foreground"), mix.GetInputInfo(0));

    // The title describes its own formats (in the order given), an optional matte, its output.
    EXPECT_EQ(title.GetType(), kPluginTypeTitle);
    ASSERT_EQ(title.GetNumFormats(), 4);
    EXPECT_STREQ(title.GetFormat(0)->GetOrder(), "RGBA");
    EXPECT_EQ(title.GetFormat(3)->GetColorspace(), kColorspaceYUV);
    for (ulkImgFormat format : {kImgFormatRGBA, kImgFormatBGRA, kImgFormatRGB, kImgFormatUYVY})
        EXPECT_TRUE(title.AcceptsFormat(format)) << format;
    EXPECT_FALSE(title.AcceptsFormat(kImgFormatARGB));
    EXPECT_FALSE(title.AcceptsFormat(kImgFormatAny));
    ASSERT_EQ(title.GetNumInputs(), 1);
    ExpectInfo(title.GetInputInfo(0), 0, "Matte", "matte", 1);
    EXPECT_EQ(title.GetRequiredInputs(), 0);
    EXPECT_EQ(title.GetOptionalInputs(), 1);
    ExpectInfo(title.GetOutputInfo(0), 0, "Title", "title", 0);
}

TEST_F(ModelDescriptionTest, FormatsAndInputsAreStoredAsGiven) {
    ulkHostModel model(0);
    EXPECT_FALSE(model.AcceptsFormat(kImgFormatAny));  // no formats: nothing accepted
    EXPECT_TRUE(model.AddFormat(kColorspaceRGB, 16, "ARGB", kImgFormatARGB));
    EXPECT_TRUE(model.AddFormat(kColorspaceOther, 10, "XYZ", kImgFormatUYVY));
    EXPECT_TRUE(model.AcceptsFormat(kImgFormatARGB));
    EXPECT_FALSE(model.AcceptsFormat(kImgFormatBGRA));
    EXPECT_EQ(model.GetFormat(0)->GetBitDepth(), 16);
    // The format code sets its own colour space and order, except "other".
    EXPECT_EQ(model.GetFormat(1)->GetColorspace(), kColorspaceOther);
    EXPECT_STREQ(model.GetFormat(1)->GetOrder(), "UYVY");

    // Input texts are copied; numbers are not checked; a flag of 7 is neither kind.
    char name[16] = "Matte";
    EXPECT_TRUE(model.AddInput(4, name, "matte", kDataTypeDefault, 0));
    EXPECT_TRUE(model.AddInput(4, "Key", "key", kDataTypeDefault, 1));
    EXPECT_TRUE(model.AddInput(5, "Odd", "odd", kDataTypeNone, 7));
    std::strcpy(name, "Changed");
    EXPECT_STREQ(model.GetInputInfo(0)->GetName(), "Matte");
    EXPECT_EQ(model.GetInputInfo(1)->GetNumber(), 4);
    EXPECT_EQ(model.GetNumInputs(), 3);
    EXPECT_EQ(model.GetRequiredInputs(), 1);
    EXPECT_EQ(model.GetOptionalInputs(), 1);
    EXPECT_EQ(model.GetError(), kErrorNone);
}

}  // namespace

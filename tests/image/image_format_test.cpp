// ulkImageFormat: the format table, order texts, compatibility and deep copies.
#include "ulk/image/image_format.h"

#include <cstring>
#include <string>

#include <gtest/gtest.h>

#include "ulk/core/list.h"

namespace {

struct Row {
    int32_t code;
    const char* order;
    ulkColorspace colorspace;
};

const Row kTable[] = {
    {1, "RGB", kColorspaceRGB},   {2, "RGBA", kColorspaceRGB},  {3, "BGR", kColorspaceRGB},
    {4, "ABGR", kColorspaceRGB},  {5, "ARGB", kColorspaceRGB},  {6, "BGRA", kColorspaceRGB},
    {7, "YUV", kColorspaceYUV},   {8, "???", kColorspaceYUV},   {9, "YUYV", kColorspaceYUV},
    {10, "UYVY", kColorspaceYUV}, {11, "YUVA", kColorspaceYUV}, {12, "AVUY", kColorspaceYUV},
    {13, "UYVY", kColorspaceYUV}, {14, "YUYV", kColorspaceYUV},
};

ulkImageFormat Made(ulkImgFormat code, int bits) {
    ulkImageFormat f;
    f.SetFormat(code);
    f.SetBitDepth(bits);
    return f;
}

}  // namespace

TEST(ImageFormatTest, NewFormatIsUnset) {
    ulkImageFormat f;
    EXPECT_EQ(f.GetFormat(), -1);
    EXPECT_EQ(f.GetColorspace(), -1);
    EXPECT_EQ(f.GetBitDepth(), 8);
    EXPECT_EQ(f.GetOrder(), nullptr);
    EXPECT_EQ(f.mList, nullptr);
}

TEST(ImageFormatTest, EveryFormatCodeSetsItsTableRow) {
    for (const Row& row : kTable) {
        ulkImageFormat f;
        f.SetBitDepth(12);
        f.SetFormat(static_cast<ulkImgFormat>(row.code));
        EXPECT_EQ(f.GetFormat(), row.code);
        EXPECT_EQ(f.GetColorspace(), row.colorspace) << row.code;
        ASSERT_NE(f.GetOrder(), nullptr) << row.code;
        EXPECT_STREQ(f.GetOrder(), row.order) << row.code;
        EXPECT_EQ(f.GetBitDepth(), 12) << "SetFormat never changes the depth";
    }
}

TEST(ImageFormatTest, SetFormatReplacesColorspaceAndOrderButNotDepth) {
    ulkImageFormat f;
    f.SetColorspace(kColorspaceRGB);
    f.SetBitDepth(10);
    f.SetOrder("BGR");
    f.SetFormat(kImgFormatUYVY);
    EXPECT_EQ(f.GetColorspace(), kColorspaceYUV);
    EXPECT_STREQ(f.GetOrder(), "UYVY");
    EXPECT_EQ(f.GetBitDepth(), 10);
}

TEST(ImageFormatTest, CodesWithoutRowChangeOnlyTheCode) {
    for (int32_t code : {0, 15, -3, 1000}) {
        ulkImageFormat f;
        f.SetColorspace(kColorspaceOther);
        f.SetOrder("XYZ");
        f.SetBitDepth(16);
        f.SetFormat(static_cast<ulkImgFormat>(code));
        EXPECT_EQ(f.GetFormat(), code);
        EXPECT_EQ(f.GetColorspace(), kColorspaceOther);
        EXPECT_STREQ(f.GetOrder(), "XYZ");
        EXPECT_EQ(f.GetBitDepth(), 16);
    }
}

TEST(ImageFormatTest, ColorspaceOtherSurvivesOnlyWhenSetAfterFormat) {
    ulkImageFormat before;
    before.SetColorspace(kColorspaceOther);
    before.SetFormat(kImgFormatRGBA);
    EXPECT_EQ(before.GetColorspace(), kColorspaceRGB);

    ulkImageFormat after;
    after.SetFormat(kImgFormatRGBA);
    after.SetColorspace(kColorspaceOther);
    EXPECT_EQ(after.GetColorspace(), kColorspaceOther);
}

TEST(ImageFormatTest, SettersStoreAnyValue) {
    ulkImageFormat f;
    f.SetColorspace(static_cast<ulkColorspace>(77));
    f.SetBitDepth(-5);
    EXPECT_EQ(f.GetColorspace(), 77);
    EXPECT_EQ(f.GetBitDepth(), -5);
}

TEST(ImageFormatTest, SetOrderKeepsItsOwnCopy) {
    char text[] = "RGBA";
    ulkImageFormat f;
    f.SetOrder(text);
    EXPECT_NE(f.GetOrder(), text);
    text[0] = 'X';
    EXPECT_STREQ(f.GetOrder(), "RGBA");
    f.SetOrder(nullptr);
    EXPECT_EQ(f.GetOrder(), nullptr);
    f.SetOrder("");
    ASSERT_NE(f.GetOrder(), nullptr);
    EXPECT_STREQ(f.GetOrder(), "");
}

TEST(ImageFormatTest, SetOrderWithItsOwnTextKeepsIt) {
    ulkImageFormat f;
    f.SetOrder("ABGR");
    f.SetOrder(f.GetOrder());
    EXPECT_STREQ(f.GetOrder(), "ABGR");
    f.SetOrder(f.GetOrder() + 1);  // a text inside the one replaced
    EXPECT_STREQ(f.GetOrder(), "BGR");
}

TEST(ImageFormatTest, Compatibility) {
    const ulkImageFormat rgba8 = Made(kImgFormatRGBA, 8);
    const ulkImageFormat rgba8b = Made(kImgFormatRGBA, 8);
    EXPECT_TRUE(rgba8.IsCompatible(&rgba8b));

    const ulkImageFormat bgra8 = Made(kImgFormatBGRA, 8);
    EXPECT_FALSE(rgba8.IsCompatible(&bgra8));

    const ulkImageFormat rgba16 = Made(kImgFormatRGBA, 16);
    EXPECT_FALSE(rgba8.IsCompatible(&rgba16));
    const ulkImageFormat rgba0 = Made(kImgFormatRGBA, 0);
    EXPECT_TRUE(rgba0.IsCompatible(&rgba16));
    EXPECT_TRUE(rgba16.IsCompatible(&rgba0));

    ulkImageFormat noOrder = Made(kImgFormatRGBA, 8);
    noOrder.SetOrder(nullptr);
    EXPECT_TRUE(rgba8.IsCompatible(&noOrder));
    EXPECT_TRUE(noOrder.IsCompatible(&rgba8));

    ulkImageFormat yuvNoOrder = Made(kImgFormatUYVY, 8);
    yuvNoOrder.SetOrder(nullptr);
    EXPECT_FALSE(noOrder.IsCompatible(&yuvNoOrder)) << "RGB and YUV never match";

    ulkImageFormat lower = Made(kImgFormatRGBA, 8);
    lower.SetOrder("rgba");
    EXPECT_FALSE(rgba8.IsCompatible(&lower));

    // Format codes are not compared.
    const ulkImageFormat uyvy = Made(kImgFormatUYVY, 8);
    const ulkImageFormat uyvyAlpha = Made(kImgFormatUYVYAlpha, 8);
    EXPECT_TRUE(uyvy.IsCompatible(&uyvyAlpha));
    ulkImageFormat any = Made(kImgFormatAny, 8);
    any.SetColorspace(kColorspaceRGB);
    any.SetOrder("RGBA");
    EXPECT_TRUE(any.IsCompatible(&rgba8));

    // No wildcard colour space: -1 matches only -1.
    ulkImageFormat unset1, unset2;
    EXPECT_TRUE(unset1.IsCompatible(&unset2));
    EXPECT_FALSE(unset1.IsCompatible(&rgba8));
    EXPECT_FALSE(rgba8.IsCompatible(nullptr));
}

TEST(ImageFormatTest, CopyMakesAllFourFieldsEqual) {
    ulkImageFormat source = Made(kImgFormatYUYV, 10);
    source.SetColorspace(kColorspaceOther);
    source.SetOrder("yuyv!");
    ulkImageFormat f = Made(kImgFormatRGB, 8);
    f.Copy(&source);
    EXPECT_EQ(f.GetFormat(), kImgFormatYUYV);
    EXPECT_EQ(f.GetColorspace(), kColorspaceOther);
    EXPECT_EQ(f.GetBitDepth(), 10);
    EXPECT_STREQ(f.GetOrder(), "yuyv!");
    EXPECT_NE(f.GetOrder(), source.GetOrder());
}

TEST(ImageFormatTest, CopyOfSourceWithoutOrderHasNoOrder) {
    ulkImageFormat source;
    source.SetFormat(kImgFormatRGB);
    source.SetOrder(nullptr);
    ulkImageFormat f;
    f.SetOrder("old");
    f.Copy(&source);
    EXPECT_EQ(f.GetFormat(), kImgFormatRGB);
    EXPECT_EQ(f.GetColorspace(), kColorspaceRGB);
    EXPECT_EQ(f.GetOrder(), nullptr);
}

TEST(ImageFormatTest, CopyOntoItselfKeepsEverything) {
    ulkImageFormat f = Made(kImgFormatRGB, 16);
    f.SetColorspace(kColorspaceOther);
    f.SetOrder("custom");
    const char* text = f.GetOrder();
    f.Copy(&f);
    EXPECT_EQ(f.GetFormat(), kImgFormatRGB);
    EXPECT_EQ(f.GetColorspace(), kColorspaceOther);
    EXPECT_EQ(f.GetBitDepth(), 16);
    EXPECT_STREQ(f.GetOrder(), "custom");
    EXPECT_EQ(f.GetOrder(), text);

    ulkImageFormat& alias = f;
    f = alias;
    EXPECT_STREQ(f.GetOrder(), "custom");
    EXPECT_EQ(f.GetColorspace(), kColorspaceOther);

    f.Copy(nullptr);
    EXPECT_STREQ(f.GetOrder(), "custom");
}

TEST(ImageFormatTest, CopiesAndAssignmentsOwnTheirTexts) {
    // Each object releases its own text once: run under ASan or valgrind to see it.
    auto* source = new ulkImageFormat(Made(kImgFormatARGB, 8));
    auto* copy = new ulkImageFormat(*source);
    ulkImageFormat assigned;
    assigned.SetOrder("x");
    assigned = *source;
    EXPECT_NE(copy->GetOrder(), source->GetOrder());
    EXPECT_NE(assigned.GetOrder(), source->GetOrder());
    EXPECT_STREQ(copy->GetOrder(), "ARGB");
    EXPECT_STREQ(assigned.GetOrder(), "ARGB");
    EXPECT_EQ(copy->GetFormat(), kImgFormatARGB);
    EXPECT_EQ(assigned.GetColorspace(), kColorspaceRGB);
    delete source;
    EXPECT_STREQ(copy->GetOrder(), "ARGB");
    EXPECT_STREQ(assigned.GetOrder(), "ARGB");
    delete copy;
}

TEST(ImageFormatTest, FormatsLiveInLists) {
    ulkList list;
    ulkImageFormat a = Made(kImgFormatRGB, 8);
    ulkImageFormat b = Made(kImgFormatUYVY, 8);
    ASSERT_TRUE(list.AddTail(&a));
    ASSERT_TRUE(list.AddTail(&b));
    EXPECT_EQ(b.GetIndex(), 1);
    EXPECT_STREQ(static_cast<ulkImageFormat*>(list.GetEntry(1))->GetOrder(), "UYVY");

    ulkImageFormat copy(b);
    EXPECT_EQ(copy.mList, nullptr) << "a copy is in no list";
    a = copy;
    EXPECT_EQ(a.mList, &list) << "assignment keeps the target's membership";
    EXPECT_EQ(a.GetIndex(), 0);
}

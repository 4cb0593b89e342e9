// ulkImageFormat: the format table, order texts, compatibility and deep copies.
#include "ulk/image/image_format.h"

#include <gtest/gtest.h>

#include "ulk/core/list.h"

namespace {

// A format of the code's table row; order "" keeps the row's text, null removes it.
ulkImageFormat Made(int32_t code, int bits, const char* order = "", int colorspace = -2) {
    ulkImageFormat f;
    f.SetFormat(static_cast<ulkImgFormat>(code));
    f.SetBitDepth(bits);
    if (!order || *order) f.SetOrder(order);
    if (colorspace != -2) f.SetColorspace(static_cast<ulkColorspace>(colorspace));
    return f;
}

}  // namespace

TEST(ImageFormatTest, FormatCodesSetTheirTableRowAndNothingElse) {
    ulkImageFormat unset;
    EXPECT_EQ(unset.GetFormat(), -1);
    EXPECT_EQ(unset.GetColorspace(), -1);
    EXPECT_EQ(unset.GetBitDepth(), 8);
    EXPECT_EQ(unset.GetOrder(), nullptr);

    const struct {
        int32_t code;
        const char* order;
        ulkColorspace colorspace;
    } rows[] = {{1, "RGB", kColorspaceRGB},
                {2, "RGBA", kColorspaceRGB},
                {3, "BGR", kColorspaceRGB},
                {4, "ABGR", kColorspaceRGB},
                {5, "ARGB", kColorspaceRGB},
                {6, "BGRA", kColorspaceRGB},
                {7, "YUV", kColorspaceYUV},
                {8, "???", kColorspaceYUV},
                {9, "YUYV", kColorspaceYUV},
                {10, "UYVY", kColorspaceYUV},
                {11, "YUVA", kColorspaceYUV},
                {12, "AVUY", kColorspaceYUV},
                {13, "UYVY", kColorspaceYUV},
                {14, "YUYV", kColorspaceYUV},
                // Codes without a row change only the code.
                {0, "XYZ", kColorspaceOther},
                {15, "XYZ", kColorspaceOther},
                {-3, "XYZ", kColorspaceOther}};
    for (const auto& row : rows) {
        SCOPED_TRACE(row.code);
        ulkImageFormat f = Made(kImgFormatAny, 12, "XYZ", kColorspaceOther);
        f.SetFormat(static_cast<ulkImgFormat>(row.code));
        EXPECT_EQ(f.GetFormat(), row.code);
        EXPECT_EQ(f.GetColorspace(), row.colorspace);
        EXPECT_STREQ(f.GetOrder(), row.order);
        EXPECT_EQ(f.GetBitDepth(), 12) << "SetFormat never changes the depth";
    }
}

TEST(ImageFormatTest, OrderTextIsTheFormatsOwn) {
    char text[] = "ABGR";
    ulkImageFormat f;
    f.SetOrder(text);
    text[0] = 'X';
    EXPECT_STREQ(f.GetOrder(), "ABGR");
    f.SetOrder(f.GetOrder());
    EXPECT_STREQ(f.GetOrder(), "ABGR");
    f.SetOrder(f.GetOrder() + 1);  // a text inside the one replaced
    EXPECT_STREQ(f.GetOrder(), "BGR");
    f.SetOrder(nullptr);
    EXPECT_EQ(f.GetOrder(), nullptr);
}

TEST(ImageFormatTest, Compatibility) {
    const ulkImageFormat rgba8 = Made(kImgFormatRGBA, 8);
    const struct {
        ulkImageFormat other;
        bool compatible;
        const char* why;
    } cases[] = {{Made(kImgFormatRGBA, 8), true, "equal"},
                 {Made(kImgFormatBGRA, 8), false, "order differs"},
                 {Made(kImgFormatRGBA, 16), false, "depth differs"},
                 {Made(kImgFormatRGBA, 0), true, "depth 0 matches any"},
                 {Made(kImgFormatRGBA, 8, nullptr), true, "a missing order matches any"},
                 {Made(kImgFormatUYVY, 8, nullptr), false, "colour spaces differ"},
                 {Made(kImgFormatRGBA, 8, "rgba"), false, "orders compare byte for byte"},
                 {Made(kImgFormatAny, 8, "RGBA", kColorspaceRGB), true, "codes are not compared"},
                 {ulkImageFormat(), false, "an unset colour space is no wildcard"}};
    for (const auto& c : cases) {
        EXPECT_EQ(rgba8.IsCompatible(&c.other), c.compatible) << c.why;
        EXPECT_EQ(c.other.IsCompatible(&rgba8), c.compatible) << c.why << " (reversed)";
    }
    EXPECT_FALSE(rgba8.IsCompatible(nullptr));
}

TEST(ImageFormatTest, CopiesAreDeepAndSelfCopiesKeepEverything) {
    ulkList list;
    ulkImageFormat target = Made(kImgFormatRGB, 8, "old");
    ASSERT_TRUE(list.AddTail(&target));
    auto* source = new ulkImageFormat(Made(kImgFormatYUYV, 10, "yuyv!", kColorspaceOther));
    const ulkImageFormat constructed(*source);
    target = *source;
    for (const ulkImageFormat* f : {&constructed, const_cast<const ulkImageFormat*>(&target)}) {
        EXPECT_EQ(f->GetFormat(), kImgFormatYUYV);
        EXPECT_EQ(f->GetColorspace(), kColorspaceOther);
        EXPECT_EQ(f->GetBitDepth(), 10);
        EXPECT_NE(f->GetOrder(), source->GetOrder());
    }
    EXPECT_EQ(constructed.mList, nullptr) << "a copy is in no list";
    EXPECT_EQ(target.GetIndex(), 0) << "assignment keeps the target's membership";
    delete source;  // each text is released once: ASan sees a shared one
    EXPECT_STREQ(target.GetOrder(), "yuyv!");

    const char* text = target.GetOrder();
    target.Copy(&target);
    ulkImageFormat& alias = target;
    target = alias;
    target.Copy(nullptr);
    EXPECT_EQ(target.GetOrder(), text);
    EXPECT_STREQ(target.GetOrder(), "yuyv!");
    EXPECT_EQ(target.GetColorspace(), kColorspaceOther);

    const ulkImageFormat noOrder = Made(kImgFormatRGB, 8, nullptr);
    target.Copy(&noOrder);
    EXPECT_EQ(target.GetOrder(), nullptr) << "a source without order text";
}

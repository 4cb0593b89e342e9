// Colours, points and rectangles: per-channel linear interpolation, channel
// names, storage checks and the class interpolators.
#include <gtest/gtest.h>

#include "ulk/ulk.h"

TEST(Compound, ColorRGBInterpolatesEveryChannel) {
    ulkColorRGB c = {0.25, 0.5, 0.75};
    ulkPColorRGB* p = ulkPColorRGB::New("C", "c", &c, sizeof c);
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(p->GetNumKeys(), 1);
    EXPECT_EQ(p->GetDefaultValue().green, 0.5);
    EXPECT_EQ(p->GetValue(0.9).blue, 0.75);
    p->SetValue(1.0, {1, 1, 1});
    const ulkColorRGB mid = p->GetValue(0.5);
    EXPECT_DOUBLE_EQ(mid.red, 0.625);
    EXPECT_DOUBLE_EQ(mid.green, 0.75);
    EXPECT_DOUBLE_EQ(mid.blue, 0.875);
    EXPECT_TRUE(p->Evaluate(0.5, nullptr, 0, -1));
    EXPECT_DOUBLE_EQ(c.red, 0.625);
    EXPECT_DOUBLE_EQ(c.blue, 0.875);
    ulkColorRGB other = {9, 9, 9};
    EXPECT_FALSE(p->Evaluate(0.5, &other, sizeof other, -1));
    EXPECT_EQ(other.red, 9);

    EXPECT_STREQ(p->GetChannelID(0), "red");
    EXPECT_STREQ(p->GetChannelLabel(2), "Blue");
    EXPECT_EQ(p->GetChannelLabel(3), nullptr);

    // One channel: a double or a float at the start; nothing for other sizes.
    double d[3] = {-1, -1, -1};
    EXPECT_TRUE(ulkPColorRGB::sLinearInterpolator(p, 0.5, d, 8, 1));
    EXPECT_DOUBLE_EQ(d[0], 0.75);
    float f = 0;
    EXPECT_TRUE(ulkPColorRGB::sLinearInterpolator(p, 0.5, &f, 4, 2));
    EXPECT_FLOAT_EQ(f, 0.875f);
    double untouched[3] = {-1, -1, -1};
    EXPECT_TRUE(ulkPColorRGB::sLinearInterpolator(p, 0.5, untouched, 24, 1));
    EXPECT_EQ(untouched[0], -1);

    // Step interpolation gives the earlier key's record unchanged.
    p->SetInterpolator(nullptr);
    EXPECT_EQ(p->GetValue(0.5).red, 0.25);
    ulkParameter::Delete(p);

    ulkPColorRGB* none = ulkPColorRGB::New("N", "n", nullptr, 0);
    EXPECT_EQ(none->GetDefaultValue().red, 0.0);
    EXPECT_EQ(none->GetDefaultValue().blue, 0.0);
    ulkParameter::Delete(none);
}

TEST(Compound, ColorHSVHueDoesNotWrap) {
    ulkPColorHSV* p = ulkPColorHSV::New("H", "h", nullptr, 0);
    ASSERT_NE(p, nullptr);
    p->SetValue(0.0, {350, 1, 1});
    p->SetValue(1.0, {10, 1, 1});
    EXPECT_DOUBLE_EQ(p->GetValue(0.5).hue, 180);
    EXPECT_STREQ(p->GetChannelID(0), "red");
    EXPECT_STREQ(p->GetChannelLabel(0), "Hue");
    EXPECT_STREQ(p->GetChannelID(1), "saturation");
    EXPECT_TRUE(p->IsColorHSV());
    EXPECT_FALSE(p->IsColorRGB());
    EXPECT_STREQ(p->ClassName(), "ColorHSV");
    ulkParameter::Delete(p);
}

TEST(Compound, PointAndRectangle) {
    ulkPoint2D pt = {0, 0};
    ulkPPoint2D* p = ulkPPoint2D::New("P", "p", &pt, sizeof pt);
    ASSERT_NE(p, nullptr);
    p->SetValue(0.5, {10, -4});
    EXPECT_DOUBLE_EQ(p->GetValue(0.25).x, 5);
    EXPECT_DOUBLE_EQ(p->GetValue(0.25).y, -2);
    EXPECT_EQ(p->GetValue(0.9).x, 10);
    EXPECT_EQ(p->GetValue(-1).y, 0);
    EXPECT_STREQ(p->GetChannelID(1), "y");
    ulkParameter::Delete(p);

    ulkPRect2D* r = ulkPRect2D::New("R", "r", nullptr, 0);
    ASSERT_NE(r, nullptr);
    const ulkRect2D v = r->GetValue(0.7);
    EXPECT_EQ(v.x1, 0);
    EXPECT_EQ(v.y1, 0);
    EXPECT_EQ(v.x2, 1);
    EXPECT_EQ(v.y2, 1);
    EXPECT_FALSE(r->Evaluate(0.5, nullptr, 0, -1));
    EXPECT_EQ(r->GetDefaultValue().x2, 0);  // no default copy: zeros
    EXPECT_STREQ(r->GetChannelLabel(3), "Y2");
    EXPECT_EQ(r->GetNumChannels(), 4);
    ulkParameter::Delete(r);
}

TEST(Compound, StorageOfAnotherSizeIsRefused) {
    double small[2] = {0, 0};
    EXPECT_EQ(ulkPColorRGB::New("C", "c", small, sizeof small), nullptr);
    EXPECT_EQ(ulkPRect2D::New("R", "r", small, sizeof small), nullptr);
    ulkRect2D big = {};
    EXPECT_EQ(ulkPPoint2D::New("P", "p", &big, sizeof big), nullptr);
    // Channel -1 fills only what the destination holds.
    ulkPRect2D* r = ulkPRect2D::New("R", "r", nullptr, 0);
    double two[3] = {-1, -1, -1};
    EXPECT_TRUE(ulkPRect2D::sLinearInterpolator(r, 0.0, two, 16, -1));
    EXPECT_EQ(two[0], 0);
    EXPECT_EQ(two[1], 0);
    EXPECT_EQ(two[2], -1);
    ulkParameter::Delete(r);
}

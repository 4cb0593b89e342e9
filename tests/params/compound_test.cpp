// Colours, points and rectangles: per-channel linear interpolation, channel
// names, storage checks and the class interpolators.
#include "param_test_helpers.h"

TEST(Compound, ColorRGBInterpolatesEveryChannel) {
    ulkColorRGB c = {0.25, 0.5, 0.75};
    Owned<ulkPColorRGB> p(ulkPColorRGB::New("C", "c", &c, sizeof c));
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(p->GetDefaultValue().green, 0.5);
    p->SetValue(1.0, {1, 1, 1});
    const ulkColorRGB mid = p->GetValue(0.5);
    EXPECT_DOUBLE_EQ(mid.red, 0.625);
    EXPECT_DOUBLE_EQ(mid.green, 0.75);
    EXPECT_DOUBLE_EQ(mid.blue, 0.875);
    EXPECT_TRUE(p->Evaluate(0.5, nullptr, 0, -1));
    EXPECT_DOUBLE_EQ(c.blue, 0.875);
    ulkColorRGB other = {9, 9, 9};
    EXPECT_FALSE(p->Evaluate(0.5, &other, sizeof other, -1));
    EXPECT_EQ(other.red, 9);
    EXPECT_STREQ(p->GetChannelID(0), "red");
    EXPECT_STREQ(p->GetChannelLabel(2), "Blue");
    EXPECT_EQ(p->GetChannelLabel(3), nullptr);

    // One channel: a double or a float at the start; nothing for other sizes.
    double d[3] = {-1, -1, -1};
    float f = 0;
    EXPECT_TRUE(ulkPColorRGB::sLinearInterpolator(p.get(), 0.5, d, 8, 1));
    EXPECT_DOUBLE_EQ(d[0], 0.75);
    EXPECT_TRUE(ulkPColorRGB::sLinearInterpolator(p.get(), 0.5, &f, 4, 2));
    EXPECT_FLOAT_EQ(f, 0.875f);
    d[0] = -1;
    EXPECT_TRUE(ulkPColorRGB::sLinearInterpolator(p.get(), 0.5, d, 24, 1));
    EXPECT_EQ(d[0], -1);
    // Step interpolation gives the earlier key's record unchanged.
    p->SetInterpolator(nullptr);
    EXPECT_EQ(p->GetValue(0.5).red, 0.25);
}

TEST(Compound, HSVPointAndRectangle) {
    Owned<ulkPColorHSV> h(ulkPColorHSV::New("H", "h", nullptr, 0));
    h->SetValue(0.0, {350, 1, 1});
    h->SetValue(1.0, {10, 1, 1});
    EXPECT_DOUBLE_EQ(h->GetValue(0.5).hue, 180) << "the hue does not wrap";
    EXPECT_STREQ(h->GetChannelID(0), "red");
    EXPECT_STREQ(h->GetChannelID(1), "saturation");

    ulkPoint2D pt = {0, 0};
    Owned<ulkPPoint2D> p(ulkPPoint2D::New("P", "p", &pt, sizeof pt));
    p->SetValue(0.5, {10, -4});
    EXPECT_DOUBLE_EQ(p->GetValue(0.25).x, 5);
    EXPECT_DOUBLE_EQ(p->GetValue(0.25).y, -2);
    EXPECT_EQ(p->GetValue(0.9).x, 10);
    EXPECT_STREQ(p->GetChannelID(1), "y");

    Owned<ulkPRect2D> r(ulkPRect2D::New("R", "r", nullptr, 0));
    const ulkRect2D v = r->GetValue(0.7);
    EXPECT_TRUE(v.x1 == 0 && v.y1 == 0 && v.x2 == 1 && v.y2 == 1);
    EXPECT_FALSE(r->Evaluate(0.5, nullptr, 0, -1));
    EXPECT_EQ(r->GetDefaultValue().x2, 0);  // no default copy: zeros
    EXPECT_STREQ(r->GetChannelLabel(3), "Y2");
    // Channel -1 fills only what the destination holds.
    double two[3] = {-1, -1, -1};
    EXPECT_TRUE(ulkPRect2D::sLinearInterpolator(r.get(), 0.0, two, 16, -1));
    EXPECT_TRUE(two[0] == 0 && two[1] == 0 && two[2] == -1);
}

TEST(Compound, StorageOfAnotherSizeIsRefused) {
    double small[2] = {0, 0};
    ulkRect2D big = {};
    EXPECT_EQ(ulkPColorRGB::New("C", "c", small, sizeof small), nullptr);
    EXPECT_EQ(ulkPRect2D::New("R", "r", small, sizeof small), nullptr);
    EXPECT_EQ(ulkPPoint2D::New("P", "p", &big, sizeof big), nullptr);
}

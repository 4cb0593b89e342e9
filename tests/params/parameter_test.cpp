// The parameter base: step and linear interpolation, the value helpers,
// storage copies and the interpolator slot, through real kinds.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>

#include "ulk/ulk.h"

namespace {

// Reaches the protected value helpers; never instantiated.
struct ValueHelpers : ulkPBoolean {
    using ulkParameter::_AssignValue;
};

}  // namespace

TEST(Parameter, StepInterpolation) {
    int32_t storage = 0;
    ulkPList* p = ulkPList::New("L", "l", &storage, 4, nullptr, kPListTypeDefault);
    ASSERT_NE(p, nullptr);
    p->SetValue(0.0, 100);  // A
    p->SetValue(0.5, 200);  // B
    EXPECT_EQ(p->GetValue(0.25), 100);
    EXPECT_EQ(p->GetValue(0.5), 200);
    EXPECT_EQ(p->GetValue(0.75), 200);
    EXPECT_EQ(p->GetValue(-0.1), 100);

    // The copy is bounded by both the destination and the key's value.
    unsigned char small[2] = {0, 0};
    EXPECT_TRUE(ulkParameter::sBasicInterpolator(p, 0.6, small, 2, -1));
    EXPECT_EQ(small[0], 200);
    unsigned char large[8];
    std::memset(large, 0xAB, sizeof large);
    EXPECT_TRUE(ulkParameter::sBasicInterpolator(p, 0.6, large, 8, -1));
    int32_t got;
    std::memcpy(&got, large, 4);
    EXPECT_EQ(got, 200);
    EXPECT_EQ(large[4], 0xAB);
    ulkParameter::Delete(p);
}

TEST(Parameter, LinearInterpolation) {
    double storage = 10.0;
    ulkPNumber* n = ulkPNumber::New("N", "n", &storage, 8, 0, 100, 1, kPNumberReal, false);
    ASSERT_NE(n, nullptr);
    n->SetValue(0.5, 20.0);
    EXPECT_DOUBLE_EQ(n->GetValue(0.25), 15.0);
    EXPECT_DOUBLE_EQ(n->GetValue(0.75), 20.0);
    EXPECT_DOUBLE_EQ(n->GetValue(-0.1), 10.0);

    // A float for a 4-byte destination; nothing for a 2-byte one, still true.
    float f = 0;
    EXPECT_TRUE(ulkParameter::sLinearInterpolator(n, 0.25, &f, 4, 0));
    EXPECT_FLOAT_EQ(f, 15.0f);
    unsigned char two[2] = {0x11, 0x22};
    EXPECT_TRUE(ulkParameter::sLinearInterpolator(n, 0.25, two, 2, 0));
    EXPECT_EQ(two[0], 0x11);
    EXPECT_EQ(two[1], 0x22);
    // A channel the keys do not hold is not read.
    double d = -1;
    EXPECT_FALSE(ulkParameter::sLinearInterpolator(n, 0.25, &d, 8, 1));
    EXPECT_FALSE(ulkParameter::sLinearInterpolator(n, 0.25, &d, 8, -1));
    EXPECT_EQ(d, -1);

    n->SetValue(0.0, 0.0);
    n->SetValue(0.5, 10.0);
    n->SetValue(1.0, 0.0);
    EXPECT_DOUBLE_EQ(n->GetValue(0.75), 5.0);
    ulkParameter::Delete(n);
}

TEST(Parameter, InterpolatorSlot) {
    double storage = 0.0;
    ulkPNumber* n = ulkPNumber::New("N", "n", &storage, 8, 0, 10, 1, kPNumberReal, false);
    n->SetValue(1.0, 10.0);
    EXPECT_DOUBLE_EQ(n->GetValue(0.5), 5.0);
    n->SetInterpolator(nullptr);  // step again
    EXPECT_DOUBLE_EQ(n->GetValue(0.5), 0.0);
    n->SetInterpolator(ulkPNumber::sLinearInterpolator);
    EXPECT_TRUE(n->Compute(0.5));  // into its own storage
    EXPECT_DOUBLE_EQ(storage, 5.0);
    EXPECT_TRUE(n->Compute(0.25, -1));
    EXPECT_DOUBLE_EQ(storage, 2.5);
    ulkParameter::Delete(n);
}

TEST(Parameter, ValueHelpers) {
    const unsigned char ff = 0xFF;
    double d = 0;
    EXPECT_EQ(ValueHelpers::_AssignValue(&ff, 1, &d), -1);
    EXPECT_EQ(d, -1.0);
    const int16_t s = -300;
    EXPECT_EQ(ValueHelpers::_AssignValue(&s, 2, nullptr), -300);
    const double big = 1e12, frac = -2.75;
    EXPECT_EQ(ValueHelpers::_AssignValue(&frac, 8, &d), -2);
    EXPECT_EQ(d, -2.75);
    EXPECT_EQ(ValueHelpers::_AssignValue(&big, 8, nullptr), INT32_MAX);  // saturates
    d = 42;
    EXPECT_EQ(ValueHelpers::_AssignValue(&ff, 3, &d), 0);
    EXPECT_EQ(ValueHelpers::_AssignValue(nullptr, 8, &d), 0);
    EXPECT_EQ(d, 42);

    unsigned char byte = 0;
    ValueHelpers::_AssignValue(300, &byte, 1);
    EXPECT_EQ(byte, 44);
    int32_t i = 0;
    ValueHelpers::_AssignValue(-5, &i, 4);
    EXPECT_EQ(i, -5);
    float f = 0;
    ValueHelpers::_AssignValue(0.1, &f, 4);
    EXPECT_EQ(f, 0.1f);
    double out = 1;
    ValueHelpers::_AssignValue(2.5, &out, 3);
    EXPECT_EQ(out, 1);
}

TEST(Parameter, IdentityStorageAndGroupLink) {
    unsigned char flag = 1;
    ulkPBoolean* b = ulkPBoolean::New("Enabled", "enabled", &flag, 1);
    ASSERT_NE(b, nullptr);
    EXPECT_STREQ(b->GetLabel(), "Enabled");
    EXPECT_STREQ(b->GetID(), "enabled");
    EXPECT_EQ(b->GetNumChannels(), 0);
    EXPECT_EQ(b->GetChannelLabel(0), nullptr);
    EXPECT_EQ(b->GetChannelID(-1), nullptr);
    EXPECT_TRUE(b->IsAtTopLevel());
    EXPECT_FALSE(b->IsHidden());
    EXPECT_FALSE(b->IsTouched());

    flag = 0;
    unsigned char copy[4] = {9, 9, 9, 9};
    EXPECT_EQ(b->CopyDefaultValue(copy, sizeof copy), 1u);
    EXPECT_EQ(copy[0], 1);
    EXPECT_EQ(copy[1], 9);
    EXPECT_EQ(b->CopyInstanceValue(copy, sizeof copy), 1u);
    EXPECT_EQ(copy[0], 0);

    ulkPGroup* g = ulkPGroup::New("G", "g", false);
    ASSERT_TRUE(g->AddParameter(b));
    EXPECT_FALSE(b->IsAtTopLevel());
    EXPECT_EQ(b->GetGroup(), g);

    // Without storage: no default copy, and the host's evaluation fails.
    ulkPBoolean* none = ulkPBoolean::New("N", "n", nullptr, 0);
    EXPECT_EQ(none->CopyDefaultValue(copy, sizeof copy), 0u);
    EXPECT_EQ(none->CopyInstanceValue(copy, sizeof copy), 0u);
    EXPECT_FALSE(none->Evaluate(0.0, nullptr, 0, -1));

    // A parameter without keys (a group) interpolates nothing.
    double d = 3;
    EXPECT_FALSE(ulkParameter::sBasicInterpolator(g, 0.0, &d, 8, -1));
    EXPECT_FALSE(ulkParameter::sLinearInterpolator(g, 0.0, &d, 8, 0));
    EXPECT_EQ(d, 3);

    ulkParameter::Delete(none);
    ulkParameter::Delete(g);
    ulkParameter::Delete(b);
    ulkParameter::Delete(nullptr);
}

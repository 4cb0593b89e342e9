// The parameter base: step and linear interpolation, the value helpers, storage
// copies and the interpolator slot, through real kinds.
#include <cstdint>
#include <cstring>

#include "param_test_helpers.h"

namespace {

// Reaches the protected value helpers; never instantiated.
struct ValueHelpers : ulkPBoolean {
    using ulkParameter::_AssignValue;
};

}  // namespace

TEST(Parameter, StepInterpolationCopiesTheEarlierKeyBounded) {
    int32_t storage = 0;
    Owned<ulkPList> p(ulkPList::New("L", "l", &storage, 4, nullptr, kPListTypeDefault));
    p->SetValue(0.0, 100);
    p->SetValue(0.5, 200);
    EXPECT_EQ(p->GetValue(-0.1), 100);
    EXPECT_EQ(p->GetValue(0.25), 100);
    EXPECT_EQ(p->GetValue(0.5), 200);
    // The copy is bounded by both the destination and the key's value.
    unsigned char small[2] = {0, 0}, large[8];
    std::memset(large, 0xAB, sizeof large);
    EXPECT_TRUE(ulkParameter::sBasicInterpolator(p.get(), 0.6, small, 2, -1));
    EXPECT_TRUE(ulkParameter::sBasicInterpolator(p.get(), 0.6, large, 8, -1));
    EXPECT_EQ(small[0], 200);
    EXPECT_EQ(large[0], 200);
    EXPECT_EQ(large[4], 0xAB);
}

TEST(Parameter, LinearInterpolationAndTheInterpolatorSlot) {
    double storage = 10.0;
    Owned<ulkPNumber> n(ulkPNumber::New("N", "n", &storage, 8, 0, 100, 1, kPNumberReal, false));
    n->SetValue(0.5, 20.0);
    n->SetValue(1.0, 0.0);
    EXPECT_DOUBLE_EQ(n->GetValue(-0.1), 10.0);
    EXPECT_DOUBLE_EQ(n->GetValue(0.25), 15.0);
    EXPECT_DOUBLE_EQ(n->GetValue(0.75), 10.0);
    EXPECT_DOUBLE_EQ(n->GetValue(2.0), 0.0);

    // A float for a 4-byte destination; nothing (still true) for a 2-byte one.
    float f = 0;
    unsigned char two[2] = {0x11, 0x22};
    EXPECT_TRUE(ulkParameter::sLinearInterpolator(n.get(), 0.25, &f, 4, 0));
    EXPECT_TRUE(ulkParameter::sLinearInterpolator(n.get(), 0.25, two, 2, 0));
    EXPECT_FLOAT_EQ(f, 15.0f);
    EXPECT_EQ(two[0], 0x11);
    // A channel the keys do not hold is not read.
    double d = -1;
    EXPECT_FALSE(ulkParameter::sLinearInterpolator(n.get(), 0.25, &d, 8, 1));
    EXPECT_FALSE(ulkParameter::sLinearInterpolator(n.get(), 0.25, &d, 8, -1));
    EXPECT_EQ(d, -1);

    n->SetInterpolator(nullptr);  // step again
    EXPECT_DOUBLE_EQ(n->GetValue(0.25), 10.0);
    n->SetInterpolator(ulkPNumber::sLinearInterpolator);
    EXPECT_TRUE(n->Compute(0.25));  // into its own storage
    EXPECT_DOUBLE_EQ(storage, 15.0);
}

TEST(Parameter, ValueHelpersConvertSaturateAndIgnoreOddSizes) {
    const unsigned char ff = 0xFF;
    const double big = 1e12, frac = -2.75;
    double d = 0, out = 1;
    unsigned char byte = 0;
    EXPECT_EQ(ValueHelpers::_AssignValue(&ff, 1, &d), -1);  // bytes are signed
    EXPECT_EQ(ValueHelpers::_AssignValue(&frac, 8, &d), -2);
    EXPECT_EQ(d, -2.75);
    EXPECT_EQ(ValueHelpers::_AssignValue(&big, 8, nullptr), INT32_MAX);
    EXPECT_EQ(ValueHelpers::_AssignValue(&ff, 3, &d), 0);
    EXPECT_EQ(d, -2.75);
    ValueHelpers::_AssignValue(300, &byte, 1);
    ValueHelpers::_AssignValue(2.5, &out, 3);
    EXPECT_EQ(byte, 44);
    EXPECT_EQ(out, 1);
}

TEST(Parameter, StorageCopiesGroupLinkAndEmptyKeyLists) {
    unsigned char flag = 1;
    Owned<ulkPBoolean> b(ulkPBoolean::New("Enabled", "enabled", &flag, 1));
    flag = 0;
    unsigned char copy[4] = {9, 9, 9, 9};
    EXPECT_EQ(b->CopyDefaultValue(copy, sizeof copy), 1u);
    EXPECT_EQ(copy[0], 1);
    EXPECT_EQ(copy[1], 9);
    EXPECT_EQ(b->CopyInstanceValue(copy, sizeof copy), 1u);
    EXPECT_EQ(copy[0], 0);
    EXPECT_EQ(b->GetChannelLabel(0), nullptr);
    EXPECT_EQ(b->GetChannelID(-1), nullptr);

    Owned<ulkPGroup> g(ulkPGroup::New("G", "g", false));
    ASSERT_TRUE(g->AddParameter(b.get()));
    EXPECT_EQ(b->GetGroup(), g.get());

    // Without storage: no copies, and the host's evaluation fails.
    Owned<ulkPBoolean> none(ulkPBoolean::New("N", "n", nullptr, 0));
    EXPECT_EQ(none->CopyDefaultValue(copy, sizeof copy), 0u);
    EXPECT_EQ(none->CopyInstanceValue(copy, sizeof copy), 0u);
    EXPECT_FALSE(none->Evaluate(0.0, nullptr, 0, -1));

    // A parameter without keys (a group) interpolates nothing.
    double d = 3;
    EXPECT_FALSE(ulkParameter::sBasicInterpolator(g.get(), 0.0, &d, 8, -1));
    EXPECT_FALSE(ulkParameter::sLinearInterpolator(g.get(), 0.0, &d, 8, 0));
    EXPECT_EQ(d, 3);
    ulkParameter::Delete(nullptr);
}

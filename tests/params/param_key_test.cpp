// Key frames: time truncation and matching, ordering, value replacement and
// the searches, checked through a real parameter kind (a list: 4-byte ints).
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstring>
#include <random>

#include "ulk/ulk.h"

namespace {

struct ListParam {
    ulkPList* p = ulkPList::New("L", "l", nullptr, 0, nullptr, kPListTypeDefault);
    ~ListParam() { ulkParameter::Delete(p); }
    int KeyInt(int index) const {
        int32_t v;
        std::memcpy(&v, p->GetKeyValue(index), 4);
        return v;
    }
};

// The searches as a plain scan over the keys, for comparison.
int ScanIndex(const ulkParameter* p, double t) {
    for (int i = 0; i < p->GetNumKeys(); ++i)
        if (std::fabs(p->GetKeyTime(i) - t) < 0.00000001) return i;
    return -1;
}
int ScanPrev(const ulkParameter* p, double t) {
    const int m = ScanIndex(p, t);
    if (m >= 0) return m - 1;
    for (int i = p->GetNumKeys() - 1; i >= 0; --i)
        if (p->GetKeyTime(i) < t) return i;
    return -1;
}
int ScanNext(const ulkParameter* p, double t) {
    const int m = ScanIndex(p, t);
    if (m >= 0) return m + 1 < p->GetNumKeys() ? m + 1 : -1;
    for (int i = 0; i < p->GetNumKeys(); ++i)
        if (p->GetKeyTime(i) > t) return i;
    return -1;
}

}  // namespace

TEST(ParamKey, OwnsItsValueAndTruncatesItsTime) {
    ulkParamKey key(0.123456789);
    EXPECT_EQ(key.GetTime(), 0.12345678);
    EXPECT_EQ(ulkParamKey(0.5).GetTime(), 0.5);
    EXPECT_EQ(ulkParamKey(-0.123456789).GetTime(), -0.12345678);
    EXPECT_EQ(key.GetValue(), nullptr);
    EXPECT_FALSE(key.IsActive());

    const double a = 1.5, b[2] = {2.5, 3.5};
    ASSERT_TRUE(key.SetValue(&a, 8));
    void* buffer = key.GetValue();
    EXPECT_TRUE(key.SetValue(&b[0], 8));  // same size: overwritten in place
    EXPECT_EQ(key.GetValue(), buffer);
    EXPECT_TRUE(key.SetValue(b, 16));  // other size: new buffer
    EXPECT_EQ(key.GetValueSize(), 16u);
    EXPECT_EQ(std::memcmp(key.GetValue(), b, 16), 0);
    EXPECT_TRUE(key.SetValue(key.GetValue(), key.GetValueSize()));  // onto itself
    EXPECT_EQ(std::memcmp(key.GetValue(), b, 16), 0);
    EXPECT_TRUE(key.SetValue(nullptr, 0));
    EXPECT_EQ(key.GetValue(), nullptr);
    EXPECT_EQ(key.GetValueSize(), 0u);
}

TEST(ParamKey, MatchingAndOrder) {
    ListParam l;
    ulkParameter* p = l.p;
    ASSERT_EQ(p->GetNumKeys(), 1);
    int v = 7;
    EXPECT_TRUE(p->SetKeyTime(0.7, &v, 4));
    EXPECT_TRUE(p->SetKeyTime(0.2, &v, 4));
    EXPECT_TRUE(p->SetKeyTime(0.5, &v, 4));
    ASSERT_EQ(p->GetNumKeys(), 4);
    EXPECT_EQ(p->GetKeyTime(0), 0.0);
    EXPECT_EQ(p->GetKeyTime(1), 0.2);
    EXPECT_EQ(p->GetKeyTime(2), 0.5);
    EXPECT_EQ(p->GetKeyTime(3), 0.7);

    EXPECT_EQ(p->GetKeyIndex(0.500000005), 2);
    EXPECT_EQ(p->GetKeyIndex(0.50000002), -1);
    EXPECT_TRUE(p->IsKeyTime(0.2));
    EXPECT_FALSE(p->IsKeyTime(0.3));

    // A time within the tolerance replaces instead of adding.
    v = 9;
    EXPECT_TRUE(p->SetKeyTime(0.500000001, &v, 4));
    EXPECT_EQ(p->GetNumKeys(), 4);
    EXPECT_EQ(l.KeyInt(2), 9);
    // A null value at an existing key keeps it as it was.
    EXPECT_TRUE(p->SetKeyTime(0.5, nullptr, 0));
    EXPECT_EQ(l.KeyInt(2), 9);

    // Times a key can never be found at are refused.
    EXPECT_FALSE(p->SetKeyTime(NAN, &v, 4));
    EXPECT_FALSE(p->SetKeyTime(INFINITY, &v, 4));
    EXPECT_EQ(p->GetNumKeys(), 4);
}

TEST(ParamKey, NewKeyWithoutValueCopiesItsNeighbour) {
    ListParam l;
    ulkParameter* p = l.p;
    int a = 11, b = 22;
    p->SetKeyTime(0.2, &a, 4);
    p->SetKeyTime(0.6, &b, 4);
    EXPECT_TRUE(p->SetKeyTime(0.4, nullptr, 0));  // between: the earlier key's value
    EXPECT_EQ(l.KeyInt(p->GetKeyIndex(0.4)), 11);

    ListParam m;
    int c = 33;
    m.p->SetKeyTime(0.0, &c, 4);
    EXPECT_TRUE(m.p->SetKeyTime(-0.5, nullptr, 0));  // before all: the old first key's
    EXPECT_EQ(m.p->GetKeyIndex(-0.5), 0);
    EXPECT_EQ(m.KeyInt(0), 33);
}

TEST(ParamKey, PrevAndNext) {
    ListParam l;
    ulkParameter* p = l.p;
    int v = 1;
    p->SetKeyTime(0.2, &v, 4);
    p->SetKeyTime(0.6, &v, 4);
    ASSERT_TRUE(p->ClearKeyTime(0.0));
    ASSERT_EQ(p->GetNumKeys(), 2);

    EXPECT_EQ(p->GetPrevKey(0.6), 0);
    EXPECT_EQ(p->GetPrevKey(0.2), -1);
    EXPECT_EQ(p->GetPrevKey(0.4), 0);
    EXPECT_EQ(p->GetPrevKey(0.9), 1);
    EXPECT_EQ(p->GetPrevKey(0.1), -1);
    EXPECT_EQ(p->GetNextKey(0.2), 1);
    EXPECT_EQ(p->GetNextKey(0.6), -1);
    EXPECT_EQ(p->GetNextKey(0.1), 0);
    EXPECT_EQ(p->GetNextKey(0.9), -1);
    EXPECT_EQ(p->GetNextKey(NAN), -1);
    EXPECT_EQ(p->GetPrevKey(NAN), -1);
}

TEST(ParamKey, SearchesAgreeWithAScanOnManyKeys) {
    ListParam l;
    ulkParameter* p = l.p;
    std::mt19937 rng(7);
    std::uniform_real_distribution<double> time(-1.0, 2.0);
    int v = 0;
    for (int i = 0; i < 500; ++i) p->SetKeyTime(time(rng), &v, 4);
    for (int i = 0; i < 100; ++i) p->SetKeyTime(i * 0.00000001, &v, 4);  // tight cluster
    for (int i = 1; i < p->GetNumKeys(); ++i) ASSERT_LE(p->GetKeyTime(i - 1), p->GetKeyTime(i));

    std::vector<double> probes;
    for (int i = 0; i < p->GetNumKeys(); ++i) {
        const double t = p->GetKeyTime(i);
        for (double d : {0.0, 0.000000005, -0.000000005, 0.00000001, -0.00000001, 0.000000015})
            probes.push_back(t + d);
    }
    for (int i = 0; i < 2000; ++i) probes.push_back(time(rng));
    auto check = [&] {
        for (double t : probes) {
            ASSERT_EQ(p->GetKeyIndex(t), ScanIndex(p, t)) << t;
            ASSERT_EQ(p->GetPrevKey(t), ScanPrev(p, t)) << t;
            ASSERT_EQ(p->GetNextKey(t), ScanNext(p, t)) << t;
        }
    };
    check();
    // Fewer keys than the last search saw.
    while (p->GetNumKeys() > 3) p->ClearKey(p->GetNumKeys() / 2);
    check();
}

TEST(ParamKey, ChangeClearAndActive) {
    ListParam l;
    ulkParameter* p = l.p;
    int v = 5;
    EXPECT_FALSE(p->ChangeKeyTime(0.3, &v, 4));  // no key there: nothing added
    EXPECT_EQ(p->GetNumKeys(), 1);
    EXPECT_TRUE(p->ChangeKeyTime(0.0, &v, 4));
    EXPECT_EQ(l.KeyInt(0), 5);

    EXPECT_FALSE(p->ClearKey(0));  // the last key stays
    EXPECT_EQ(p->GetNumKeys(), 1);
    EXPECT_FALSE(p->ClearKeyTime(0.3));
    p->SetKeyTime(0.3, &v, 4);
    EXPECT_FALSE(p->ClearKey(2));
    EXPECT_FALSE(p->ClearKey(-1));
    EXPECT_EQ(p->GetKey(5), nullptr);
    EXPECT_EQ(p->GetKeyValue(-1), nullptr);

    p->SetKeyIsActive(true, 0.4);
    EXPECT_FALSE(p->GetKey(0)->IsActive());
    EXPECT_FALSE(p->GetKey(1)->IsActive());
    p->SetKeyIsActive(true, 0.3);
    EXPECT_TRUE(p->GetKey(1)->IsActive());

    EXPECT_TRUE(p->ClearKeyTime(0.3));
    EXPECT_EQ(p->GetNumKeys(), 1);
}

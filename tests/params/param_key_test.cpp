// Key frames: time truncation and matching, ordering, value replacement and
// the searches, checked through a real parameter kind (a list: 4-byte ints).
#include <cmath>
#include <cstdint>
#include <cstring>
#include <random>
#include <vector>

#include "param_test_helpers.h"

namespace {

Owned<ulkPList> NewList() {
    return Owned<ulkPList>(ulkPList::New("L", "l", nullptr, 0, nullptr, kPListTypeDefault));
}
int KeyInt(const ulkParameter* p, int index) {
    int32_t v;
    std::memcpy(&v, p->GetKeyValue(index), 4);
    return v;
}

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
    EXPECT_EQ(ulkParamKey(-0.123456789).GetTime(), -0.12345678);
    const double a = 1.5, b[2] = {2.5, 3.5};
    ASSERT_TRUE(key.SetValue(&a, 8));
    void* buffer = key.GetValue();
    EXPECT_TRUE(key.SetValue(&b[0], 8));  // same size: overwritten in place
    EXPECT_EQ(key.GetValue(), buffer);
    EXPECT_TRUE(key.SetValue(b, 16));                               // other size: new buffer
    EXPECT_TRUE(key.SetValue(key.GetValue(), key.GetValueSize()));  // onto itself
    EXPECT_EQ(key.GetValueSize(), 16u);
    EXPECT_EQ(std::memcmp(key.GetValue(), b, 16), 0);
    EXPECT_TRUE(key.SetValue(nullptr, 0));
    EXPECT_EQ(key.GetValue(), nullptr);
}

TEST(ParamKey, SettingAKeyReplacesAddsInOrderOrRefuses) {
    Owned<ulkPList> p = NewList();
    int v = 7, w = 9;
    for (double t : {0.7, 0.2, 0.5}) EXPECT_TRUE(p->SetKeyTime(t, &v, 4));
    ASSERT_EQ(p->GetNumKeys(), 4);
    EXPECT_EQ(p->GetKeyTime(1), 0.2);
    EXPECT_EQ(p->GetKeyTime(3), 0.7);
    // A time within the tolerance replaces; a null value at an existing key keeps it.
    EXPECT_TRUE(p->SetKeyTime(0.500000001, &w, 4));
    EXPECT_TRUE(p->SetKeyTime(0.5, nullptr, 0));
    EXPECT_EQ(p->GetNumKeys(), 4);
    EXPECT_EQ(KeyInt(p.get(), 2), 9);
    // A new key without value copies the earlier key's value, or the first key's before all.
    EXPECT_TRUE(p->SetKeyTime(0.6, nullptr, 0));
    EXPECT_EQ(KeyInt(p.get(), p->GetKeyIndex(0.6)), 9);
    p->ChangeKeyTime(0.0, &w, 4);
    EXPECT_TRUE(p->SetKeyTime(-0.5, nullptr, 0));
    EXPECT_EQ(KeyInt(p.get(), 0), 9);
    // Times a key can never be found at are refused.
    EXPECT_FALSE(p->SetKeyTime(NAN, &v, 4));
    EXPECT_FALSE(p->SetKeyTime(INFINITY, &v, 4));
    EXPECT_EQ(p->GetNumKeys(), 6);
}

TEST(ParamKey, SearchesAgreeWithAScanOnManyKeys) {
    Owned<ulkPList> list = NewList();
    ulkParameter* p = list.get();
    std::mt19937 rng(7);
    std::uniform_real_distribution<double> time(-1.0, 2.0);
    int v = 0;
    for (int i = 0; i < 500; ++i) p->SetKeyTime(time(rng), &v, 4);
    for (int i = 0; i < 100; ++i) p->SetKeyTime(i * 0.00000001, &v, 4);  // tight cluster
    for (int i = 1; i < p->GetNumKeys(); ++i) ASSERT_LE(p->GetKeyTime(i - 1), p->GetKeyTime(i));

    std::vector<double> probes = {NAN, -5.0, 5.0};
    for (int i = 0; i < p->GetNumKeys(); ++i)
        for (double d : {0.0, 0.000000005, -0.000000005, 0.00000001, -0.00000001, 0.000000015})
            probes.push_back(p->GetKeyTime(i) + d);
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

TEST(ParamKey, ChangeClearAndActiveNeedAKeyThere) {
    Owned<ulkPList> p = NewList();
    int v = 5;
    EXPECT_FALSE(p->ChangeKeyTime(0.3, &v, 4));  // no key there: nothing added
    EXPECT_EQ(p->GetNumKeys(), 1);
    EXPECT_TRUE(p->ChangeKeyTime(0.0, &v, 4));
    EXPECT_EQ(KeyInt(p.get(), 0), 5);
    EXPECT_FALSE(p->ClearKey(0));  // the last key stays
    EXPECT_FALSE(p->ClearKeyTime(0.3));
    p->SetKeyTime(0.3, &v, 4);
    for (int bad : {2, -1}) {
        EXPECT_FALSE(p->ClearKey(bad));
        EXPECT_EQ(p->GetKey(bad), nullptr);
        EXPECT_EQ(p->GetKeyValue(bad), nullptr);
    }
    p->SetKeyIsActive(true, 0.4);
    EXPECT_FALSE(p->GetKey(0)->IsActive() || p->GetKey(1)->IsActive());
    p->SetKeyIsActive(true, 0.3);
    EXPECT_TRUE(p->GetKey(1)->IsActive());
    EXPECT_TRUE(p->ClearKeyTime(0.3));
    EXPECT_EQ(p->GetNumKeys(), 1);
}

// Numbers: range handling, real and integer evaluation, creation checks and text.
#include <gtest/gtest.h>

#include <cmath>

#include "ulk/ulk.h"

TEST(Number, IncrementAndTextBelow) {
    ulkPNumber* a = ulkPNumber::New("A", "a", nullptr, 0, 0, 10, 0, kPNumberReal, false);
    EXPECT_DOUBLE_EQ(a->GetIncrement(), 1.0);
    EXPECT_FALSE(a->GetTextBelow());
    ulkPNumber* b = ulkPNumber::New("B", "b", nullptr, 0, 0, 1, 0, kPNumberReal, false);
    EXPECT_DOUBLE_EQ(b->GetIncrement(), 0.1);
    EXPECT_TRUE(b->GetTextBelow());
    ulkPNumber* c = ulkPNumber::New("C", "c", nullptr, 0, -20000, 10, 5, kPNumberReal, false);
    EXPECT_TRUE(c->GetTextBelow());
    ulkPNumber* d = ulkPNumber::New("D", "d", static_cast<ulkPNumberWidget>(77), nullptr, 0, 0, 10,
                                    2, kPNumberReal, true);
    EXPECT_EQ(d->GetWidget(), 77);
    EXPECT_EQ(a->GetWidget(), kPNumberWidgetDefault);
    for (ulkParameter* p : {(ulkParameter*)a, (ulkParameter*)b, (ulkParameter*)c, (ulkParameter*)d})
        ulkParameter::Delete(p);
}

TEST(Number, ClampsValues) {
    ulkPNumber* n = ulkPNumber::New("N", "n", nullptr, 0, 0, 10, 1, kPNumberReal, false);
    n->SetValue(0.0, 12);
    EXPECT_EQ(n->GetValue(0.0), 10);
    n->SetValue(0.0, -5);
    EXPECT_EQ(n->GetValue(0.0), 0);
    n->SetValue(0.0, NAN);
    EXPECT_EQ(n->GetValue(0.0), 10);
    ulkPNumber* inv = ulkPNumber::New("I", "i", nullptr, 0, 5, 1, 1, kPNumberReal, false);
    inv->SetValue(0.0, 3);
    EXPECT_EQ(inv->GetValue(0.0), 5);
    inv->SetValue(0.0, -100);
    EXPECT_EQ(inv->GetValue(0.0), 5);
    ulkParameter::Delete(n);
    ulkParameter::Delete(inv);
}

TEST(Number, RealEvaluatesIntoTheDouble) {
    double v = 2.5;
    ulkPNumber* n = ulkPNumber::New("N", "n", &v, sizeof v, 0, 20, 1, kPNumberReal, false);
    ASSERT_EQ(n->GetNumKeys(), 1);
    EXPECT_EQ(n->GetKeyTime(0), 0.0);
    EXPECT_EQ(n->GetValue(0.7), 2.5);
    EXPECT_EQ(n->GetDefaultValue(), 2.5);
    n->SetValue(0.0, 0.5);
    n->SetValue(1.0, 10.5);
    EXPECT_EQ(v, 2.5);  // setters change keys only
    EXPECT_TRUE(n->Evaluate(0.5, nullptr, 0, -1));
    EXPECT_DOUBLE_EQ(v, 5.5);
    double other = 0;
    EXPECT_FALSE(n->Evaluate(0.5, &other, sizeof other, -1));
    EXPECT_EQ(other, 0);
    ulkParameter::Delete(n);
}

TEST(Number, IntegerEvaluatesThroughItsOwnDouble) {
    int target = 3;
    ulkPNumber* n =
        ulkPNumber::New("I", "i", &target, sizeof target, -10, 10, 1, kPNumberInteger, false);
    ASSERT_NE(n, nullptr);
    EXPECT_EQ(n->GetValueSize(), 8u);
    EXPECT_EQ(n->GetDefaultValue(), 3.0);
    n->SetValue(0.0, 4.7);
    EXPECT_TRUE(n->Evaluate(0.0, nullptr, 0, -1));
    EXPECT_EQ(target, 4);
    double own = 0;
    EXPECT_EQ(n->CopyInstanceValue(&own, sizeof own), 8u);
    EXPECT_EQ(own, 4.7);
    n->SetValue(0.0, -4.7);
    EXPECT_TRUE(n->Compute(0.0, -1));
    EXPECT_EQ(target, -4);
    n->SetValue(1.0, 8.0);
    EXPECT_TRUE(n->Evaluate(0.9, nullptr, 0, -1));  // steps: the earlier key
    EXPECT_EQ(target, -4);
    EXPECT_TRUE(n->Evaluate(1.0, nullptr, 0, -1));
    EXPECT_EQ(target, 8);
    ulkParameter::Delete(n);
    EXPECT_EQ(target, 8);  // the plug-in's variable outlives the number
}

TEST(Number, CreationChecks) {
    int i = 0;
    double d = 0;
    // Storage that does not fit the type, and unknown types, are refused.
    EXPECT_EQ(ulkPNumber::New("N", "n", &i, 4, 0, 1, 0, kPNumberReal, false), nullptr);
    EXPECT_EQ(ulkPNumber::New("N", "n", &d, 8, 0, 1, 0, kPNumberInteger, false), nullptr);
    EXPECT_EQ(ulkPNumber::New("N", "n", &d, 8, 0, 1, 0, static_cast<ulkPNumberType>(2), false),
              nullptr);
    // Without storage: the middle of the range, stepping for integers.
    ulkPNumber* r = ulkPNumber::New("R", "r", nullptr, 0, 10, 20, 1, kPNumberReal, false);
    ulkPNumber* n = ulkPNumber::New("I", "i", &i, 0, -10, 30, 1, kPNumberInteger, false);
    ASSERT_NE(r, nullptr);
    ASSERT_NE(n, nullptr);
    EXPECT_EQ(r->GetValue(0.3), 15.0);
    EXPECT_EQ(n->GetValue(0.3), 10.0);
    EXPECT_EQ(r->GetDefaultValue(), 0.0);
    EXPECT_FALSE(n->Evaluate(0.0, nullptr, 0, -1));
    n->SetValue(1.0, 20);
    EXPECT_EQ(n->GetValue(0.9), 10.0);
    EXPECT_STREQ(r->ClassName(), "Number");
    EXPECT_TRUE(r->IsNumber());
    EXPECT_FALSE(r->IsBoolean());
    ulkParameter::Delete(r);
    ulkParameter::Delete(n);
}

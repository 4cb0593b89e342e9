// Numbers: range handling, real and integer evaluation, creation checks.
#include <cmath>

#include "param_test_helpers.h"

TEST(Number, IncrementAndTextBelowFollowTheRange) {
    const struct {
        double minimum, maximum, increment, expectedIncrement;
        bool textBelow;
    } cases[] = {{0, 10, 0, 1.0, false}, {0, 1, 0, 0.1, true}, {-20000, 10, 5, 5, true}};
    for (const auto& c : cases) {
        Owned<ulkPNumber> n(ulkPNumber::New("N", "n", nullptr, 0, c.minimum, c.maximum, c.increment,
                                            kPNumberReal, false));
        EXPECT_DOUBLE_EQ(n->GetIncrement(), c.expectedIncrement) << c.maximum;
        EXPECT_EQ(n->GetTextBelow(), c.textBelow) << c.minimum << " " << c.maximum;
    }
    Owned<ulkPNumber> w(ulkPNumber::New("D", "d", static_cast<ulkPNumberWidget>(77), nullptr, 0, 0,
                                        10, 2, kPNumberReal, true));
    EXPECT_EQ(w->GetWidget(), 77);
}

TEST(Number, ValuesAreClampedToTheRange) {
    Owned<ulkPNumber> n(ulkPNumber::New("N", "n", nullptr, 0, 0, 10, 1, kPNumberReal, false));
    Owned<ulkPNumber> inverted(ulkPNumber::New("I", "i", nullptr, 0, 5, 1, 1, kPNumberReal, false));
    const struct {
        ulkPNumber* number;
        double set, expected;
    } cases[] = {{n.get(), 12, 10},   {n.get(), -5, 0},       {n.get(), NAN, 10},
                 {n.get(), 3.5, 3.5}, {inverted.get(), 3, 5}, {inverted.get(), -100, 5}};
    for (const auto& c : cases) {
        c.number->SetValue(0.0, c.set);
        EXPECT_EQ(c.number->GetValue(0.0), c.expected) << c.set;
    }
}

TEST(Number, RealEvaluatesIntoItsDoubleOnly) {
    double v = 2.5;
    Owned<ulkPNumber> n(ulkPNumber::New("N", "n", &v, sizeof v, 0, 20, 1, kPNumberReal, false));
    ASSERT_EQ(n->GetNumKeys(), 1);
    EXPECT_EQ(n->GetValue(0.7), 2.5);
    n->SetValue(0.0, 0.5);
    n->SetValue(1.0, 10.5);
    EXPECT_EQ(v, 2.5);  // setters change keys only
    EXPECT_EQ(n->GetDefaultValue(), 2.5);
    EXPECT_TRUE(n->Evaluate(0.5, nullptr, 0, -1));
    EXPECT_DOUBLE_EQ(v, 5.5);
    double other = 0;
    EXPECT_FALSE(n->Evaluate(0.5, &other, sizeof other, -1));
    EXPECT_EQ(other, 0);
}

TEST(Number, IntegerStepsAndTruncatesIntoTheTarget) {
    int target = 3;
    Owned<ulkPNumber> n(
        ulkPNumber::New("I", "i", &target, sizeof target, -10, 10, 1, kPNumberInteger, false));
    ASSERT_NE(n, nullptr);
    EXPECT_EQ(n->GetDefaultValue(), 3.0);
    n->SetValue(0.0, 4.7);
    EXPECT_TRUE(n->Evaluate(0.0, nullptr, 0, -1));
    EXPECT_EQ(target, 4);
    double own = 0;
    EXPECT_EQ(n->CopyInstanceValue(&own, sizeof own), 8u);
    EXPECT_EQ(own, 4.7);
    n->SetValue(0.0, -4.7);
    n->SetValue(1.0, 8.0);
    EXPECT_TRUE(n->Compute(0.9, -1));  // steps: the earlier key, truncated toward zero
    EXPECT_EQ(target, -4);
    n.reset();
    EXPECT_EQ(target, -4);  // the plug-in's variable outlives the number
}

TEST(Number, CreationChecksAndTheMiddleOfTheRange) {
    int i = 0;
    double d = 0;
    // Storage that does not fit the type, and unknown types, are refused.
    EXPECT_EQ(ulkPNumber::New("N", "n", &i, 4, 0, 1, 0, kPNumberReal, false), nullptr);
    EXPECT_EQ(ulkPNumber::New("N", "n", &d, 8, 0, 1, 0, kPNumberInteger, false), nullptr);
    EXPECT_EQ(ulkPNumber::New("N", "n", &d, 8, 0, 1, 0, static_cast<ulkPNumberType>(2), false),
              nullptr);
    // Without storage (null or size 0): the middle of the range, stepping for integers.
    Owned<ulkPNumber> r(ulkPNumber::New("R", "r", nullptr, 0, 10, 20, 1, kPNumberReal, false));
    Owned<ulkPNumber> n(ulkPNumber::New("I", "i", &i, 0, -10, 30, 1, kPNumberInteger, false));
    ASSERT_TRUE(r && n);
    EXPECT_EQ(r->GetValue(0.3), 15.0);
    EXPECT_EQ(r->GetDefaultValue(), 0.0);
    EXPECT_FALSE(n->Evaluate(0.0, nullptr, 0, -1));
    n->SetValue(1.0, 20);
    EXPECT_EQ(n->GetValue(0.9), 10.0);
}

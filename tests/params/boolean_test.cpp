// Booleans and group enables: one byte, stepping from key to key.
#include <gtest/gtest.h>

#include "ulk/ulk.h"

TEST(Boolean, ValuesAndEvaluation) {
    ulkPBoolean* b = ulkPBoolean::New("B", "b", nullptr, 0);
    ASSERT_NE(b, nullptr);
    EXPECT_FALSE(b->GetValue(0.0));
    EXPECT_FALSE(b->GetValue(0.9));
    EXPECT_FALSE(b->GetDefaultValue());
    b->SetValue(0.5, true);
    EXPECT_FALSE(b->GetValue(0.25));
    EXPECT_TRUE(b->GetValue(0.75));

    bool flag = true;
    ulkPBoolean* s = ulkPBoolean::New("S", "s", &flag, sizeof flag);
    EXPECT_TRUE(s->GetDefaultValue());
    s->SetValue(0.5, false);
    EXPECT_TRUE(s->Evaluate(0.25, nullptr, 0, -1));
    EXPECT_TRUE(flag);
    EXPECT_TRUE(s->Evaluate(0.75, nullptr, 0, -1));
    EXPECT_FALSE(flag);
    bool other = true;
    EXPECT_FALSE(s->Evaluate(0.75, &other, 1, -1));
    EXPECT_TRUE(other);
    EXPECT_STREQ(s->ClassName(), "Boolean");
    ulkParameter::Delete(b);
    ulkParameter::Delete(s);
}

TEST(Boolean, GroupEnableIsABooleanWithItsOwnIdentity) {
    bool on = true;
    ulkPGroupEnable* e = ulkPGroupEnable::New("On", "on", &on, 1);
    ASSERT_NE(e, nullptr);
    EXPECT_STREQ(e->ClassName(), "GroupEnable");
    EXPECT_TRUE(e->IsBoolean());
    EXPECT_TRUE(e->IsGroupEnable());
    EXPECT_FALSE(e->IsGroup());
    e->SetValue(0.5, false);
    EXPECT_TRUE(e->Evaluate(0.6, nullptr, 0, -1));
    EXPECT_FALSE(on);
    ulkParameter::Delete(e);
}

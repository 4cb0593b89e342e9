// Booleans and group enables: one byte, stepping from key to key.
#include "param_test_helpers.h"

TEST(Boolean, StepsFromKeyToKeyIntoItsOwnByteOnly) {
    bool flag = true;
    Owned<ulkPBoolean> none(ulkPBoolean::New("B", "b", nullptr, 0));
    Owned<ulkPBoolean> b(ulkPBoolean::New("S", "s", &flag, sizeof flag));
    Owned<ulkPGroupEnable> e(ulkPGroupEnable::New("On", "on", &flag, 1));
    ASSERT_TRUE(none && b && e);
    EXPECT_FALSE(none->GetValue(0.9));
    EXPECT_FALSE(none->GetDefaultValue());
    EXPECT_TRUE(b->GetDefaultValue());
    b->SetValue(0.5, false);
    EXPECT_TRUE(b->Evaluate(0.25, nullptr, 0, -1));
    EXPECT_TRUE(flag);
    EXPECT_TRUE(b->Evaluate(0.75, nullptr, 0, -1));
    EXPECT_FALSE(flag);
    bool other = true;
    EXPECT_FALSE(b->Evaluate(0.75, &other, 1, -1));
    EXPECT_TRUE(other);

    // A group enable is a boolean with an identity of its own.
    EXPECT_TRUE(e->IsBoolean() && e->IsGroupEnable() && !e->IsGroup());
    EXPECT_STREQ(e->ClassName(), "GroupEnable");
    e->SetValue(0.5, true);
    EXPECT_TRUE(e->Evaluate(0.6, nullptr, 0, -1));
    EXPECT_TRUE(flag);
}

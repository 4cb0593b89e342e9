// Lists: item copies, unchecked indices as values, checked item access.
#include "param_test_helpers.h"

TEST(List, ItemsAreCopiedAndValuesAreNotLimitedToThem) {
    char first[] = "A";
    const char* items[] = {first, "B", "C", nullptr};
    int choice = 2;
    Owned<ulkPList> l(
        ulkPList::New("L", "l", &choice, sizeof choice, items, static_cast<ulkPListType>(5)));
    ASSERT_NE(l, nullptr);
    first[0] = 'Z';
    EXPECT_EQ(l->GetNumItems(), 3);
    EXPECT_STREQ(l->GetListItem(0), "A");
    EXPECT_STREQ(l->GetListItem(2), "C");
    EXPECT_EQ(l->GetListItem(3), nullptr);
    EXPECT_EQ(l->GetListItem(-1), nullptr);
    EXPECT_EQ(l->GetDefaultValue(), 2);

    l->SetValue(0.5, 7);
    EXPECT_TRUE(l->Evaluate(0.6, nullptr, 0, -1));
    EXPECT_EQ(choice, 7);
    int other = 0;
    EXPECT_FALSE(l->Evaluate(0.6, &other, sizeof other, -1));
    EXPECT_EQ(other, 0);

    Owned<ulkPList> empty(ulkPList::New("E", "e", nullptr, 0, nullptr, kPListTypeDefault));
    ASSERT_NE(empty, nullptr);
    EXPECT_EQ(empty->GetNumItems(), 0);
    EXPECT_EQ(empty->GetValue(0.0), 0);
}

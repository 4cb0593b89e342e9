// The indexed list: growth, ordering of inserts and removals, node links.
#include <gtest/gtest.h>

#include "ulk/core/list.h"

namespace {

struct Item : ulkNode {};

TEST(ListTest, GrowsByGrainAndKeepsOrder) {
    ulkList list;
    EXPECT_TRUE(list.IsEmpty());
    EXPECT_EQ(list.mEntries, nullptr);
    EXPECT_EQ(list.RemHead(), nullptr);
    EXPECT_EQ(list.RemTail(), nullptr);

    Item items[12];
    ASSERT_TRUE(list.AddTail(&items[0]));
    EXPECT_EQ(list.mMaxEntries, 11);
    for (int i = 1; i < 12; ++i) ASSERT_TRUE(list.AddTail(&items[i]));
    EXPECT_EQ(list.mMaxEntries, 22);
    for (int i = 0; i < 12; ++i) EXPECT_EQ(list.GetEntry(i), &items[i]);
    EXPECT_TRUE(list.SetMaxEntries(5));
    EXPECT_EQ(list.mMaxEntries, 22);

    ulkList exact(0);
    for (int i = 0; i < 3; ++i) {
        exact.AddTail(&items[i]);
        EXPECT_EQ(exact.mMaxEntries, i + 1);
    }
    // A negative grain never leaves fewer slots than entries.
    ulkList negative(-5);
    for (int i = 0; i < 4; ++i) ASSERT_TRUE(negative.AddTail(&items[i]));
    EXPECT_GE(negative.mMaxEntries, 4);
    EXPECT_EQ(negative.GetEntry(3), &items[3]);
}

TEST(ListTest, InsertsAndRemovesKeepIndicesDense) {
    Item a, b, c, x;
    ulkList list;
    list.AddTail(&a);
    list.AddTail(&b);
    list.AddHead(&x);
    EXPECT_EQ(list.GetIndex(&x), 0);
    EXPECT_EQ(list.GetIndex(&b), 2);
    list.RemHead();
    EXPECT_EQ(x.mList, nullptr);

    list.AddTail(&c);  // a, b, c
    list.Insert(&x, 1);
    EXPECT_EQ(list.GetEntry(1), &x);
    EXPECT_EQ(list.GetEntry(2), &b);
    list.Remove(1);
    list.Insert(&x, 3);  // at the count: appends
    EXPECT_EQ(list.GetEntry(3), &x);
    x.Remove();
    EXPECT_EQ(list.GetCount(), 3);

    list.Remove(1);  // a, c
    EXPECT_EQ(b.mList, nullptr);
    EXPECT_EQ(list.GetEntry(1), &c);
    EXPECT_EQ(c.GetIndex(), 1);
    EXPECT_EQ(list.RemTail(), &c);
    EXPECT_EQ(c.mList, nullptr);
    EXPECT_EQ(list.GetCount(), 1);
    EXPECT_EQ(list.GetIndex(&c), -1);
    EXPECT_EQ(c.GetIndex(), -1);  // in no list
}

TEST(ListTest, SetEntryReplacesAppendsOrRefuses) {
    Item a, b, x, y;
    ulkList list;
    list.AddTail(&a);
    list.AddTail(&a);
    EXPECT_EQ(list.GetIndex(&a), 0);  // stored twice: the lower index
    EXPECT_TRUE(list.SetEntry(1, &b));
    EXPECT_EQ(list.GetCount(), 2);
    EXPECT_TRUE(list.SetEntry(2, &x));
    EXPECT_EQ(list.GetCount(), 3);
    EXPECT_EQ(x.mList, &list);
    EXPECT_FALSE(list.SetEntry(5, &y));  // beyond the count: refused
    EXPECT_EQ(list.GetCount(), 3);
    EXPECT_EQ(y.mList, nullptr);
}

}  // namespace

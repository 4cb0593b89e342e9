// The indexed list: growth, ordering of inserts and removals, node links.
#include <gtest/gtest.h>

#include <vector>

#include "ulk/core/list.h"

namespace {

struct Item : ulkNode {};

std::vector<ulkNode*> Entries(const ulkList& list) {
    std::vector<ulkNode*> entries;
    for (int i = 0; i < list.GetCount(); ++i) entries.push_back(list.GetEntry(i));
    return entries;
}

}  // namespace

TEST(ListTest, GrowsByGrainAndKeepsOrder) {
    Item items[12];
    for (int grain : {10, 0, -5}) {
        ulkList list(grain);
        EXPECT_EQ(list.RemHead(), nullptr);
        EXPECT_EQ(list.RemTail(), nullptr);
        for (int i = 0; i < 12; ++i) {
            ASSERT_TRUE(list.AddTail(&items[i]));
            // Room for the entry plus the grain; a negative grain never leaves fewer slots.
            EXPECT_GE(list.mMaxEntries, i + 1) << grain;
        }
        EXPECT_EQ(list.mMaxEntries, grain == 10 ? 22 : 12);
        for (int i = 0; i < 12; ++i) EXPECT_EQ(list.GetEntry(i), &items[i]) << grain;
    }
}

TEST(ListTest, InsertsAndRemovesKeepIndicesDense) {
    Item a, b, c, x;
    ulkList list;
    list.AddTail(&a);
    list.AddTail(&b);
    list.AddHead(&x);
    EXPECT_EQ(Entries(list), (std::vector<ulkNode*>{&x, &a, &b}));
    EXPECT_EQ(list.RemHead(), &x);
    EXPECT_EQ(x.mList, nullptr);

    list.AddTail(&c);
    list.Insert(&x, 1);
    EXPECT_EQ(Entries(list), (std::vector<ulkNode*>{&a, &x, &b, &c}));
    list.Remove(1);
    list.Insert(&x, 3);  // at the count: appends
    EXPECT_EQ(Entries(list), (std::vector<ulkNode*>{&a, &b, &c, &x}));
    x.Remove();
    list.Remove(1);
    EXPECT_EQ(Entries(list), (std::vector<ulkNode*>{&a, &c}));
    EXPECT_EQ(b.mList, nullptr);
    EXPECT_EQ(c.GetIndex(), 1);
    EXPECT_EQ(list.RemTail(), &c);
    EXPECT_EQ(c.mList, nullptr);
    EXPECT_EQ(c.GetIndex(), -1);
    list.Remove(&c);  // not in the list: ignored
    EXPECT_EQ(Entries(list), (std::vector<ulkNode*>{&a}));
}

TEST(ListTest, SetEntryReplacesAppendsOrRefuses) {
    Item a, b, x, y;
    ulkList list;
    list.AddTail(&a);
    list.AddTail(&a);
    EXPECT_EQ(list.GetIndex(&a), 0);  // stored twice: the lower index
    EXPECT_TRUE(list.SetEntry(1, &b));
    EXPECT_TRUE(list.SetEntry(2, &x));
    EXPECT_FALSE(list.SetEntry(5, &y));  // beyond the count: refused
    EXPECT_EQ(Entries(list), (std::vector<ulkNode*>{&a, &b, &x}));
    EXPECT_EQ(x.mList, &list);
    EXPECT_EQ(y.mList, nullptr);
}

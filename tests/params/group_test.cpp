// Groups: membership without ownership, no nesting, checked member access.
#include "param_test_helpers.h"

TEST(Group, MembersStayWithTheirOwner) {
    ulkPGroup* g = ulkPGroup::New("G", "g", true);
    Owned<ulkPGroup> inner(ulkPGroup::New("I", "i", false));
    double v = 1;
    Owned<ulkPNumber> n(ulkPNumber::New("N", "n", &v, 8, 0, 10, 1, kPNumberReal, false));
    ASSERT_NE(g, nullptr);
    EXPECT_EQ(g->GetNumKeys(), 0);
    EXPECT_FALSE(g->AddParameter(inner.get()));  // no nesting
    EXPECT_TRUE(inner->IsAtTopLevel());
    EXPECT_FALSE(g->AddParameter(nullptr));
    EXPECT_TRUE(g->AddParameter(n.get()));
    EXPECT_FALSE(n->IsAtTopLevel());
    EXPECT_TRUE(g->ContainsParameter(n.get()));
    EXPECT_FALSE(g->ContainsParameter(inner.get()));
    EXPECT_EQ(g->GetNumParameters(), 1);
    EXPECT_EQ(g->GetParameter(0), n.get());
    EXPECT_EQ(g->GetParameter(1), nullptr);
    EXPECT_EQ(g->GetParameter(-1), nullptr);
    EXPECT_TRUE(g->Evaluate(0.5, nullptr, 0, -1));
    EXPECT_TRUE(g->Evaluate(0.5, &v, 8, -1));

    ulkParameter::Delete(g);
    // The member is still alive and usable (ASan).
    n->SetValue(0.0, 4);
    EXPECT_TRUE(n->Evaluate(0.0, nullptr, 0, -1));
    EXPECT_EQ(v, 4);
}

// ulkMediaObject: the abstract media base, seen through an image and a host's own type.
#include "ulk/image/media_object.h"

#include <gtest/gtest.h>

#include "ulk/core/list.h"
#include "ulk/image/image.h"

namespace {

int gDestroyed = 0;

class CountedMedia : public ulkMediaObject {
  public:
    ~CountedMedia() override { ++gDestroyed; }
    const char* ClassName() const override { return "Counted"; }
};

}  // namespace

TEST(MediaObjectTest, DeletingThroughTheBaseRunsTheDerivedDestructor) {
    ulkMediaObject* image = ulkImage::New();
    ASSERT_NE(image, nullptr);
    EXPECT_STREQ(image->ClassName(), "Image");
    delete image;  // ASan reports a mismatched or partial destruction
    gDestroyed = 0;
    ulkMediaObject* media = new CountedMedia;
    delete media;
    EXPECT_EQ(gDestroyed, 1);
}

TEST(MediaObjectTest, CopiesStartOutsideListsAndAssignmentKeepsMembership) {
    ulkList list;
    CountedMedia a, c;
    ASSERT_TRUE(list.AddTail(&a));
    CountedMedia b(a);
    c = a;
    EXPECT_EQ(b.mList, nullptr);
    EXPECT_EQ(c.mList, nullptr);
    a = c;
    EXPECT_EQ(a.GetIndex(), 0);
}

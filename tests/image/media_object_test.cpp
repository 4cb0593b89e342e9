// ulkMediaObject: the abstract media base, seen through an image.
#include "ulk/image/media_object.h"

#include <gtest/gtest.h>

#include "ulk/core/list.h"
#include "ulk/image/image.h"

namespace {

int gDestroyed = 0;

// A media type of a host's own, to see the virtual destructor run.
class CountedMedia : public ulkMediaObject {
  public:
    ~CountedMedia() override { ++gDestroyed; }
    const char* ClassName() const override { return "Counted"; }
};

}  // namespace

TEST(MediaObjectTest, ImageAnswersImageThroughTheBase) {
    ulkImage* image = ulkImage::New();
    ASSERT_NE(image, nullptr);
    ulkMediaObject* media = image;
    EXPECT_STREQ(media->ClassName(), "Image");
    delete media;  // runs the image's destructor, then the base's, and frees once
}

TEST(MediaObjectTest, DeletingThroughTheBaseRunsTheDerivedDestructor) {
    gDestroyed = 0;
    ulkMediaObject* media = new CountedMedia;
    EXPECT_STREQ(media->ClassName(), "Counted");
    delete media;
    EXPECT_EQ(gDestroyed, 1);
}

TEST(MediaObjectTest, MediaLiveInListsAndCopiesStartOutside) {
    ulkList list;
    CountedMedia a;
    ASSERT_TRUE(list.AddTail(&a));
    EXPECT_EQ(a.GetIndex(), 0);
    CountedMedia b(a);
    EXPECT_EQ(b.mList, nullptr);
    CountedMedia c;
    c = a;
    EXPECT_EQ(c.mList, nullptr);
    a = c;
    EXPECT_EQ(a.mList, &list);
}

#include "ulk_tools/sequence.h"

#include <gtest/gtest.h>

#include <cstdio>

#include "scratch_folder.h"

using namespace ulk_tools;

TEST(Sequence, HashesAndPrintfSpellingsNumberFrames) {
    EXPECT_EQ(SequenceFramePath("shot.####.exr", 7), "shot.0007.exr");
    EXPECT_EQ(SequenceFramePath("shot.#.exr", 123), "shot.123.exr");
    EXPECT_EQ(SequenceFramePath("shot.##.exr", 12345), "shot.12345.exr");  // wider than padding
    EXPECT_EQ(SequenceFramePath("out/f_%04d.png", 42), "out/f_0042.png");
    EXPECT_EQ(SequenceFramePath("f%d.png", 42), "f42.png");
    EXPECT_EQ(SequenceFramePath("f%03d.png", -4), "f-04.png");
    // Only the first placeholder counts; "%%" is a literal percent sign.
    EXPECT_EQ(SequenceFramePath("a_##_b_##.png", 3), "a_03_b_##.png");
    EXPECT_EQ(SequenceFramePath("50%%_%02d.png", 3), "50%_03.png");
    // The folder is taken literally.
    EXPECT_EQ(SequenceFramePath("take#2/%04d.dpx", 9), "take#2/0009.dpx");
}

TEST(Sequence, DetectsPatternsAndRejectsMisspellings) {
    EXPECT_TRUE(IsSequencePattern("a.####.exr"));
    EXPECT_TRUE(IsSequencePattern("a.%04d.exr"));
    EXPECT_TRUE(IsSequencePattern("a.%d.exr"));
    EXPECT_FALSE(IsSequencePattern("a.exr"));
    EXPECT_FALSE(IsSequencePattern("100%.png"));
    EXPECT_FALSE(IsSequencePattern("50%%.png"));
    EXPECT_FALSE(IsSequencePattern("dir#1/a.png"));
    EXPECT_EQ(SequenceFramePath("still.png", 5), "still.png");

    SequencePattern pattern;
    std::string error;
    ASSERT_TRUE(ParseSequencePattern("dir/s.%05d.tif", &pattern, &error)) << error;
    EXPECT_EQ(pattern.prefix, "dir/s.");
    EXPECT_EQ(pattern.suffix, ".tif");
    EXPECT_EQ(pattern.padding, 5);
    EXPECT_FALSE(ParseSequencePattern("s.%4d.tif", &pattern, &error));
    EXPECT_NE(error.find("%04d"), std::string::npos) << error;
    EXPECT_FALSE(ParseSequencePattern("s.%0999999999999d.tif", &pattern, &error));
    EXPECT_FALSE(ParseSequencePattern(std::string(40, '#'), &pattern, &error));
    EXPECT_FALSE(ParseSequencePattern("plain.png", &pattern, &error));
    EXPECT_NE(error.find("plain.png"), std::string::npos) << error;
}

TEST(Sequence, ListsOnlyFilesThePatternSpells) {
    ScratchFolder folder;
    for (const char* name : {"s.0003.png", "s.0001.png", "s.12345.png", "s.7.png", "s.0002.jpg",
                             "t.0004.png", "s.00x5.png", "s.-001.png"}) {
        FILE* file = std::fopen(folder.Path(name).c_str(), "wb");
        ASSERT_NE(file, nullptr);
        std::fclose(file);
    }
    SequencePattern pattern;
    std::string error;
    ASSERT_TRUE(ParseSequencePattern(folder.Path("s.####.png"), &pattern, &error)) << error;
    EXPECT_EQ(ListSequenceFrames(pattern), (std::vector<int>{-1, 1, 3, 12345}));
    ASSERT_TRUE(ParseSequencePattern(folder.Path("s.%d.png"), &pattern, &error)) << error;
    EXPECT_EQ(ListSequenceFrames(pattern), (std::vector<int>{7, 12345}));
    ASSERT_TRUE(ParseSequencePattern(folder.Path("nothing/s.####.png"), &pattern, &error));
    EXPECT_TRUE(ListSequenceFrames(pattern).empty());
}

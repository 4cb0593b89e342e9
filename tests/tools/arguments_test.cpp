#include "ulk_tools/arguments.h"

#include <gtest/gtest.h>

using namespace ulk_tools;

TEST(Arguments, FrameRanges) {
    FrameRange range;
    std::string error;
    ASSERT_TRUE(ParseFrameRange("1-48", &range, &error)) << error;
    EXPECT_EQ(range.first, 1);
    EXPECT_EQ(range.last, 48);
    EXPECT_EQ(range.Count(), 48);
    ASSERT_TRUE(ParseFrameRange("7", &range, &error));
    EXPECT_EQ(range.first, 7);
    EXPECT_EQ(range.last, 7);
    ASSERT_TRUE(ParseFrameRange("-5--1", &range, &error));
    EXPECT_EQ(range.first, -5);
    EXPECT_EQ(range.last, -1);
    ASSERT_TRUE(ParseFrameRange("-2147483648-2147483647", &range, &error));
    EXPECT_EQ(range.Count(), 4294967296LL);

    for (const char* bad : {"", "-", "1-", "-1-", "a-b", "1-2-3", "1..5", " 1-2", "1-2 ", "+1-2",
                            "99999999999-1", "1.5"}) {
        EXPECT_FALSE(ParseFrameRange(bad, &range, &error)) << bad;
        EXPECT_NE(error.find(std::string("'") + bad + "'"), std::string::npos) << error;
    }
    EXPECT_FALSE(ParseFrameRange("10-2", &range, &error));
    EXPECT_NE(error.find("before"), std::string::npos) << error;
}

TEST(Arguments, Sizes) {
    int width = 0, height = 0;
    std::string error;
    ASSERT_TRUE(ParseSize("1920x1080", &width, &height, &error)) << error;
    EXPECT_EQ(width, 1920);
    EXPECT_EQ(height, 1080);
    ASSERT_TRUE(ParseSize("1X1", &width, &height, &error));
    EXPECT_EQ(width, 1);
    for (const char* bad : {"", "1920", "x1080", "1920x", "0x10", "10x-1", "1920*1080", "70000x10",
                            "12x12x12", "1e3x2"}) {
        EXPECT_FALSE(ParseSize(bad, &width, &height, &error)) << bad;
        EXPECT_NE(error.find("size"), std::string::npos);
    }
}

TEST(Arguments, SetSplitsIdTimeAndText) {
    SetArgument set;
    std::string error;
    ASSERT_TRUE(ParseSetArgument("radius=2.5", &set, &error)) << error;
    EXPECT_EQ(set.id, "radius");
    EXPECT_FALSE(set.hasTime);
    EXPECT_EQ(set.text, "2.5");

    // Only the first '=' splits: the text keeps the rest, spaces and '@' included.
    ASSERT_TRUE(ParseSetArgument("title@12.5=a = b @ c", &set, &error)) << error;
    EXPECT_EQ(set.id, "title");
    EXPECT_TRUE(set.hasTime);
    EXPECT_DOUBLE_EQ(set.time, 12.5);
    EXPECT_EQ(set.text, "a = b @ c");
    ASSERT_TRUE(ParseSetArgument("name=", &set, &error));
    EXPECT_EQ(set.text, "");
    ASSERT_TRUE(ParseSetArgument("k@-1e1=x", &set, &error));
    EXPECT_DOUBLE_EQ(set.time, -10.0);

    EXPECT_FALSE(ParseSetArgument("radius", &set, &error));
    EXPECT_NE(error.find("ID=TEXT"), std::string::npos) << error;
    EXPECT_FALSE(ParseSetArgument("=5", &set, &error));
    EXPECT_FALSE(ParseSetArgument("@1=5", &set, &error));
    for (const char* bad : {"k@=1", "k@one=1", "k@1s=1", "k@nan=1", "k@inf=1", "k@ 1=1"}) {
        EXPECT_FALSE(ParseSetArgument(bad, &set, &error)) << bad;
        EXPECT_NE(error.find("not a number"), std::string::npos) << error;
    }
}

TEST(Arguments, RealNumbersReadBackExactly) {
    double value = 0;
    for (double v : {0.1, -2.5, 1e300, 1.0 / 3, 25.0}) {
        ASSERT_TRUE(ParseDouble(FormatDouble(v), &value)) << v;
        EXPECT_EQ(value, v);
    }
    EXPECT_EQ(FormatDouble(25.0), "25");
    EXPECT_TRUE(ParseDouble("+0.5", &value));
    EXPECT_EQ(value, 0.5);
    EXPECT_FALSE(ParseDouble("+-1", &value));
    EXPECT_FALSE(ParseDouble("1e999", &value));
    EXPECT_FALSE(ParseDouble("0x10", &value));
}

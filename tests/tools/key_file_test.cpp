#include "ulk_tools/key_file.h"

#include <gtest/gtest.h>

#include <cstdint>

#include "scratch_folder.h"

using namespace ulk_tools;

TEST(KeyFile, ParsesKeysCommentsAndTexts) {
    const std::string text =
        "\xEF\xBB\xBF# made by hand\n"
        "radius 0 2.5\n"
        "\n"
        "   # indented comment\n"
        "title\t12.5\tHello  world # not a comment\r\n"
        "empty -1\n"
        "  spaced   3   trailing  \n"
        "last 4 no newline";
    std::vector<KeyLine> keys;
    std::string error;
    ASSERT_TRUE(ParseKeyText(text, "k.txt", &keys, &error)) << error;
    ASSERT_EQ(keys.size(), 5u);
    EXPECT_EQ(keys[0].id, "radius");
    EXPECT_EQ(keys[0].time, 0.0);
    EXPECT_EQ(keys[0].text, "2.5");
    EXPECT_EQ(keys[0].line, 2);
    EXPECT_EQ(keys[1].id, "title");
    EXPECT_EQ(keys[1].time, 12.5);
    EXPECT_EQ(keys[1].text, "Hello  world # not a comment");
    EXPECT_EQ(keys[1].line, 5);
    EXPECT_EQ(keys[2].id, "empty");
    EXPECT_EQ(keys[2].time, -1.0);
    EXPECT_EQ(keys[2].text, "");
    EXPECT_EQ(keys[3].id, "spaced");
    EXPECT_EQ(keys[3].text, "trailing  ");
    EXPECT_EQ(keys[4].text, "no newline");
    EXPECT_EQ(keys[4].line, 8);

    ASSERT_TRUE(ParseKeyText("", "k.txt", &keys, &error));
    EXPECT_TRUE(keys.empty());
}

TEST(KeyFile, MalformedLinesNameFileAndLine) {
    std::vector<KeyLine> keys;
    std::string error;
    EXPECT_FALSE(ParseKeyText("a 1 x\n# c\nradius\n", "keys.txt", &keys, &error));
    EXPECT_EQ(error, "keys.txt:3: key 'radius' has no time (expected ID TIME TEXT)");
    EXPECT_EQ(keys.size(), 1u);  // what came before the bad line

    EXPECT_FALSE(ParseKeyText("a 1 x\r\nb one x\r\n", "keys.txt", &keys, &error));
    EXPECT_EQ(error, "keys.txt:2: key 'b': time 'one' is not a number");
    EXPECT_FALSE(ParseKeyText("a 1,5 x", "f", &keys, &error));
    EXPECT_EQ(error.rfind("f:1: ", 0), 0u) << error;
    EXPECT_FALSE(ParseKeyText("a nan x", "f", &keys, &error));
    EXPECT_FALSE(ParseKeyText("a \t ", "f", &keys, &error));
    // Long garbage is quoted short.
    EXPECT_FALSE(ParseKeyText("a " + std::string(5000, 'z'), "f", &keys, &error));
    EXPECT_LT(error.size(), 120u);
}

TEST(KeyFile, AnyBytesParseWithoutFaulting) {
    // Deterministic pseudo-random inputs drawn from the characters that matter to the parser.
    const char alphabet[] = {' ', '\t', '\n', '\r', '#',    '-',    '.',    'e',
                             '1', '0',  'x',  '\0', '\xEF', '\xBB', '\xBF', '\xFF'};
    uint32_t state = 12345;
    std::vector<KeyLine> keys;
    std::string error;
    for (int round = 0; round < 2000; ++round) {
        std::string input;
        const int length = round % 64;
        for (int i = 0; i < length; ++i) {
            state = state * 1664525u + 1013904223u;
            input += alphabet[(state >> 24) % sizeof alphabet];
        }
        if (ParseKeyText(input, "f", &keys, &error)) {
            for (const KeyLine& key : keys) EXPECT_FALSE(key.id.empty()) << round;
        } else {
            EXPECT_EQ(error.rfind("f:", 0), 0u) << round;
        }
    }
}

TEST(KeyFile, WrittenFilesReadBackTheSameKeys) {
    ScratchFolder folder;
    const std::vector<KeyLine> keys = {{"radius", 0, "2.5", 0},
                                       {"title", 1.0 / 3, "two  words # and more  ", 0},
                                       {"flag", -12, "", 0},
                                       {"far", 1e15, "x", 0}};
    std::string error;
    ASSERT_TRUE(WriteKeyFile(folder.Path("k.txt"), keys, &error)) << error;
    std::vector<KeyLine> back;
    ASSERT_TRUE(ReadKeyFile(folder.Path("k.txt"), &back, &error)) << error;
    ASSERT_EQ(back.size(), keys.size());
    for (size_t i = 0; i < keys.size(); ++i) {
        EXPECT_EQ(back[i].id, keys[i].id);
        EXPECT_EQ(back[i].time, keys[i].time);  // exact: shortest round-trip form
        EXPECT_EQ(back[i].text, keys[i].text);
    }
    EXPECT_EQ(folder.Names(), std::vector<std::string>{"k.txt"});

    // Keys that could not read back the same are refused, and nothing is written.
    for (const KeyLine& bad : {KeyLine{"", 0, "x", 0}, KeyLine{"two words", 0, "x", 0},
                               KeyLine{"#id", 0, "x", 0}, KeyLine{"t", 0, "a\nb", 0},
                               KeyLine{"t", 0, " lead", 0}, KeyLine{"t", 1.0 / 0.0, "x", 0}}) {
        EXPECT_FALSE(WriteKeyFile(folder.Path("bad.txt"), {bad}, &error)) << bad.id;
        EXPECT_EQ(error.rfind(folder.Path("bad.txt") + ": key '", 0), 0u) << error;
    }
    EXPECT_EQ(folder.Names(), std::vector<std::string>{"k.txt"});

    EXPECT_FALSE(ReadKeyFile(folder.Path("missing.txt"), &back, &error));
    EXPECT_NE(error.find("missing.txt"), std::string::npos);
    EXPECT_FALSE(WriteKeyFile(folder.Path("none/k.txt"), keys, &error));
}

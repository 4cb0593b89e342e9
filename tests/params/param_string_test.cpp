// Strings: size limits, the buffer layout, exceptions that leave the value
// alone, and the two destination rules.
#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "ulk/ulk.h"

namespace {

std::string Thrown(void (*f)()) {
    try {
        f();
    } catch (const char* message) {
        return message;
    }
    return "";
}

}  // namespace

TEST(String, SizeLimits) {
    EXPECT_EQ(Thrown([] { ulkPString::New("S", "s", nullptr, 0, kPStringTypeDefault); }),
              "ulkPString::New, size must be > 0!");
    EXPECT_EQ(Thrown([] { ulkPString::New("S", "s", nullptr, 257, kPStringTypeDefault); }),
              "ulkPString::New, size must be <= 256!");
    ulkPString* s = ulkPString::New("S", "s", nullptr, 256, static_cast<ulkPStringType>(3));
    ASSERT_NE(s, nullptr);
    EXPECT_EQ(s->GetType(), 3);
    // Made without storage: one key of zero bytes.
    ASSERT_EQ(s->GetNumKeys(), 1);
    char text[256];
    std::memset(text, 'x', sizeof text);
    EXPECT_TRUE(s->GetValue(0.5, text, sizeof text));
    EXPECT_EQ(text[0], 0);
    EXPECT_EQ(text[255], 0);
    ulkParameter::Delete(s);
}

TEST(String, ValuesAndTooLongTexts) {
    char storage[8] = "abc";
    ulkPString* s = ulkPString::New("S", "s", storage, sizeof storage, kPStringTypeDefault);
    ASSERT_NE(s, nullptr);
    s->SetValue(0.5, "1234567");  // seven characters fit
    EXPECT_THROW(s->SetValue(0.5, "12345678"), const char*);
    EXPECT_THROW(s->SetValue(0.7, "12345678"), const char*);
    EXPECT_EQ(s->GetNumKeys(), 2);  // nothing added by the failed call
    char out[8];
    ASSERT_TRUE(s->GetValue(0.5, out, sizeof out));
    EXPECT_STREQ(out, "1234567");

    s->SetValue(0.0, "xyz");
    const unsigned char expected[8] = {'x', 'y', 'z', 0, 0, 0, 0, 0};
    EXPECT_EQ(std::memcmp(s->GetKeyValue(0), expected, 8), 0);
    s->SetValue(0.0, nullptr);
    const unsigned char zeros[8] = {};
    EXPECT_EQ(std::memcmp(s->GetKeyValue(0), zeros, 8), 0);
    ulkParameter::Delete(s);

    // Storage whose text does not end inside it is refused like a text too long.
    char full[4] = {'a', 'b', 'c', 'd'};
    EXPECT_THROW(ulkPString::New("S", "s", full, sizeof full, kPStringTypeDefault), const char*);
}

TEST(String, DestinationRules) {
    char storage[8] = "hello";
    ulkPString* s = ulkPString::New("S", "s", storage, sizeof storage, kPStringTypeDefault);
    char seven[7] = {};
    EXPECT_FALSE(s->GetValue(0.0, seven, sizeof seven));
    EXPECT_EQ(seven[0], 0);
    EXPECT_FALSE(s->GetValue(0.0, nullptr, 8));
    char eight[8];
    EXPECT_TRUE(s->GetValue(0.0, eight, sizeof eight));
    EXPECT_STREQ(eight, "hello");

    s->SetValue(0.5, "later");
    EXPECT_FALSE(s->Evaluate(0.6, eight, 8, -1));  // must be larger than the value
    char nine[9];
    std::memset(nine, 'x', sizeof nine);
    EXPECT_TRUE(s->Evaluate(0.6, nine, 9, -1));
    EXPECT_STREQ(nine, "later");
    EXPECT_EQ(nine[8], 'x');  // eight bytes copied
    EXPECT_TRUE(s->Evaluate(0.6, nullptr, 0, -1));
    EXPECT_STREQ(storage, "later");
    EXPECT_STREQ(s->ClassName(), "String");
    ulkParameter::Delete(s);

    ulkPString* none = ulkPString::New("N", "n", nullptr, 8, kPStringTypeDefault);
    EXPECT_FALSE(none->Evaluate(0.0, nullptr, 0, -1));
    ulkParameter::Delete(none);
}

// Strings: size limits, the buffer layout, exceptions that leave the value
// alone, and the two destination rules.
#include <cstring>
#include <string>

#include "param_test_helpers.h"

TEST(String, SizeLimitsAndTheEmptyFirstKey) {
    for (size_t size : {size_t{0}, size_t{257}})
        EXPECT_THROW(ulkPString::New("S", "s", nullptr, size, kPStringTypeDefault), const char*);
    // Storage whose text does not end inside it is refused like a text too long.
    char full[4] = {'a', 'b', 'c', 'd'};
    EXPECT_THROW(ulkPString::New("S", "s", full, sizeof full, kPStringTypeDefault), const char*);

    Owned<ulkPString> s(ulkPString::New("S", "s", nullptr, 256, kPStringTypeDefault));
    ASSERT_EQ(s->GetNumKeys(), 1);
    char text[256];
    std::memset(text, 'x', sizeof text);
    EXPECT_TRUE(s->GetValue(0.5, text, sizeof text));
    EXPECT_EQ(std::string(text, sizeof text), std::string(256, '\0'));
}

TEST(String, TooLongTextsThrowAndChangeNothing) {
    char storage[8] = "abc";
    Owned<ulkPString> s(ulkPString::New("S", "s", storage, sizeof storage, kPStringTypeDefault));
    s->SetValue(0.5, "1234567");  // seven characters fit
    EXPECT_THROW(s->SetValue(0.5, "12345678"), const char*);
    EXPECT_THROW(s->SetValue(0.7, "12345678"), const char*);
    EXPECT_EQ(s->GetNumKeys(), 2);
    char out[8];
    ASSERT_TRUE(s->GetValue(0.5, out, sizeof out));
    EXPECT_STREQ(out, "1234567");
    // The value is the text and zeros up to the size.
    s->SetValue(0.0, "xyz");
    EXPECT_EQ(std::memcmp(s->GetKeyValue(0), "xyz\0\0\0\0\0", 8), 0);
    s->SetValue(0.0, nullptr);
    EXPECT_EQ(std::memcmp(s->GetKeyValue(0), "\0\0\0\0\0\0\0\0", 8), 0);
}

TEST(String, DestinationRules) {
    char storage[8] = "hello";
    Owned<ulkPString> s(ulkPString::New("S", "s", storage, sizeof storage, kPStringTypeDefault));
    char seven[7] = {}, eight[8], nine[9];
    EXPECT_FALSE(s->GetValue(0.0, seven, sizeof seven));
    EXPECT_EQ(seven[0], 0);
    EXPECT_FALSE(s->GetValue(0.0, nullptr, 8));
    EXPECT_TRUE(s->GetValue(0.0, eight, sizeof eight));
    EXPECT_STREQ(eight, "hello");

    s->SetValue(0.5, "later");
    EXPECT_FALSE(s->Evaluate(0.6, eight, 8, -1));  // must be larger than the value
    std::memset(nine, 'x', sizeof nine);
    EXPECT_TRUE(s->Evaluate(0.6, nine, 9, -1));
    EXPECT_STREQ(nine, "later");
    EXPECT_EQ(nine[8], 'x');  // eight bytes copied
    EXPECT_TRUE(s->Evaluate(0.6, nullptr, 0, -1));
    EXPECT_STREQ(storage, "later");

    Owned<ulkPString> none(ulkPString::New("N", "n", nullptr, 8, kPStringTypeDefault));
    EXPECT_FALSE(none->Evaluate(0.0, nullptr, 0, -1));
}

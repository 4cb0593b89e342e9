// What the fuzzers found in the library, each checked where a host would meet it.
#include <gtest/gtest.h>

#include <cmath>

#include "ulk/ulk.h"

namespace {

ulkImage* MakeImage(ulkImgFormat code, int bits, int width, int height) {
    ulkImageFormat format;
    format.SetFormat(code);
    format.SetBitDepth(bits);
    ulkImage* image = ulkImage::New();
    image->SetFormat(&format);
    image->SetSize(width, height);
    return image;
}

// A buffer the library makes must hold every row it lays out; with a negative row
// delta the rows (and the alpha plane of formats 13 and 14) would lie before it.
TEST(ImageBuffer, NegativeRowDeltaIsRefusedByCreateBuffer) {
    for (ulkImgFormat code : {kImgFormatRGBA, kImgFormatUYVY, kImgFormatUYVYAlpha}) {
        for (int height : {1, 4}) {
            ulkImage* image = MakeImage(code, 8, 6, height);
            image->SetRowDelta(-64);
            void* buffer = image->CreateBuffer();
            EXPECT_EQ(buffer, nullptr) << code << " height " << height;
            image->FreeBuffer(buffer);
            ulkImage::Delete(image);
        }
    }
    // A positive row delta, even one shorter than a row, stays inside the buffer.
    ulkImage* image = MakeImage(kImgFormatRGBA, 8, 6, 4);
    image->SetRowDelta(3);
    void* buffer = image->CreateBuffer();
    ASSERT_NE(buffer, nullptr);
    image->FreeBuffer(buffer);
    ulkImage::Delete(image);
}

// A sample narrower than a byte still occupies one, the alpha plane's last included.
TEST(ImageBuffer, SubByteAlphaPlaneHoldsItsLastSample) {
    for (ulkImgFormat code : {kImgFormatUYVYAlpha, kImgFormatYUYVAlpha}) {
        ulkImage* image = MakeImage(code, 1, 40, 3);
        image->SetRowDelta(8);  // the alpha plane starts at 24 bytes
        unsigned char* buffer = static_cast<unsigned char*>(image->CreateBuffer());
        ASSERT_NE(buffer, nullptr);
        auto* last = static_cast<unsigned char*>(image->GetPixelPtr(39, 2, 4));
        ASSERT_NE(last, nullptr);
        *last = 0xA5;  // AddressSanitizer and valgrind catch a write past the buffer
        EXPECT_EQ(*last, 0xA5);
        image->FreeBuffer(buffer);
        ulkImage::Delete(image);
    }
}

// A key set at a time is found at that time, however large the time: scaling a huge
// time to whole steps and back must neither overflow nor move the key.
TEST(ParameterKeys, KeysAtHugeTimesAreFoundAtTheirTime) {
    for (double time : {-2.8e306, 1.4e228, 3.0e12, 1.0e8}) {
        double storage = 0.0;
        ulkPNumber* number = ulkPNumber::New("Gain", "gain", &storage, sizeof storage, -10.0, 10.0,
                                             0.5, kPNumberReal, false);
        ASSERT_NE(number, nullptr);
        ASSERT_TRUE(number->ParseValue(time, "4"));
        ASSERT_EQ(number->GetNumKeys(), 2) << time;
        EXPECT_GE(number->GetKeyIndex(time), 0) << time;
        EXPECT_EQ(number->GetValue(time), 4.0) << time;
        // Half way between the key at 0 and the huge one: a number, not NaN.
        EXPECT_TRUE(std::isfinite(number->GetValue(time / 2))) << time;

        ulkMemoryFile text;
        ASSERT_TRUE(number->WriteValue(time, &text));
        EXPECT_STREQ(text.GetText(), "4") << time;
        ulkParameter::Delete(number);
    }

    char storage[32] = {};
    ulkPString* label =
        ulkPString::New("Label", "label", storage, sizeof storage, kPStringTypeDefault);
    ASSERT_NE(label, nullptr);
    ASSERT_TRUE(label->ParseValue(1.4e228, "x"));
    ulkMemoryFile text;
    ASSERT_TRUE(label->WriteValue(1.4e228, &text));
    EXPECT_STREQ(text.GetText(), "x");
    ulkParameter::Delete(label);
}

}  // namespace

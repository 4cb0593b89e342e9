// ulkImage: channel layouts, placement in memory, buffers, copies and index checks.
#include "ulk/image/image.h"

#include <cstdint>
#include <cstring>
#include <memory>
#include <vector>

#include <gtest/gtest.h>

#include "alloc_hooks.h"

namespace {

// The image answers untyped addresses; the tests look at bytes.
unsigned char* Bytes(void* p) {
    return static_cast<unsigned char*>(p);
}


// An image that deletes itself, and optionally the buffer CreateBuffer gave it.
struct ImageDeleter {
    void operator()(ulkImage* image) const { ulkImage::Delete(image); }
};
using ImagePtr = std::unique_ptr<ulkImage, ImageDeleter>;

ImagePtr MakeImage(ulkImgFormat code, int bits, int width, int height) {
    ImagePtr image(ulkImage::New());
    ulkImageFormat format;
    format.SetFormat(code);
    format.SetBitDepth(bits);
    image->SetFormat(&format);
    image->SetSize(width, height);
    return image;
}

// A buffer with guard bytes on both sides, to see that nothing is written outside.
class GuardedBuffer {
  public:
    static constexpr size_t kGuard = 64;
    static constexpr unsigned char kFill = 0xA5;

    explicit GuardedBuffer(size_t size) : mSize(size), mBytes(size + 2 * kGuard, kFill) {}
    unsigned char* data() { return mBytes.data() + kGuard; }
    size_t size() const { return mSize; }
    bool GuardsIntact() const {
        for (size_t i = 0; i < kGuard; ++i)
            if (mBytes[i] != kFill || mBytes[kGuard + mSize + i] != kFill) return false;
        return true;
    }

  private:
    size_t mSize;
    std::vector<unsigned char> mBytes;
};

unsigned char Pattern(int x, int y, int c, int salt = 0) {
    return static_cast<unsigned char>(x * 7 + y * 31 + c * 59 + salt * 101 + 1);
}

// Writes Pattern through GetPixelPtr into every sample of channels 0 to count - 1.
void Paint(ulkImage* image, int columns, int salt = 0) {
    for (int c = 0; c < image->GetNumChannels(); ++c) {
        const int cols = c < 4 ? columns : image->GetWidth();
        for (int y = 0; y < image->GetHeight(); ++y)
            for (int x = 0; x < cols; ++x) *Bytes(image->GetPixelPtr(x, y, c)) = Pattern(x, y, c, salt);
    }
}

// Counts the samples of channels 0 to count - 1 that differ from Pattern.
int Mismatches(const ulkImage* image, int columns, int salt = 0) {
    int bad = 0;
    for (int c = 0; c < image->GetNumChannels(); ++c) {
        const int cols = c < 4 ? columns : image->GetWidth();
        for (int y = 0; y < image->GetHeight(); ++y)
            for (int x = 0; x < cols; ++x)
                if (*Bytes(image->GetPixelPtr(x, y, c)) != Pattern(x, y, c, salt)) ++bad;
    }
    return bad;
}

struct LayoutCase {
    ulkImgFormat code;
    int count;
    ulkImgChannel types[5];
    int pixelSamples[5];  // pixel delta in samples
};

const ulkImgChannel A = kImgChannelA, R = kImgChannelRV, G = kImgChannelG, B = kImgChannelBU,
                    Y0 = kImgChannelY0, Y1 = kImgChannelY1, N = kImgChannelNone;

const LayoutCase kLayouts[] = {
    {kImgFormatRGB, 3, {R, G, B, N, N}, {3, 3, 3, 0, 0}},
    {kImgFormatRGBA, 4, {R, G, B, A, N}, {4, 4, 4, 4, 0}},
    {kImgFormatBGR, 3, {B, G, R, N, N}, {3, 3, 3, 0, 0}},
    {kImgFormatABGR, 4, {A, B, G, R, N}, {4, 4, 4, 4, 0}},
    {kImgFormatARGB, 4, {A, R, G, B, N}, {4, 4, 4, 4, 0}},
    {kImgFormatBGRA, 4, {B, G, R, A, N}, {4, 4, 4, 4, 0}},
    {kImgFormatYUV422, 4, {B, Y0, R, Y1, N}, {4, 4, 4, 4, 0}},
    {kImgFormatYUYV, 4, {Y0, B, Y1, R, N}, {4, 4, 4, 4, 0}},
    {kImgFormatUYVY, 4, {B, Y0, R, Y1, N}, {4, 4, 4, 4, 0}},
    {kImgFormatUYVYAlpha, 5, {B, Y0, R, Y1, A}, {4, 4, 4, 4, 1}},
    {kImgFormatYUYVAlpha, 5, {Y0, B, Y1, R, A}, {4, 4, 4, 4, 1}},
};

}  // namespace

// ------------------------------------------------------------------ creation and layouts

TEST(ImageTest, NewImageIsEmpty) {
    ImagePtr image(ulkImage::New());
    ASSERT_NE(image, nullptr);
    EXPECT_EQ(image->GetNumChannels(), 0);
    EXPECT_EQ(image->GetWidth(), 0);
    EXPECT_EQ(image->GetHeight(), 0);
    EXPECT_EQ(image->GetOrientation(), 0);
    EXPECT_EQ(image->GetImgFormat(), -1);
    EXPECT_EQ(image->GetColorspace(), -1);
    for (int i = 0; i < 8; ++i) {
        EXPECT_EQ(Bytes(image->GetChannelPtr(i)), nullptr);
        EXPECT_EQ(image->GetChannelType(i), kImgChannelNone);
        EXPECT_EQ(image->GetChannelSize(i), 0);
        EXPECT_EQ(image->GetChannelDelta(i), 0);
        EXPECT_EQ(image->GetPixelDelta(i), 0);
        EXPECT_EQ(image->GetRowDelta(i), 0);
    }
    EXPECT_EQ(image->GetChannel(kImgChannelA), -1);
    EXPECT_EQ(image->GetChannel(kImgChannelNone), 0);
    EXPECT_STREQ(image->ClassName(), "Image");
}

TEST(ImageTest, NewAnswersNullWithoutMemory) {
    alloc_hooks::gFailNext = true;
    EXPECT_EQ(ulkImage::New(), nullptr);
    ulkImage::Delete(nullptr);  // ignored
}

TEST(ImageTest, EveryFormatCodeLaysOutItsChannels) {
    for (int bits : {8, 16}) {
        const int s = bits / 8;
        for (const LayoutCase& layout : kLayouts) {
            SCOPED_TRACE(testing::Message() << "format " << layout.code << " at " << bits);
            ImagePtr image = MakeImage(layout.code, bits, 8, 2);
            ASSERT_EQ(image->GetNumChannels(), layout.count);
            for (int i = 0; i < layout.count; ++i) {
                EXPECT_EQ(image->GetChannelType(i), layout.types[i]) << i;
                EXPECT_EQ(image->GetChannelSize(i), bits) << i;
                EXPECT_EQ(image->GetChannelDelta(i), s) << i;
                EXPECT_EQ(image->GetPixelDelta(i), layout.pixelSamples[i] * s) << i;
                EXPECT_EQ(Bytes(image->GetChannelPtr(i)), nullptr) << "SetFormat places nothing";
                EXPECT_EQ(image->GetRowDelta(i), 0) << "SetFormat sets no row delta";
            }
            for (int i = layout.count; i < 8; ++i)
                EXPECT_EQ(image->GetChannelType(i), kImgChannelNone) << i;
        }
    }
}

TEST(ImageTest, TenAndTwelveBitSamplesTakeOneByte) {
    ImagePtr image = MakeImage(kImgFormatRGBA, 10, 4, 1);
    EXPECT_EQ(image->GetChannelSize(0), 10);
    EXPECT_EQ(image->GetChannelDelta(0), 1);
    EXPECT_EQ(image->GetPixelDelta(0), 4);
}

TEST(ImageTest, FormatsWithoutLayoutKeepThePreviousOne) {
    for (ulkImgFormat code : {kImgFormatYUV, kImgFormatYUVA, kImgFormatAVUY, kImgFormatAny,
                              static_cast<ulkImgFormat>(15), static_cast<ulkImgFormat>(-2)}) {
        ImagePtr image = MakeImage(kImgFormatBGR, 8, 4, 4);
        ulkImageFormat format;
        format.SetFormat(code);
        image->SetFormat(&format);
        EXPECT_EQ(image->GetImgFormat(), code);
        EXPECT_EQ(image->GetNumChannels(), 3);
        EXPECT_EQ(image->GetChannelType(0), kImgChannelBU);
        EXPECT_EQ(image->GetPixelDelta(2), 3);
    }
}

TEST(ImageTest, FormatWithFewerChannelsEmptiesTheRest) {
    ImagePtr image = MakeImage(kImgFormatUYVYAlpha, 8, 4, 4);
    ASSERT_EQ(image->GetChannel(kImgChannelA), 4);
    ulkImageFormat rgb;
    rgb.SetFormat(kImgFormatRGB);
    image->SetFormat(&rgb);
    EXPECT_EQ(image->GetNumChannels(), 3);
    EXPECT_EQ(image->GetChannel(kImgChannelA), -1);
    EXPECT_EQ(image->GetChannel(kImgChannelY1), -1);
    EXPECT_EQ(image->GetChannel(kImgChannelNone), 3);
    EXPECT_EQ(image->GetPixelDelta(4), 0);
}

TEST(ImageTest, GetChannelFindsTheFirstSlot) {
    ImagePtr rgb = MakeImage(kImgFormatRGB, 8, 1, 1);
    EXPECT_EQ(rgb->GetChannel(kImgChannelRV), 0);
    EXPECT_EQ(rgb->GetChannel(kImgChannelBU), 2);
    EXPECT_EQ(rgb->GetChannel(kImgChannelA), -1);
    EXPECT_EQ(rgb->GetChannel(kImgChannelNone), 3);
    ImagePtr yuyv = MakeImage(kImgFormatYUYV, 8, 2, 1);
    EXPECT_EQ(yuyv->GetChannel(kImgChannelY1), 2);
    EXPECT_EQ(yuyv->GetChannel(kImgChannelRV), 3);
}

TEST(ImageTest, ChangingTheEmbeddedFormatDoesNotLayOutAgain) {
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 2, 2);
    image->GetFormat()->SetFormat(kImgFormatRGBA);
    EXPECT_EQ(image->GetImgFormat(), kImgFormatRGBA);
    EXPECT_EQ(image->GetNumChannels(), 3);
    // Giving the image its own format lays it out and keeps the order text.
    image->GetFormat()->SetOrder("rgba-custom");
    image->SetFormat(image->GetFormat());
    EXPECT_EQ(image->GetNumChannels(), 4);
    EXPECT_STREQ(image->GetFormat()->GetOrder(), "rgba-custom");
    const ulkImage& view = *image;
    EXPECT_EQ(view.GetFormat(), image->GetFormat());
}

// ------------------------------------------------------------------ placement

TEST(ImageTest, Rgba8At640x480) {
    ImagePtr image = MakeImage(kImgFormatRGBA, 8, 640, 480);
    EXPECT_EQ(image->GetChannel(kImgChannelA), 3);
    alloc_hooks::gLastArraySize = 0;
    unsigned char* p = Bytes(image->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(alloc_hooks::gLastArraySize, 1228800u);
    for (int i = 0; i < 4; ++i) {
        EXPECT_EQ(Bytes(image->GetChannelPtr(i)), p + i);
        EXPECT_EQ(image->GetRowDelta(i), 2560);
    }
    EXPECT_EQ(Bytes(image->GetPixelPtr(1, 1, 0)), p + 2564);
    EXPECT_EQ(Bytes(image->GetPixelPtr(639, 479, 3)), p + 1228799);
    EXPECT_EQ(Bytes(image->GetRowPtr(2, 1)), p + 5121);

    // Real pixels: what goes in through channel A of pixel (x, y) is byte 4x + 3 of row y.
    Paint(image.get(), 640);
    EXPECT_EQ(p[2560 * 7 + 4 * 5 + 3], Pattern(5, 7, 3));
    EXPECT_EQ(p[2560 * 479 + 4 * 639 + 0], Pattern(639, 479, 0));
    EXPECT_EQ(Mismatches(image.get(), 640), 0);
    image->FreeBuffer(p);
}

TEST(ImageTest, Bgr16PlacesTwoByteSamples) {
    ImagePtr image = MakeImage(kImgFormatBGR, 16, 3, 2);
    std::vector<uint16_t> pixels(3 * 3 * 2);
    unsigned char* p = reinterpret_cast<unsigned char*>(pixels.data());
    image->SetData(p);
    EXPECT_EQ(Bytes(image->GetChannelPtr(0)), p);
    EXPECT_EQ(Bytes(image->GetChannelPtr(1)), p + 2);
    EXPECT_EQ(Bytes(image->GetChannelPtr(2)), p + 4);
    EXPECT_EQ(image->GetPixelDelta(0), 6);
    EXPECT_EQ(image->GetChannelDelta(0), 2);
    EXPECT_EQ(image->GetRowDelta(2), 18);
    EXPECT_EQ(image->GetChannelType(0), kImgChannelBU);
    EXPECT_EQ(image->GetChannelType(2), kImgChannelRV);
    *reinterpret_cast<uint16_t*>(Bytes(image->GetPixelPtr(2, 1, image->GetChannel(kImgChannelRV)))) =
        0xBEEF;
    EXPECT_EQ(pixels[3 * 3 + 3 * 2 + 2], 0xBEEF);
}

TEST(ImageTest, Uyvy8PairsOfPixels) {
    ImagePtr image = MakeImage(kImgFormatUYVY, 8, 720, 486);
    alloc_hooks::gLastArraySize = 0;
    unsigned char* p = Bytes(image->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(alloc_hooks::gLastArraySize, 699840u);
    for (int i = 0; i < 4; ++i) {
        EXPECT_EQ(image->GetPixelDelta(i), 4);
        EXPECT_EQ(image->GetRowDelta(i), 1440);
        EXPECT_EQ(Bytes(image->GetChannelPtr(i)), p + i);
    }
    // Pair x of row y is bytes 4x to 4x + 3: U Y0 V Y1.
    *Bytes(image->GetPixelPtr(359, 485, image->GetChannel(kImgChannelY1))) = 0x42;
    EXPECT_EQ(p[1440 * 485 + 4 * 359 + 3], 0x42);
    EXPECT_EQ(Bytes(image->GetPixelPtr(360, 0, 0)), nullptr) << "pairs end at width / 2";
    EXPECT_EQ(Bytes(image->GetPixelPtr(719, 0, 1)), nullptr);
    image->FreeBuffer(p);
}

TEST(ImageTest, UyvyAlphaHasAnAlphaPlane) {
    ImagePtr image = MakeImage(kImgFormatUYVYAlpha, 8, 720, 486);
    alloc_hooks::gLastArraySize = 0;
    unsigned char* p = Bytes(image->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(alloc_hooks::gLastArraySize, 1049760u);
    EXPECT_EQ(image->GetNumChannels(), 5);
    for (int i = 0; i < 4; ++i) {
        EXPECT_EQ(Bytes(image->GetChannelPtr(i)), p + i);
        EXPECT_EQ(image->GetRowDelta(i), 1440);
    }
    EXPECT_EQ(Bytes(image->GetChannelPtr(4)), p + 699840);
    EXPECT_EQ(image->GetPixelDelta(4), 1);
    EXPECT_EQ(image->GetRowDelta(4), 720);
    EXPECT_EQ(Bytes(image->GetPixelPtr(719, 485, 4)), p + 1049759) << "the last byte of the buffer";
    EXPECT_NE(Bytes(image->GetPixelPtr(719, 485, 4)), nullptr) << "the alpha plane counts pixels";
    Paint(image.get(), 360);
    EXPECT_EQ(Mismatches(image.get(), 360), 0);
    EXPECT_EQ(p[699840 + 720 * 3 + 10], Pattern(10, 3, 4));
    image->FreeBuffer(p);
}

TEST(ImageTest, SetRowDeltaHoldsForOneSetData) {
    ImagePtr image = MakeImage(kImgFormatRGBA, 8, 640, 480);
    std::vector<unsigned char> pixels(4096 * 480);
    image->SetRowDelta(4096);
    image->SetData(pixels.data());
    for (int i = 0; i < 4; ++i) EXPECT_EQ(image->GetRowDelta(i), 4096);
    EXPECT_EQ(image->GetRowDelta(4), 0) << "slots beyond the count are not written";
    EXPECT_EQ(Bytes(image->GetPixelPtr(1, 1, 0)), pixels.data() + 4096 + 4);
    image->SetData(pixels.data());
    for (int i = 0; i < 4; ++i) EXPECT_EQ(image->GetRowDelta(i), 2560);
}

TEST(ImageTest, YuyvAlphaAlphaPlaneFollowsPaddedRows) {
    ImagePtr image = MakeImage(kImgFormatYUYVAlpha, 8, 720, 486);
    GuardedBuffer buffer(3000 * 486 + 720 * 486);
    image->SetRowDelta(3000);
    image->SetData(buffer.data());
    for (int i = 0; i < 4; ++i) EXPECT_EQ(image->GetRowDelta(i), 3000);
    EXPECT_EQ(image->GetRowDelta(4), 720);
    EXPECT_EQ(Bytes(image->GetChannelPtr(4)), buffer.data() + 3000 * 486);
    Paint(image.get(), 360);
    EXPECT_EQ(Mismatches(image.get(), 360), 0) << "the planes do not overlap";
    EXPECT_TRUE(buffer.GuardsIntact());
}

TEST(ImageTest, FormatsWithoutLayoutPlaceNothing) {
    ImagePtr image = MakeImage(kImgFormatYUV, 8, 16, 16);
    unsigned char pixels[16];
    image->SetData(pixels);
    for (int i = 0; i < 8; ++i) EXPECT_EQ(Bytes(image->GetChannelPtr(i)), nullptr);
    alloc_hooks::gLastArraySize = 123;
    unsigned char* buffer = Bytes(image->CreateBuffer());
    EXPECT_NE(buffer, nullptr);
    EXPECT_EQ(alloc_hooks::gLastArraySize, 0u) << "a zero-byte allocation";
    image->FreeBuffer(buffer);
}

TEST(ImageTest, GetPixelPtrBounds) {
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 5, 3);
    unsigned char* p = Bytes(image->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(Bytes(image->GetPixelPtr(5, 0, 0)), nullptr);
    EXPECT_EQ(Bytes(image->GetPixelPtr(0, 3, 0)), nullptr);
    EXPECT_EQ(Bytes(image->GetPixelPtr(-1, 0, 0)), nullptr);
    EXPECT_EQ(Bytes(image->GetPixelPtr(0, -1, 0)), nullptr);
    EXPECT_EQ(Bytes(image->GetPixelPtr(4, 2, 2)), p + 15 * 2 + 12 + 2);
    EXPECT_EQ(Bytes(image->GetPixelPtr(0, 0, 0)), p);
    image->FreeBuffer(p);
}

TEST(ImageTest, CreateBufferMakesRoomForPaddedRows) {
    // With a row delta the buffer holds row delta(0) x height bytes, so every pixel lies inside.
    ImagePtr image = MakeImage(kImgFormatRGBA, 8, 10, 4);
    image->SetRowDelta(64);
    alloc_hooks::gLastArraySize = 0;
    unsigned char* p = Bytes(image->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(alloc_hooks::gLastArraySize, 64u * 4);
    EXPECT_EQ(image->GetRowDelta(0), 64);
    EXPECT_EQ(Bytes(image->GetPixelPtr(9, 3, 3)), p + 64 * 3 + 36 + 3);
    image->FreeBuffer(p);

    ImagePtr alpha = MakeImage(kImgFormatUYVYAlpha, 8, 8, 4);
    alpha->SetRowDelta(40);
    alloc_hooks::gLastArraySize = 0;
    p = Bytes(alpha->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_EQ(alloc_hooks::gLastArraySize, 40u * 4 + 8 * 4);
    EXPECT_EQ(Bytes(alpha->GetChannelPtr(4)), p + 160);
    EXPECT_EQ(Bytes(alpha->GetPixelPtr(7, 3, 4)), p + 160 + 31);
    alpha->FreeBuffer(p);

    // A channel count set below the layout's pixel step still gets room for every pixel.
    ImagePtr fewer = MakeImage(kImgFormatRGBA, 8, 10, 4);
    fewer->SetNumChannels(3);
    alloc_hooks::gLastArraySize = 0;
    p = Bytes(fewer->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_GE(alloc_hooks::gLastArraySize, size_t(Bytes(fewer->GetPixelPtr(9, 3, 2)) - p + 1));
    fewer->FreeBuffer(p);
}

TEST(ImageTest, CreateBufferFailureLeavesTheImage) {
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 4, 4);
    unsigned char pixels[48];
    image->SetData(pixels);
    alloc_hooks::gFailNext = true;
    EXPECT_EQ(Bytes(image->CreateBuffer()), nullptr);
    EXPECT_EQ(Bytes(image->GetChannelPtr(0)), pixels);

    ImagePtr huge = MakeImage(kImgFormatRGBA, 8, 1 << 30, 1 << 30);
    EXPECT_EQ(Bytes(huge->CreateBuffer()), nullptr);
    EXPECT_EQ(Bytes(huge->GetChannelPtr(0)), nullptr);
}

// ------------------------------------------------------------------ index checks

TEST(ImageTest, ChannelIndexesOutsideTheSlots) {
    ImagePtr image = MakeImage(kImgFormatRGBA, 8, 4, 4);
    unsigned char* p = Bytes(image->CreateBuffer());
    for (int index : {-1, 8, 9, 1000, -1000}) {
        EXPECT_EQ(image->GetChannelType(index), kImgChannelNone) << index;
        EXPECT_EQ(image->GetChannelSize(index), 0) << index;
        EXPECT_EQ(Bytes(image->GetChannelPtr(index)), nullptr) << index;
        EXPECT_EQ(image->GetChannelDelta(index), 0) << index;
        EXPECT_EQ(image->GetPixelDelta(index), 0) << index;
        EXPECT_EQ(image->GetRowDelta(index), 0) << index;
        EXPECT_EQ(Bytes(image->GetRowPtr(0, index)), nullptr) << index;
        EXPECT_EQ(Bytes(image->GetPixelPtr(0, 0, index)), nullptr) << index;
    }
    image->FreeBuffer(p);
}

TEST(ImageTest, SetNumChannelsKeepsAtMostEight) {
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 4, 4);
    image->SetNumChannels(9);
    EXPECT_EQ(image->GetNumChannels(), 8);
    image->SetNumChannels(1000);
    EXPECT_EQ(image->GetNumChannels(), 8);
    image->SetRowDelta(99);  // writes the eight slots and no more
    EXPECT_EQ(image->GetRowDelta(7), 99);
    image->SetNumChannels(2);
    EXPECT_EQ(image->GetNumChannels(), 2);
    EXPECT_EQ(image->GetChannelType(2), kImgChannelBU) << "SetNumChannels changes nothing else";
}

TEST(ImageTest, SetRowDeltaWithoutChannelsStillMarksIt) {
    ImagePtr image(ulkImage::New());
    image->SetRowDelta(100);
    EXPECT_EQ(image->GetRowDelta(0), 0);
    EXPECT_TRUE(image->mRowDeltaSet);
    ulkImageFormat rgb;
    rgb.SetFormat(kImgFormatRGB);
    image->SetFormat(&rgb);
    image->SetSize(2, 2);
    unsigned char pixels[12];
    image->SetData(pixels);
    EXPECT_EQ(image->GetRowDelta(0), 0) << "the marked (zero) row delta was kept once";
    EXPECT_FALSE(image->mRowDeltaSet);
}

// ------------------------------------------------------------------ copies of images

TEST(ImageTest, CopiesSharePixelsButNotFormatTexts) {
    ImagePtr image = MakeImage(kImgFormatARGB, 8, 8, 8);
    image->mOrientation = static_cast<ulkOrientation>(3);
    image->SetRowDelta(40);
    unsigned char* p = Bytes(image->CreateBuffer());
    image->SetRowDelta(40);  // a pending row delta travels with the copy

    ulkImage* copy = new ulkImage(*image);
    EXPECT_EQ(Bytes(copy->GetChannelPtr(0)), p);
    EXPECT_EQ(copy->GetRowDelta(3), 40);
    EXPECT_EQ(copy->GetOrientation(), 3);
    EXPECT_EQ(copy->GetWidth(), 8);
    EXPECT_EQ(copy->GetNumChannels(), 4);
    EXPECT_TRUE(copy->mRowDeltaSet);
    EXPECT_STREQ(copy->GetFormat()->GetOrder(), "ARGB");
    EXPECT_NE(copy->GetFormat()->GetOrder(), image->GetFormat()->GetOrder());
    EXPECT_EQ(copy->mList, nullptr);

    *Bytes(copy->GetPixelPtr(2, 3, 0)) = 0x5A;
    EXPECT_EQ(*Bytes(image->GetPixelPtr(2, 3, 0)), 0x5A) << "one pixel buffer";

    ImagePtr assigned = MakeImage(kImgFormatUYVY, 16, 1, 1);
    *assigned = *copy;
    EXPECT_EQ(assigned->GetImgFormat(), kImgFormatARGB);
    EXPECT_EQ(assigned->GetChannelType(0), kImgChannelA);
    EXPECT_EQ(Bytes(assigned->GetChannelPtr(3)), p + 3);
    EXPECT_NE(assigned->GetFormat()->GetOrder(), copy->GetFormat()->GetOrder());
    *assigned = *assigned;
    EXPECT_STREQ(assigned->GetFormat()->GetOrder(), "ARGB");

    ulkImage::Delete(copy);  // releases its own text and never the pixels
    EXPECT_STREQ(image->GetFormat()->GetOrder(), "ARGB");
    EXPECT_EQ(*Bytes(image->GetPixelPtr(2, 3, 0)), 0x5A);
    image->FreeBuffer(p);
}

// ------------------------------------------------------------------ Copy

TEST(ImageCopyTest, TightImagesCopyEveryByte) {
    ImagePtr from = MakeImage(kImgFormatRGB, 8, 7, 5);
    ImagePtr to = MakeImage(kImgFormatRGB, 8, 7, 5);
    unsigned char* a = Bytes(from->CreateBuffer());
    GuardedBuffer b(7 * 5 * 3);
    to->SetData(b.data());
    Paint(from.get(), 7);
    EXPECT_TRUE(to->Copy(from.get(), nullptr));
    EXPECT_EQ(std::memcmp(a, b.data(), b.size()), 0);
    EXPECT_TRUE(b.GuardsIntact());
    from->FreeBuffer(a);
}

TEST(ImageCopyTest, DifferentRowDeltasCopyRowByRow) {
    // Tight source, padded destination: the padding stays untouched.
    ImagePtr from = MakeImage(kImgFormatBGRA, 8, 9, 6);
    ImagePtr to = MakeImage(kImgFormatBGRA, 8, 9, 6);
    unsigned char* a = Bytes(from->CreateBuffer());
    Paint(from.get(), 9);
    GuardedBuffer b(50 * 6);
    std::memset(b.data(), 0xEE, b.size());
    to->SetRowDelta(50);
    to->SetData(b.data());
    EXPECT_TRUE(to->Copy(from.get(), nullptr));
    EXPECT_EQ(Mismatches(to.get(), 9), 0);
    for (int y = 0; y < 6; ++y)
        for (int x = 36; x < 50; ++x) EXPECT_EQ(b.data()[50 * y + x], 0xEE);
    EXPECT_TRUE(b.GuardsIntact());

    // Padded source, tight destination with exactly the tight size.
    GuardedBuffer c(9 * 6 * 4);
    ImagePtr back = MakeImage(kImgFormatBGRA, 8, 9, 6);
    back->SetData(c.data());
    EXPECT_TRUE(back->Copy(to.get(), nullptr));
    EXPECT_EQ(Mismatches(back.get(), 9), 0);
    EXPECT_EQ(std::memcmp(a, c.data(), c.size()), 0);
    EXPECT_TRUE(c.GuardsIntact());
    from->FreeBuffer(a);
}

TEST(ImageCopyTest, BothPlanesOfAlphaFormats) {
    ImagePtr from = MakeImage(kImgFormatUYVYAlpha, 8, 10, 4);
    unsigned char* a = Bytes(from->CreateBuffer());
    Paint(from.get(), 5, 2);
    ImagePtr to = MakeImage(kImgFormatUYVYAlpha, 8, 10, 4);
    GuardedBuffer b(32 * 4 + 10 * 4);
    to->SetRowDelta(32);
    to->SetData(b.data());
    ulkBounds region = {2, 1, 3, 2};
    EXPECT_TRUE(to->Copy(from.get(), &region)) << "the region is not consulted";
    EXPECT_EQ(Mismatches(to.get(), 5, 2), 0);
    EXPECT_TRUE(b.GuardsIntact());
    from->FreeBuffer(a);
}

TEST(ImageCopyTest, SixteenBitPackedImages) {
    ImagePtr from = MakeImage(kImgFormatYUYV, 16, 6, 3);
    ImagePtr to = MakeImage(kImgFormatYUYV, 16, 6, 3);
    unsigned char* a = Bytes(from->CreateBuffer());
    for (int i = 0; i < 6 * 3 * 4; ++i) a[i] = static_cast<unsigned char>(i * 3 + 1);
    GuardedBuffer b(6 * 3 * 4);
    to->SetData(b.data());
    EXPECT_TRUE(to->Copy(from.get(), nullptr));
    EXPECT_EQ(std::memcmp(a, b.data(), b.size()), 0);
    EXPECT_TRUE(b.GuardsIntact());
    from->FreeBuffer(a);
}

TEST(ImageCopyTest, MismatchesAreRefusedAndCopyNothing) {
    ImagePtr to = MakeImage(kImgFormatRGBA, 8, 4, 4);
    GuardedBuffer b(64);
    std::memset(b.data(), 0x11, b.size());
    to->SetData(b.data());
    auto untouched = [&] {
        for (size_t i = 0; i < b.size(); ++i)
            if (b.data()[i] != 0x11) return false;
        return b.GuardsIntact();
    };

    EXPECT_FALSE(to->Copy(nullptr, nullptr));

    struct Case {
        ulkImgFormat code;
        int bits, width, height;
    };
    for (const Case& c : {Case{kImgFormatBGRA, 8, 4, 4}, Case{kImgFormatRGBA, 16, 4, 4},
                          Case{kImgFormatRGBA, 8, 5, 4}, Case{kImgFormatRGBA, 8, 4, 3},
                          Case{kImgFormatRGBA, 8, 8, 8}}) {
        ImagePtr from = MakeImage(c.code, c.bits, c.width, c.height);
        unsigned char* a = Bytes(from->CreateBuffer());
        Paint(from.get(), c.width);
        EXPECT_FALSE(to->Copy(from.get(), nullptr)) << c.code << " " << c.bits << " " << c.width;
        from->FreeBuffer(a);
    }
    EXPECT_TRUE(untouched());

    // No data on either side.
    ImagePtr empty = MakeImage(kImgFormatRGBA, 8, 4, 4);
    EXPECT_FALSE(to->Copy(empty.get(), nullptr));
    EXPECT_FALSE(empty->Copy(to.get(), nullptr));
    ImagePtr bare(ulkImage::New());
    ImagePtr bare2(ulkImage::New());
    EXPECT_FALSE(bare->Copy(bare2.get(), nullptr));

    // The same format code with a different layout (the depth changed without SetFormat).
    ImagePtr odd = MakeImage(kImgFormatRGBA, 8, 4, 4);
    odd->GetFormat()->SetBitDepth(8);
    odd->SetNumChannels(4);
    odd->mPixelDelta[0] = 3;
    unsigned char pixels[64] = {};
    odd->SetData(pixels);
    EXPECT_FALSE(to->Copy(odd.get(), nullptr));
    EXPECT_TRUE(untouched());
}

TEST(ImageCopyTest, CopyOntoItselfChangesNothing) {
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 3, 3);
    unsigned char* p = Bytes(image->CreateBuffer());
    Paint(image.get(), 3);
    EXPECT_TRUE(image->Copy(image.get(), nullptr));
    EXPECT_EQ(Mismatches(image.get(), 3), 0);
    image->FreeBuffer(p);
}

// ulkImage: channel layouts, placement in memory, buffers, copies and index checks.
#include "ulk/image/image.h"

#include <algorithm>
#include <cstdint>
#include <memory>
#include <new>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

// The image test program replaces the non-throwing array allocation libulk uses, to see how
// many bytes CreateBuffer asked for and to make the next allocation fail.
namespace {
size_t gLastArraySize = 0;
bool gFailNext = false;
}  // namespace

void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    gLastArraySize = size;
    // Sizes no machine has are refused without a sanitizer's report.
    if (size > (size_t{1} << 40)) return nullptr;
    if (gFailNext) {
        gFailNext = false;
        return nullptr;
    }
    try {
        return ::operator new[](size);
    } catch (...) {
        return nullptr;
    }
}

namespace {

unsigned char* Bytes(void* p) {
    return static_cast<unsigned char*>(p);
}

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

// A buffer of a fill byte with guard bytes on both sides, to see that nothing is written outside.
class GuardedBuffer {
  public:
    static constexpr size_t kGuard = 64;
    explicit GuardedBuffer(size_t size, unsigned char fill = 0xA5)
        : mSize(size), mFill(fill), mBytes(size + 2 * kGuard, fill) {}
    unsigned char* data() { return mBytes.data() + kGuard; }
    bool GuardsIntact() const {
        for (size_t i = 0; i < kGuard; ++i)
            if (mBytes[i] != mFill || mBytes[kGuard + mSize + i] != mFill) return false;
        return true;
    }

  private:
    size_t mSize;
    unsigned char mFill;
    std::vector<unsigned char> mBytes;
};

unsigned char Pattern(int x, int y, int c, int k) {
    return static_cast<unsigned char>(x * 7 + y * 31 + c * 59 + k * 101 + 1);
}

// Visits every byte of every sample of every channel through GetPixelPtr (packed 4:2:2
// channels count pairs) and writes Pattern, or counts the bytes that differ from it.
int PaintOrCount(ulkImage* image, bool paint) {
    const int32_t code = image->GetImgFormat();
    const bool packed =
        code >= kImgFormatYUV422 && code != kImgFormatYUVA && code != kImgFormatAVUY;
    const int bytes = image->GetChannelSize(0) / 8;
    int bad = 0;
    for (int c = 0; c < image->GetNumChannels(); ++c) {
        const int columns = packed && c < 4 ? image->GetWidth() / 2 : image->GetWidth();
        for (int y = 0; y < image->GetHeight(); ++y)
            for (int x = 0; x < columns; ++x)
                for (int k = 0; k < bytes; ++k) {
                    unsigned char* sample = Bytes(image->GetPixelPtr(x, y, c)) + k;
                    if (paint)
                        *sample = Pattern(x, y, c, k);
                    else if (*sample != Pattern(x, y, c, k))
                        ++bad;
                }
    }
    return bad;
}
const ulkImgChannel A = kImgChannelA, R = kImgChannelRV, G = kImgChannelG, B = kImgChannelBU,
                    Y0 = kImgChannelY0, Y1 = kImgChannelY1, N = kImgChannelNone;

}  // namespace

TEST(ImageTest, EveryFormatCodeLaysOutItsChannels) {
    const struct {
        ulkImgFormat code;
        int count;
        ulkImgChannel types[5];
        int pixelSamples;  // pixel delta of slots 0 to 3, in samples; the alpha plane's is 1
    } layouts[] = {{kImgFormatRGB, 3, {R, G, B, N, N}, 3},
                   {kImgFormatRGBA, 4, {R, G, B, A, N}, 4},
                   {kImgFormatBGR, 3, {B, G, R, N, N}, 3},
                   {kImgFormatABGR, 4, {A, B, G, R, N}, 4},
                   {kImgFormatARGB, 4, {A, R, G, B, N}, 4},
                   {kImgFormatBGRA, 4, {B, G, R, A, N}, 4},
                   {kImgFormatYUV422, 4, {B, Y0, R, Y1, N}, 4},
                   {kImgFormatYUYV, 4, {Y0, B, Y1, R, N}, 4},
                   {kImgFormatUYVY, 4, {B, Y0, R, Y1, N}, 4},
                   {kImgFormatUYVYAlpha, 5, {B, Y0, R, Y1, A}, 4},
                   {kImgFormatYUYVAlpha, 5, {Y0, B, Y1, R, A}, 4}};
    for (int bits : {8, 10, 16}) {
        const int s = bits / 8;  // 10-bit samples take one byte
        for (const auto& layout : layouts) {
            SCOPED_TRACE(testing::Message() << "format " << layout.code << " at " << bits);
            // Laid out over a previous layout with more channels: its extra slots are emptied.
            ImagePtr image = MakeImage(kImgFormatUYVYAlpha, 8, 8, 2);
            ulkImageFormat format;
            format.SetFormat(layout.code);
            format.SetBitDepth(bits);
            image->SetFormat(&format);
            ASSERT_EQ(image->GetNumChannels(), layout.count);
            for (int i = 0; i < 8; ++i) {
                EXPECT_EQ(image->GetChannelType(i), i < layout.count ? layout.types[i] : N) << i;
                EXPECT_EQ(image->GetChannelSize(i), i < layout.count ? bits : 0) << i;
                EXPECT_EQ(image->GetChannelDelta(i), i < layout.count ? s : 0) << i;
                EXPECT_EQ(image->GetPixelDelta(i),
                          i < layout.count ? (i < 4 ? layout.pixelSamples : 1) * s : 0)
                    << i;
            }
            EXPECT_EQ(image->GetChannel(layout.types[3]), 3) << "the first slot of a type";
        }
    }
}

TEST(ImageTest, SetFormatLaysOutOnlyCodesWithALayout) {
    for (int32_t code : {7, 11, 12, 0, 15, -2}) {
        ImagePtr image = MakeImage(kImgFormatBGR, 8, 4, 4);
        ulkImageFormat format;
        format.SetFormat(static_cast<ulkImgFormat>(code));
        image->SetFormat(&format);
        EXPECT_EQ(image->GetImgFormat(), code);
        EXPECT_EQ(image->GetNumChannels(), 3) << code;
        EXPECT_EQ(image->GetChannelType(0), kImgChannelBU) << code;
    }
    // Changing the embedded format does not lay out again; handing it back does, keeping its text.
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 2, 2);
    image->GetFormat()->SetFormat(kImgFormatRGBA);
    EXPECT_EQ(image->GetNumChannels(), 3);
    image->GetFormat()->SetOrder("rgba-custom");
    image->SetFormat(image->GetFormat());
    EXPECT_EQ(image->GetNumChannels(), 4);
    EXPECT_STREQ(image->GetFormat()->GetOrder(), "rgba-custom");
}

TEST(ImageTest, CreateBufferHoldsEveryPixelOfEveryLayout) {
    const struct {
        ulkImgFormat code;
        int bits, width, height, rowDelta;  // rowDelta 0: none set
        size_t bytes;                       // what CreateBuffer allocates
        int rows;                           // row delta of the placed slots
        long alphaPlane;                    // offset of the alpha plane, or -1
    } cases[] = {{kImgFormatRGBA, 8, 640, 480, 0, 1228800, 2560, -1},
                 {kImgFormatBGR, 16, 3, 2, 0, 36, 18, -1},
                 {kImgFormatUYVY, 8, 720, 486, 0, 699840, 1440, -1},
                 {kImgFormatYUYV, 16, 6, 3, 0, 72, 24, -1},
                 {kImgFormatUYVYAlpha, 8, 720, 486, 0, 1049760, 1440, 699840},
                 {kImgFormatRGBA, 8, 10, 4, 64, 256, 64, -1},
                 {kImgFormatUYVYAlpha, 8, 8, 4, 40, 40 * 4 + 8 * 4, 40, 160},
                 {kImgFormatYUYVAlpha, 8, 10, 3, 0, 60 + 30, 20, 60}};
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << "format " << c.code << " " << c.width << "x" << c.height
                                        << " row delta " << c.rowDelta);
        ImagePtr image = MakeImage(c.code, c.bits, c.width, c.height);
        if (c.rowDelta) image->SetRowDelta(c.rowDelta);
        gLastArraySize = 0;
        unsigned char* p = Bytes(image->CreateBuffer());
        ASSERT_NE(p, nullptr);
        EXPECT_EQ(gLastArraySize, c.bytes);
        const int placed = c.alphaPlane >= 0 ? 4 : image->GetNumChannels();
        for (int i = 0; i < placed; ++i) {
            EXPECT_EQ(Bytes(image->GetChannelPtr(i)), p + i * c.bits / 8) << i;
            EXPECT_EQ(image->GetRowDelta(i), c.rows) << i;
        }
        if (c.alphaPlane >= 0) {
            EXPECT_EQ(Bytes(image->GetChannelPtr(4)), p + c.alphaPlane);
            EXPECT_EQ(image->GetRowDelta(4), c.width);
            EXPECT_EQ(Bytes(image->GetPixelPtr(c.width - 1, c.height - 1, 4)), p + c.bytes - 1);
        }
        PaintOrCount(image.get(), true);  // ASan sees a sample outside the buffer
        EXPECT_EQ(PaintOrCount(image.get(), false), 0) << "no two samples share a byte";
        image->FreeBuffer(p);
    }

    // Real bytes: channel A of RGBA pixel (5, 7) is byte 4 x 5 + 3 of row 7.
    ImagePtr rgba = MakeImage(kImgFormatRGBA, 8, 640, 480);
    unsigned char* p = Bytes(rgba->CreateBuffer());
    PaintOrCount(rgba.get(), true);
    EXPECT_EQ(p[2560 * 7 + 4 * 5 + 3], Pattern(5, 7, rgba->GetChannel(kImgChannelA), 0));
    rgba->FreeBuffer(p);
}

TEST(ImageTest, CreateBufferWithoutLayoutOrMemory) {
    // A channel count set below the layout's pixel step still gets room for every pixel.
    ImagePtr fewer = MakeImage(kImgFormatRGBA, 8, 10, 4);
    fewer->SetNumChannels(3);
    unsigned char* p = Bytes(fewer->CreateBuffer());
    ASSERT_NE(p, nullptr);
    EXPECT_GE(gLastArraySize, size_t(Bytes(fewer->GetPixelPtr(9, 3, 2)) - p + 1));
    fewer->FreeBuffer(p);

    ImagePtr yuv = MakeImage(kImgFormatYUV, 8, 16, 16);
    unsigned char pixels[48];
    yuv->SetData(pixels);
    EXPECT_EQ(Bytes(yuv->GetChannelPtr(0)), nullptr) << "no layout: nothing placed";
    p = Bytes(yuv->CreateBuffer());
    EXPECT_EQ(gLastArraySize, 0u);
    yuv->FreeBuffer(p);

    ImagePtr image = MakeImage(kImgFormatRGB, 8, 4, 4);
    image->SetData(pixels);
    gFailNext = true;
    EXPECT_EQ(image->CreateBuffer(), nullptr);
    EXPECT_EQ(Bytes(image->GetChannelPtr(0)), pixels) << "a failed CreateBuffer changes nothing";
    ImagePtr huge = MakeImage(kImgFormatRGBA, 8, 1 << 30, 1 << 30);
    EXPECT_EQ(huge->CreateBuffer(), nullptr);
    EXPECT_EQ(huge->GetChannelPtr(0), nullptr);
}

TEST(ImageTest, SetRowDeltaHoldsForOneSetDataAndAlphaFollowsPaddedRows) {
    ImagePtr image = MakeImage(kImgFormatYUYVAlpha, 8, 10, 3);
    GuardedBuffer buffer(32 * 3 + 10 * 3);
    image->SetRowDelta(32);
    image->SetData(buffer.data());
    EXPECT_EQ(image->GetRowDelta(3), 32);
    EXPECT_EQ(image->GetRowDelta(4), 10);
    EXPECT_EQ(Bytes(image->GetChannelPtr(4)), buffer.data() + 32 * 3);
    PaintOrCount(image.get(), true);
    EXPECT_EQ(PaintOrCount(image.get(), false), 0) << "the planes do not overlap";
    EXPECT_TRUE(buffer.GuardsIntact());
    image->SetData(buffer.data());
    EXPECT_EQ(image->GetRowDelta(0), 20) << "the next SetData computes it again";

    // Marked on an image without channels, the (zero) row delta is kept once all the same.
    ImagePtr bare(ulkImage::New());
    bare->SetRowDelta(100);
    ulkImageFormat rgb;
    rgb.SetFormat(kImgFormatRGB);
    bare->SetFormat(&rgb);
    bare->SetSize(2, 2);
    bare->SetData(buffer.data());
    EXPECT_EQ(bare->GetRowDelta(0), 0);
    bare->SetData(buffer.data());
    EXPECT_EQ(bare->GetRowDelta(0), 6);
}

TEST(ImageTest, IndexesOutsideTheImageAnswerNothing) {
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 5, 3);
    unsigned char* p = Bytes(image->CreateBuffer());
    for (int index : {-1, 8, 1000, -1000}) {
        EXPECT_EQ(image->GetChannelType(index), kImgChannelNone) << index;
        EXPECT_EQ(image->GetChannelSize(index), 0) << index;
        EXPECT_EQ(image->GetChannelPtr(index), nullptr) << index;
        EXPECT_EQ(image->GetChannelDelta(index), 0) << index;
        EXPECT_EQ(image->GetPixelDelta(index), 0) << index;
        EXPECT_EQ(image->GetRowDelta(index), 0) << index;
        EXPECT_EQ(image->GetRowPtr(0, index), nullptr) << index;
        EXPECT_EQ(image->GetPixelPtr(0, 0, index), nullptr) << index;
    }
    for (const auto& xy : {std::make_pair(5, 0), {0, 3}, {-1, 0}, {0, -1}})
        EXPECT_EQ(image->GetPixelPtr(xy.first, xy.second, 0), nullptr)
            << xy.first << "," << xy.second;
    EXPECT_EQ(Bytes(image->GetPixelPtr(4, 2, 2)), p + 15 * 2 + 12 + 2);
    EXPECT_EQ(Bytes(image->GetRowPtr(2, 1)), p + 31);
    image->FreeBuffer(p);

    ImagePtr uyvy = MakeImage(kImgFormatUYVY, 8, 720, 1);
    unsigned char pixels[1440];
    uyvy->SetData(pixels);
    EXPECT_EQ(uyvy->GetPixelPtr(360, 0, 0), nullptr) << "pairs end at width / 2";
    EXPECT_EQ(uyvy->GetPixelPtr(719, 0, 1), nullptr);

    image->SetNumChannels(1000);
    EXPECT_EQ(image->GetNumChannels(), 8);
    image->SetRowDelta(99);  // writes the eight slots and no more (ASan)
    EXPECT_EQ(image->GetRowDelta(7), 99);
    image->SetNumChannels(2);
    EXPECT_EQ(image->GetChannelType(2), kImgChannelBU) << "SetNumChannels changes nothing else";
}

TEST(ImageTest, CopiesSharePixelsButNotFormatTexts) {
    ImagePtr image = MakeImage(kImgFormatARGB, 8, 8, 8);
    image->mOrientation = static_cast<ulkOrientation>(3);
    unsigned char* p = Bytes(image->CreateBuffer());
    image->SetRowDelta(40);  // a pending row delta travels with the copy

    ulkImage* copy = new ulkImage(*image);
    EXPECT_EQ(copy->GetChannelPtr(0), p);
    EXPECT_EQ(copy->GetOrientation(), 3);
    EXPECT_TRUE(copy->mRowDeltaSet);
    EXPECT_NE(copy->GetFormat()->GetOrder(), image->GetFormat()->GetOrder());
    *Bytes(copy->GetPixelPtr(2, 3, 0)) = 0x5A;
    EXPECT_EQ(*Bytes(image->GetPixelPtr(2, 3, 0)), 0x5A) << "one pixel buffer";

    ImagePtr assigned = MakeImage(kImgFormatUYVY, 16, 1, 1);
    *assigned = *copy;
    EXPECT_EQ(Bytes(assigned->GetChannelPtr(3)), p + 3);
    EXPECT_EQ(assigned->GetRowDelta(3), 40);
    EXPECT_NE(assigned->GetFormat()->GetOrder(), copy->GetFormat()->GetOrder());
    *assigned = *assigned;
    EXPECT_STREQ(assigned->GetFormat()->GetOrder(), "ARGB");

    ulkImage::Delete(copy);  // releases its own text (ASan) and never the pixels
    EXPECT_EQ(*Bytes(image->GetPixelPtr(2, 3, 0)), 0x5A);
    image->FreeBuffer(p);
}

TEST(ImageCopyTest, CopiesEveryPlaneRowByRowInsideTheDestination) {
    const struct {
        ulkImgFormat code;
        int bits, width, height, fromRowDelta, toRowDelta;  // 0: tight
        size_t toBytes;
    } cases[] = {{kImgFormatRGB, 8, 7, 5, 0, 0, 7 * 5 * 3},
                 {kImgFormatBGRA, 8, 9, 6, 0, 50, 50 * 6},
                 {kImgFormatBGRA, 8, 9, 6, 50, 0, 9 * 6 * 4},
                 {kImgFormatUYVYAlpha, 8, 10, 4, 0, 32, 32 * 4 + 10 * 4},
                 {kImgFormatYUYVAlpha, 8, 10, 4, 32, 0, 20 * 4 + 10 * 4},
                 {kImgFormatYUYV, 16, 6, 3, 0, 0, 6 * 3 * 4}};
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << "format " << c.code << " row deltas " << c.fromRowDelta
                                        << " to " << c.toRowDelta);
        ImagePtr from = MakeImage(c.code, c.bits, c.width, c.height);
        if (c.fromRowDelta) from->SetRowDelta(c.fromRowDelta);
        unsigned char* a = Bytes(from->CreateBuffer());
        PaintOrCount(from.get(), true);
        ImagePtr to = MakeImage(c.code, c.bits, c.width, c.height);
        GuardedBuffer b(c.toBytes, 0xEE);
        if (c.toRowDelta) to->SetRowDelta(c.toRowDelta);
        to->SetData(b.data());
        const ulkBounds region = {2, 1, 3, 2};
        EXPECT_TRUE(to->Copy(from.get(), &region)) << "the region is not consulted";
        EXPECT_EQ(PaintOrCount(to.get(), false), 0);
        EXPECT_TRUE(b.GuardsIntact());
        for (int y = 0; c.code == kImgFormatBGRA && c.toRowDelta && y < c.height; ++y)
            EXPECT_EQ(b.data()[c.toRowDelta * y + 40], 0xEE) << "row padding untouched";
        from->FreeBuffer(a);
    }
    ImagePtr image = MakeImage(kImgFormatRGB, 8, 3, 3);
    unsigned char* p = Bytes(image->CreateBuffer());
    PaintOrCount(image.get(), true);
    EXPECT_TRUE(image->Copy(image.get(), nullptr));
    EXPECT_EQ(PaintOrCount(image.get(), false), 0);
    image->FreeBuffer(p);
}

TEST(ImageCopyTest, MismatchesAreRefusedAndCopyNothing) {
    ImagePtr to = MakeImage(kImgFormatRGBA, 8, 4, 4);
    GuardedBuffer b(64, 0x11);
    to->SetData(b.data());
    EXPECT_FALSE(to->Copy(nullptr, nullptr));

    const struct {
        ulkImgFormat code;
        int bits, width, height;
    } cases[] = {{kImgFormatBGRA, 8, 4, 4},
                 {kImgFormatRGBA, 16, 4, 4},
                 {kImgFormatRGBA, 8, 5, 4},
                 {kImgFormatRGBA, 8, 4, 3},
                 {kImgFormatRGBA, 8, 8, 8}};
    for (const auto& c : cases) {
        ImagePtr from = MakeImage(c.code, c.bits, c.width, c.height);
        unsigned char* a = Bytes(from->CreateBuffer());
        PaintOrCount(from.get(), true);
        EXPECT_FALSE(to->Copy(from.get(), nullptr)) << c.code << " " << c.bits << " " << c.width;
        from->FreeBuffer(a);
    }
    // No data on either side.
    ImagePtr empty = MakeImage(kImgFormatRGBA, 8, 4, 4);
    EXPECT_FALSE(to->Copy(empty.get(), nullptr));
    EXPECT_FALSE(empty->Copy(to.get(), nullptr));
    ImagePtr bare(ulkImage::New()), bare2(ulkImage::New());
    EXPECT_FALSE(bare->Copy(bare2.get(), nullptr));
    // The same format code with another row size (a pixel step changed by hand).
    ImagePtr odd = MakeImage(kImgFormatRGBA, 8, 4, 4);
    odd->mPixelDelta[0] = 3;
    unsigned char pixels[64] = {};
    odd->SetData(pixels);
    EXPECT_FALSE(to->Copy(odd.get(), nullptr));

    EXPECT_TRUE(b.GuardsIntact());
    EXPECT_EQ(std::count(b.data(), b.data() + 64, 0x11), 64) << "nothing copied";
}

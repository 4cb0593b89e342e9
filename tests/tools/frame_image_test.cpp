#include "ulk_tools/frame_image.h"

#include <gtest/gtest.h>

#include "ulk_tools/test_pattern.h"

using namespace ulk_tools;

namespace {

Frame Numbered(int width, int height) {
    Frame frame(width, height);
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            for (int c = 0; c < 4; ++c)
                frame.Pixel(x, y)[c] = static_cast<uint8_t>((y * width + x) * 4 + c);
    return frame;
}

uint8_t At(const ulkImage& image, int x, int y, ulkImgChannel type) {
    return *static_cast<const uint8_t*>(image.GetPixelPtr(x, y, image.GetChannel(type)));
}

}  // namespace

TEST(FrameImage, WrapsTheFramesOwnPixelsInEachOrder) {
    Frame frame = Numbered(3, 2);
    ImagePtr rgba = WrapFrame(frame);
    ASSERT_TRUE(rgba);
    EXPECT_EQ(rgba->GetImgFormat(), kImgFormatRGBA);
    EXPECT_EQ(rgba->GetWidth(), 3);
    EXPECT_EQ(rgba->GetHeight(), 2);
    EXPECT_EQ(rgba->GetChannelSize(0), 8);
    EXPECT_EQ(rgba->GetRowDelta(0), 12);
    EXPECT_EQ(rgba->GetPixelPtr(2, 1, 0), frame.Pixel(2, 1));  // a view, not a copy
    EXPECT_EQ(At(*rgba, 2, 1, kImgChannelA), frame.Pixel(2, 1)[3]);

    // The same bytes seen as BGRA: what the frame calls red is the image's blue.
    ImagePtr bgra = WrapFrame(frame, kImgFormatBGRA);
    ASSERT_TRUE(bgra);
    EXPECT_EQ(At(*bgra, 1, 1, kImgChannelBU), frame.Pixel(1, 1)[0]);
    EXPECT_EQ(At(*bgra, 1, 1, kImgChannelRV), frame.Pixel(1, 1)[2]);

    EXPECT_FALSE(WrapFrame(frame, kImgFormatRGB));
    EXPECT_FALSE(WrapFrame(frame, kImgFormatUYVY));
    Frame empty;
    EXPECT_FALSE(WrapFrame(empty));
}

TEST(FrameImage, CopiesConvertBetweenChannelOrders) {
    const Frame source = Numbered(4, 3);
    std::string error;
    for (ulkImgFormat order : {kImgFormatRGBA, kImgFormatBGRA, kImgFormatARGB, kImgFormatABGR}) {
        SCOPED_TRACE(order);
        Frame scratch(4, 3);
        ImagePtr image = WrapFrame(scratch, order);
        ASSERT_TRUE(CopyFrameToImage(source, image.get(), &error)) << error;
        EXPECT_EQ(At(*image, 3, 2, kImgChannelRV), source.Pixel(3, 2)[0]);
        EXPECT_EQ(At(*image, 3, 2, kImgChannelG), source.Pixel(3, 2)[1]);
        EXPECT_EQ(At(*image, 3, 2, kImgChannelBU), source.Pixel(3, 2)[2]);
        EXPECT_EQ(At(*image, 3, 2, kImgChannelA), source.Pixel(3, 2)[3]);
        Frame back;
        ASSERT_TRUE(CopyImageToFrame(*image, &back, &error)) << error;
        EXPECT_TRUE(back.SamePixels(source));
    }

    // A three-channel BGR image with padded rows: alpha dropped one way, 255 the other way.
    ImagePtr bgr(ulkImage::New());
    ulkImageFormat format;
    format.SetFormat(kImgFormatBGR);
    format.SetBitDepth(8);
    bgr->SetFormat(&format);
    bgr->SetSize(4, 3);
    bgr->SetRowDelta(16);
    void* buffer = bgr->CreateBuffer();
    ASSERT_NE(buffer, nullptr);
    ASSERT_TRUE(CopyFrameToImage(source, bgr.get(), &error)) << error;
    EXPECT_EQ(At(*bgr, 2, 2, kImgChannelRV), source.Pixel(2, 2)[0]);
    Frame back;
    ASSERT_TRUE(CopyImageToFrame(*bgr, &back, &error)) << error;
    EXPECT_EQ(back.Pixel(2, 2)[2], source.Pixel(2, 2)[2]);
    EXPECT_EQ(back.Pixel(2, 2)[3], 255);

    // Mismatches are refused with a reason.
    EXPECT_FALSE(CopyFrameToImage(Numbered(5, 3), bgr.get(), &error));
    EXPECT_NE(error.find("5x3"), std::string::npos) << error;
    format.SetFormat(kImgFormatRGBA);
    format.SetBitDepth(16);
    bgr->SetFormat(&format);
    EXPECT_FALSE(CopyImageToFrame(*bgr, &back, &error));
    bgr->FreeBuffer(buffer);
    ImagePtr blank(ulkImage::New());
    EXPECT_FALSE(CopyImageToFrame(*blank, &back, &error));
}

#include "ulk_tools/frame_image.h"

#include <cstdint>

namespace ulk_tools {

namespace {

// Where R, G, B and A lie inside one pixel of image, as byte offsets from the pixel's first
// sample (a = -1 when there is no alpha), or false when the image is not one the tools copy.
struct ChannelOffsets {
    int r, g, b, a;
};

bool OffsetsOf(const ulkImage& image, ChannelOffsets* offsets, std::string* error) {
    const int32_t format = image.GetImgFormat();
    if (format < kImgFormatRGB || format > kImgFormatBGRA) {
        *error = "image format " + std::to_string(format) + " is not interleaved RGB";
        return false;
    }
    const int count = image.GetNumChannels();
    if (count < 3 || count > 4) {
        *error = "image has " + std::to_string(count) + " channels";
        return false;
    }
    for (int i = 0; i < count; ++i) {
        if (image.GetChannelSize(i) != 8) {
            *error = "image is not 8 bits per sample";
            return false;
        }
    }
    const auto* base = static_cast<const unsigned char*>(image.GetChannelPtr(0));
    if (!base || image.GetWidth() < 1 || image.GetHeight() < 1) {
        *error = "image has no pixels";
        return false;
    }
    auto at = [&](ulkImgChannel type) {
        const int slot = image.GetChannel(type);
        if (slot < 0) return -1;
        return static_cast<int>(static_cast<const unsigned char*>(image.GetChannelPtr(slot)) -
                                base);
    };
    *offsets =
        ChannelOffsets{at(kImgChannelRV), at(kImgChannelG), at(kImgChannelBU), at(kImgChannelA)};
    if (offsets->r < 0 || offsets->g < 0 || offsets->b < 0) {
        *error = "image lacks a colour channel";
        return false;
    }
    return true;
}

}  // namespace

bool IsFourChannelOrder(ulkImgFormat format) {
    return format == kImgFormatRGBA || format == kImgFormatBGRA || format == kImgFormatARGB ||
           format == kImgFormatABGR;
}

ImagePtr WrapFrame(Frame& frame, ulkImgFormat order) {
    if (frame.Empty() || !IsFourChannelOrder(order)) return nullptr;
    ImagePtr image(ulkImage::New());
    if (!image) return nullptr;
    ulkImageFormat format;
    format.SetFormat(order);
    format.SetBitDepth(8);
    image->SetFormat(&format);
    image->SetSize(frame.Width(), frame.Height());
    image->SetRowDelta(static_cast<int>(frame.RowBytes()));
    image->SetData(frame.Data());
    return image;
}

bool CopyImageToFrame(const ulkImage& image, Frame* frame, std::string* error) {
    ChannelOffsets at{};
    if (!OffsetsOf(image, &at, error)) return false;
    if (!frame->Allocate(image.GetWidth(), image.GetHeight())) {
        *error = "cannot hold an image of " + SizeText(image.GetWidth(), image.GetHeight());
        return false;
    }
    const int step = image.GetPixelDelta(0);
    for (int y = 0; y < frame->Height(); ++y) {
        const auto* src = static_cast<const unsigned char*>(image.GetRowPtr(y, 0));
        uint8_t* dst = frame->Row(y);
        for (int x = 0; x < frame->Width(); ++x, src += step, dst += 4) {
            dst[0] = src[at.r];
            dst[1] = src[at.g];
            dst[2] = src[at.b];
            dst[3] = at.a < 0 ? 255 : src[at.a];
        }
    }
    return true;
}

bool CopyFrameToImage(const Frame& frame, ulkImage* image, std::string* error) {
    ChannelOffsets at{};
    if (!OffsetsOf(*image, &at, error)) return false;
    if (image->GetWidth() != frame.Width() || image->GetHeight() != frame.Height()) {
        *error = "image is " + SizeText(image->GetWidth(), image->GetHeight()) + ", frame is " +
                 SizeText(frame.Width(), frame.Height());
        return false;
    }
    const int step = image->GetPixelDelta(0);
    for (int y = 0; y < frame.Height(); ++y) {
        const uint8_t* src = frame.Row(y);
        auto* dst = static_cast<unsigned char*>(image->GetRowPtr(y, 0));
        for (int x = 0; x < frame.Width(); ++x, src += 4, dst += step) {
            dst[at.r] = src[0];
            dst[at.g] = src[1];
            dst[at.b] = src[2];
            if (at.a >= 0) dst[at.a] = src[3];
        }
    }
    return true;
}

}  // namespace ulk_tools

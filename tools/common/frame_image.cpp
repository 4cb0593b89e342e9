#include "ulk_tools/frame_image.h"

#include <cstdint>
#include <cstring>

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

// Bit shift of the byte at position (0 to 3) inside a 32-bit word loaded from memory.
constexpr int ByteShift(int position) {
#if defined(__BYTE_ORDER__) && __BYTE_ORDER__ == __ORDER_BIG_ENDIAN__
    return 8 * (3 - position);
#else
    return 8 * position;
#endif
}

// Moves byte i of each of count four-byte pixels to byte to(i). A word at a time, so that
// with to() known at compile time the loop is a few shifts and masks the compiler can
// vectorise.
template <typename To>
void SwizzleRow(const uint8_t* src, uint8_t* dst, int count, To to) {
    for (int x = 0; x < count; ++x, src += 4, dst += 4) {
        uint32_t in;
        std::memcpy(&in, src, 4);
        uint32_t out = 0;
        for (int i = 0; i < 4; ++i) out |= ((in >> ByteShift(i)) & 0xffu) << ByteShift(to(i));
        std::memcpy(dst, &out, 4);
    }
}

// One row of count pixels from src to dst, byte i of each pixel going to byte to[i]: a plain
// copy when nothing moves, a compiled shuffle for the channel orders the tools meet (RGBA to
// and from BGRA, ARGB, ABGR).
void CopyPixelRow(const uint8_t* src, uint8_t* dst, int count, const int to[4]) {
    const int code = to[0] | to[1] << 2 | to[2] << 4 | to[3] << 6;
    switch (code) {
        case 0 | 1 << 2 | 2 << 4 | 3 << 6:
            std::memcpy(dst, src, static_cast<size_t>(count) * 4);
            return;
        case 2 | 1 << 2 | 0 << 4 | 3 << 6:  // RGBA <-> BGRA
            return SwizzleRow(src, dst, count, [](int i) { return i == 3 ? 3 : 2 - i; });
        case 3 | 2 << 2 | 1 << 4 | 0 << 6:  // RGBA <-> ABGR
            return SwizzleRow(src, dst, count, [](int i) { return 3 - i; });
        case 1 | 2 << 2 | 3 << 4 | 0 << 6:  // RGBA -> ARGB
            return SwizzleRow(src, dst, count, [](int i) { return (i + 1) & 3; });
        case 3 | 0 << 2 | 1 << 4 | 2 << 6:  // ARGB -> RGBA
            return SwizzleRow(src, dst, count, [](int i) { return (i + 3) & 3; });
        default:
            return SwizzleRow(src, dst, count, [to](int i) { return to[i]; });
    }
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
    // A frame of the right size is reused: its samples are all overwritten.
    if ((frame->Width() != image.GetWidth() || frame->Height() != image.GetHeight()) &&
        !frame->Allocate(image.GetWidth(), image.GetHeight())) {
        *error = "cannot hold an image of " + SizeText(image.GetWidth(), image.GetHeight());
        return false;
    }
    const int step = image.GetPixelDelta(0);
    if (step == 4 && at.a >= 0) {
        // Image byte at.r goes to frame byte 0, and so on.
        int to[4];
        to[at.r] = 0, to[at.g] = 1, to[at.b] = 2, to[at.a] = 3;
        for (int y = 0; y < frame->Height(); ++y)
            CopyPixelRow(static_cast<const uint8_t*>(image.GetRowPtr(y, 0)), frame->Row(y),
                         frame->Width(), to);
        return true;
    }
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
    if (step == 4 && at.a >= 0) {
        const int to[4] = {at.r, at.g, at.b, at.a};
        for (int y = 0; y < frame.Height(); ++y)
            CopyPixelRow(frame.Row(y), static_cast<uint8_t*>(image->GetRowPtr(y, 0)), frame.Width(),
                         to);
        return true;
    }
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

#include "ulk/image/image.h"

#include <cstdint>
#include <cstring>
#include <new>

namespace {

// Packed 4:2:2 formats: slots 0 to 3 hold one pair of pixels per pixel step.
bool IsPacked422(int32_t format) {
    return format == kImgFormatYUV422 || format == kImgFormatYUYV || format == kImgFormatUYVY ||
           format == kImgFormatUYVYAlpha || format == kImgFormatYUYVAlpha;
}

// Formats whose slot 4 is an alpha plane after the packed plane.
bool HasAlphaPlane(int32_t format) {
    return format == kImgFormatUYVYAlpha || format == kImgFormatYUYVAlpha;
}

bool IsInterleaved(int32_t format) {
    return format >= kImgFormatRGB && format <= kImgFormatBGRA;
}

bool ValidChannel(int index) {
    return index >= 0 && index < ulkImage::kMaxChannels;
}

// Offsets are computed in 64 bits so that no product overflows, and a null base
// stays null instead of becoming an address computed from nothing.
unsigned char* Advance(unsigned char* base, int64_t offset) {
    return base ? base + offset : nullptr;
}

// a * b, false when it does not fit in 64 bits or either is negative.
bool MulSize(int64_t a, int64_t b, int64_t* out) {
    if (a < 0 || b < 0) return false;
    return !__builtin_mul_overflow(a, b, out);
}

struct Layout {
    int count;
    ulkImgChannel types[5];
};

// Channel layouts by format code; count 0 means "no layout".
Layout LayoutFor(int32_t format) {
    const ulkImgChannel A = kImgChannelA, R = kImgChannelRV, G = kImgChannelG, B = kImgChannelBU,
                        Y0 = kImgChannelY0, Y1 = kImgChannelY1, N = kImgChannelNone;
    switch (format) {
        case kImgFormatRGB:
            return {3, {R, G, B, N, N}};
        case kImgFormatBGR:
            return {3, {B, G, R, N, N}};
        case kImgFormatRGBA:
            return {4, {R, G, B, A, N}};
        case kImgFormatABGR:
            return {4, {A, B, G, R, N}};
        case kImgFormatARGB:
            return {4, {A, R, G, B, N}};
        case kImgFormatBGRA:
            return {4, {B, G, R, A, N}};
        case kImgFormatYUV422:
        case kImgFormatUYVY:
            return {4, {B, Y0, R, Y1, N}};
        case kImgFormatYUYV:
            return {4, {Y0, B, Y1, R, N}};
        case kImgFormatUYVYAlpha:
            return {5, {B, Y0, R, Y1, A}};
        case kImgFormatYUYVAlpha:
            return {5, {Y0, B, Y1, R, A}};
        default:
            return {0, {N, N, N, N, N}};
    }
}

// One block of rows an image's pixels occupy: the packed or interleaved plane,
// and for formats 13 and 14 the alpha plane.
struct Plane {
    unsigned char* data;
    int64_t rowDelta;
    int64_t rowBytes;
};

// The planes of an image; 0 when it has no data.
int PlanesOf(const ulkImage& image, Plane planes[2]) {
    const int32_t format = image.GetImgFormat();
    if (image.GetNumChannels() <= 0 || !image.GetChannelPtr(0)) return 0;
    const int64_t width = image.GetWidth();
    int64_t rowBytes = image.GetPixelDelta(0) * width;
    if (IsPacked422(format)) rowBytes /= 2;
    planes[0] = {image.mChannelPtr[0], image.GetRowDelta(0), rowBytes};
    if (!HasAlphaPlane(format)) return 1;
    if (!image.GetChannelPtr(4)) return 0;
    planes[1] = {image.mChannelPtr[4], image.GetRowDelta(4), image.GetPixelDelta(4) * width};
    return 2;
}

}  // namespace

// ------------------------------------------------------------------ creation

ulkImage::ulkImage()
    : mOrientation(static_cast<ulkOrientation>(0)),
      mWidth(0),
      mHeight(0),
      mNumChannels(0),
      mRowDeltaSet(false) {
    for (int i = 0; i < kMaxChannels; ++i) {
        mChannelPtr[i] = nullptr;
        mChannelType[i] = kImgChannelNone;
        mChannelSize[i] = 0;
        mChannelDelta[i] = 0;
        mPixelDelta[i] = 0;
        mRowDelta[i] = 0;
    }
}

ulkImage::ulkImage(const ulkImage& source)
    : ulkMediaObject(source),
      mFormat(source.mFormat),
      mOrientation(source.mOrientation),
      mWidth(source.mWidth),
      mHeight(source.mHeight),
      mNumChannels(source.mNumChannels),
      mRowDeltaSet(source.mRowDeltaSet) {
    for (int i = 0; i < kMaxChannels; ++i) {
        mChannelPtr[i] = source.mChannelPtr[i];
        mChannelType[i] = source.mChannelType[i];
        mChannelSize[i] = source.mChannelSize[i];
        mChannelDelta[i] = source.mChannelDelta[i];
        mPixelDelta[i] = source.mPixelDelta[i];
        mRowDelta[i] = source.mRowDelta[i];
    }
}

ulkImage& ulkImage::operator=(const ulkImage& source) {
    if (this == &source) return *this;
    ulkMediaObject::operator=(source);
    mFormat = source.mFormat;
    mOrientation = source.mOrientation;
    mWidth = source.mWidth;
    mHeight = source.mHeight;
    mNumChannels = source.mNumChannels;
    for (int i = 0; i < kMaxChannels; ++i) {
        mChannelPtr[i] = source.mChannelPtr[i];
        mChannelType[i] = source.mChannelType[i];
        mChannelSize[i] = source.mChannelSize[i];
        mChannelDelta[i] = source.mChannelDelta[i];
        mPixelDelta[i] = source.mPixelDelta[i];
        mRowDelta[i] = source.mRowDelta[i];
    }
    mRowDeltaSet = source.mRowDeltaSet;
    return *this;
}

ulkImage::~ulkImage() {}

ulkImage* ulkImage::New() {
    return new (std::nothrow) ulkImage();
}

void ulkImage::Delete(ulkImage* image) {
    delete image;
}

const char* ulkImage::ClassName() const {
    return "Image";
}

// ------------------------------------------------------------------ format and size

void ulkImage::SetFormat(ulkImageFormat* format) {
    mFormat.Copy(format);
    _InitChannels();
}

void ulkImage::_InitChannels() {
    const int32_t format = mFormat.GetFormat();
    const Layout layout = LayoutFor(format);
    if (layout.count == 0) return;  // no layout: the previous one stays

    const int32_t bits = mFormat.GetBitDepth();
    const int32_t bytes = bits / 8;
    mNumChannels = layout.count;
    for (int i = 0; i < layout.count; ++i) {
        mChannelType[i] = layout.types[i];
        mChannelSize[i] = bits;
        mChannelDelta[i] = bytes;
        if (IsInterleaved(format))
            mPixelDelta[i] = bytes * layout.count;  // one whole pixel
        else
            mPixelDelta[i] = i < 4 ? bytes * 4 : bytes;  // a 4:2:2 pair; the alpha plane
    }
    // Slots the new layout does not use are emptied, so that GetChannel never finds a
    // channel of the previous format (an RGBA image made RGB has no alpha).
    for (int i = layout.count; i < kMaxChannels; ++i) {
        mChannelPtr[i] = nullptr;
        mChannelType[i] = kImgChannelNone;
        mChannelSize[i] = 0;
        mChannelDelta[i] = 0;
        mPixelDelta[i] = 0;
        mRowDelta[i] = 0;
    }
}

void ulkImage::SetSize(int width, int height) {
    mWidth = width;
    mHeight = height;
}

void ulkImage::SetNumChannels(int count) {
    mNumChannels = count > kMaxChannels ? kMaxChannels : count;
}

// ------------------------------------------------------------------ channels

ulkImgChannel ulkImage::GetChannelType(int index) const {
    return ValidChannel(index) ? mChannelType[index] : kImgChannelNone;
}

int ulkImage::GetChannel(ulkImgChannel type) const {
    for (int i = 0; i < kMaxChannels; ++i)
        if (mChannelType[i] == type) return i;
    return -1;
}

int ulkImage::GetChannelSize(int index) const {
    return ValidChannel(index) ? mChannelSize[index] : 0;
}

void* ulkImage::GetChannelPtr(int index) const {
    return ValidChannel(index) ? mChannelPtr[index] : nullptr;
}

int ulkImage::GetChannelDelta(int index) const {
    return ValidChannel(index) ? mChannelDelta[index] : 0;
}

int ulkImage::GetPixelDelta(int index) const {
    return ValidChannel(index) ? mPixelDelta[index] : 0;
}

int ulkImage::GetRowDelta(int index) const {
    return ValidChannel(index) ? mRowDelta[index] : 0;
}

void* ulkImage::GetRowPtr(int row, int channel) const {
    if (!ValidChannel(channel)) return nullptr;
    return Advance(mChannelPtr[channel], int64_t{mRowDelta[channel]} * row);
}

void* ulkImage::GetPixelPtr(int x, int y, int channel) const {
    if (!ValidChannel(channel)) return nullptr;
    if (x < 0 || x >= mWidth || y < 0 || y >= mHeight) return nullptr;
    // A packed channel's row holds width / 2 pairs; a pair index beyond them would
    // address the next row or past the buffer.
    if (channel < 4 && IsPacked422(mFormat.GetFormat()) && x >= mWidth / 2) return nullptr;
    return Advance(mChannelPtr[channel],
                   int64_t{mPixelDelta[channel]} * x + int64_t{mRowDelta[channel]} * y);
}

// ------------------------------------------------------------------ memory

void ulkImage::SetRowDelta(int bytes) {
    const int count = mNumChannels > kMaxChannels ? kMaxChannels : mNumChannels;
    for (int i = 0; i < count; ++i) mRowDelta[i] = bytes;
    mRowDeltaSet = true;
}

void ulkImage::SetData(void* buffer) {
    unsigned char* data = static_cast<unsigned char*>(buffer);
    const int32_t format = mFormat.GetFormat();
    const int count = mNumChannels > kMaxChannels ? kMaxChannels : mNumChannels;
    if (IsInterleaved(format) || IsPacked422(format)) {
        const bool packed = IsPacked422(format);
        // Formats 13 and 14 always place the four packed slots.
        const int placed = HasAlphaPlane(format) ? 4 : count;
        for (int i = 0; i < placed; ++i) {
            if (!mRowDeltaSet) {
                int64_t delta = int64_t{mPixelDelta[i]} * mWidth;
                if (packed) delta /= 2;
                mRowDelta[i] = static_cast<int32_t>(delta);
            }
            mChannelPtr[i] = Advance(data, int64_t{mChannelDelta[i]} * i);
        }
        if (HasAlphaPlane(format)) {
            // The alpha plane is tight and follows the packed plane's rows, whatever row
            // delta they were given, so it never overlaps them.
            mRowDelta[4] = static_cast<int32_t>(int64_t{mPixelDelta[4]} * mWidth);
            mChannelPtr[4] = Advance(data, int64_t{mRowDelta[0]} * mHeight);
        }
    }
    mRowDeltaSet = false;
}

void* ulkImage::CreateBuffer() {
    const int32_t format = mFormat.GetFormat();
    const bool packed = IsPacked422(format);
    const bool placesChannels = IsInterleaved(format) || packed;

    // The described size: a tightly packed buffer, slot 0's sample size for all.
    int64_t samples = mNumChannels;
    if (packed) samples -= 2;
    if (samples < 0) samples = 0;
    int64_t size = 0;
    int64_t pixels = 0;
    if (!MulSize(mWidth, mHeight, &pixels)) return nullptr;
    if (!MulSize(int64_t{mChannelSize[0] / 8} * samples, pixels, &size)) return nullptr;

    // Room for every row SetData will lay out: the first plane spans row delta(0) x
    // height bytes (the explicit row delta, or the one SetData is about to compute),
    // formats 13 and 14 add their tight alpha plane, and no channel's last sample may
    // lie beyond the end.
    if (placesChannels && mWidth > 0 && mHeight > 0) {
        int64_t rowDelta0 = mRowDelta[0];
        if (!mRowDeltaSet) {
            rowDelta0 = int64_t{mPixelDelta[0]} * mWidth;
            if (packed) rowDelta0 /= 2;
        }
        int64_t planes = 0;
        if (rowDelta0 > 0 && !MulSize(rowDelta0, mHeight, &planes)) return nullptr;
        if (HasAlphaPlane(format)) {
            int64_t alpha = 0;
            if (!MulSize(mPixelDelta[4] < 0 ? 0 : mPixelDelta[4], pixels, &alpha)) return nullptr;
            // A sample narrower than a byte still takes one: the last one may end past
            // pixels x pixel delta.
            const int64_t beyond =
                (mChannelSize[4] + 7) / 8 - (mPixelDelta[4] > 0 ? mPixelDelta[4] : 0);
            planes += alpha + (beyond > 0 ? beyond : 0);
        }
        if (planes > size) size = planes;

        const int placed =
            HasAlphaPlane(format) ? 4 : (mNumChannels > kMaxChannels ? kMaxChannels : mNumChannels);
        for (int i = 0; i < placed; ++i) {
            const int64_t rowDelta = mRowDeltaSet ? int64_t{mRowDelta[i]} : rowDelta0;
            // SetData lays the rows out from the buffer's start: with a negative row delta
            // every row after the first, and the alpha plane of formats 13 and 14, would
            // lie before the buffer.
            if (rowDelta < 0) return nullptr;
            const int64_t columns = packed ? mWidth / 2 : mWidth;
            if (columns <= 0) continue;
            const int64_t end = int64_t{mChannelDelta[i]} * i +
                                (rowDelta > 0 ? rowDelta : 0) * (mHeight - 1) +
                                (mPixelDelta[i] > 0 ? int64_t{mPixelDelta[i]} : 0) * (columns - 1) +
                                (mChannelSize[i] + 7) / 8;
            if (end > size) size = end;
        }
    }

    if (size < 0 || static_cast<uint64_t>(size) > SIZE_MAX) return nullptr;
    unsigned char* buffer = new (std::nothrow) unsigned char[static_cast<size_t>(size)];
    if (buffer) SetData(buffer);
    return buffer;
}

void ulkImage::FreeBuffer(void* buffer) {
    delete[] static_cast<unsigned char*>(buffer);
}

bool ulkImage::Copy(const ulkImage* source, const ulkBounds* region) {
    (void)region;  // the whole image is copied
    if (!source) return false;
    if (source->GetImgFormat() != GetImgFormat() ||
        source->mFormat.GetBitDepth() != mFormat.GetBitDepth() || source->mWidth != mWidth ||
        source->mHeight != mHeight)
        return false;

    Plane to[2], from[2];
    const int planes = PlanesOf(*this, to);
    if (planes == 0 || PlanesOf(*source, from) != planes) return false;
    for (int p = 0; p < planes; ++p)
        if (to[p].rowBytes != from[p].rowBytes) return false;

    for (int p = 0; p < planes; ++p) {
        if (to[p].rowBytes <= 0) continue;
        const size_t rowBytes = static_cast<size_t>(to[p].rowBytes);
        if (mHeight > 0 && to[p].rowDelta == to[p].rowBytes && from[p].rowDelta == to[p].rowBytes) {
            // Tight rows on both sides: the plane is one block.
            std::memmove(to[p].data, from[p].data, rowBytes * static_cast<size_t>(mHeight));
            continue;
        }
        for (int64_t y = 0; y < mHeight; ++y)
            std::memmove(to[p].data + to[p].rowDelta * y, from[p].data + from[p].rowDelta * y,
                         rowBytes);
    }
    return true;
}

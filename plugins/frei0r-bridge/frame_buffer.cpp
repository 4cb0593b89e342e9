#include "frame_buffer.h"

#include <algorithm>
#include <cstring>

#include "ulk/ulk.h"

namespace frei0r_bridge {

unsigned char* FrameBuffer::PixelStart(const ulkImage* image) {
    unsigned char* start = nullptr;
    for (int c = 0; c < 4; ++c) {
        auto* p = static_cast<unsigned char*>(image->GetChannelPtr(c));
        if (p && (!start || p < start)) start = p;
    }
    return start;
}

uint32_t* FrameBuffer::Bind(ulkImage* image, int paddedWidth, int paddedHeight, bool copyIn,
                            bool ownMemory) {
    const int width = image->GetWidth(), height = image->GetHeight();
    const int rowBytes = width * 4;
    const int rowDelta = image->GetRowDelta(0);
    unsigned char* start = PixelStart(image);
    mImage = image;
    mPaddedWidth = paddedWidth;

    const bool fits = !ownMemory && width == paddedWidth && height == paddedHeight &&
                      rowDelta == rowBytes && reinterpret_cast<uintptr_t>(start) % 16 == 0;
    mUsesScratch = !fits;
    if (fits) return reinterpret_cast<uint32_t*>(start);

    const size_t pixels = static_cast<size_t>(paddedWidth) * paddedHeight;
    if (pixels != mScratchPixels) {
        // aligned_alloc wants a size that is a multiple of the alignment; 8
        // x 8 pixels make 256 bytes, so a padded frame always is.
        mScratch.reset(static_cast<uint32_t*>(std::aligned_alloc(16, pixels * 4)));
        if (!mScratch) {
            mScratchPixels = 0;
            return nullptr;
        }
        std::memset(mScratch.get(), 0, pixels * 4);
        mScratchPixels = pixels;
    }
    uint32_t* frame = mScratch.get();
    if (copyIn) {
        for (int y = 0; y < paddedHeight; ++y) {
            uint32_t* row = frame + static_cast<size_t>(y) * paddedWidth;
            const unsigned char* source =
                start + static_cast<ptrdiff_t>(rowDelta) * std::min(y, height - 1);
            std::memcpy(row, source, rowBytes);
            std::fill(row + width, row + paddedWidth, row[width - 1]);
        }
    }
    return frame;
}

void FrameBuffer::CopyOut() const {
    if (!mUsesScratch) return;
    unsigned char* start = PixelStart(mImage);
    const int rowDelta = mImage->GetRowDelta(0);
    for (int y = 0; y < mImage->GetHeight(); ++y)
        std::memcpy(start + static_cast<ptrdiff_t>(rowDelta) * y,
                    mScratch.get() + static_cast<size_t>(y) * mPaddedWidth,
                    static_cast<size_t>(mImage->GetWidth()) * 4);
}

}  // namespace frei0r_bridge

#include "ulk_tools/frame.h"

#include <cstring>
#include <new>

namespace ulk_tools {

bool Frame::Allocate(int width, int height) {
    Clear();
    if (width < 1 || height < 1 || width > kMaxFrameSide || height > kMaxFrameSide) return false;
    const size_t rowBytes = static_cast<size_t>(width) * 4;
    try {
        mPixels.assign(rowBytes * static_cast<size_t>(height), 0);
    } catch (const std::bad_alloc&) {
        return false;
    }
    mWidth = width;
    mHeight = height;
    mRowBytes = rowBytes;
    return true;
}

void Frame::Clear() {
    std::vector<uint8_t>().swap(mPixels);
    mWidth = 0;
    mHeight = 0;
    mRowBytes = 0;
}

void Frame::Fill(uint8_t r, uint8_t g, uint8_t b, uint8_t a) {
    for (int y = 0; y < mHeight; ++y) {
        uint8_t* p = Row(y);
        for (int x = 0; x < mWidth; ++x, p += 4) {
            p[0] = r;
            p[1] = g;
            p[2] = b;
            p[3] = a;
        }
    }
}

bool Frame::SamePixels(const Frame& other) const {
    return mWidth == other.mWidth && mHeight == other.mHeight && mPixels == other.mPixels;
}

std::string SizeText(int width, int height) {
    return std::to_string(width) + "x" + std::to_string(height);
}

}  // namespace ulk_tools

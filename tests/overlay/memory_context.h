// A drawing context backed by ordinary memory, as a host would supply one for
// an off-screen viewer. Rows may be padded (row delta above width x 4).
#ifndef ULK_TESTS_OVERLAY_MEMORY_CONTEXT_H
#define ULK_TESTS_OVERLAY_MEMORY_CONTEXT_H

#include <cstdint>
#include <vector>

#include "ulk/overlay/overlay_context.h"

class MemoryContext : public ulkBaseOverlayContext {
  public:
    MemoryContext(short width, short height, short rowDelta) { Resize(width, height, rowDelta); }

    /// A new surface of the given geometry, cleared to zero.
    void Resize(short width, short height, short rowDelta) {
        mWidth = width;
        mHeight = height;
        mRowDelta = rowDelta;
        mPixels.assign(rowDelta > 0 && height > 0 ? static_cast<size_t>(rowDelta) * height : 0, 0);
    }

    /// The BGRA sample c of pixel (x, y).
    uint8_t Sample(int x, int y, int c) const {
        return mPixels[static_cast<size_t>(y) * mRowDelta + x * 4 + c];
    }

    unsigned char* GetBuffer() override { return mPixels.data(); }
    void* GetNativeWindow() override { return &mWindowToken; }
    void GetVidRect(ulkBounds& rect) override { rect = mVidRect; }
    short GetWidth() override { return mWidth; }
    short GetHeight() override { return mHeight; }
    short GetRowDelta() override { return mRowDelta; }

    std::vector<unsigned char> mPixels;
    short mWidth = 0;
    short mHeight = 0;
    short mRowDelta = 0;
    ulkBounds mVidRect = {2, 3, 17, 12};
    int mWindowToken = 0;
};

/// The same surface with an OpenGL context of its own.
class GLMemoryContext : public MemoryContext {
  public:
    using MemoryContext::MemoryContext;
    void* GetOpenGLContext() override { return &mGLToken; }
    int mGLToken = 0;
};

#endif  // ULK_TESTS_OVERLAY_MEMORY_CONTEXT_H

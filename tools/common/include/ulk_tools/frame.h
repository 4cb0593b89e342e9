// Frame: one owned picture of 8-bit samples, four per pixel, the currency of the tools.
//
// Pixels are stored row after row, each row RowBytes() apart, with samples in R, G, B, A
// order unless a caller chooses to view them otherwise (see frame_image.h). Alpha is
// straight (not premultiplied), as PNG files and raw RGBA pipes carry it. A frame owns its
// memory and copies deeply. Not thread-safe: one thread uses a frame at a time.
#ifndef ULK_TOOLS_FRAME_H
#define ULK_TOOLS_FRAME_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace ulk_tools {

/// Largest width or height any tool accepts; keeps every size computation far from overflow.
constexpr int kMaxFrameSide = 65536;

/// An owned RGBA 8-bit picture.
class Frame {
  public:
    /// An empty frame (0 x 0, no pixels).
    Frame() = default;
    /// A frame of width x height, every sample 0; see Allocate for the limits.
    Frame(int width, int height) { Allocate(width, height); }

    /// Makes the frame width x height with tight rows, every sample 0. False (and an empty
    /// frame) when a side is not in 1 to kMaxFrameSide or memory ran out.
    bool Allocate(int width, int height);
    /// Makes the frame empty and releases its memory.
    void Clear();

    int Width() const { return mWidth; }
    int Height() const { return mHeight; }
    /// Bytes from one row to the next (width x 4 for frames made here).
    size_t RowBytes() const { return mRowBytes; }
    /// Bytes of the whole picture, RowBytes() x height.
    size_t ByteSize() const { return mPixels.size(); }
    bool Empty() const { return mPixels.empty(); }

    /// First sample of the picture; null when empty.
    uint8_t* Data() { return mPixels.empty() ? nullptr : mPixels.data(); }
    const uint8_t* Data() const { return mPixels.empty() ? nullptr : mPixels.data(); }
    /// First sample of row y (0 at the top); the row is not range-checked.
    uint8_t* Row(int y) { return mPixels.data() + RowBytes() * static_cast<size_t>(y); }
    const uint8_t* Row(int y) const { return mPixels.data() + RowBytes() * static_cast<size_t>(y); }
    /// The four samples of pixel (x, y); not range-checked.
    uint8_t* Pixel(int x, int y) { return Row(y) + 4 * static_cast<size_t>(x); }
    const uint8_t* Pixel(int x, int y) const { return Row(y) + 4 * static_cast<size_t>(x); }

    /// Sets every pixel to (r, g, b, a).
    void Fill(uint8_t r, uint8_t g, uint8_t b, uint8_t a);
    /// True when both have the same size and the same samples.
    bool SamePixels(const Frame& other) const;

  private:
    int mWidth = 0;
    int mHeight = 0;
    size_t mRowBytes = 0;
    std::vector<uint8_t> mPixels;
};

/// "WxH" for messages ("1920x1080").
std::string SizeText(int width, int height);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_FRAME_H

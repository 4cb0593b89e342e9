// The frame memory handed to frei0r.
//
// frei0r effects take a frame as one block of width x height 32-bit pixels:
// rows follow each other without gaps, and many effects assume more than
// frei0r.h states (SIMD loads on 16-byte boundaries, loops unrolled by 8
// pixels). Given anything else some read or write past their buffers. A
// FrameBuffer therefore hands frei0r the host's own pixels only when they
// already fit (tight rows, 16-byte aligned, width and height multiples of 8)
// and otherwise a scratch frame padded to the next multiple of 8, filled by
// repeating the last column and row so that filters see no false edge.
#ifndef ULK_FREI0R_BRIDGE_FRAME_BUFFER_H
#define ULK_FREI0R_BRIDGE_FRAME_BUFFER_H

#include <cstdint>
#include <cstdlib>
#include <memory>

class ulkImage;

namespace frei0r_bridge {

/// Rounds up to the frame size frei0r gets: the next multiple of 8.
inline int PaddedSize(int size) {
    return (size + 7) / 8 * 8;
}

class FrameBuffer {
  public:
    /// Points at frei0r-ready memory for image, whose padded size is
    /// paddedWidth x paddedHeight. copyIn fills a scratch frame from the image
    /// (for inputs); ownMemory asks for scratch even when the image fits (an
    /// output that is also an input).
    uint32_t* Bind(ulkImage* image, int paddedWidth, int paddedHeight, bool copyIn, bool ownMemory);
    /// Copies the visible part of a scratch frame back into the image; nothing
    /// when frei0r worked on the image's own memory.
    void CopyOut() const;
    /// The first byte of the image's pixel (0, 0), whatever the channel order.
    static unsigned char* PixelStart(const ulkImage* image);

  private:
    struct Free {
        void operator()(uint32_t* p) const { std::free(p); }
    };
    std::unique_ptr<uint32_t, Free> mScratch;
    size_t mScratchPixels = 0;
    int mPaddedWidth = 0;
    ulkImage* mImage = nullptr;
    bool mUsesScratch = false;
};

}  // namespace frei0r_bridge

#endif  // ULK_FREI0R_BRIDGE_FRAME_BUFFER_H

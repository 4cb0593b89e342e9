// Pixel memory with guard bytes, for ulk-validate: a buffer of rows with a gap after each row
// and guard bands before the first row and after the last, all filled with a known pattern,
// so that any byte a plug-in writes outside its rows can be found afterwards.
//
//     [ leading guard ][ row 0 ][ gap ][ row 1 ][ gap ] ... [ row h-1 ][ gap ][ trailing guard ]
//
// GuardedImage lays a ulkImage of one of the interleaved RGB-family formats over such a
// buffer, with a row delta larger than the row. One thread uses an object at a time.
#ifndef ULK_TOOLS_VALIDATE_IMAGE_H
#define ULK_TOOLS_VALIDATE_IMAGE_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "ulk/ulk.h"
#include "ulk_tools/frame_image.h"

namespace ulk_tools {

/// Rows of pixel memory between guard bytes.
class GuardedBuffer {
  public:
    /// Bytes in the guard bands before the first row and after the gap of the last one.
    static constexpr size_t kGuardBytes = 64;

    GuardedBuffer() = default;
    /// rows rows of rowBytes bytes, rowDelta (>= rowBytes) apart; pixels are filled from seed,
    /// guards with their own pattern.
    GuardedBuffer(size_t rowBytes, size_t rowDelta, int rows, uint32_t seed);

    uint8_t* Pixels() { return mBytes.data() + kGuardBytes; }
    size_t RowBytes() const { return mRowBytes; }
    size_t RowDelta() const { return mRowDelta; }
    int Rows() const { return mRows; }

    /// Empty when every guard byte holds its pattern; otherwise where the first changed byte
    /// lies and how many changed ("3 bytes, the first 2 bytes after the end of row 4").
    std::string GuardDamage() const;
    /// The whole buffer, guards included, as it is now.
    const std::vector<uint8_t>& Bytes() const { return mBytes; }
    /// Empty when the buffer equals before byte for byte; otherwise where it first differs.
    std::string Difference(const std::vector<uint8_t>& before) const;
    /// Puts the guard pattern back (after damage was reported).
    void RepairGuards();
    /// Puts bytes taken with Bytes() back (after a change was reported).
    void Restore(const std::vector<uint8_t>& bytes);

  private:
    bool IsGuard(size_t index) const;
    std::string Where(size_t index) const;

    size_t mRowBytes = 0;
    size_t mRowDelta = 0;
    int mRows = 0;
    std::vector<uint8_t> mBytes;
};

/// An 8- or 16-bit interleaved RGB-family image over a guarded buffer.
class GuardedImage {
  public:
    /// format: kImgFormatRGB to kImgFormatBGRA; bitDepth 8 or 16. Rows are padded to a
    /// multiple of 16 bytes and then by 32 more.
    GuardedImage(ulkImgFormat format, int bitDepth, int width, int height, uint32_t seed);

    /// Null when the image could not be made.
    ulkImage* Image() const { return mImage.get(); }
    GuardedBuffer& Buffer() { return mBuffer; }
    const GuardedBuffer& Buffer() const { return mBuffer; }

    /// Bytes per pixel of format at bitDepth (3 or 4 samples).
    static size_t PixelBytes(ulkImgFormat format, int bitDepth);

  private:
    GuardedBuffer mBuffer;
    ImagePtr mImage;
};

}  // namespace ulk_tools

#endif  // ULK_TOOLS_VALIDATE_IMAGE_H

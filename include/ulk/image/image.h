// ulkImage: the view through which pixels pass between a host and an effect.
//
// An image never owns pixel memory. It describes where each of up to eight
// channels starts in a buffer (channel pointer) and how far apart its pixels
// and rows lie (pixel delta, row delta), which covers interleaved pixels,
// packed 4:2:2 pairs and a separate alpha plane with one set of formulas:
//
//     pixel (x, y) of channel i = GetChannelPtr(i) + GetPixelDelta(i) * x + GetRowDelta(i) * y
//
// For the packed 4:2:2 channels (slots 0 to 3 of formats 8, 9, 10, 13, 14) one
// pixel step covers a pair of pixels, so x there counts pairs.
//
// The usual order is New, SetFormat (lays the channels out), SetSize,
// optionally SetRowDelta, then SetData (the host's own memory) or CreateBuffer
// (a buffer the caller later releases with FreeBuffer). Delete never releases
// pixel memory. Copies of an image share its pixels but hold a format of their
// own. Channel indexes outside 0 to 7 answer 0, null or kImgChannelNone.
// Not thread-safe: one thread uses an image at a time.
#ifndef ULK_IMAGE_IMAGE_H
#define ULK_IMAGE_IMAGE_H

#include <cstdint>

#include "ulk/core/types.h"
#include "ulk/export.h"
#include "ulk/image/image_format.h"
#include "ulk/image/media_object.h"

/// What a channel slot holds.
enum ulkImgChannel : int32_t {
    kImgChannelNone = -1,  ///< no channel in this slot
    kImgChannelA = 0,      ///< alpha
    kImgChannelRV = 1,     ///< red; V (red difference) in YUV layouts
    kImgChannelG = 2,      ///< green
    kImgChannelBU = 3,     ///< blue; U (blue difference) in YUV layouts
    kImgChannelY0 = 5,     ///< luma of the first pixel of a 4:2:2 pair
    kImgChannelY1 = 6,     ///< luma of the second pixel of a 4:2:2 pair
};

/// Orientation of an image; the values belong to the host. The library stores and copies
/// it and gives it no meaning.
enum ulkOrientation : int32_t {};

/// A view of pixel memory: format, size and per-channel placement.
class ULK_API ulkImage : public ulkMediaObject {
  public:
    /// Number of channel slots.
    static constexpr int kMaxChannels = 8;

    // --- creation
    /// A new image (no format, size 0, every slot empty), or null when memory ran out.
    static ulkImage* New();
    /// Destroys image (null is ignored); its pixel memory is not released.
    static void Delete(ulkImage* image);
    /// Copies every field; the format gets its own order text, the pixels are shared.
    ulkImage(const ulkImage& source);
    /// As the copy constructor; list membership stays this image's own.
    ulkImage& operator=(const ulkImage& source);

    /// "Image".
    const char* ClassName() const override;

    // --- format and size
    /// The embedded format; changing it through this pointer does not lay the channels out again.
    ulkImageFormat* GetFormat() { return &mFormat; }
    /// The embedded format, read-only.
    const ulkImageFormat* GetFormat() const { return &mFormat; }
    /// Copies format into the embedded one, then lays the channels out for its format code.
    void SetFormat(ulkImageFormat* format);
    ulkImgFormat GetImgFormat() const { return mFormat.GetFormat(); }
    ulkColorspace GetColorspace() const { return mFormat.GetColorspace(); }
    ulkOrientation GetOrientation() const { return mOrientation; }
    int GetWidth() const { return mWidth; }
    int GetHeight() const { return mHeight; }
    int GetNumChannels() const { return mNumChannels; }
    /// Stores the size; pointers and row deltas change only at the next SetData.
    void SetSize(int width, int height);
    /// Stores the channel count, at most 8.
    void SetNumChannels(int count);

    // --- channels (index 0 to 7; any other index answers kImgChannelNone, 0 or null)
    ulkImgChannel GetChannelType(int index) const;
    /// First of the eight slots holding type, or -1.
    int GetChannel(ulkImgChannel type) const;
    /// Bits per sample of the channel.
    int GetChannelSize(int index) const;
    /// Address of the channel's sample in pixel (0, 0).
    void* GetChannelPtr(int index) const;
    /// Bytes between adjacent channels inside one pixel.
    int GetChannelDelta(int index) const;
    /// Bytes from one pixel (one pair, for packed 4:2:2 channels) to the next in a row.
    int GetPixelDelta(int index) const;
    /// Bytes from one row to the next.
    int GetRowDelta(int index) const;
    /// Start of the row in the channel; the row is not range-checked.
    void* GetRowPtr(int row, int channel) const;
    /// Sample of pixel (x, y) in the channel; null outside the image (for packed 4:2:2
    /// channels x counts pairs, 0 to width / 2 - 1).
    void* GetPixelPtr(int x, int y, int channel) const;

    // --- memory
    /// Row delta of every channel in use, kept by the next SetData only.
    void SetRowDelta(int bytes);
    /// Places the channels in the buffer at data (which stays the caller's).
    void SetData(void* data);
    /// A new buffer large enough for every pointer SetData computes, already placed with
    /// SetData; null when memory ran out (the image is then unchanged). Release it with FreeBuffer.
    void* CreateBuffer();
    /// Releases a buffer from CreateBuffer; the image's pointers dangle until the next SetData.
    void FreeBuffer(void* buffer);
    /// Copies the pixels of source into this image, plane by plane and row by row, each image
    /// with its own row deltas. False, copying nothing, when source is null, either image has no
    /// data or the two differ in format code, bit depth, width, height or row size. The region
    /// is not consulted: the whole image is copied.
    bool Copy(const ulkImage* source, const ulkBounds* region);

    ulkImageFormat mFormat;
    ulkOrientation mOrientation;
    int32_t mWidth;
    int32_t mHeight;
    int32_t mNumChannels;
    unsigned char* mChannelPtr[kMaxChannels];
    ulkImgChannel mChannelType[kMaxChannels];
    int32_t mChannelSize[kMaxChannels];
    int32_t mChannelDelta[kMaxChannels];
    int32_t mPixelDelta[kMaxChannels];
    int32_t mRowDelta[kMaxChannels];
    bool mRowDeltaSet;

  protected:
    ulkImage();
    ~ulkImage() override;
    /// Lays the channels out for the embedded format's code (count, types, sizes, steps).
    void _InitChannels();
};

#endif  // ULK_IMAGE_IMAGE_H

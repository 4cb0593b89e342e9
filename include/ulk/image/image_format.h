// ulkImageFormat: the description of one pixel format.
//
// A format is a format code (ulkImgFormat), a colour space, the bit depth of
// one sample and a short text spelling the order of the samples in a pixel
// ("RGBA", "UYVY", ...). Setting a format code from 1 to 14 sets the colour
// space and order text of the fixed table below; the bit depth is set on its
// own. A model keeps the formats it accepts in a ulkList (hence the ulkNode
// base); every ulkImage embeds one and lays its channels out from it.
//
// The format owns its order text (ordinary global new/delete). Copies, by
// constructor, assignment or Copy, are deep: each holds a text of its own, and
// copying a format onto itself keeps it as it was. Not thread-safe: one thread
// uses a format at a time.
#ifndef ULK_IMAGE_IMAGE_FORMAT_H
#define ULK_IMAGE_IMAGE_FORMAT_H

#include <cstdint>

#include "ulk/core/list.h"
#include "ulk/export.h"

/// Pixel format codes. Any 32-bit value can be stored; only 1 to 14 have a
/// table row (order text and colour space). 0 accepts every format in a
/// model's list of formats.
enum ulkImgFormat : int32_t {
    kImgFormatAny = 0,         ///< no table row; "any format" in a model's list
    kImgFormatRGB = 1,         ///< "RGB", RGB
    kImgFormatRGBA = 2,        ///< "RGBA", RGB
    kImgFormatBGR = 3,         ///< "BGR", RGB
    kImgFormatABGR = 4,        ///< "ABGR", RGB
    kImgFormatARGB = 5,        ///< "ARGB", RGB
    kImgFormatBGRA = 6,        ///< "BGRA", RGB
    kImgFormatYUV = 7,         ///< "YUV", YUV (no image channel layout)
    kImgFormatYUV422 = 8,      ///< "???", YUV, packed 4:2:2 U Y0 V Y1
    kImgFormatYUYV = 9,        ///< "YUYV", YUV, packed 4:2:2 Y0 U Y1 V
    kImgFormatUYVY = 10,       ///< "UYVY", YUV, packed 4:2:2 U Y0 V Y1
    kImgFormatYUVA = 11,       ///< "YUVA", YUV (no image channel layout)
    kImgFormatAVUY = 12,       ///< "AVUY", YUV (no image channel layout)
    kImgFormatUYVYAlpha = 13,  ///< "UYVY", YUV, packed U Y0 V Y1 then an alpha plane
    kImgFormatYUYVAlpha = 14,  ///< "YUYV", YUV, packed Y0 U Y1 V then an alpha plane
};

/// Colour spaces. No format code sets kColorspaceOther; set it after SetFormat.
enum ulkColorspace : int32_t {
    kColorspaceRGB = 0,
    kColorspaceYUV = 1,
    kColorspaceOther = 2,
};

/// One pixel format: format code, colour space, bits per sample, order text.
class ULK_API ulkImageFormat : public ulkNode {
  public:
    /// Format -1, colour space -1 (both "not set"), bit depth 8, no order text; in no list.
    ulkImageFormat();
    /// A deep copy of source (its own order text); the copy is in no list.
    ulkImageFormat(const ulkImageFormat& source);
    /// Releases the order text.
    ~ulkImageFormat();
    /// Makes the four fields equal to source's, as Copy does; list membership stays this format's
    /// own.
    ulkImageFormat& operator=(const ulkImageFormat& source);

    // --- format code, colour space, bit depth (any value is stored)
    /// Stores the code; for 1 to 14 also sets the table's colour space and order text. Never
    /// changes the bit depth.
    void SetFormat(ulkImgFormat format);
    ulkImgFormat GetFormat() const { return mFormat; }
    void SetColorspace(ulkColorspace colorspace) { mColorspace = colorspace; }
    ulkColorspace GetColorspace() const { return mColorspace; }
    /// Bits per sample; 0 means "any depth" to IsCompatible.
    void SetBitDepth(int bitDepth) { mBitDepth = bitDepth; }
    int GetBitDepth() const { return mBitDepth; }

    // --- order text
    /// Replaces the order text with a copy of text (null: no text). Out of memory leaves no text.
    void SetOrder(const char* text);
    /// The format's own text (not a copy) or null; valid until the text is next replaced.
    const char* GetOrder() const { return mOrder; }

    // --- comparison and copy
    /// True when colour spaces are equal, bit depths match (0 matches any) and the order texts
    /// are equal byte for byte or either is missing. Format codes are not compared.
    bool IsCompatible(const ulkImageFormat* other) const;
    /// Makes this format equal to source (a null source or this format itself changes nothing).
    void Copy(const ulkImageFormat* source);

    ulkImgFormat mFormat;
    ulkColorspace mColorspace;
    int32_t mBitDepth;
    char* mOrder;
};

#endif  // ULK_IMAGE_IMAGE_FORMAT_H

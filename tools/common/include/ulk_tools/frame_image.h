// Adapters between Frame and the library's ulkImage.
//
// WrapFrame gives a ulkImage view over a frame's own pixels (no copy): the frame must outlive
// the view and keep its size while the view is in use. The four samples of each pixel can be
// viewed in any 8-bit four-channel order the library knows (RGBA, BGRA, ARGB, ABGR), which
// is how a tool feeds an effect that wants BGRA: wrap a scratch frame as BGRA and
// CopyFrameToImage into it. The copy functions go through the image's channel pointers and
// steps, so they work for any 8-bit interleaved RGB-family image, three or four channels;
// rows of four-byte pixels are copied whole (same order) or shuffled a word at a time.
#ifndef ULK_TOOLS_FRAME_IMAGE_H
#define ULK_TOOLS_FRAME_IMAGE_H

#include <memory>
#include <string>

#include "ulk/image/image.h"
#include "ulk_tools/frame.h"

namespace ulk_tools {

/// Releases an image made by ulkImage::New (its pixels stay where they are).
struct ImageDeleter {
    void operator()(ulkImage* image) const { ulkImage::Delete(image); }
};

/// An owned ulkImage; its pixel memory belongs to someone else.
using ImagePtr = std::unique_ptr<ulkImage, ImageDeleter>;

/// True for the formats WrapFrame accepts: RGBA, BGRA, ARGB, ABGR.
bool IsFourChannelOrder(ulkImgFormat format);

/// A new 8-bit image of the given order over frame's pixels, row delta = frame.RowBytes().
/// Null when the frame is empty, the order is not a four-channel one or memory ran out.
ImagePtr WrapFrame(Frame& frame, ulkImgFormat order = kImgFormatRGBA);

/// Copies image into frame as RGBA (frame is resized to the image, or reused when it has the
/// image's size); an image without alpha gives alpha 255. False with a message when the image is
/// not 8-bit interleaved RGB-family or has no data.
bool CopyImageToFrame(const ulkImage& image, Frame* frame, std::string* error);

/// Copies an RGBA frame into image, in whatever channel order the image has (alpha is dropped
/// for a three-channel image). False with a message when sizes differ or the image is not
/// 8-bit interleaved RGB-family or has no data.
bool CopyFrameToImage(const Frame& frame, ulkImage* image, std::string* error);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_FRAME_IMAGE_H

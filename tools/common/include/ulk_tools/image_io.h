// Reading and writing image files through OpenImageIO, always as RGBA 8-bit frames.
//
// Any format OpenImageIO reads can be read (PNG, JPEG, TIFF, OpenEXR, DPX, ...); the first
// subimage's data window becomes the frame. Grey is spread over R, G and B, a missing alpha
// reads as 255, and 16-bit, half and float samples are converted with rounding (floats are
// clamped to 0..1 first). Alpha is kept straight: pixel values pass through unchanged, never
// premultiplied or divided. Writing picks the format by the file's extension and drops alpha
// where the format has none (JPEG, ...). Every failure comes back as a one-line message
// naming the file; nothing is thrown and a corrupt file is a message, not a crash.
// Safe to call from several threads on different files.
#ifndef ULK_TOOLS_IMAGE_IO_H
#define ULK_TOOLS_IMAGE_IO_H

#include <string>

#include "ulk_tools/frame.h"

namespace ulk_tools {

/// Reads the image at path into frame. False with "PATH: reason" on failure (frame then empty).
bool ReadImage(const std::string& path, Frame* frame, std::string* error);

/// Writes frame to path in the format its extension names, through a temporary file renamed
/// when complete. False with "PATH: reason" on failure; nothing is left under either name.
bool WriteImage(const std::string& path, const Frame& frame, std::string* error);

/// True when OpenImageIO has a writer for path's extension.
bool CanWriteImage(const std::string& path);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_IMAGE_IO_H

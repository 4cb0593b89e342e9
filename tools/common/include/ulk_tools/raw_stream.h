// Raw RGBA frames on byte streams, for pipes to and from other video tools.
//
// A raw stream is frames of width x height x 4 bytes back to back, rows top to bottom, no
// header (what "-f rawvideo -pix_fmt rgba" produces and expects). The size is agreed outside
// the stream (--raw WxH). Reads are exact: a frame is either read whole, or the stream ended
// cleanly before its first byte, or it is an error (a truncated last frame is never passed
// off as a frame). The caller owns the FILE* and may use any thread, one per stream.
#ifndef ULK_TOOLS_RAW_STREAM_H
#define ULK_TOOLS_RAW_STREAM_H

#include <cstdio>
#include <string>

#include "ulk_tools/frame.h"

namespace ulk_tools {

/// Outcome of reading one raw frame.
enum class RawReadResult {
    kFrame,  ///< a whole frame was read
    kEnd,    ///< the stream ended before the frame's first byte
    kError,  ///< read error or a partial frame; see the message
};

/// Reads one frame of frame's current size (allocate it first) from stream. kError with a
/// message naming the byte counts when the stream ends inside the frame or fails.
RawReadResult ReadRawFrame(std::FILE* stream, Frame* frame, std::string* error);

/// Writes frame to stream and flushes it. False with a message when the stream fails (a pipe
/// closed by the reader, a full disk).
bool WriteRawFrame(std::FILE* stream, const Frame& frame, std::string* error);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_RAW_STREAM_H

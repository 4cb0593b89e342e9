#include "ulk_tools/raw_stream.h"

#include <cerrno>
#include <cstring>

namespace ulk_tools {

// Frames have tight rows (frame.h), so a whole frame is one block of bytes: one read or write
// per frame, straight between the stream and the frame's pixels.

RawReadResult ReadRawFrame(std::FILE* stream, Frame* frame, std::string* error) {
    if (frame->Empty()) {
        *error = "raw frame size not set";
        return RawReadResult::kError;
    }
    const size_t total = frame->ByteSize();
    const size_t got = std::fread(frame->Data(), 1, total, stream);
    if (got == total) return RawReadResult::kFrame;
    if (std::ferror(stream)) {
        *error = std::string("raw input: ") + std::strerror(errno);
        return RawReadResult::kError;
    }
    if (got == 0) return RawReadResult::kEnd;
    *error = "raw input ended inside a frame: " + std::to_string(got) + " of " +
             std::to_string(total) + " bytes for " + SizeText(frame->Width(), frame->Height()) +
             " RGBA";
    return RawReadResult::kError;
}

bool WriteRawFrame(std::FILE* stream, const Frame& frame, std::string* error) {
    if (std::fwrite(frame.Data(), 1, frame.ByteSize(), stream) != frame.ByteSize()) {
        *error = std::string("raw output: ") + std::strerror(errno);
        return false;
    }
    // Flushed per frame so that the next program in the pipe sees it at once.
    if (std::fflush(stream) != 0) {
        *error = std::string("raw output: ") + std::strerror(errno);
        return false;
    }
    return true;
}

}  // namespace ulk_tools

#include "ulk_tools/raw_stream.h"

#include <cerrno>
#include <cstring>

namespace ulk_tools {

RawReadResult ReadRawFrame(std::FILE* stream, Frame* frame, std::string* error) {
    if (frame->Empty()) {
        *error = "raw frame size not set";
        return RawReadResult::kError;
    }
    const size_t rowBytes = static_cast<size_t>(frame->Width()) * 4;
    const size_t total = rowBytes * static_cast<size_t>(frame->Height());
    size_t got = 0;
    for (int y = 0; y < frame->Height(); ++y) {
        const size_t count = std::fread(frame->Row(y), 1, rowBytes, stream);
        got += count;
        if (count == rowBytes) continue;
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
    return RawReadResult::kFrame;
}

bool WriteRawFrame(std::FILE* stream, const Frame& frame, std::string* error) {
    const size_t rowBytes = static_cast<size_t>(frame.Width()) * 4;
    for (int y = 0; y < frame.Height(); ++y) {
        if (std::fwrite(frame.Row(y), 1, rowBytes, stream) != rowBytes) {
            *error = std::string("raw output: ") + std::strerror(errno);
            return false;
        }
    }
    // Flushed per frame so that the next program in the pipe sees it at once.
    if (std::fflush(stream) != 0) {
        *error = std::string("raw output: ") + std::strerror(errno);
        return false;
    }
    return true;
}

}  // namespace ulk_tools

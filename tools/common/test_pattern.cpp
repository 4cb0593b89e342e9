#include "ulk_tools/test_pattern.h"

#include <algorithm>
#include <cstdint>

namespace ulk_tools {

namespace {

constexpr uint8_t kBars[8][3] = {{255, 255, 255}, {255, 255, 0}, {0, 255, 255}, {0, 255, 0},
                                 {255, 0, 255},   {255, 0, 0},   {0, 0, 255},   {0, 0, 0}};
constexpr int kMarker = 8;

}  // namespace

void FillTestPattern(Frame* frame, int frameNumber) {
    const int width = frame->Width();
    const int height = frame->Height();
    if (width < 1 || height < 1) return;
    const int barsHeight = std::max(1, height * 2 / 3);
    // Unsigned arithmetic: any frame number, negative too, shifts the ramp without overflow.
    const unsigned shift = static_cast<unsigned>(frameNumber);
    for (int y = 0; y < height; ++y) {
        uint8_t* p = frame->Row(y);
        for (int x = 0; x < width; ++x, p += 4) {
            if (y < barsHeight) {
                const uint8_t* bar = kBars[static_cast<int64_t>(x) * 8 / width];
                p[0] = bar[0];
                p[1] = bar[1];
                p[2] = bar[2];
            } else {
                const uint8_t level = static_cast<uint8_t>(
                    static_cast<unsigned>(static_cast<int64_t>(x) * 256 / width) + shift);
                p[0] = p[1] = p[2] = level;
            }
            p[3] = 255;
        }
    }
    const unsigned number = static_cast<unsigned>(frameNumber);
    const uint8_t low = static_cast<uint8_t>(number & 0xFF);
    const uint8_t high = static_cast<uint8_t>((number >> 8) & 0xFF);
    for (int y = std::max(0, height - kMarker); y < height; ++y) {
        for (int x = 0; x < std::min(width, kMarker); ++x) {
            uint8_t* p = frame->Pixel(x, y);
            p[0] = low;
            p[1] = high;
            p[2] = static_cast<uint8_t>(255 - low);
        }
    }
}

int TestPatternFrameNumber(const Frame& frame) {
    if (frame.Empty()) return -1;
    const uint8_t* p = frame.Pixel(0, frame.Height() - 1);
    return p[0] | (p[1] << 8);
}

}  // namespace ulk_tools

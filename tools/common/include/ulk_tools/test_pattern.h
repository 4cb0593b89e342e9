// A built-in test picture, so a tool can render without any input file.
//
// The picture is deterministic: the same size and frame number always give the same
// pixels. The top two thirds are eight colour bars (white, yellow, cyan, green, magenta, red,
// blue, black), the bottom third a grey ramp that moves one step right per frame. The frame
// number is written into the pixels of the bottom-left 8 x 8 block (R = low byte, G = high
// byte, B = 255 - low byte), so consecutive frames always differ and a test can read the
// number back. Alpha is 255 everywhere.
#ifndef ULK_TOOLS_TEST_PATTERN_H
#define ULK_TOOLS_TEST_PATTERN_H

#include "ulk_tools/frame.h"

namespace ulk_tools {

/// Paints the test picture for frame into frame, at its current size (allocate it first).
void FillTestPattern(Frame* frame, int frameNumber);

/// The frame number FillTestPattern stored in frame's marker block (its low 16 bits).
int TestPatternFrameNumber(const Frame& frame);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_TEST_PATTERN_H

// Numbered image sequences: a file name with a placeholder for the frame number.
//
// Two spellings are understood. A run of '#' is replaced by the frame number padded with
// zeros to the run's length ("shot.####.exr", frame 7 -> "shot.0007.exr"). A printf-style
// "%d" or "%0Nd" is replaced likewise ("%04d" pads to 4, "%d" does not pad). Only the first
// placeholder in the file name counts; "%%" stands for a literal '%'. Numbers wider than the
// padding are written in full, negative ones with a leading '-'. Pure functions, except
// ListSequenceFrames, which reads the folder.
#ifndef ULK_TOOLS_SEQUENCE_H
#define ULK_TOOLS_SEQUENCE_H

#include <string>
#include <vector>

namespace ulk_tools {

/// A parsed sequence name: what comes before and after the number, and its zero padding.
struct SequencePattern {
    std::string prefix;  ///< text before the number, folder included
    std::string suffix;  ///< text after the number
    int padding = 0;     ///< minimum digits (0 or 1: none)
};

/// True when name holds a frame-number placeholder ('#' run, "%d" or "%0Nd").
bool IsSequencePattern(const std::string& name);

/// Splits name at its placeholder. False when it has none (or "%" is followed by anything but
/// a valid "%d", "%0Nd" or "%%"); error then says why.
bool ParseSequencePattern(const std::string& name, SequencePattern* pattern, std::string* error);

/// The file name of frame in pattern.
std::string SequenceFramePath(const SequencePattern& pattern, int frame);

/// The file name of frame in name; name itself when it is not a pattern.
std::string SequenceFramePath(const std::string& name, int frame);

/// Frame numbers of the files in pattern's folder that match it, ascending. A padded pattern
/// matches exactly its number of digits, or more when the number needs them.
std::vector<int> ListSequenceFrames(const SequencePattern& pattern);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_SEQUENCE_H

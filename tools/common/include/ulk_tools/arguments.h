// Parsers for the values of the tools' command-line options.
//
// Each parser is a pure function over the option's text: it fills its result and answers
// true, or answers false with a one-line message that quotes the text and says what was
// expected. Numbers are read with the C locale's rules whatever the process locale is.
#ifndef ULK_TOOLS_ARGUMENTS_H
#define ULK_TOOLS_ARGUMENTS_H

#include <string>
#include <string_view>

namespace ulk_tools {

/// An inclusive range of frame numbers.
struct FrameRange {
    int first = 0;  ///< first frame
    int last = 0;   ///< last frame, >= first
    /// Number of frames in the range.
    long long Count() const { return static_cast<long long>(last) - first + 1; }
};

/// Parses "A-B" or "A" (--frames). Numbers may be negative ("-5--1"); B must not be below A.
bool ParseFrameRange(std::string_view text, FrameRange* range, std::string* error);

/// Parses "WxH" (--raw, --size), each side 1 to kMaxFrameSide.
bool ParseSize(std::string_view text, int* width, int* height, std::string* error);

/// One --set option: a parameter value, at a time or for the whole shot.
struct SetArgument {
    std::string id;        ///< the parameter's identifier
    bool hasTime = false;  ///< true for "ID@TIME=TEXT"
    double time = 0.0;     ///< the key's time when hasTime
    std::string text;      ///< the value as text, possibly empty; may hold '=', '@' and spaces
};

/// Splits "ID=TEXT" or "ID@TIME=TEXT" at the first '=' (and the first '@' before it).
bool ParseSetArgument(std::string_view text, SetArgument* set, std::string* error);

/// Parses a whole decimal integer ("-12"); false without a message on anything else.
bool ParseInt(std::string_view text, int* value);

/// Parses a whole finite real number ("0.5", "-1e3"); false without a message otherwise.
bool ParseDouble(std::string_view text, double* value);

/// The shortest text ParseDouble reads back as exactly value ("0.5", "1e+100").
std::string FormatDouble(double value);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_ARGUMENTS_H

#include "ulk_tools/arguments.h"

#include <charconv>
#include <cmath>

#include "ulk_tools/frame.h"

namespace ulk_tools {

namespace {

std::string Quoted(std::string_view text) {
    return "'" + std::string(text) + "'";
}

}  // namespace

bool ParseInt(std::string_view text, int* value) {
    if (text.empty()) return false;
    const char* first = text.data();
    const char* last = text.data() + text.size();
    int parsed = 0;
    const auto result = std::from_chars(first, last, parsed);
    if (result.ec != std::errc() || result.ptr != last) return false;
    *value = parsed;
    return true;
}

bool ParseDouble(std::string_view text, double* value) {
    if (text.empty()) return false;
    // from_chars takes no '+'; people write "+0.5" in files, so allow it here.
    if (text.front() == '+') {
        text.remove_prefix(1);
        if (text.empty() || text.front() == '+' || text.front() == '-') return false;
    }
    const char* last = text.data() + text.size();
    double parsed = 0.0;
    const auto result = std::from_chars(text.data(), last, parsed);
    if (result.ec != std::errc() || result.ptr != last || !std::isfinite(parsed)) return false;
    *value = parsed;
    return true;
}

std::string FormatDouble(double value) {
    char buffer[64];
    const auto result = std::to_chars(buffer, buffer + sizeof buffer, value);
    return std::string(buffer, result.ptr);
}

bool ParseFrameRange(std::string_view text, FrameRange* range, std::string* error) {
    const std::string expected = "frame range " + Quoted(text) + ": expected A-B or A";
    // The separating '-' is the first one after the first character (which may be a sign).
    const size_t dash = text.size() > 1 ? text.find('-', 1) : std::string_view::npos;
    FrameRange parsed;
    if (dash == std::string_view::npos) {
        if (!ParseInt(text, &parsed.first)) {
            *error = expected;
            return false;
        }
        parsed.last = parsed.first;
    } else if (!ParseInt(text.substr(0, dash), &parsed.first) ||
               !ParseInt(text.substr(dash + 1), &parsed.last)) {
        *error = expected;
        return false;
    }
    if (parsed.last < parsed.first) {
        *error = "frame range " + Quoted(text) + ": last frame before first";
        return false;
    }
    *range = parsed;
    return true;
}

bool ParseSize(std::string_view text, int* width, int* height, std::string* error) {
    const size_t x = text.find_first_of("xX");
    int w = 0;
    int h = 0;
    if (x == std::string_view::npos || !ParseInt(text.substr(0, x), &w) ||
        !ParseInt(text.substr(x + 1), &h)) {
        *error = "size " + Quoted(text) + ": expected WIDTHxHEIGHT, e.g. 1920x1080";
        return false;
    }
    if (w < 1 || h < 1 || w > kMaxFrameSide || h > kMaxFrameSide) {
        *error =
            "size " + Quoted(text) + ": each side must be 1 to " + std::to_string(kMaxFrameSide);
        return false;
    }
    *width = w;
    *height = h;
    return true;
}

bool ParseSetArgument(std::string_view text, SetArgument* set, std::string* error) {
    const size_t equals = text.find('=');
    if (equals == std::string_view::npos) {
        *error = "--set " + Quoted(text) + ": expected ID=TEXT or ID@TIME=TEXT";
        return false;
    }
    const std::string_view head = text.substr(0, equals);
    const size_t at = head.find('@');
    SetArgument parsed;
    parsed.id = std::string(head.substr(0, at));
    parsed.text = std::string(text.substr(equals + 1));
    if (parsed.id.empty()) {
        *error = "--set " + Quoted(text) + ": missing parameter ID before '" +
                 (at == std::string_view::npos ? "=" : "@") + "'";
        return false;
    }
    if (at != std::string_view::npos) {
        parsed.hasTime = true;
        if (!ParseDouble(head.substr(at + 1), &parsed.time)) {
            *error = "--set " + Quoted(text) + ": time " + Quoted(head.substr(at + 1)) +
                     " is not a number";
            return false;
        }
    }
    *set = std::move(parsed);
    return true;
}

}  // namespace ulk_tools

#include "ulk_tools/sequence.h"

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <filesystem>
#include <system_error>

namespace ulk_tools {

namespace {

// More digits than any int has; a longer padding is a typo, not a wish.
constexpr int kMaxPadding = 32;

bool IsDigit(char c) {
    return c >= '0' && c <= '9';
}

// Result of looking for a placeholder in the file-name part of a name.
struct Scan {
    bool found = false;
    std::string error;
    SequencePattern pattern;
};

Scan ScanName(const std::string& name) {
    Scan scan;
    const size_t slash = name.find_last_of('/');
    const size_t start = slash == std::string::npos ? 0 : slash + 1;
    // The folder is taken literally; only the file name is interpreted.
    std::string text = name.substr(0, start);
    size_t i = start;
    while (i < name.size()) {
        const char c = name[i];
        if (c == '#' && !scan.found) {
            size_t end = i;
            while (end < name.size() && name[end] == '#') ++end;
            scan.found = true;
            scan.pattern.padding = static_cast<int>(std::min<size_t>(end - i, kMaxPadding + 1));
            scan.pattern.prefix = text;
            text.clear();
            i = end;
            continue;
        }
        if (c == '%' && i + 1 < name.size() && name[i + 1] == '%') {
            text += '%';
            i += 2;
            continue;
        }
        if (c == '%' && !scan.found) {
            size_t j = i + 1;
            const bool zero = j < name.size() && name[j] == '0';
            if (zero) ++j;
            size_t digitsEnd = j;
            while (digitsEnd < name.size() && IsDigit(name[digitsEnd])) ++digitsEnd;
            if (digitsEnd < name.size() && name[digitsEnd] == 'd') {
                int width = 0;
                if (digitsEnd > j) {
                    if (digitsEnd - j > 3)
                        width = kMaxPadding + 1;
                    else
                        std::from_chars(name.data() + j, name.data() + digitsEnd, width);
                }
                if (width > 0 && !zero) {
                    scan.error = "'" + name.substr(i, digitsEnd + 1 - i) +
                                 "' pads with spaces; use '%0" + std::to_string(width) + "d'";
                    return scan;
                }
                scan.found = true;
                scan.pattern.padding = width;
                scan.pattern.prefix = text;
                text.clear();
                i = digitsEnd + 1;
                continue;
            }
        }
        text += c;
        ++i;
    }
    if (scan.found) {
        scan.pattern.suffix = text;
        if (scan.pattern.padding > kMaxPadding) {
            scan.found = false;
            scan.error = "frame number padding longer than " + std::to_string(kMaxPadding);
        }
    }
    return scan;
}

}  // namespace

bool IsSequencePattern(const std::string& name) {
    return ScanName(name).found;
}

bool ParseSequencePattern(const std::string& name, SequencePattern* pattern, std::string* error) {
    Scan scan = ScanName(name);
    if (!scan.found) {
        *error =
            name + ": " +
            (scan.error.empty() ? "no frame number placeholder ('####' or '%04d')" : scan.error);
        return false;
    }
    *pattern = std::move(scan.pattern);
    return true;
}

std::string SequenceFramePath(const SequencePattern& pattern, int frame) {
    char digits[kMaxPadding + 16];
    std::snprintf(digits, sizeof digits, "%0*d", pattern.padding, frame);
    return pattern.prefix + digits + pattern.suffix;
}

std::string SequenceFramePath(const std::string& name, int frame) {
    Scan scan = ScanName(name);
    return scan.found ? SequenceFramePath(scan.pattern, frame) : name;
}

std::vector<int> ListSequenceFrames(const SequencePattern& pattern) {
    const size_t slash = pattern.prefix.find_last_of('/');
    const std::string folder =
        slash == std::string::npos ? "." : pattern.prefix.substr(0, slash + 1);
    const std::string head =
        slash == std::string::npos ? pattern.prefix : pattern.prefix.substr(slash + 1);
    std::vector<int> frames;
    std::error_code code;
    std::filesystem::directory_iterator it(folder, code), end;
    for (; !code && it != end; it.increment(code)) {
        const std::string name = it->path().filename().string();
        if (name.size() <= head.size() + pattern.suffix.size()) continue;
        if (name.compare(0, head.size(), head) != 0) continue;
        if (name.compare(name.size() - pattern.suffix.size(), pattern.suffix.size(),
                         pattern.suffix) != 0)
            continue;
        const char* first = name.data() + head.size();
        const char* last = name.data() + name.size() - pattern.suffix.size();
        int frame = 0;
        const auto parsed = std::from_chars(first, last, frame);
        if (parsed.ec != std::errc() || parsed.ptr != last) continue;
        // Only the spelling the pattern itself produces counts: "7" is not frame 7 of "####".
        const std::string expected =
            SequenceFramePath(SequencePattern{head, pattern.suffix, pattern.padding}, frame);
        if (expected == name) frames.push_back(frame);
    }
    std::sort(frames.begin(), frames.end());
    return frames;
}

}  // namespace ulk_tools

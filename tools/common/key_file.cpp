#include "ulk_tools/key_file.h"

#include <cmath>

#include "ulk_tools/arguments.h"
#include "ulk_tools/atomic_file.h"

namespace ulk_tools {

namespace {

bool IsBlank(char c) {
    return c == ' ' || c == '\t';
}

size_t SkipBlanks(std::string_view text, size_t i) {
    while (i < text.size() && IsBlank(text[i])) ++i;
    return i;
}

size_t SkipWord(std::string_view text, size_t i) {
    while (i < text.size() && !IsBlank(text[i])) ++i;
    return i;
}

// Messages quote what they found; a fuzzer's megabyte of garbage is cut short.
std::string Shown(std::string_view text) {
    constexpr size_t kLimit = 40;
    return "'" + std::string(text.substr(0, kLimit)) + (text.size() > kLimit ? "...'" : "'");
}

}  // namespace

bool ParseKeyText(std::string_view content, const std::string& fileName, std::vector<KeyLine>* keys,
                  std::string* error) {
    keys->clear();
    // A byte-order mark from a Windows editor is not part of the first ID.
    if (content.substr(0, 3) == "\xEF\xBB\xBF") content.remove_prefix(3);
    int number = 0;
    while (!content.empty()) {
        ++number;
        const size_t end = content.find('\n');
        std::string_view line = content.substr(0, end);
        content.remove_prefix(end == std::string_view::npos ? content.size() : end + 1);
        if (!line.empty() && line.back() == '\r') line.remove_suffix(1);

        const auto fail = [&](const std::string& message) {
            *error = fileName + ":" + std::to_string(number) + ": " + message;
            return false;
        };
        size_t i = SkipBlanks(line, 0);
        if (i == line.size() || line[i] == '#') continue;

        KeyLine key;
        key.line = number;
        const size_t idEnd = SkipWord(line, i);
        key.id = std::string(line.substr(i, idEnd - i));
        i = SkipBlanks(line, idEnd);
        if (i == line.size())
            return fail("key " + Shown(key.id) + " has no time (expected ID TIME TEXT)");
        const size_t timeEnd = SkipWord(line, i);
        const std::string_view time = line.substr(i, timeEnd - i);
        if (!ParseDouble(time, &key.time))
            return fail("key " + Shown(key.id) + ": time " + Shown(time) + " is not a number");
        key.text = std::string(line.substr(SkipBlanks(line, timeEnd)));
        keys->push_back(std::move(key));
    }
    return true;
}

bool FormatKeyText(const std::vector<KeyLine>& keys, std::string* content, std::string* error) {
    std::string out = "# ID TIME TEXT\n";
    for (const KeyLine& key : keys) {
        const auto fail = [&](const std::string& why) {
            *error = "key " + Shown(key.id) + " at time " + FormatDouble(key.time) + ": " + why;
            return false;
        };
        if (key.id.empty() || key.id.find_first_of(" \t\r\n") != std::string::npos ||
            key.id[0] == '#')
            return fail("the ID cannot be written to a key file");
        if (!std::isfinite(key.time)) return fail("the time is not a finite number");
        if (key.text.find_first_of("\r\n") != std::string::npos)
            return fail("the text holds a line break");
        if (!key.text.empty() && IsBlank(key.text[0])) return fail("the text starts with a blank");
        out += key.id;
        out += ' ';
        out += FormatDouble(key.time);
        if (!key.text.empty()) {
            out += ' ';
            out += key.text;
        }
        out += '\n';
    }
    *content = std::move(out);
    return true;
}

bool ReadKeyFile(const std::string& path, std::vector<KeyLine>* keys, std::string* error) {
    std::string content;
    if (!ReadWholeFile(path, &content, error)) return false;
    return ParseKeyText(content, path, keys, error);
}

bool WriteKeyFile(const std::string& path, const std::vector<KeyLine>& keys, std::string* error) {
    std::string content;
    if (!FormatKeyText(keys, &content, error)) {
        *error = path + ": " + *error;
        return false;
    }
    return WriteFileAtomically(path, content, error);
}

}  // namespace ulk_tools

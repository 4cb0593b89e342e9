// The key file reader over any bytes; what it accepts and the writer can write must read
// back to the same keys.
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "ulk_tools/key_file.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view content(reinterpret_cast<const char*>(data), size);
    std::vector<ulk_tools::KeyLine> keys;
    std::string error;
    if (!ulk_tools::ParseKeyText(content, "fuzz.keys", &keys, &error)) {
        if (error.rfind("fuzz.keys:", 0) != 0) {
            std::fprintf(stderr, "message does not name the file: %s\n", error.c_str());
            std::abort();
        }
        return 0;
    }
    std::string text;
    if (!ulk_tools::FormatKeyText(keys, &text, &error)) return 0;
    std::vector<ulk_tools::KeyLine> again;
    if (!ulk_tools::ParseKeyText(text, "again.keys", &again, &error) ||
        again.size() != keys.size()) {
        std::fprintf(stderr, "written keys do not read back: %s\n", error.c_str());
        std::abort();
    }
    for (size_t i = 0; i < keys.size(); ++i) {
        const bool sameTime = keys[i].time == again[i].time ||
                              (std::isnan(keys[i].time) && std::isnan(again[i].time));
        if (keys[i].id != again[i].id || !sameTime || keys[i].text != again[i].text) {
            std::fprintf(stderr, "key %zu reads back differently\n", i);
            std::abort();
        }
    }
    return 0;
}

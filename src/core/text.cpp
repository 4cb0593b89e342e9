#include "core/text.h"

#include <cstring>

namespace ulk {

void CopyTerminated(char* dest, const char* text, size_t size) {
    if (size == 0) return;
    size_t n = 0;
    if (text) {
        while (n < size - 1 && text[n] != '\0') ++n;
        std::memcpy(dest, text, n);
    }
    dest[n] = '\0';
}

void CopyPadded(char* dest, const char* text, size_t size) {
    if (size == 0) return;
    CopyTerminated(dest, text, size);
    const size_t n = std::strlen(dest);
    std::memset(dest + n, 0, size - n);
}

}  // namespace ulk

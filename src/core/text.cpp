#include "core/text.h"

#include <cstring>

namespace ulk {

void CopyTerminated(char* dest, const char* text, size_t size) {
    if (size == 0) return;
    // strnlen and one block copy: error records reset their texts on every
    // wrapped plug-in call, so this sits on the per-frame path.
    const size_t n = text ? strnlen(text, size - 1) : 0;
    std::memcpy(dest, text ? text : "", n);
    dest[n] = '\0';
}

void CopyPadded(char* dest, const char* text, size_t size) {
    if (size == 0) return;
    CopyTerminated(dest, text, size);
    const size_t n = std::strlen(dest);
    std::memset(dest + n, 0, size - n);
}

}  // namespace ulk

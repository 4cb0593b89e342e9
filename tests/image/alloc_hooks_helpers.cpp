#include "alloc_hooks.h"

#include <new>

namespace alloc_hooks {
size_t gLastArraySize = 0;
bool gFailNext = false;
}  // namespace alloc_hooks

// The replacements forward to the ordinary operators, so the library's ordinary
// delete and delete[] still match what they return.
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    if (alloc_hooks::gFailNext) {
        alloc_hooks::gFailNext = false;
        return nullptr;
    }
    try {
        return ::operator new(size);
    } catch (...) {
        return nullptr;
    }
}

void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    alloc_hooks::gLastArraySize = size;
    // Sizes no machine has are refused here too, as the ordinary operator would, but
    // without a sanitizer's report.
    if (size > (size_t{1} << 40)) return nullptr;
    if (alloc_hooks::gFailNext) {
        alloc_hooks::gFailNext = false;
        return nullptr;
    }
    try {
        return ::operator new[](size);
    } catch (...) {
        return nullptr;
    }
}

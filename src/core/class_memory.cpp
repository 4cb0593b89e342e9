#include "core/class_memory.h"

namespace ulk {

void* AllocReporting(ulkAllocCallback callback, size_t size, ulkError& error) {
    if (!callback) {
        error.SetError(kErrorNullCallback);
        return nullptr;
    }
    void* p = callback(size);
    if (!p) error.SetError(kErrorOutOfMemory);
    return p;
}

void FreeReporting(ulkFreeCallback callback, void* p, ulkError& error) {
    if (!callback) {
        error.SetError(kErrorNullCallback);
        return;
    }
    if (p) callback(p);
}

}  // namespace ulk

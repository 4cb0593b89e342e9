// The per-class memory pairs of the host model, instance and overlay share one
// behaviour: a missing callback records kErrorNullCallback, an allocator that
// gives nothing records kErrorOutOfMemory, and the record's texts are kept.
#ifndef ULK_SRC_CORE_CLASS_MEMORY_H
#define ULK_SRC_CORE_CLASS_MEMORY_H

#include <cstddef>

#include "ulk/core/error.h"
#include "ulk/core/host_global.h"

namespace ulk {

/// size bytes from callback (even for size 0), reporting into error.
void* AllocReporting(ulkAllocCallback callback, size_t size, ulkError& error);
/// Gives p (when not null) to callback, reporting a missing callback into error.
void FreeReporting(ulkFreeCallback callback, void* p, ulkError& error);

}  // namespace ulk

#endif  // ULK_SRC_CORE_CLASS_MEMORY_H

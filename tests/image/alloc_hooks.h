// Replaces the non-throwing global allocation operators in the image test program, so a
// test can see how many bytes libulk asked for and make the next allocation fail.
#ifndef ULK_TESTS_IMAGE_ALLOC_HOOKS_H
#define ULK_TESTS_IMAGE_ALLOC_HOOKS_H

#include <cstddef>

namespace alloc_hooks {

/// Size of the last non-throwing array allocation (new (std::nothrow) T[n]).
extern size_t gLastArraySize;
/// When true, the next non-throwing allocation (array or not) answers null, then resets.
extern bool gFailNext;

}  // namespace alloc_hooks

#endif  // ULK_TESTS_IMAGE_ALLOC_HOOKS_H

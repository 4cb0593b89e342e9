// Bounded text copies used throughout the library (not part of the interface).
#ifndef ULK_SRC_CORE_TEXT_H
#define ULK_SRC_CORE_TEXT_H

#include <cstddef>

namespace ulk {

/// Copies at most size - 1 characters of text into dest and terminates it;
/// a null text gives an empty string; size 0 writes nothing.
void CopyTerminated(char* dest, const char* text, size_t size);

/// Copies at most size - 1 characters of text into dest and fills the rest of
/// the size bytes with NULs, so dest is always terminated; size 0 writes nothing.
void CopyPadded(char* dest, const char* text, size_t size);

}  // namespace ulk

#endif  // ULK_SRC_CORE_TEXT_H

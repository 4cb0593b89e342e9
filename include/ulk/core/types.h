// Small value records shared by several parts of the interface.
#ifndef ULK_CORE_TYPES_H
#define ULK_CORE_TYPES_H

#include <cstddef>
#include <cstdint>

/// Version of an interface library: major.minor, a beta number (0 for a
/// release) and a reserved field. Passed by value and by pointer.
struct ulkVersion {
    int16_t major;
    int16_t minor;
    uint16_t beta;
    int32_t reserved;
};

/// A rectangle of pixels; right and bottom are inclusive.
struct ulkBounds {
    int32_t left;
    int32_t top;
    int32_t right;
    int32_t bottom;
};

#endif  // ULK_CORE_TYPES_H

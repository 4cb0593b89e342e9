// A module that exports none of the entry points: it starts, offers one
// model, and can make nothing.
#include "ulk/export.h"

ULK_PLUGIN_EXPORT int notAnEntryPoint(void) {
    return 42;
}

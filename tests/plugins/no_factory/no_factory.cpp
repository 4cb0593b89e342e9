// A module that loads and starts but offers no model factory.
#include "ulk/ulk.h"

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 1;
}

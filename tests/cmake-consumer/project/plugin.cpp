// A module that offers two models.
#include <ulk/ulk.h>

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 2;
}

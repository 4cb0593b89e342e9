// A frei0r filter whose instances can never be made (f0r_construct answers
// null), as happens to real effects that run out of memory or refuse a frame
// size. Loaded by the bridge like any installed effect.
// frei0r.h declares the functions without C linkage of its own.
extern "C" {
#include <frei0r.h>

int f0r_init() {
    return 1;
}
void f0r_deinit() {}
void f0r_get_plugin_info(f0r_plugin_info_t* info) {
    info->name = "Unconstructible";
    info->author = "ULK tests";
    info->plugin_type = F0R_PLUGIN_TYPE_FILTER;
    info->color_model = F0R_COLOR_MODEL_RGBA8888;
    info->frei0r_version = FREI0R_MAJOR_VERSION;
    info->major_version = 1;
    info->minor_version = 0;
    info->num_params = 0;
    info->explanation = "fails to construct";
}
void f0r_get_param_info(f0r_param_info_t*, int) {}
f0r_instance_t f0r_construct(unsigned int, unsigned int) {
    return nullptr;
}
void f0r_destruct(f0r_instance_t) {}
void f0r_set_param_value(f0r_instance_t, f0r_param_t, int) {}
void f0r_get_param_value(f0r_instance_t, f0r_param_t, int) {}
void f0r_update(f0r_instance_t, double, const uint32_t*, uint32_t*) {}

}  // extern "C"

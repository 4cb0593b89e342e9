#include "modules/host_attribute.h"

namespace {

ulkHostAttributeCallback gHostAttributeCallback = nullptr;

}  // namespace

void InstallHostAttributeCallback(ulkHostAttributeCallback callback) {
    gHostAttributeCallback = callback;
}

namespace ulk {

ulkHostAttributeCallback GetHostAttributeCallback() {
    return gHostAttributeCallback;
}

}  // namespace ulk

#include "ulk/overlay/overlay_mode.h"

#include <cstring>
#include <new>

ulkOverlayMode::ulkOverlayMode(const char* name) : mName(nullptr) {
    if (!name) return;
    const size_t length = std::strlen(name);
    mName = new (std::nothrow) char[length + 1];
    if (mName) std::memcpy(mName, name, length + 1);
}

ulkOverlayMode::~ulkOverlayMode() {
    delete[] mName;
}

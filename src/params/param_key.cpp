#include "ulk/params/param_key.h"

#include <cmath>
#include <cstring>
#include <new>

ulkParamKey::ulkParamKey(double time)
    : mValue(nullptr), mValueSize(0), mUserData(nullptr), mIsActive(false) {
    SetTime(time);
}

ulkParamKey::~ulkParamKey() {
    delete[] static_cast<unsigned char*>(mValue);
}

void ulkParamKey::SetTime(double time) {
    mTime = time;
    // Truncation to whole 0.00000001 steps. Within +-21.47483648 this is exactly
    // the 32-bit integer conversion; beyond it the same truncation still holds
    // instead of an out-of-range integer conversion. From 2^53 steps on (about
    // 9e7) a double holds no fraction of a step: scaling back would only add
    // rounding error (and beyond about 1.8e300 overflow to infinity), so that a
    // key set at a time would not be found at it. Such times stay as they are.
    const double steps = time * 100000000.0;
    mKeyTime = std::fabs(steps) < 9007199254740992.0 ? std::trunc(steps) / 100000000.0 : time;
}

bool ulkParamKey::SetValue(const void* source, size_t size) {
    if (mValue) {
        if (source && size == mValueSize) {
            // memmove: the source may be this very buffer.
            std::memmove(mValue, source, size);
            return true;
        }
        delete[] static_cast<unsigned char*>(mValue);
        mValue = nullptr;
        mValueSize = 0;
    }
    if (!source || size == 0) return true;
    unsigned char* buffer = new (std::nothrow) unsigned char[size];
    if (!buffer) return false;
    std::memcpy(buffer, source, size);
    mValue = buffer;
    mValueSize = size;
    return true;
}

bool ulkParamKey::CopyValue(const ulkParamKey* other) {
    if (!other) return SetValue(nullptr, 0);
    return SetValue(other->mValue, other->mValueSize);
}

#include "ulk/params/boolean.h"

#include <cstring>
#include <new>

#include "c_locale.h"

const char ulkPBoolean::className[] = "Boolean";

ulkPBoolean* ulkPBoolean::New(const char* label, const char* id, void* value, size_t size) {
    ulkPBoolean* boolean = new (std::nothrow) ulkPBoolean(label, id, value, size);
    if (boolean && (boolean->GetNumKeys() == 0 || !boolean->mLabel || !boolean->mID)) {
        Delete(boolean);
        return nullptr;
    }
    return boolean;
}

ulkPBoolean::ulkPBoolean(const char* label, const char* id, void* value, size_t size)
    : ulkParameter(label, id, value, size, 0) {
    if (value && size > 0) {
        SetKeyTime(0.0, value, size);
    } else {
        const unsigned char off = 0;
        SetKeyTime(0.0, &off, 1);
    }
}

ulkPBoolean::~ulkPBoolean() {}

bool ulkPBoolean::GetValue(double time) {
    unsigned char value = 0;
    Interpolate(time, &value, 1, -1);
    return value != 0;
}

void ulkPBoolean::SetValue(double time, bool value) {
    const unsigned char byte = value ? 1 : 0;
    SetKeyTime(time, &byte, 1);
}

bool ulkPBoolean::GetDefaultValue() {
    return mDefaultValue && *static_cast<const unsigned char*>(mDefaultValue) != 0;
}

bool ulkPBoolean::Evaluate(double time, void* buffer, size_t, int) {
    if (buffer || !mInstanceValue || mValueSize == 0) return false;
    return Interpolate(time, mInstanceValue, mValueSize, -1);
}

bool ulkPBoolean::ParseValue(double time, const char* text) {
    if (!text) return false;
    // "true" is what WriteValue prints, so it has to read back as true.
    SetValue(time, std::strcmp(text, "1") == 0 || std::strcmp(text, "true") == 0);
    return true;
}

bool ulkPBoolean::WriteValue(double time, ulkFile* file) {
    if (!file) return false;
    const bool value = GetValue(time);
    ulkCLocaleScope cLocale;
    return file->Printf("%s", value ? "true" : "false") != 0;
}

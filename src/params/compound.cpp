#include "ulk/params/compound.h"

#include <cstdio>
#include <cstring>
#include <new>

#include "c_locale.h"

const char ulkPColorRGB::className[] = "ColorRGB";
const char ulkPColorHSV::className[] = "ColorHSV";
const char ulkPPoint2D::className[] = "Point2D";
const char ulkPRect2D::className[] = "Rect2D";

namespace {

// Storage of a size other than the record's would be read or written past one
// end or the other; it is refused. Null storage or size 0 mean none.
bool AcceptsStorage(const void* value, size_t size, size_t recordSize) {
    return !value || size == 0 || size == recordSize;
}

// Every channel into its own double of the destination (channel -1), or one
// channel at the destination's start. Channels beyond the destination's size
// are left out so that a small destination is never overrun.
bool CompoundInterpolate(ulkParameter* parameter, double time, void* destination, size_t size,
                         int channel) {
    if (!parameter) return false;
    if (channel >= 0)
        return ulkParameter::sLinearInterpolator(parameter, time, destination, size, channel);
    const int channels = parameter->GetNumChannels();
    for (int c = 0; c < channels; ++c) {
        const size_t offset = sizeof(double) * static_cast<size_t>(c);
        if (offset + sizeof(double) > size) break;
        ulkParameter::sLinearInterpolator(
            parameter, time, static_cast<unsigned char*>(destination) + offset, sizeof(double), c);
    }
    return true;
}

// Reads exactly count comma-separated doubles; false otherwise.
bool ScanFields(const char* text, int count, double* f) {
    if (!text) return false;
    ulkCLocaleScope cLocale;
    switch (count) {
        case 2:
            return std::sscanf(text, "%lg,%lg", &f[0], &f[1]) == 2;
        case 3:
            return std::sscanf(text, "%lg,%lg,%lg", &f[0], &f[1], &f[2]) == 3;
        case 4:
            return std::sscanf(text, "%lg,%lg,%lg,%lg", &f[0], &f[1], &f[2], &f[3]) == 4;
        default:
            return false;
    }
}

bool PrintFields(ulkFile* file, int count, const double* f) {
    if (!file) return false;
    ulkCLocaleScope cLocale;
    switch (count) {
        case 2:
            return file->Printf("%lg,%lg", f[0], f[1]) != 0;
        case 3:
            return file->Printf("%lg,%lg,%lg", f[0], f[1], f[2]) != 0;
        case 4:
            return file->Printf("%lg,%lg,%lg,%lg", f[0], f[1], f[2], f[3]) != 0;
        default:
            return false;
    }
}

template <class Record>
Record RecordFromDefault(const void* defaultValue, size_t valueSize) {
    Record record{};
    if (defaultValue)
        std::memcpy(&record, defaultValue, valueSize < sizeof(record) ? valueSize : sizeof(record));
    return record;
}

template <class Kind>
Kind* Complete(Kind* parameter) {
    if (parameter &&
        (parameter->GetNumKeys() == 0 || !parameter->GetLabel() || !parameter->GetID())) {
        ulkParameter::Delete(parameter);
        return nullptr;
    }
    return parameter;
}

}  // namespace

// ------------------------------------------------------------- RGB colour

ulkPColorRGB* ulkPColorRGB::New(const char* label, const char* id, void* value, size_t size) {
    if (!AcceptsStorage(value, size, sizeof(ulkColorRGB))) return nullptr;
    return Complete(new (std::nothrow) ulkPColorRGB(label, id, value, size));
}

ulkPColorRGB::ulkPColorRGB(const char* label, const char* id, void* value, size_t size)
    : ulkParameter(label, id, value, size, 3) {
    _SetChannelInfo(0, "Red", "red");
    _SetChannelInfo(1, "Green", "green");
    _SetChannelInfo(2, "Blue", "blue");
    const ulkColorRGB first = {0.0, 0.0, 0.0};
    if (value && size > 0)
        SetKeyTime(0.0, value, size);
    else
        SetKeyTime(0.0, &first, sizeof(first));
    SetInterpolator(sLinearInterpolator);
}

ulkPColorRGB::~ulkPColorRGB() {}

ulkColorRGB ulkPColorRGB::GetValue(double time) {
    ulkColorRGB value{};
    Interpolate(time, &value, sizeof(value), -1);
    return value;
}

void ulkPColorRGB::SetValue(double time, ulkColorRGB value) {
    SetKeyTime(time, &value, sizeof(value));
}

ulkColorRGB ulkPColorRGB::GetDefaultValue() {
    return RecordFromDefault<ulkColorRGB>(mDefaultValue, mValueSize);
}

bool ulkPColorRGB::Evaluate(double time, void* buffer, size_t, int channel) {
    if (buffer || !mInstanceValue || mValueSize == 0) return false;
    return Interpolate(time, mInstanceValue, mValueSize, channel);
}

bool ulkPColorRGB::ParseValue(double time, const char* text) {
    double f[3];
    if (!ScanFields(text, 3, f)) return false;
    SetValue(time, ulkColorRGB{f[0], f[1], f[2]});
    return true;
}

bool ulkPColorRGB::WriteValue(double time, ulkFile* file) {
    const ulkColorRGB value = GetValue(time);
    const double f[3] = {value.red, value.green, value.blue};
    return PrintFields(file, 3, f);
}

bool ulkPColorRGB::sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                       size_t size, int channel) {
    return CompoundInterpolate(parameter, time, destination, size, channel);
}

// ------------------------------------------------------------- HSV colour

ulkPColorHSV* ulkPColorHSV::New(const char* label, const char* id, void* value, size_t size) {
    if (!AcceptsStorage(value, size, sizeof(ulkColorHSV))) return nullptr;
    return Complete(new (std::nothrow) ulkPColorHSV(label, id, value, size));
}

ulkPColorHSV::ulkPColorHSV(const char* label, const char* id, void* value, size_t size)
    : ulkParameter(label, id, value, size, 3) {
    // The hue's identifier is "red", as stored files and hosts know it.
    _SetChannelInfo(0, "Hue", "red");
    _SetChannelInfo(1, "Saturation", "saturation");
    _SetChannelInfo(2, "Value", "value");
    const ulkColorHSV first = {0.0, 0.0, 0.0};
    if (value && size > 0)
        SetKeyTime(0.0, value, size);
    else
        SetKeyTime(0.0, &first, sizeof(first));
    SetInterpolator(sLinearInterpolator);
}

ulkPColorHSV::~ulkPColorHSV() {}

ulkColorHSV ulkPColorHSV::GetValue(double time) {
    ulkColorHSV value{};
    Interpolate(time, &value, sizeof(value), -1);
    return value;
}

void ulkPColorHSV::SetValue(double time, ulkColorHSV value) {
    SetKeyTime(time, &value, sizeof(value));
}

ulkColorHSV ulkPColorHSV::GetDefaultValue() {
    return RecordFromDefault<ulkColorHSV>(mDefaultValue, mValueSize);
}

bool ulkPColorHSV::Evaluate(double time, void* buffer, size_t, int channel) {
    if (buffer || !mInstanceValue || mValueSize == 0) return false;
    return Interpolate(time, mInstanceValue, mValueSize, channel);
}

bool ulkPColorHSV::ParseValue(double time, const char* text) {
    double f[3];
    if (!ScanFields(text, 3, f)) return false;
    SetValue(time, ulkColorHSV{f[0], f[1], f[2]});
    return true;
}

bool ulkPColorHSV::WriteValue(double time, ulkFile* file) {
    const ulkColorHSV value = GetValue(time);
    const double f[3] = {value.hue, value.saturation, value.value};
    return PrintFields(file, 3, f);
}

bool ulkPColorHSV::sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                       size_t size, int channel) {
    return CompoundInterpolate(parameter, time, destination, size, channel);
}

// ------------------------------------------------------------- point

ulkPPoint2D* ulkPPoint2D::New(const char* label, const char* id, void* value, size_t size) {
    if (!AcceptsStorage(value, size, sizeof(ulkPoint2D))) return nullptr;
    return Complete(new (std::nothrow) ulkPPoint2D(label, id, value, size));
}

ulkPPoint2D::ulkPPoint2D(const char* label, const char* id, void* value, size_t size)
    : ulkParameter(label, id, value, size, 2) {
    _SetChannelInfo(0, "X", "x");
    _SetChannelInfo(1, "Y", "y");
    const ulkPoint2D first = {0.0, 0.0};
    if (value && size > 0)
        SetKeyTime(0.0, value, size);
    else
        SetKeyTime(0.0, &first, sizeof(first));
    SetInterpolator(sLinearInterpolator);
}

ulkPPoint2D::~ulkPPoint2D() {}

ulkPoint2D ulkPPoint2D::GetValue(double time) {
    ulkPoint2D value{};
    Interpolate(time, &value, sizeof(value), -1);
    return value;
}

void ulkPPoint2D::SetValue(double time, ulkPoint2D value) {
    SetKeyTime(time, &value, sizeof(value));
}

ulkPoint2D ulkPPoint2D::GetDefaultValue() {
    return RecordFromDefault<ulkPoint2D>(mDefaultValue, mValueSize);
}

bool ulkPPoint2D::Evaluate(double time, void* buffer, size_t, int channel) {
    if (buffer || !mInstanceValue || mValueSize == 0) return false;
    return Interpolate(time, mInstanceValue, mValueSize, channel);
}

bool ulkPPoint2D::ParseValue(double time, const char* text) {
    double f[2];
    if (!ScanFields(text, 2, f)) return false;
    SetValue(time, ulkPoint2D{f[0], f[1]});
    return true;
}

bool ulkPPoint2D::WriteValue(double time, ulkFile* file) {
    const ulkPoint2D value = GetValue(time);
    const double f[2] = {value.x, value.y};
    return PrintFields(file, 2, f);
}

bool ulkPPoint2D::sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                      size_t size, int channel) {
    return CompoundInterpolate(parameter, time, destination, size, channel);
}

// ------------------------------------------------------------- rectangle

ulkPRect2D* ulkPRect2D::New(const char* label, const char* id, void* value, size_t size) {
    if (!AcceptsStorage(value, size, sizeof(ulkRect2D))) return nullptr;
    return Complete(new (std::nothrow) ulkPRect2D(label, id, value, size));
}

ulkPRect2D::ulkPRect2D(const char* label, const char* id, void* value, size_t size)
    : ulkParameter(label, id, value, size, 4) {
    _SetChannelInfo(0, "X1", "x1");
    _SetChannelInfo(1, "Y1", "y1");
    _SetChannelInfo(2, "X2", "x2");
    _SetChannelInfo(3, "Y2", "y2");
    const ulkRect2D first = {0.0, 0.0, 1.0, 1.0};
    if (value && size > 0)
        SetKeyTime(0.0, value, size);
    else
        SetKeyTime(0.0, &first, sizeof(first));
    SetInterpolator(sLinearInterpolator);
}

ulkPRect2D::~ulkPRect2D() {}

ulkRect2D ulkPRect2D::GetValue(double time) {
    ulkRect2D value{};
    Interpolate(time, &value, sizeof(value), -1);
    return value;
}

void ulkPRect2D::SetValue(double time, ulkRect2D value) {
    SetKeyTime(time, &value, sizeof(value));
}

ulkRect2D ulkPRect2D::GetDefaultValue() {
    return RecordFromDefault<ulkRect2D>(mDefaultValue, mValueSize);
}

bool ulkPRect2D::Evaluate(double time, void* buffer, size_t, int channel) {
    if (buffer || !mInstanceValue || mValueSize == 0) return false;
    return Interpolate(time, mInstanceValue, mValueSize, channel);
}

bool ulkPRect2D::ParseValue(double time, const char* text) {
    double f[4];
    if (!ScanFields(text, 4, f)) return false;
    SetValue(time, ulkRect2D{f[0], f[1], f[2], f[3]});
    return true;
}

bool ulkPRect2D::WriteValue(double time, ulkFile* file) {
    const ulkRect2D value = GetValue(time);
    const double f[4] = {value.x1, value.y1, value.x2, value.y2};
    return PrintFields(file, 4, f);
}

bool ulkPRect2D::sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                     size_t size, int channel) {
    return CompoundInterpolate(parameter, time, destination, size, channel);
}

#include "ulk/params/number.h"

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <limits>
#include <new>

#include "c_locale.h"

const char ulkPNumber::className[] = "Number";

namespace {

// Truncation toward zero into an int that saturates instead of overflowing;
// NaN gives 0.
int32_t TruncateToInt(double value) {
    if (std::isnan(value)) return 0;
    if (value >= 2147483647.0) return std::numeric_limits<int32_t>::max();
    if (value <= -2147483648.0) return std::numeric_limits<int32_t>::min();
    return static_cast<int32_t>(value);
}

}  // namespace

ulkPNumber* ulkPNumber::New(const char* label, const char* id, void* value, size_t size,
                            double minimum, double maximum, double increment, ulkPNumberType type,
                            bool textBelow) {
    return New(label, id, kPNumberWidgetDefault, value, size, minimum, maximum, increment, type,
               textBelow);
}

ulkPNumber* ulkPNumber::New(const char* label, const char* id, ulkPNumberWidget widget, void* value,
                            size_t size, double minimum, double maximum, double increment,
                            ulkPNumberType type, bool textBelow) {
    if (type != kPNumberReal && type != kPNumberInteger) return nullptr;
    // Storage of the wrong size would be read or written past its end.
    const bool hasStorage = value && size > 0;
    if (hasStorage && size != (type == kPNumberInteger ? sizeof(int32_t) : sizeof(double)))
        return nullptr;
    ulkPNumber* number = new (std::nothrow)
        ulkPNumber(label, id, widget, value, size, minimum, maximum, increment, type, textBelow);
    if (number && (number->GetNumKeys() == 0 || !number->mLabel || !number->mID ||
                   (hasStorage && type == kPNumberInteger && !number->mOwnValue))) {
        Delete(number);
        return nullptr;
    }
    return number;
}

ulkPNumber::ulkPNumber(const char* label, const char* id, ulkPNumberWidget widget, void* value,
                       size_t size, double minimum, double maximum, double increment,
                       ulkPNumberType type, bool textBelow)
    : ulkParameter(label, id, value, size, 0),
      mType(type),
      mMinimum(minimum),
      mMaximum(maximum),
      mIncrement(increment),
      mTextBelow(textBelow),
      mIntegerTarget(nullptr),
      mWidget(widget),
      mOwnValue(nullptr) {
    if (mIncrement <= 0.0) mIncrement = (maximum - minimum) / 10.0;
    if (std::fabs(mIncrement) < 1.0 || std::fabs(minimum) > 9999.0 || std::fabs(maximum) > 9999.0)
        mTextBelow = true;

    if (value && size > 0) {
        if (type == kPNumberInteger) {
            // The int is only the target: the number evaluates into a double of
            // its own and then stores the truncated value into the int.
            int32_t start;
            std::memcpy(&start, value, sizeof(start));
            const double startValue = start;
            mOwnValue = new (std::nothrow) double(startValue);
            if (!mOwnValue) return;
            mIntegerTarget = static_cast<int*>(value);
            mInstanceValue = mOwnValue;
            mValueSize = sizeof(double);
            delete[] static_cast<unsigned char*>(mDefaultValue);
            unsigned char* copy = new (std::nothrow) unsigned char[sizeof(double)];
            if (copy) std::memcpy(copy, &startValue, sizeof(double));
            mDefaultValue = copy;
            SetKeyTime(0.0, &startValue, sizeof(double));
            SetInterpolator(sBasicInterpolator);
        } else {
            SetKeyTime(0.0, value, sizeof(double));
            SetInterpolator(sLinearInterpolator);
        }
    } else {
        const double start = minimum + (maximum - minimum) / 2.0;
        SetKeyTime(0.0, &start, sizeof(double));
        SetInterpolator(type == kPNumberReal ? sLinearInterpolator : sBasicInterpolator);
    }
}

ulkPNumber::~ulkPNumber() {
    delete mOwnValue;
}

double ulkPNumber::GetValue(double time) {
    double value = 0.0;
    Interpolate(time, &value, sizeof(value), 0);
    return value;
}

void ulkPNumber::SetValue(double time, double value) {
    double clamped = value < mMaximum ? value : mMaximum;
    if (mMinimum > clamped) clamped = mMinimum;
    SetKeyTime(time, &clamped, sizeof(clamped));
}

double ulkPNumber::GetDefaultValue() {
    double value = 0.0;
    if (mDefaultValue)
        std::memcpy(&value, mDefaultValue, mValueSize < sizeof(value) ? mValueSize : sizeof(value));
    return value;
}

bool ulkPNumber::Evaluate(double time, void* buffer, size_t, int) {
    if (buffer || !mInstanceValue || mValueSize == 0) return false;
    const bool ok = Interpolate(time, mInstanceValue, mValueSize, 0);
    if (ok && mIntegerTarget) {
        double value;
        std::memcpy(&value, mInstanceValue, sizeof(value));
        const int32_t truncated = TruncateToInt(value);
        std::memcpy(mIntegerTarget, &truncated, sizeof(truncated));
    }
    return ok;
}

bool ulkPNumber::ParseValue(double time, const char* text) {
    if (!text) return false;
    double value;
    int fields;
    {
        ulkCLocaleScope cLocale;
        fields = std::sscanf(text, "%lg", &value);
    }
    if (fields != 1) return false;
    SetValue(time, value);
    return true;
}

bool ulkPNumber::WriteValue(double time, ulkFile* file) {
    if (!file) return false;
    const double value = GetValue(time);
    ulkCLocaleScope cLocale;
    return file->Printf("%lg", value) != 0;
}

bool ulkPNumber::sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                     size_t size, int) {
    return ulkParameter::sLinearInterpolator(parameter, time, destination, size, 0);
}

bool ulkPNumber::sBasicInterpolator(ulkParameter* parameter, double time, void* destination,
                                    size_t size, int) {
    return ulkParameter::sBasicInterpolator(parameter, time, destination, size, -1);
}

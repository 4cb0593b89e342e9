#include "ulk/params/parameter.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <limits>
#include <new>

namespace {

// Two key times are the same when they differ by less than this.
constexpr double kKeyTolerance = 0.00000001;

// Channel counts are small (at most four); this only keeps a wild count from
// turning into a huge allocation.
constexpr int kMaxChannels = 1 << 16;

double KeyTime(const ulkList& keys, int index) {
    return static_cast<const ulkParamKey*>(keys.GetEntry(index))->GetTime();
}

// First index in [first, last) whose key time satisfies pred, or last. The
// keys stand in time order and pred is false for a prefix and true for the
// rest, so there is exactly one such boundary and this finds the same index
// as a scan from first upward. Parameters animated frame by frame hold many
// keys and are evaluated at neighbouring times one frame after the other, so
// the boundary found last time and the one after it are tried first; a
// binary search finds any other.
template <class Pred>
int FirstWhere(const ulkList& keys, int first, int last, Pred pred, int& hint) {
    for (int guess = hint; guess <= hint + 1; ++guess) {
        if (guess < first || guess > last) continue;
        if ((guess == last || pred(KeyTime(keys, guess))) &&
            (guess == first || !pred(KeyTime(keys, guess - 1)))) {
            hint = guess;
            return guess;
        }
    }
    int low = first, high = last;
    while (low < high) {
        const int middle = low + (high - low) / 2;
        if (pred(KeyTime(keys, middle)))
            high = middle;
        else
            low = middle + 1;
    }
    hint = low;
    return low;
}

bool ReadChannel(const ulkParamKey* key, int channel, double* value) {
    const size_t offset = sizeof(double) * static_cast<size_t>(channel);
    if (!key->GetValue() || key->GetValueSize() < offset + sizeof(double)) return false;
    std::memcpy(value, static_cast<const unsigned char*>(key->GetValue()) + offset, sizeof(double));
    return true;
}

// Truncation toward zero that saturates instead of overflowing; NaN gives 0.
int32_t TruncateToInt(double value) {
    if (std::isnan(value)) return 0;
    if (value >= 2147483647.0) return std::numeric_limits<int32_t>::max();
    if (value <= -2147483648.0) return std::numeric_limits<int32_t>::min();
    return static_cast<int32_t>(value);
}

size_t CopyBytes(const void* source, size_t size, void* destination, size_t destinationSize) {
    if (!source || !destination) return 0;
    const size_t count = std::min(size, destinationSize);
    if (count) std::memcpy(destination, source, count);
    return count;
}

}  // namespace

// ------------------------------------------------------------- construction

ulkParameter::ulkParameter(const char* label, const char* id, void* value, size_t size,
                           int numChannels)
    : mLabel(_newstr(label ? label : "")),
      mID(_newstr(id ? id : "")),
      mInstanceValue(value),
      mValueSize(size),
      mDefaultValue(nullptr),
      mGroup(nullptr),
      mNumChannels(numChannels),
      mChannelLabels(nullptr),
      mChannelIDs(nullptr),
      mKeys(10),
      mUserData(nullptr),
      mHidden(false),
      mTouched(false),
      mInterpolator(sBasicInterpolator),
      mSearchHint(0) {
    if (value && size > 0) {
        unsigned char* copy = new (std::nothrow) unsigned char[size];
        if (copy) std::memcpy(copy, value, size);
        mDefaultValue = copy;
    }
    if (numChannels >= 1 && numChannels <= kMaxChannels) {
        mChannelLabels = new (std::nothrow) char*[numChannels]();
        mChannelIDs = new (std::nothrow) char*[numChannels]();
        if (!mChannelLabels || !mChannelIDs) {
            delete[] mChannelLabels;
            delete[] mChannelIDs;
            mChannelLabels = nullptr;
            mChannelIDs = nullptr;
        }
    }
}

ulkParameter::~ulkParameter() {
    delete[] mLabel;
    delete[] mID;
    delete[] static_cast<unsigned char*>(mDefaultValue);
    if (mChannelLabels && mChannelIDs) {
        for (int c = 0; c < mNumChannels; ++c) {
            delete[] mChannelLabels[c];
            delete[] mChannelIDs[c];
        }
    }
    delete[] mChannelLabels;
    delete[] mChannelIDs;
    while (ulkNode* key = mKeys.RemTail()) delete static_cast<ulkParamKey*>(key);
}

void ulkParameter::Delete(ulkParameter* parameter) {
    delete parameter;
}

char* ulkParameter::_newstr(const char* text) {
    if (!text) return nullptr;
    const size_t length = std::strlen(text);
    char* copy = new (std::nothrow) char[length + 1];
    if (copy) std::memcpy(copy, text, length + 1);
    return copy;
}

void ulkParameter::_SetChannelInfo(int channel, const char* label, const char* id) {
    if (channel < 0 || channel >= mNumChannels || !mChannelLabels || !mChannelIDs) return;
    delete[] mChannelLabels[channel];
    delete[] mChannelIDs[channel];
    mChannelLabels[channel] = _newstr(label);
    mChannelIDs[channel] = _newstr(id);
}

const char* ulkParameter::GetChannelLabel(int channel) const {
    if (channel < 0 || channel >= mNumChannels || !mChannelLabels) return nullptr;
    return mChannelLabels[channel];
}

const char* ulkParameter::GetChannelID(int channel) const {
    if (channel < 0 || channel >= mNumChannels || !mChannelIDs) return nullptr;
    return mChannelIDs[channel];
}

// ------------------------------------------------------------- value helpers

void ulkParameter::_AssignValue(int value, void* destination, size_t size) {
    if (!destination) return;
    if (size == 1) {
        const int8_t v = static_cast<int8_t>(value);
        std::memcpy(destination, &v, 1);
    } else if (size == 2) {
        const int16_t v = static_cast<int16_t>(value);
        std::memcpy(destination, &v, 2);
    } else if (size == 4) {
        const int32_t v = static_cast<int32_t>(value);
        std::memcpy(destination, &v, 4);
    }
}

void ulkParameter::_AssignValue(double value, void* destination, size_t size) {
    if (!destination) return;
    if (size == 4) {
        const float v = static_cast<float>(value);
        std::memcpy(destination, &v, 4);
    } else if (size == 8) {
        std::memcpy(destination, &value, 8);
    }
}

int ulkParameter::_AssignValue(const void* source, size_t size, double* value) {
    if (!source) return 0;
    double result;
    if (size == 1) {
        int8_t v;
        std::memcpy(&v, source, 1);
        result = v;
    } else if (size == 2) {
        int16_t v;
        std::memcpy(&v, source, 2);
        result = v;
    } else if (size == 4) {
        int32_t v;
        std::memcpy(&v, source, 4);
        result = v;
    } else if (size == 8) {
        std::memcpy(&result, source, 8);
    } else {
        return 0;
    }
    if (value) *value = result;
    return TruncateToInt(result);
}

size_t ulkParameter::CopyDefaultValue(void* destination, size_t destinationSize) {
    return CopyBytes(mDefaultValue, mValueSize, destination, destinationSize);
}

size_t ulkParameter::CopyInstanceValue(void* destination, size_t destinationSize) {
    return CopyBytes(mInstanceValue, mValueSize, destination, destinationSize);
}

// ------------------------------------------------------------- evaluation

bool ulkParameter::Compute(double time, int channel) {
    return Evaluate(time, nullptr, 0, channel);
}

void ulkParameter::SetInterpolator(ulkInterpolator interpolator) {
    mInterpolator = interpolator ? interpolator : sBasicInterpolator;
}

bool ulkParameter::ParseValue(double, const char*) {
    return true;
}

bool ulkParameter::WriteValue(double, ulkFile*) {
    return true;
}

bool ulkParameter::Interpolate(double time, void* destination, size_t size, int channel) {
    return mInterpolator(this, time, destination, size, channel);
}

bool ulkParameter::sBasicInterpolator(ulkParameter* parameter, double time, void* destination,
                                      size_t size, int channel) {
    return parameter && parameter->InterpolateBasic(time, destination, size, channel);
}

bool ulkParameter::sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                       size_t size, int channel) {
    return parameter && parameter->InterpolateLinear(time, destination, size, channel);
}

bool ulkParameter::InterpolateBasic(double time, void* destination, size_t size, int) {
    const int count = mKeys.GetCount();
    if (count == 0) return false;
    int index = GetKeyIndex(time);
    if (index < 0) {
        if (count == 1 || KeyTime(mKeys, 0) > time)
            index = 0;
        else if (time > KeyTime(mKeys, count - 1))
            index = count - 1;
        else
            index = GetPrevKey(time);
        // Only a time that compares with nothing (NaN) finds no earlier key.
        if (index < 0) index = 0;
    }
    const ulkParamKey* key = _Key(index);
    const size_t bytes = std::min(size, key->GetValueSize());
    if (bytes == 0) return true;
    if (!destination) return false;
    std::memcpy(destination, key->GetValue(), bytes);
    return true;
}

bool ulkParameter::InterpolateLinear(double time, void* destination, size_t size, int channel) {
    const int count = mKeys.GetCount();
    // A channel the keys do not hold cannot be read: nothing is written.
    if (count == 0 || channel < 0) return false;
    double value;
    if (count == 1 || KeyTime(mKeys, 0) > time || std::isnan(time)) {
        if (!ReadChannel(_Key(0), channel, &value)) return false;
    } else if (time > KeyTime(mKeys, count - 1)) {
        if (!ReadChannel(_Key(count - 1), channel, &value)) return false;
    } else {
        const int i = FirstWhere(
            mKeys, 1, count, [time](double t) { return t >= time; }, mSearchHint);
        const int p = i - 1;
        double ap, ai;
        if (!ReadChannel(_Key(p), channel, &ap) || !ReadChannel(_Key(i), channel, &ai))
            return false;
        const double tp = KeyTime(mKeys, p);
        const double ti = KeyTime(mKeys, i);
        // Two keys at one time (moved there with ulkParamKey::SetTime) would divide
        // by zero; the later key's value is the value at that time.
        if (ti > tp) {
            const double f = (time - tp) / (ti - tp);
            value = ap - (ap - ai) * f;
        } else {
            value = ai;
        }
    }
    if (!destination && (size == 4 || size == 8)) return false;
    _AssignValue(value, destination, size);
    return true;
}

// ------------------------------------------------------------- keys

ulkParamKey* ulkParameter::GetKey(int index) const {
    if (index < 0 || index >= mKeys.GetCount()) return nullptr;
    return _Key(index);
}

double ulkParameter::GetKeyTime(int index) const {
    if (index < 0 || index >= mKeys.GetCount()) return 0.0;
    return KeyTime(mKeys, index);
}

void* ulkParameter::GetKeyValue(int index) const {
    if (index < 0 || index >= mKeys.GetCount()) return nullptr;
    return _Key(index)->GetValue();
}

int ulkParameter::GetKeyIndex(double time) const {
    const int count = mKeys.GetCount();
    // The keys within the tolerance of the time form one run in a time-ordered
    // list: find the first key not below the run, then check it is inside.
    const int index = FirstWhere(
        mKeys, 0, count, [time](double t) { return t - time > -kKeyTolerance; }, mSearchHint);
    if (index < count && std::fabs(KeyTime(mKeys, index) - time) < kKeyTolerance) return index;
    return -1;
}

int ulkParameter::GetPrevKey(double time) const {
    const int match = GetKeyIndex(time);
    if (match >= 0) return match - 1;
    // The last key strictly before the time.
    return FirstWhere(
               mKeys, 0, mKeys.GetCount(), [time](double t) { return !(t < time); }, mSearchHint) -
           1;
}

int ulkParameter::GetNextKey(double time) const {
    const int count = mKeys.GetCount();
    const int match = GetKeyIndex(time);
    if (match >= 0) return match + 1 < count ? match + 1 : -1;
    const int index = FirstWhere(
        mKeys, 0, count, [time](double t) { return t > time; }, mSearchHint);
    return index < count ? index : -1;
}

bool ulkParameter::SetKeyTime(double time, const void* value, size_t size) {
    // A key at NaN or infinity could never be found again and would break the
    // time order every search relies on.
    if (!std::isfinite(time)) return false;
    const int match = GetKeyIndex(time);
    if (match >= 0) return value ? _Key(match)->SetValue(value, size) : true;

    ulkParamKey* key = new (std::nothrow) ulkParamKey(time);
    if (!key) return false;
    const int next = GetNextKey(time);
    const int count = mKeys.GetCount();
    // Grow geometrically: keys set frame by frame would otherwise copy the
    // whole slot array every few keys.
    if (count + 1 > mKeys.mMaxEntries) mKeys.SetMaxEntries(std::max(count + 1, count * 2));
    const int position = next < 0 ? count : next;
    if (!mKeys.Insert(key, position)) {
        delete key;
        return false;
    }

    bool ok;
    if (value && size > 0) {
        ok = key->SetValue(value, size);
    } else if (position > 0) {
        ok = key->CopyValue(_Key(position - 1));
    } else if (position + 1 < mKeys.GetCount()) {
        ok = key->CopyValue(_Key(position + 1));
    } else {
        ok = true;  // the only key, and nothing to copy from
    }
    if (!ok) {
        // Keep the list as it was rather than leave a key without its value.
        mKeys.Remove(position);
        delete key;
    }
    return ok;
}

bool ulkParameter::ChangeKeyTime(double time, const void* value, size_t size) {
    const int match = GetKeyIndex(time);
    if (match < 0) return false;
    return value ? _Key(match)->SetValue(value, size) : true;
}

bool ulkParameter::ClearKey(int index) {
    const int count = mKeys.GetCount();
    if (count == 1 || index < 0 || index >= count) return false;
    ulkParamKey* key = _Key(index);
    mKeys.Remove(index);
    delete key;
    return true;
}

bool ulkParameter::ClearKeyTime(double time) {
    const int match = GetKeyIndex(time);
    if (match < 0) return false;
    return ClearKey(match);
}

void ulkParameter::SetKeyIsActive(bool active, double time) {
    const int match = GetKeyIndex(time);
    if (match >= 0) _Key(match)->SetIsActive(active);
}

#include "ulk/params/param_string.h"

#include <cstring>
#include <new>

#include "c_locale.h"

const char ulkPString::className[] = "String";

namespace {

constexpr size_t kMaxStringSize = 256;
// WriteValue reads the text into a buffer comfortably larger than any value.
constexpr size_t kWriteBufferSize = 1024;

const char* const kTooLong =
    "ulkPString::SetValue, string longer then the current parameter buffer!";

}  // namespace

ulkPString* ulkPString::New(const char* label, const char* id, void* value, size_t size,
                            ulkPStringType type) {
    if (size == 0) throw "ulkPString::New, size must be > 0!";
    if (size > kMaxStringSize) throw "ulkPString::New, size must be <= 256!";
    // An exception from the constructor releases the object on its way out.
    ulkPString* string = new (std::nothrow) ulkPString(label, id, value, size, type);
    if (string && (string->GetNumKeys() == 0 || !string->mLabel || !string->mID)) {
        Delete(string);
        return nullptr;
    }
    return string;
}

ulkPString::ulkPString(const char* label, const char* id, void* value, size_t size,
                       ulkPStringType type)
    : ulkParameter(label, id, value, size, 0), mType(type) {
    if (value) {
        // Read the storage only as far as its size: a text without its zero
        // inside the buffer does not fit and is refused like any text too long.
        const char* text = static_cast<const char*>(value);
        if (std::memchr(text, 0, size) == nullptr) throw kTooLong;
        SetValue(0.0, text);
    } else {
        SetValue(0.0, nullptr);  // the first key: an empty text
    }
}

ulkPString::~ulkPString() {}

void ulkPString::SetValue(double time, const char* text) {
    char buffer[kMaxStringSize] = {};
    if (text) {
        const size_t length = std::strlen(text);
        if (length >= mValueSize) throw kTooLong;
        std::memcpy(buffer, text, length);
    }
    buffer[mValueSize - 1] = '\0';
    SetKeyTime(time, buffer, mValueSize);
}

bool ulkPString::GetValue(double time, char* destination, size_t destinationSize) {
    if (!destination || destinationSize < mValueSize) return false;
    return Interpolate(time, destination, mValueSize, -1);
}

bool ulkPString::Evaluate(double time, void* buffer, size_t bufferSize, int) {
    void* destination = buffer;
    if (!buffer) {
        destination = mInstanceValue;
        if (!destination) return false;
    } else if (bufferSize <= mValueSize) {
        return false;
    }
    if (mValueSize == 0) return false;
    return Interpolate(time, destination, mValueSize, -1);
}

bool ulkPString::ParseValue(double time, const char* text) {
    if (!text) return false;
    SetValue(time, text);
    return true;
}

bool ulkPString::WriteValue(double time, ulkFile* file) {
    if (!file) return false;
    char text[kWriteBufferSize] = {};
    if (!GetValue(time, text, sizeof(text))) return false;
    ulkCLocaleScope cLocale;
    return file->Printf("%s", text) != 0;
}

#include "ulk/params/file.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "c_locale.h"

namespace {

locale_t CLocale() {
    // Made once and kept for the life of the process: the threads that format
    // values may still hold it while the library unloads.
    static const locale_t sLocale = newlocale(LC_ALL_MASK, "C", static_cast<locale_t>(0));
    return sLocale;
}

}  // namespace

ulkCLocaleScope::ulkCLocaleScope() : mPrevious(static_cast<locale_t>(0)) {
    const locale_t c = CLocale();
    if (c) mPrevious = uselocale(c);
}

ulkCLocaleScope::~ulkCLocaleScope() {
    if (mPrevious) uselocale(mPrevious);
}

ulkFile::~ulkFile() {}

int ulkFile::Printf(const char* format, ...) {
    va_list args;
    va_start(args, format);
    const int result = VPrintf(format, args);
    va_end(args);
    return result;
}

int ulkFile::VPrintf(const char*, va_list) {
    return 2;
}

ulkMemoryFile::~ulkMemoryFile() {
    std::free(mText);
}

int ulkMemoryFile::VPrintf(const char* format, va_list args) {
    if (!format) return 0;
    ulkCLocaleScope cLocale;
    va_list measure;
    va_copy(measure, args);
    const int length = std::vsnprintf(nullptr, 0, format, measure);
    va_end(measure);
    if (length < 0) return 0;
    const size_t needed = mLength + static_cast<size_t>(length) + 1;
    if (needed > mCapacity) {
        size_t capacity = mCapacity ? mCapacity : 64;
        while (capacity < needed) capacity *= 2;
        char* text = static_cast<char*>(std::realloc(mText, capacity));
        if (!text) return 0;
        mText = text;
        mCapacity = capacity;
    }
    std::vsnprintf(mText + mLength, static_cast<size_t>(length) + 1, format, args);
    mLength += static_cast<size_t>(length);
    return 2;
}

const char* ulkMemoryFile::GetText() const {
    return mText ? mText : "";
}

void ulkMemoryFile::Clear() {
    mLength = 0;
    if (mText) mText[0] = '\0';
}

#include "ulk/core/host_global.h"

#include <cstdio>
#include <cstring>

#include "core/text.h"

ulkAllocCallback ulkHostGlobal::mAllocCallback = nullptr;
ulkFreeCallback ulkHostGlobal::mFreeCallback = nullptr;
ulkConsoleCallback ulkHostGlobal::mConsoleCallback = nullptr;
char* ulkHostGlobal::mHostInfoString = nullptr;
char* ulkHostGlobal::mHostVendor = nullptr;
char* ulkHostGlobal::mHostAppname = nullptr;
char* ulkHostGlobal::mHostVersion = nullptr;
char* ulkHostGlobal::mHostVersionString = nullptr;
ulkVersion ulkHostGlobal::mHostULKVersion = {1, 0, 0, 0};

namespace {

const ulkVersion kLibraryVersion = {1, 5, 0, 0};

// Replaces a stored text with a copy of at most maxLen characters of text made
// with the host's allocator, releasing the text it replaces. A null text keeps
// the stored one.
void StoreText(char*& slot, const char* text, size_t maxLen) {
    if (!text) return;
    size_t n = std::strlen(text);
    if (n > maxLen) n = maxLen;
    char* copy = static_cast<char*>(ulkHostGlobal::AllocMem(n + 1));
    if (copy) {
        std::memcpy(copy, text, n);
        copy[n] = '\0';
    }
    ulkHostGlobal::FreeMem(slot);
    slot = copy;
}

void CopyOut(char* dest, size_t len, const char* stored) {
    if (dest && stored) ulk::CopyTerminated(dest, stored, len);
}

void ReleaseText(char*& slot) {
    if (!slot) return;
    ulkHostGlobal::FreeMem(slot);
    slot = nullptr;
}

}  // namespace

void* ulkHostGlobal::AllocMem(size_t size) {
    if (!mAllocCallback || size == 0) return nullptr;
    return mAllocCallback(size);
}

void ulkHostGlobal::FreeMem(void* p) {
    if (mFreeCallback && p) mFreeCallback(p);
}

int ulkHostGlobal::ConsolePrintf(const char* text) {
    if (!mConsoleCallback) return 0;
    // The text is data: a '%' in a plug-in's message must be printed, not
    // interpreted by a host callback that formats its first argument.
    return mConsoleCallback("%s", text ? text : "");
}

void ulkHostGlobal::SetHostDescription(const char* info, const char* vendor, const char* appname,
                                       const char* version) {
    const size_t unbounded = static_cast<size_t>(-1) - 1;
    StoreText(mHostInfoString, info, unbounded);
    StoreText(mHostVendor, vendor, unbounded);
    StoreText(mHostAppname, appname, unbounded);
    StoreText(mHostVersion, version, unbounded);
}

void ulkHostGlobal::GetHostDescription(char* info, size_t infoLen, char* vendor, size_t vendorLen,
                                       char* appname, size_t appnameLen, char* version,
                                       size_t versionLen) {
    CopyOut(info, infoLen, mHostInfoString);
    CopyOut(vendor, vendorLen, mHostVendor);
    CopyOut(appname, appnameLen, mHostAppname);
    CopyOut(version, versionLen, mHostVersion);
}

void ulkHostGlobal::GetLibraryVersion(char* text, size_t len, ulkVersion* version) {
    if (version) *version = kLibraryVersion;
    if (!text) return;
    char number[16];
    std::snprintf(number, sizeof number, "%d.0%d", kLibraryVersion.major, kLibraryVersion.minor);
    char line[64];
    if (kLibraryVersion.beta == 0)
        std::snprintf(line, sizeof line, "ULK Library Version %.4s\n", number);
    else
        std::snprintf(line, sizeof line, "ULK Library Version %.4sb%d\n", number,
                      kLibraryVersion.beta);
    ulk::CopyPadded(text, line, len);
}

void ulkHostGlobal::SetHostLibraryVersion(const char* text, size_t len, ulkVersion version) {
    StoreText(mHostVersionString, text, len);
    mHostULKVersion = version;
}

void ulkHostGlobal::GetHostLibraryVersion(char* text, size_t len, ulkVersion* version) {
    if (text && mHostVersionString) ulk::CopyPadded(text, mHostVersionString, len);
    if (version) *version = mHostULKVersion;
}

void ulkHostGlobal::FreeULKGlobalMemory() {
    // Without a release function the texts are forgotten, as documented.
    ReleaseText(mHostInfoString);
    ReleaseText(mHostVendor);
    ReleaseText(mHostAppname);
    ReleaseText(mHostVersion);
    ReleaseText(mHostVersionString);
}

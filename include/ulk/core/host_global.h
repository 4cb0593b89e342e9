// Process-wide host services: memory, console, host description, versions,
// and the process-wide modes (play mode, optical-flow mode).
//
// The host installs its services in ulkHostGlobal once at start, before it
// opens modules, and calls FreeULKGlobalMemory at the end while its release
// function is still installed. Plug-ins reach the same services, read-only,
// through ulkGlobal. The callback slots and stored texts are unsynchronised;
// the modes are atomic, so instances may render on separate threads.
#ifndef ULK_CORE_HOST_GLOBAL_H
#define ULK_CORE_HOST_GLOBAL_H

#include <cstddef>
#include <cstdint>

#include "ulk/core/types.h"
#include "ulk/export.h"

/// How the host is playing. The library gives meaning to 0 and 1 only (they
/// decide the render flag modules read); any other value is stored unchanged.
enum ulkPlayMode : int32_t {
    kPlayModeRender = 0,  ///< final rendering: render flag 1
    kPlayModePlay = 1     ///< interactive playback: render flag 0
};

/// Host allocator, release function and console output.
typedef void* (*ulkAllocCallback)(size_t size);
typedef void (*ulkFreeCallback)(void* p);
typedef int (*ulkConsoleCallback)(const char* format, ...);

/// The host's process-wide services. Static members only.
class ULK_API ulkHostGlobal {
public:
    // --- memory
    /// Installs or replaces the host's allocator.
    static void SetAllocCallback(ulkAllocCallback callback) { mAllocCallback = callback; }
    /// Installs or replaces the host's release function.
    static void SetFreeCallback(ulkFreeCallback callback) { mFreeCallback = callback; }
    /// size bytes from the host's allocator; null without an allocator or for size 0.
    static void* AllocMem(size_t size);
    /// Gives p back to the host's release function; nothing without one or for null.
    static void FreeMem(void* p);

    // --- console
    static void SetConsoleCallback(ulkConsoleCallback callback) { mConsoleCallback = callback; }
    /// Prints text on the host's console (as data, never as a format); 0 without a callback.
    static int ConsolePrintf(const char* text);

    // --- host description (texts are copied with the host's allocator)
    /// Stores copies of the four texts, releasing the ones they replace; a null
    /// text keeps the one stored before.
    static void SetHostDescription(const char* info, const char* vendor, const char* appname,
                                   const char* version);
    /// Copies the stored texts out, each cut to its length - 1 and terminated;
    /// a null destination or a text never stored leaves that destination untouched.
    static void GetHostDescription(char* info, size_t infoLen, char* vendor, size_t vendorLen,
                                   char* appname, size_t appnameLen, char* version,
                                   size_t versionLen);

    // --- versions
    /// This library's version {1, 5, 0, 0} and, when text is given, its line
    /// "ULK Library Version 1.05\n", cut to len - 1 and NUL-padded to len.
    static void GetLibraryVersion(char* text, size_t len, ulkVersion* version);
    /// Stores the interface version the host was built against and, when text
    /// is given, at most len characters of its text.
    static void SetHostLibraryVersion(const char* text, size_t len, ulkVersion version);
    /// What SetHostLibraryVersion stored (text cut to len - 1 and NUL-padded).
    static void GetHostLibraryVersion(char* text, size_t len, ulkVersion* version);

    /// Releases every stored text through the host's release function.
    static void FreeULKGlobalMemory();

    static ulkAllocCallback mAllocCallback;
    static ulkFreeCallback mFreeCallback;
    static ulkConsoleCallback mConsoleCallback;
    static char* mHostInfoString;
    static char* mHostVendor;
    static char* mHostAppname;
    static char* mHostVersion;
    static char* mHostVersionString;
    static ulkVersion mHostULKVersion;
};

/// The host's services as a plug-in sees them: read and use, never set.
class ULK_API ulkGlobal {
public:
    /// Memory from the host's allocator (null without one or for size 0).
    static void* AllocMem(size_t size) { return ulkHostGlobal::AllocMem(size); }
    /// Gives memory from AllocMem back to the host.
    static void FreeMem(void* p) { ulkHostGlobal::FreeMem(p); }
    /// Prints text on the host's console.
    static int ConsolePrintf(const char* text) { return ulkHostGlobal::ConsolePrintf(text); }
    /// The host's description texts (see ulkHostGlobal::GetHostDescription).
    static void GetHostDescription(char* info, size_t infoLen, char* vendor, size_t vendorLen,
                                   char* appname, size_t appnameLen, char* version,
                                   size_t versionLen) {
        ulkHostGlobal::GetHostDescription(info, infoLen, vendor, vendorLen, appname, appnameLen,
                                          version, versionLen);
    }
    /// The host's interface version and its text.
    static void GetHostLibraryVersion(char* text, size_t len, ulkVersion* version) {
        ulkHostGlobal::GetHostLibraryVersion(text, len, version);
    }
};

/// Sets the process-wide play mode (1 at start).
ULK_API void ulkSetPlayMode(ulkPlayMode mode);
/// The process-wide play mode.
ULK_API ulkPlayMode ulkGetPlayMode();
/// Sets the process-wide optical-flow mode (1 at start); modules read it
/// through the function handed to them at start-up.
ULK_API void ULKSetOpticalFlowMode(int32_t mode);

#endif  // ULK_CORE_HOST_GLOBAL_H

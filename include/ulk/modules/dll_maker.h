// ulkDLLMaker: the process-wide registry of loaded plug-in modules.
//
// Every host model gets its module here by path and hands it back when it
// closes. A module is loaded and started once per path (exact text) and shared
// by all users of that path; its reference count says how many hold it. On
// the last Close the close mode decides whether it is unloaded at once or kept
// for reuse. At most mMaxDLLs modules are loaded at a time (1 at start): when
// the bound is reached, Open evicts the oldest idle module, and fails when
// every loaded module is in use. Static members only; not thread-safe.
#ifndef ULK_MODULES_DLL_MAKER_H
#define ULK_MODULES_DLL_MAKER_H

#include <cstdint>

#include "ulk/core/list.h"
#include "ulk/export.h"
#include "ulk/modules/dll.h"

/// What Close does when a module's last user lets go.
enum ulkCloseMode_t : int32_t {
    kCloseNow = 0,     ///< shut the module down, unload and destroy it
    kCloseKeep = 1,    ///< keep it loaded and registered for reuse (any other value too)
    kCloseDefault = 2  ///< use the registry's default mode
};

class ULK_API ulkDLLMaker {
public:
    /// The loaded module for path, loading and starting it on first use, or
    /// null: no path, bound reached with nothing idle, load or start-up failed.
    /// startUpArg and info reach the module only when it is first loaded.
    static ulkDLL* Open(const char* path, unsigned char* startUpArg, hostAppInfo* info);
    /// Releases one use of dll; a module the registry does not hold is ignored.
    static void Close(ulkDLL* dll, ulkCloseMode_t mode);
    /// Sets the bound on loaded modules (and the list's growth grain); true.
    static bool SetActiveDLLs(short n);
    /// Sets the mode kCloseDefault stands for (kCloseNow at start).
    static void SetDefaultCloseMode(ulkCloseMode_t mode) { mCloseMode = mode; }

    /// How many modules are loaded now.
    static int GetNumLoaded() { return mDLLList.GetCount(); }

    static int16_t mMaxDLLs;
    static ulkCloseMode_t mCloseMode;
    static ulkList mDLLList;

protected:
    /// The first loaded module whose path equals path exactly, or null.
    static ulkDLL* Lookup(const char* path);
    /// Whether dll is a loaded module of the registry.
    static bool IsMember(const ulkDLL* dll);
    /// Unloads the oldest idle module; false when every module is in use.
    static bool MakeRoom();
};

#endif  // ULK_MODULES_DLL_MAKER_H

// Puts the process-wide module registry back to its start state around a test.
#ifndef ULK_TEST_REGISTRY_GUARD_H
#define ULK_TEST_REGISTRY_GUARD_H

#include <dlfcn.h>

#include <string>

#include "ulk/modules/dll_maker.h"

/// Unloads every module the registry still holds and restores its defaults.
inline void ResetRegistry() {
    while (ulkDLLMaker::mDLLList.GetCount() > 0) {
        ulkDLL* dll = static_cast<ulkDLL*>(ulkDLLMaker::mDLLList.GetEntry(0));
        while (dll->GetRefCount() > 1) ulkDLLMaker::Close(dll, kCloseKeep);
        ulkDLLMaker::Close(dll, kCloseNow);
    }
    ulkDLLMaker::SetActiveDLLs(1);
    ulkDLLMaker::SetDefaultCloseMode(kCloseNow);
}

/// Whether the shared object at path is loaded in this process.
inline bool IsLoaded(const std::string& path) {
    void* handle = dlopen(path.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (!handle) return false;
    dlclose(handle);
    return true;
}

#endif  // ULK_TEST_REGISTRY_GUARD_H

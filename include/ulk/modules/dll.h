// ulkDLL and ulkNTDLL: one loaded plug-in module.
//
// ulkDLL knows the module's path, whether it is loaded, how many effect models
// it offers and how many users hold it, and drives the module's start-up,
// shut-down and attribute exchange through its entry points. ulkNTDLL is the
// platform module that loads the library (dlopen with RTLD_NOW | RTLD_LOCAL)
// and looks its symbols up. Module objects are created, shared and destroyed
// only by the registry, ulkDLLMaker; hosts get them from ulkDLLMaker::Open.
#ifndef ULK_MODULES_DLL_H
#define ULK_MODULES_DLL_H

#include <cstdint>

#include "ulk/core/list.h"
#include "ulk/export.h"
#include "ulk/modules/entry_points.h"

class ULK_API ulkDLL : public ulkNode {
public:
    ulkDLL(const ulkDLL&) = delete;
    ulkDLL& operator=(const ulkDLL&) = delete;

    // --- platform hooks
    /// Loads the library; true when it is loaded.
    virtual bool SystemOpen() = 0;
    /// Unloads the library when it is loaded; a second call does nothing.
    virtual void Close() = 0;
    /// Called before every call into the module's code; does nothing here.
    virtual void SetUpEnv() {}
    /// Called after every call into the module's code; does nothing here.
    virtual void SetDownEnv() {}
    /// Resource hooks behind ulkHostModel::OpenEnv, CloseEnv and IsEnvOpen.
    virtual bool OpenResource() { return true; }
    virtual void CloseResource() {}
    virtual bool IsResourceOpen() { return false; }
    /// Address of an exported symbol, or null.
    virtual const void* GetSymbol(const char* name) = 0;
    /// A text about the platform module's state.
    virtual const char* GetErrorString() const = 0;
    /// Releases the name buffer.
    virtual ~ulkDLL();

    // --- the module's life
    /// Loads the library (SystemOpen).
    bool Open() { return SystemOpen(); }
    /// Runs the start-up entry point and hands over the attribute functions
    /// (0, 3, 14, and 15 when a host callback is installed); false when the
    /// module is not loaded or its start-up answered false.
    bool StartUp(unsigned char* startUpArg);
    /// Runs the shut-down entry point when the module is loaded.
    void ShutDown();
    /// Sends the host's record as attribute 1 (nothing for null).
    void InitHostInfo(hostAppInfo* info);
    /// Asks the module how many models it offers (1 without ulkNumModels_v1).
    void InitNumModels();

    // --- state
    /// The number of models the module offers; the argument is ignored.
    unsigned short GetNumModels(float = 0.0f) const { return mNumModels; }
    /// The module's path as given: the registry's key.
    const char* GetName() const { return mName; }
    /// Whether the library is loaded.
    bool IsOpen() const { return mIsOpen; }
    /// How many users hold the module (kept by the registry).
    int16_t GetRefCount() const { return mRefCount; }

protected:
    ulkDLL();
    /// True when the name buffer exists.
    bool Init() const { return mName != nullptr; }
    /// Makes the name buffer hold path (growing it beyond 256 bytes as needed).
    bool SetName(const char* path);

    char* mName;
    bool mIsOpen;
    uint16_t mNumModels;
    int16_t mRefCount;

    friend class ulkDLLMaker;
};

/// The platform module: a library loaded with dlopen.
class ULK_API ulkNTDLL : public ulkDLL {
public:
    /// A module for path; nothing is loaded until Open.
    explicit ulkNTDLL(const char* path);
    ~ulkNTDLL() override;

    bool SystemOpen() override;
    void Close() override;
    const void* GetSymbol(const char* name) override;
    /// Always "Not yet".
    const char* GetErrorString() const override;

protected:
    void* mHandle;
    char* mPath;
};

#endif  // ULK_MODULES_DLL_H

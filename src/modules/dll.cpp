#include "ulk/modules/dll.h"

#include <dlfcn.h>

#include <cstring>
#include <new>

#include "core/process_modes.h"
#include "modules/host_attribute.h"

namespace {

const size_t kNameBufferSize = 256;

template <typename Proc>
Proc Lookup(ulkDLL& dll, const char* name) {
    return reinterpret_cast<Proc>(const_cast<void*>(dll.GetSymbol(name)));
}

void* ModeFunction(ulkModeFunction function) {
    return reinterpret_cast<void*>(function);
}

}  // namespace

ulkDLL::ulkDLL()
    : mName(new (std::nothrow) char[kNameBufferSize]()), mIsOpen(false), mNumModels(0),
      mRefCount(0) {}

ulkDLL::~ulkDLL() {
    delete[] mName;
}

bool ulkDLL::SetName(const char* path) {
    const size_t size = std::strlen(path) + 1;
    if (size > kNameBufferSize) {
        char* grown = new (std::nothrow) char[size];
        if (!grown) return false;
        delete[] mName;
        mName = grown;
    }
    std::memcpy(mName, path, size);
    return true;
}

bool ulkDLL::StartUp(unsigned char* startUpArg) {
    if (!mIsOpen) return false;

    bool started = true;
    if (auto startUp = Lookup<ulkStartUpProc>(*this, "ulkStartUp_v1")) {
        SetUpEnv();
        started = startUp(startUpArg);
        SetDownEnv();
    }

    // The module gets the functions that read the process-wide modes whatever
    // its start-up answered; the registry shuts it down on failure.
    if (auto setAttribute = Lookup<ulkSetAttributeProc>(*this, "ulkSetAttribute")) {
        unsigned char output[8] = {};
        setAttribute(0, kAttributeRenderFlagFunction, ModeFunction(&ulk::GetRenderFlag), output);
        setAttribute(0, kAttributeOpticalFlowFunction, ModeFunction(&ulk::GetOpticalFlowMode),
                     output);
    }
    if (auto getAttributes =
            Lookup<ulkGetModelAttributesProc>(*this, "ulkGetModelAttributes_v1ext")) {
        getAttributes(0, kAttributePlayModeFunction, ModeFunction(&ulk::GetPlayModeValue));
        if (ulkHostAttributeCallback callback = ulk::GetHostAttributeCallback())
            getAttributes(0, kAttributeHostCallback, reinterpret_cast<void*>(callback));
    }
    return started;
}

void ulkDLL::ShutDown() {
    if (!mIsOpen) return;
    if (auto shutDown = Lookup<ulkShutDownProc>(*this, "ulkShutDown_v1")) {
        SetUpEnv();
        shutDown();
        SetDownEnv();
    }
}

void ulkDLL::InitHostInfo(hostAppInfo* info) {
    if (!info) return;
    if (auto setAttribute = Lookup<ulkSetAttributeProc>(*this, "ulkSetAttribute")) {
        unsigned char output[8] = {};
        setAttribute(0, kAttributeHostAppInfo, info, output);
    }
}

void ulkDLL::InitNumModels() {
    if (auto numModels = Lookup<ulkNumModelsProc>(*this, "ulkNumModels_v1")) {
        SetUpEnv();
        mNumModels = static_cast<uint16_t>(numModels() & 0xFFFF);
        SetDownEnv();
    } else {
        mNumModels = 1;
    }
}

ulkNTDLL::ulkNTDLL(const char* path) : mHandle(nullptr), mPath(nullptr) {
    if (!Init() || !path) return;
    const size_t size = std::strlen(path) + 1;
    mPath = new (std::nothrow) char[size];
    if (!mPath || !SetName(path)) {
        // Without its path the module cannot be opened; Init() reports it.
        delete[] mPath;
        mPath = nullptr;
        delete[] mName;
        mName = nullptr;
        return;
    }
    std::memcpy(mPath, path, size);
}

ulkNTDLL::~ulkNTDLL() {
    Close();
    delete[] mPath;
}

bool ulkNTDLL::SystemOpen() {
    if (mHandle) return true;
    if (!mPath) return false;
    mHandle = dlopen(mPath, RTLD_NOW | RTLD_LOCAL);
    if (mHandle) mIsOpen = true;
    return mHandle != nullptr;
}

void ulkNTDLL::Close() {
    if (!mIsOpen) return;
    mIsOpen = false;
    if (mHandle) dlclose(mHandle);
    mHandle = nullptr;
}

const void* ulkNTDLL::GetSymbol(const char* name) {
    if (!mHandle || !name) return nullptr;
    return dlsym(mHandle, name);
}

const char* ulkNTDLL::GetErrorString() const {
    return "Not yet";
}

#include "ulk/model/host_model.h"

#include <cstring>

#include "core/class_memory.h"
#include "ulk/instance/host_instance.h"
#include "ulk/instance/instance.h"
#include "ulk/model/model.h"
#include "ulk/modules/dll_maker.h"

ulkAllocCallback ulkHostModel::mAllocCallback = nullptr;
ulkFreeCallback ulkHostModel::mFreeCallback = nullptr;

const char* const ulkHostModel::sPluginTypeNames[3] = {"Filter", "Compositor", "Title"};
const char* const ulkHostModel::sPluginClassNames[1] = {"Image"};

ulkHostModel::ulkHostModel(short modelIndex)
    : mDLL(nullptr),
      mModel(nullptr),
      mModelIndex(static_cast<uint16_t>(modelIndex)),
      mPathname(nullptr),
      mFormats(2),
      mInputs(4),
      mOutputs(2),
      mULKVersion(0.0f),
      mType(kPluginTypeNone),
      mName(nullptr),
      mClass(kPluginClassImage),
      mVendor(nullptr),
      mCategory("ULK Plugins"),
      mIdentifier(nullptr),
      mDescription("No Description"),
      mSubType(nullptr),
      mPluginVersion(1.0f),
      mUpdateParamsCallback(nullptr),
      mFlushInstanceDataCallback(nullptr),
      mState(ULKState::kStateIdle),
      mInstanceRefCount(0) {}

ulkHostModel::~ulkHostModel() {
    Close();
    if (mPathname) FreeMem(mPathname);
}

// ------------------------------------------------------------------ opening and closing

bool ulkHostModel::Open(const char* path, unsigned char startUpFlag, hostAppInfo* info) {
    mError.ResetError();
    if (mDLL) return true;

    if (mPathname) {
        FreeMem(mPathname);
        mPathname = nullptr;
    }
    if (path) {
        const size_t size = std::strlen(path) + 1;
        char* copy = static_cast<char*>(AllocMem(size));
        // Without a copy the reason is the allocation's status, not a missing path.
        if (!copy) return false;
        std::memcpy(copy, path, size);
        mPathname = copy;
    }
    return Open(startUpFlag, info);
}

bool ulkHostModel::Open(unsigned char startUpFlag, hostAppInfo* info) {
    mError.ResetError();
    if (mDLL) return true;
    if (!mPathname) {
        mError.SetError(kErrorNullDLLPathname);
        return false;
    }

    unsigned char startUpArg = startUpFlag;
    mDLL = ulkDLLMaker::Open(mPathname, &startUpArg, info);
    if (!mDLL) return false;

    if (auto setAttribute = reinterpret_cast<ulkSetAttributeProc>(
            const_cast<void*>(mDLL->GetSymbol("ulkSetAttribute")))) {
        unsigned char output[8] = {};
        setAttribute(0, kAttributeModelOpened, nullptr, output);
    }

    auto factory =
        reinterpret_cast<ulkNewModelProc>(const_cast<void*>(mDLL->GetSymbol("ulkNewModel_v1")));
    if (!factory) {
        _Release();
        return false;
    }

    SetUp();
    try {
        mModel = factory(mModelIndex);
    } catch (...) {
        // A factory that throws offers no model; the open fails without a status.
        mModel = nullptr;
    }
    SetDown();
    if (!mModel) {
        _Release();
        return false;
    }

    mULKVersion = 1.0f;
    mModel->mHostModel = this;

    bool identified = false;
    bool described = false;
    try {
        identified = DefineIdentity() && mName && mType != kPluginTypeNone;
        described = identified && DefineEffect();
    } catch (...) {
        // The exception is the plug-in's to report, but a half-defined model must
        // not stay open: a later Open would take it for a working one.
        _Release();
        throw;
    }
    if (!identified) {
        if (mError.GetError() == kErrorNone) mError.SetError(kErrorDefineIdentity);
        _Release();
        return false;
    }
    if (!described) {
        if (mError.GetError() == kErrorNone) mError.SetError(kErrorDefineEffect);
        _Release();
        return false;
    }
    return true;
}

void ulkHostModel::Close() {
    mError.ResetError();
    _Release();
}

void ulkHostModel::_Release() {
    if (mModel) {
        SetUp();
        delete mModel;
        SetDown();
        mModel = nullptr;
    }
    ClearHostModel();
    if (mDLL) {
        ulkDLLMaker::Close(mDLL, kCloseDefault);
        mDLL = nullptr;
    }
}

void ulkHostModel::ClearHostModel() {
    while (!mFormats.IsEmpty()) delete static_cast<ulkImageFormat*>(mFormats.RemTail());
    while (!mInputs.IsEmpty()) delete static_cast<ulkObjectInfo*>(mInputs.RemTail());
    while (!mOutputs.IsEmpty()) delete static_cast<ulkObjectInfo*>(mOutputs.RemTail());
}

// ------------------------------------------------------------------ calls into the plug-in model

bool ulkHostModel::DefineIdentity() {
    mError.ResetError();
    SetUp();
    ULKState guard(ULKState::kStateDefineIdentity, mState);
    const bool result = mModel->DefineIdentity();
    SetDown();
    return result;
}

bool ulkHostModel::DefineEffect() {
    mError.ResetError();
    SetUp();
    ULKState guard(ULKState::kStateDefineEffect, mState);
    const bool result = mModel->DefineEffect();
    SetDown();
    return result;
}

bool ulkHostModel::HasUI() {
    mError.ResetError();
    SetUp();
    const bool result = mModel->HasUI();
    SetDown();
    return result;
}

const char* ulkHostModel::GetInitString() {
    mError.ResetError();
    SetUp();
    const char* result = mModel->GetInitString();
    SetDown();
    return result;
}

ulkHostInstance* ulkHostModel::NewInstance() {
    mError.ResetError();
    SetUp();
    ulkInstance_v1* plugin = mModel->NewInstance();
    SetDown();
    if (!plugin) return nullptr;

    ulkHostInstance* instance = ulkHostInstance::New(this, plugin);
    if (!instance) {
        SetUp();
        mModel->DeleteInstance(plugin);
        SetDown();
        return nullptr;
    }
    ++mInstanceRefCount;

    bool defined = false;
    try {
        defined = instance->DefineParameters();
    } catch (...) {
        // No half-made instance is left behind: it goes exactly as DeleteInstance
        // would take it, then the plug-in's exception reaches the caller.
        DeleteInstance(instance);
        throw;
    }
    if (!defined) {
        // The reason outlives the instance: a status the plug-in recorded on the
        // model stays; else one it recorded on the instance is carried over.
        ulkError reason = mError;
        if (reason.GetError() == kErrorNone) reason = *instance->GetErrorObj();
        DeleteInstance(instance);
        mError = reason;
        if (mError.GetError() == kErrorNone) mError.SetError(kErrorInvalidPluginMethod);
        return nullptr;
    }
    return instance;
}

void ulkHostModel::DeleteInstance(ulkHostInstance* hostInstance) {
    mError.ResetError();
    hostInstance->CleanUp();
    SetUp();
    mModel->DeleteInstance(hostInstance->GetPluginInstance());
    SetDown();
    ulkHostInstance::Delete(hostInstance);
    --mInstanceRefCount;
}

// ------------------------------------------------------------------ names

const char* ulkHostModel::GetTypeName(ulkPluginType type) {
    if (type < 0 || type >= 3) return nullptr;
    return sPluginTypeNames[type];
}

const char* ulkHostModel::GetClassName(ulkPluginClass pluginClass) {
    if (pluginClass != kPluginClassImage) return nullptr;
    return sPluginClassNames[pluginClass];
}

// ------------------------------------------------------------------ environment

void ulkHostModel::SetUp() {
    if (mDLL) mDLL->SetUpEnv();
}

void ulkHostModel::SetDown() {
    if (mDLL) mDLL->SetDownEnv();
}

bool ulkHostModel::OpenEnv() {
    return mDLL ? mDLL->OpenResource() : false;
}

void ulkHostModel::CloseEnv() {
    if (mDLL) mDLL->CloseResource();
}

bool ulkHostModel::IsEnvOpen() {
    return mDLL ? mDLL->IsResourceOpen() : false;
}

// ------------------------------------------------------------------ errors and memory

void ulkHostModel::SetError(ulkErrorStatus status) {
    mError.ResetError();
    mError.SetError(status);
}

void* ulkHostModel::AllocMem(size_t size) {
    return ulk::AllocReporting(mAllocCallback, size, mError);
}

void ulkHostModel::FreeMem(void* p) {
    ulk::FreeReporting(mFreeCallback, p, mError);
}

#include "ulk/modules/dll_maker.h"

#include <cstring>
#include <new>

int16_t ulkDLLMaker::mMaxDLLs = 1;
ulkCloseMode_t ulkDLLMaker::mCloseMode = kCloseNow;
ulkList ulkDLLMaker::mDLLList(0);

namespace {

ulkDLL* ModuleAt(int index) {
    return static_cast<ulkDLL*>(ulkDLLMaker::mDLLList.GetEntry(index));
}

void Destroy(ulkDLL* dll) {
    dll->ShutDown();
    delete dll;
}

}  // namespace

ulkDLL* ulkDLLMaker::Open(const char* path, unsigned char* startUpArg, hostAppInfo* info) {
    if (!path) return nullptr;

    if (ulkDLL* dll = Lookup(path)) {
        ++dll->mRefCount;
        dll->OpenResource();
        return dll;
    }

    if (mDLLList.GetCount() >= mMaxDLLs && !MakeRoom()) return nullptr;

    ulkDLL* dll = new (std::nothrow) ulkNTDLL(path);
    if (!dll) return nullptr;
    if (!dll->Init() || !dll->Open() || !dll->StartUp(startUpArg)) {
        Destroy(dll);
        return nullptr;
    }
    dll->InitHostInfo(info);
    dll->InitNumModels();
    if (!mDLLList.AddTail(dll)) {
        // An unregistered module could never be closed or shared: give it up.
        Destroy(dll);
        return nullptr;
    }
    dll->mRefCount = 1;
    return dll;
}

void ulkDLLMaker::Close(ulkDLL* dll, ulkCloseMode_t mode) {
    if (!IsMember(dll)) return;
    if (mode == kCloseDefault) mode = mCloseMode;
    if (dll->mRefCount > 0) --dll->mRefCount;
    if (dll->mRefCount == 0 && mode == kCloseNow) {
        mDLLList.Remove(dll);
        Destroy(dll);
    }
}

bool ulkDLLMaker::SetActiveDLLs(short n) {
    mMaxDLLs = n;
    mDLLList.SetGrain(n);
    return true;
}

ulkDLL* ulkDLLMaker::Lookup(const char* path) {
    for (int i = 0; i < mDLLList.GetCount(); ++i) {
        ulkDLL* dll = ModuleAt(i);
        if (std::strcmp(dll->GetName(), path) == 0) return dll;
    }
    return nullptr;
}

bool ulkDLLMaker::IsMember(const ulkDLL* dll) {
    return dll && mDLLList.GetIndex(dll) >= 0;
}

bool ulkDLLMaker::MakeRoom() {
    for (int i = 0; i < mDLLList.GetCount(); ++i) {
        ulkDLL* dll = ModuleAt(i);
        if (dll->mRefCount == 0) {
            Close(dll, kCloseNow);
            return true;
        }
    }
    return false;
}

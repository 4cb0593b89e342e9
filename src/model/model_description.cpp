#include "ulk/model/model_description.h"

#include <cstring>
#include <new>

#include "ulk/model/host_model.h"

namespace {

// Appends a new input or output description to list; false with status 8 when
// it cannot be made or listed (the record is reset first).
bool AddObjectInfo(ulkList& list, ulkError& error, int number, const char* name, const char* id,
                   ulkDataType type, unsigned char optional) {
    error.ResetError();
    ulkObjectInfo* info = new (std::nothrow) ulkObjectInfo;
    if (info) {
        info->SetNumber(number);
        info->SetName(name);
        info->SetID(id);
        info->SetDataType(type);
        info->SetOptional(optional);
        if (list.AddTail(info)) return true;
        delete info;
    }
    if (error.GetError() == kErrorNone) error.SetError(kErrorObjectCreation);
    return false;
}

char* CopyText(const char* text) {
    if (!text) return nullptr;
    const size_t size = std::strlen(text) + 1;
    char* copy = new (std::nothrow) char[size];
    if (copy) std::memcpy(copy, text, size);
    return copy;
}

const ulkObjectInfo* InfoAt(const ulkList& list, int index) {
    if (index < 0 || index >= list.GetCount()) return nullptr;
    return static_cast<const ulkObjectInfo*>(list.GetEntry(index));
}

int CountOptional(const ulkList& list, unsigned char flag) {
    int count = 0;
    for (int i = 0; i < list.GetCount(); ++i)
        if (static_cast<const ulkObjectInfo*>(list.GetEntry(i))->IsOptional() == flag) ++count;
    return count;
}

}  // namespace

// ------------------------------------------------------------------ ulkObjectInfo

ulkObjectInfo::ulkObjectInfo()
    : mNumber(0), mName(nullptr), mID(nullptr), mDataType(kDataTypeNone), mOptional(0) {}

ulkObjectInfo::~ulkObjectInfo() {
    delete[] mName;
    delete[] mID;
}

void ulkObjectInfo::SetName(const char* name) {
    delete[] mName;
    mName = CopyText(name);
}

void ulkObjectInfo::SetID(const char* id) {
    delete[] mID;
    mID = CopyText(id);
}

// ------------------------------------------------------------------ formats

bool ulkHostModel::AddFormat(ulkColorspace colorspace, int bitDepth, const char* order,
                             ulkImgFormat format) {
    mError.ResetError();
    ulkImageFormat* entry = new (std::nothrow) ulkImageFormat;
    if (!entry) {
        if (mError.GetError() == kErrorNone) mError.SetError(kErrorObjectCreation);
        return false;
    }
    entry->SetColorspace(colorspace);
    entry->SetBitDepth(bitDepth);
    entry->SetOrder(order);
    entry->SetFormat(format);
    // No format code sets "other": a plug-in asking for it keeps it.
    if (colorspace == kColorspaceOther) entry->SetColorspace(kColorspaceOther);
    if (!mFormats.AddTail(entry)) {
        delete entry;
        if (mError.GetError() == kErrorNone) mError.SetError(kErrorObjectCreation);
        return false;
    }
    return true;
}

const ulkImageFormat* ulkHostModel::GetFormat(int index) const {
    if (index < 0 || index >= mFormats.GetCount()) return nullptr;
    return static_cast<const ulkImageFormat*>(mFormats.GetEntry(index));
}

bool ulkHostModel::AcceptsFormat(ulkImgFormat format) const {
    for (int i = 0; i < mFormats.GetCount(); ++i) {
        const ulkImgFormat entry =
            static_cast<const ulkImageFormat*>(mFormats.GetEntry(i))->GetFormat();
        if (entry == format || entry == kImgFormatAny) return true;
    }
    return false;
}

// ------------------------------------------------------------------ inputs and outputs

bool ulkHostModel::AddInput(int number, const char* name, const char* id, ulkDataType type,
                            unsigned char optional) {
    return AddObjectInfo(mInputs, mError, number, name, id, type, optional);
}

bool ulkHostModel::AddOutput(int number, const char* name, const char* id, ulkDataType type) {
    return AddObjectInfo(mOutputs, mError, number, name, id, type, 0);
}

const ulkObjectInfo* ulkHostModel::GetInputInfo(int index) const {
    return InfoAt(mInputs, index);
}

const ulkObjectInfo* ulkHostModel::GetOutputInfo(int index) const {
    return InfoAt(mOutputs, index);
}

const ulkObjectInfo* ulkHostModel::GetInputInfoByID(const char* id) const {
    if (!id) return nullptr;
    for (int i = 0; i < mInputs.GetCount(); ++i) {
        const ulkObjectInfo* info = InfoAt(mInputs, i);
        if (info->GetID() && std::strcmp(info->GetID(), id) == 0) return info;
    }
    return nullptr;
}

int ulkHostModel::GetRequiredInputs() const {
    return CountOptional(mInputs, 0);
}

int ulkHostModel::GetOptionalInputs() const {
    return CountOptional(mInputs, 1);
}

int ulkHostModel::GetRequiredOutputs() const {
    return CountOptional(mOutputs, 0);
}

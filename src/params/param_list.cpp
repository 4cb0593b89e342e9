#include "ulk/params/param_list.h"

#include <cstdint>
#include <cstring>
#include <new>

#include "c_locale.h"

const char ulkPList::className[] = "List";

ulkPList* ulkPList::New(const char* label, const char* id, void* value, size_t size,
                        const char* const* items, ulkPListType type) {
    ulkPList* list = new (std::nothrow) ulkPList(label, id, value, size, items, type);
    if (!list) return nullptr;
    bool complete = list->GetNumKeys() > 0 && list->mLabel && list->mID &&
                    (list->mNumItems == 0 || list->mItems);
    for (int i = 0; complete && i < list->mNumItems; ++i) complete = list->mItems[i] != nullptr;
    if (!complete) {
        Delete(list);
        return nullptr;
    }
    return list;
}

ulkPList::ulkPList(const char* label, const char* id, void* value, size_t size,
                   const char* const* items, ulkPListType type)
    : ulkParameter(label, id, value, size, 0), mType(type), mNumItems(0), mItems(nullptr) {
    int count = 0;
    if (items)
        while (items[count]) ++count;
    if (count > 0) {
        mItems = new (std::nothrow) char*[count]();
        if (mItems) {
            mNumItems = count;
            for (int i = 0; i < count; ++i) mItems[i] = _newstr(items[i]);
        }
    }
    if (value && size > 0) {
        SetKeyTime(0.0, value, size);
    } else {
        const int32_t first = 0;
        SetKeyTime(0.0, &first, sizeof(first));
    }
}

ulkPList::ulkPList(const char* label, const char* id)
    : ulkParameter(label, id, nullptr, 0, 0),
      mType(kPListTypeDefault),
      mNumItems(0),
      mItems(nullptr) {
    const int32_t first = 0;
    SetKeyTime(0.0, &first, sizeof(first));
}

ulkPList::~ulkPList() {
    if (mItems)
        for (int i = 0; i < mNumItems; ++i) delete[] mItems[i];
    delete[] mItems;
}

int ulkPList::GetValue(double time) {
    int32_t value = 0;
    Interpolate(time, &value, sizeof(value), -1);
    return value;
}

void ulkPList::SetValue(double time, int index) {
    const int32_t value = index;
    SetKeyTime(time, &value, sizeof(value));
}

int ulkPList::GetDefaultValue() {
    int32_t value = 0;
    if (mDefaultValue)
        std::memcpy(&value, mDefaultValue, mValueSize < sizeof(value) ? mValueSize : sizeof(value));
    return value;
}

const char* ulkPList::GetListItem(int index) const {
    if (index < 0 || index >= mNumItems || !mItems) return nullptr;
    return mItems[index];
}

bool ulkPList::Evaluate(double time, void* buffer, size_t, int) {
    if (buffer || !mInstanceValue || mValueSize == 0) return false;
    return Interpolate(time, mInstanceValue, mValueSize, -1);
}

bool ulkPList::ParseValue(double time, const char* text) {
    if (!text) return false;
    int found = -1;
    for (int i = 0; i < mNumItems; ++i)
        if (mItems[i] && std::strcmp(mItems[i], text) == 0) found = i;
    if (found < 0) return false;
    SetValue(time, found);
    return true;
}

bool ulkPList::WriteValue(double time, ulkFile* file) {
    if (!file) return false;
    const char* item = GetListItem(GetValue(time));
    if (!item) return false;
    ulkCLocaleScope cLocale;
    return file->Printf("%s", item) != 0;
}

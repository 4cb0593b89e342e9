#include "ulk/params/group.h"

#include <new>

const char ulkPGroup::className[] = "Group";
const char ulkPGroupEnable::className[] = "GroupEnable";

// ------------------------------------------------------------- group

ulkPGroup* ulkPGroup::New(const char* label, const char* id, bool autoOpen) {
    ulkPGroup* group = new (std::nothrow) ulkPGroup(label, id, autoOpen);
    if (group && (!group->mLabel || !group->mID)) {
        Delete(group);
        return nullptr;
    }
    return group;
}

ulkPGroup::ulkPGroup(const char* label, const char* id, bool autoOpen)
    : ulkParameter(label, id, nullptr, 0, 0), mMembers(10), mAutoOpen(autoOpen) {}

ulkPGroup::~ulkPGroup() {
    // The entries are the group's; the members belong to their instance.
    while (ulkNode* entry = mMembers.RemTail()) delete static_cast<ulkPGroupEntry*>(entry);
}

bool ulkPGroup::AddParameter(ulkParameter* parameter) {
    if (!parameter || parameter->IsGroup()) return false;
    parameter->SetGroup(this);
    ulkPGroupEntry* entry = new (std::nothrow) ulkPGroupEntry(parameter);
    if (!entry) return false;
    if (!mMembers.AddTail(entry)) {
        delete entry;
        return false;
    }
    return true;
}

bool ulkPGroup::ContainsParameter(const ulkParameter* parameter) const {
    for (int i = 0; i < mMembers.GetCount(); ++i)
        if (static_cast<const ulkPGroupEntry*>(mMembers.GetEntry(i))->mParameter == parameter)
            return true;
    return false;
}

ulkParameter* ulkPGroup::GetParameter(int index) const {
    if (index < 0 || index >= mMembers.GetCount()) return nullptr;
    return static_cast<const ulkPGroupEntry*>(mMembers.GetEntry(index))->mParameter;
}

bool ulkPGroup::Evaluate(double, void*, size_t, int) {
    return true;
}

bool ulkPGroup::ParseValue(double, const char*) {
    return true;
}

bool ulkPGroup::WriteValue(double, ulkFile*) {
    return true;
}

// ------------------------------------------------------------- group enable

ulkPGroupEnable* ulkPGroupEnable::New(const char* label, const char* id, void* value, size_t size) {
    ulkPGroupEnable* enable = new (std::nothrow) ulkPGroupEnable(label, id, value, size);
    if (enable && (enable->GetNumKeys() == 0 || !enable->mLabel || !enable->mID)) {
        Delete(enable);
        return nullptr;
    }
    return enable;
}

ulkPGroupEnable::ulkPGroupEnable(const char* label, const char* id, void* value, size_t size)
    : ulkPBoolean(label, id, value, size) {}

ulkPGroupEnable::~ulkPGroupEnable() {}

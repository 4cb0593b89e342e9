#include "ulk/core/list.h"

#include <cstring>
#include <new>

int ulkNode::GetIndex() const {
    return mList ? mList->GetIndex(this) : -1;
}

void ulkNode::Remove() {
    if (mList) mList->Remove(this);
}

ulkList::ulkList(int grain) : mCount(0), mMaxEntries(0), mGrain(grain), mEntries(nullptr) {}

ulkList::~ulkList() {
    delete[] mEntries;
    mEntries = nullptr;
    mCount = 0;
    mMaxEntries = 0;
}

bool ulkList::SetMaxEntries(int n) {
    if (n <= mMaxEntries) return true;
    // A negative grain (a registry bound set below zero) must never make the
    // array smaller than the n entries asked for.
    const int slots = n + (mGrain > 0 ? mGrain : 0);
    ulkNode** entries = new (std::nothrow) ulkNode*[slots]();
    if (!entries) return false;
    if (mCount > 0) std::memcpy(entries, mEntries, sizeof(ulkNode*) * mCount);
    delete[] mEntries;
    mEntries = entries;
    mMaxEntries = slots;
    return true;
}

int ulkList::GetIndex(const ulkNode* node) const {
    for (int i = 0; i < mCount; ++i)
        if (mEntries[i] == node) return i;
    return -1;
}

bool ulkList::AddTail(ulkNode* node) {
    return Insert(node, mCount);
}

bool ulkList::AddHead(ulkNode* node) {
    return Insert(node, 0);
}

bool ulkList::Insert(ulkNode* node, int index) {
    if (!SetMaxEntries(mCount + 1)) return false;
    if (index < mCount)
        std::memmove(mEntries + index + 1, mEntries + index, sizeof(ulkNode*) * (mCount - index));
    mEntries[index] = node;
    ++mCount;
    node->mList = this;
    return true;
}

bool ulkList::SetEntry(int index, ulkNode* node) {
    // An index beyond the count would leave a hole of undefined slots inside
    // the list's contents; such a call is refused.
    if (index < 0 || index > mCount) return false;
    if (!SetMaxEntries(index + 1)) return false;
    mEntries[index] = node;
    node->mList = this;
    if (index + 1 > mCount) ++mCount;
    return true;
}

ulkNode* ulkList::RemHead() {
    if (mCount == 0) return nullptr;
    ulkNode* node = mEntries[0];
    Remove(0);
    return node;
}

ulkNode* ulkList::RemTail() {
    if (mCount == 0) return nullptr;
    ulkNode* node = mEntries[mCount - 1];
    node->mList = nullptr;
    --mCount;
    return node;
}

void ulkList::Remove(int index) {
    if (mEntries[index]) mEntries[index]->mList = nullptr;
    if (index < mCount - 1)
        std::memmove(mEntries + index, mEntries + index + 1,
                     sizeof(ulkNode*) * (mCount - 1 - index));
    --mCount;
}

void ulkList::Remove(ulkNode* node) {
    const int index = GetIndex(node);
    if (index >= 0) Remove(index);
}

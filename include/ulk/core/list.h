// ulkList and ulkNode: the one collection type of the interface.
//
// A ulkList is a growable array of ulkNode pointers addressed by a zero-based
// index. Lists never own their nodes: adding stores a pointer, removing forgets
// it, and destroying a list frees only its slot array. Whoever creates a node
// deletes it. Lists are short (formats, parameters, keys, modules), so access
// is a plain array read and searches are linear. Not thread-safe.
#ifndef ULK_CORE_LIST_H
#define ULK_CORE_LIST_H

#include <cstdint>

#include "ulk/export.h"

class ulkList;

/// Base of every object kept in a ulkList. Has no virtual functions; its
/// destructor does not remove the node from its list.
class ULK_API ulkNode {
public:
    ulkNode() : mList(nullptr) {}
    ~ulkNode() {}

    /// Index of this node in its list; the node must be in a list.
    int GetIndex() const;
    /// Removes this node from its list (without deleting it); the node must be in a list.
    void Remove();

    /// The list this node was last added to; null when in no list.
    ulkList* mList;
};

/// Growable array of node pointers. Copies are not offered: two lists would
/// share one slot array.
class ULK_API ulkList {
public:
    /// grain: how many slots beyond the requested number each growth allocates.
    explicit ulkList(int grain = 10);
    ~ulkList();
    ulkList(const ulkList&) = delete;
    ulkList& operator=(const ulkList&) = delete;

    // --- size
    void SetGrain(int grain) { mGrain = grain; }
    int GetCount() const { return mCount; }
    bool IsEmpty() const { return mCount == 0; }
    /// Makes room for at least n entries; false when memory ran out (nothing changed).
    bool SetMaxEntries(int n);

    // --- access
    /// Entry at index, unchecked: keep 0 <= index < GetCount().
    ulkNode* GetEntry(int index) const { return mEntries[index]; }
    /// Index of the first entry equal to node, or -1.
    int GetIndex(const ulkNode* node) const;

    // --- adding (false only when room could not be made; nothing changed then)
    bool AddTail(ulkNode* node);
    bool AddHead(ulkNode* node);
    /// Inserts at index (0 <= index <= GetCount()); entries from index on move up.
    bool Insert(ulkNode* node, int index);
    /// Replaces entry index, or appends when index == GetCount(); false beyond the count.
    bool SetEntry(int index, ulkNode* node);

    // --- removing (nodes are never deleted)
    /// Removes and returns the first entry, or null when empty.
    ulkNode* RemHead();
    /// Removes and returns the last entry, or null when empty.
    ulkNode* RemTail();
    /// Removes the entry at index (0 <= index < GetCount()).
    void Remove(int index);
    /// Removes node; a node not in this list is ignored.
    void Remove(ulkNode* node);

    int32_t mCount;
    int32_t mMaxEntries;
    int32_t mGrain;
    ulkNode** mEntries;
};

#endif  // ULK_CORE_LIST_H

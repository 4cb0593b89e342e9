// ulkPList: a choice among named items.
//
// The value is an int, the index of the chosen item, stepping from key to
// key. The list keeps its own copies of the item texts. Owned by the instance
// it is added to; one thread at a time.
#ifndef ULK_PARAMS_PARAM_LIST_H
#define ULK_PARAMS_PARAM_LIST_H

#include <cstdint>

#include "ulk/params/parameter.h"

/// How a host presents a list; the host gives the values their meaning and the
/// library only stores them.
enum ulkPListType : int32_t {
    kPListTypeDefault = 0,
};

/// A list parameter.
class ULK_API ulkPList : public ulkParameter {
  public:
    static const char className[];

    /// value: the plug-in's int (size 4), or null / size 0 to start at 0.
    /// items: texts ended by a null entry (null: no items); they are copied.
    static ulkPList* New(const char* label, const char* id, void* value, size_t size,
                         const char* const* items, ulkPListType type);

    // --- value
    /// The item index at the time.
    int GetValue(double time);
    /// Sets the key at the time to the index; the index is not limited to the items.
    void SetValue(double time, int index);
    /// The index the storage held at construction; 0 when made without storage.
    int GetDefaultValue();

    // --- items
    int GetNumItems() const { return mNumItems; }
    /// The item's text; null outside 0 to GetNumItems() - 1.
    const char* GetListItem(int index) const;
    ulkPListType GetType() const { return mType; }

    // --- parameter
    const char* ClassName() const override { return className; }
    bool IsList() override { return true; }
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Selects the last item whose text equals the text exactly; false when none does.
    bool ParseValue(double time, const char* text) override;
    /// Prints the chosen item's text; prints nothing and answers false when the
    /// index names no item.
    bool WriteValue(double time, ulkFile* file) override;

  protected:
    ulkPList(const char* label, const char* id, void* value, size_t size, const char* const* items,
             ulkPListType type);
    /// A list without items and without storage whose first key holds 0.
    ulkPList(const char* label, const char* id);
    ~ulkPList() override;

    ulkPListType mType;
    int mNumItems;
    char** mItems;
};

#endif  // ULK_PARAMS_PARAM_LIST_H

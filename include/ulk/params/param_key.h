// ulkParamKey: one key frame of a parameter.
//
// A key is a time together with a private copy of the value bytes the
// parameter holds at that time. Keys live in their parameter's key list in
// time order and are created, replaced and destroyed only through the key
// operations of ulkParameter, which owns them. The bytes are opaque to the
// key; the parameter decides what they mean. Not thread-safe.
#ifndef ULK_PARAMS_PARAM_KEY_H
#define ULK_PARAMS_PARAM_KEY_H

#include <cstddef>

#include "ulk/core/list.h"
#include "ulk/export.h"

class ulkParameter;

/// One key frame: a time and an owned copy of the value bytes at that time.
class ULK_API ulkParamKey : public ulkNode {
  public:
    /// A key at the time, in no list, without value or user data, not active.
    explicit ulkParamKey(double time = 0.0);
    ~ulkParamKey();
    ulkParamKey(const ulkParamKey&) = delete;
    ulkParamKey& operator=(const ulkParamKey&) = delete;

    // --- time
    /// The time truncated to a multiple of 0.00000001; every key comparison uses it.
    double GetTime() const { return mKeyTime; }
    /// Stores the time unchanged; the caller keeps the key list in time order.
    void SetTime(double time);

    // --- value
    /// The value bytes, or null when the key holds no value.
    void* GetValue() const { return mValue; }
    /// Number of value bytes; 0 when the key holds no value.
    size_t GetValueSize() const { return mValueSize; }
    /// Copies size bytes from source (null: the key then holds no value);
    /// false when memory ran out (the key then holds no value).
    bool SetValue(const void* source, size_t size);
    /// SetValue with the other key's value and size.
    bool CopyValue(const ulkParamKey* other);

    // --- caller's data
    /// A pointer for the caller's own use; never read or released here.
    void SetUserData(const void* data) { mUserData = data; }
    const void* GetUserData() const { return mUserData; }
    /// The active flag, set through ulkParameter::SetKeyIsActive.
    bool IsActive() const { return mIsActive; }

  protected:
    friend class ulkParameter;
    void SetIsActive(bool active) { mIsActive = active; }

    double mTime;
    void* mValue;
    size_t mValueSize;
    const void* mUserData;
    bool mIsActive;

  private:
    double mKeyTime;  // mTime truncated, kept because every search compares it
};

#endif  // ULK_PARAMS_PARAM_KEY_H

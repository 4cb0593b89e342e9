// ulkParameter: the abstract base of every effect parameter.
//
// A parameter is a keyframed value: its keys (ulkParamKey) stand in time
// order, and an interpolator turns them into the value at any time. A
// plug-in makes parameters with the kinds' New functions (ulkPNumber,
// ulkPBoolean, ulkPList, ulkPString, the colour, point and rectangle kinds,
// ulkPGroup) and hands them to its instance, which owns them and destroys
// them with ulkParameter::Delete. Evaluating a parameter writes its value at a
// time into the storage given at construction, normally a variable of the
// plug-in; the parameter never owns that storage. Typed setters and the key
// operations change only the keys.
//
// Key times are compared after truncation to a multiple of 0.00000001; a key
// is "at" a time when its truncated time lies strictly within 0.00000001 of
// it. Not thread-safe: one thread at a time uses a parameter.
#ifndef ULK_PARAMS_PARAMETER_H
#define ULK_PARAMS_PARAMETER_H

#include <cstddef>

#include "ulk/core/list.h"
#include "ulk/export.h"
#include "ulk/params/file.h"
#include "ulk/params/param_key.h"

class ulkParameter;

/// Turns a parameter's keys into its value at a time. Channel -1 means the
/// whole value, 0 and above one channel (one double of the value).
typedef bool (*ulkInterpolator)(ulkParameter* parameter, double time, void* destination,
                                size_t size, int channel);

/// Base of every parameter kind. Made by a kind's New, destroyed by Delete.
class ULK_API ulkParameter : public ulkNode {
  public:
    ulkParameter(const ulkParameter&) = delete;
    ulkParameter& operator=(const ulkParameter&) = delete;

    /// Destroys a parameter made by a kind's New; null is ignored.
    static void Delete(ulkParameter* parameter);

    // --- kind
    /// The kind's name: "Number", "Boolean", "String", "List", "ColorRGB", ...
    virtual const char* ClassName() const = 0;
    virtual bool IsNumber() { return false; }
    virtual bool IsBoolean() { return false; }
    virtual bool IsString() { return false; }
    virtual bool IsList() { return false; }
    virtual bool IsColorRGB() { return false; }
    virtual bool IsColorHSV() { return false; }
    virtual bool IsPoint2D() { return false; }
    virtual bool IsRect2D() { return false; }
    virtual bool IsGroup() { return false; }
    virtual bool IsGroupEnable() { return false; }

    // --- evaluation
    /// With a null buffer (the host's form: null, 0, -1) writes the value at the
    /// time into the parameter's storage and answers the interpolator's result;
    /// false without storage. Only strings accept a buffer (one larger than the
    /// value); groups answer true and do nothing.
    virtual bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) = 0;
    /// Evaluates into the parameter's own storage: Evaluate(time, nullptr, 0, channel).
    bool Compute(double time, int channel = -1);
    /// Installs the interpolator; null installs sBasicInterpolator again.
    void SetInterpolator(ulkInterpolator interpolator);

    // --- value text
    /// Sets the value at the time from its text form; false when the text does
    /// not hold a value of this kind (nothing changes then) or is null.
    virtual bool ParseValue(double time, const char* text);
    /// Prints the value at the time to the file; true when the print answered non-zero.
    virtual bool WriteValue(double time, ulkFile* file);

    // --- identity and presentation
    /// The label given at construction.
    const char* GetLabel() const { return mLabel; }
    /// The identifier given at construction; instances find parameters by it.
    const char* GetID() const { return mID; }
    int GetNumChannels() const { return mNumChannels; }
    /// A channel's label, null when not set or the channel is out of range.
    const char* GetChannelLabel(int channel) const;
    /// A channel's identifier, null when not set or the channel is out of range.
    const char* GetChannelID(int channel) const;
    /// The group holding this parameter; null at top level. Set by ulkPGroup::AddParameter.
    ulkParameter* GetGroup() const { return mGroup; }
    void SetGroup(ulkParameter* group) { mGroup = group; }
    /// True when the parameter belongs to no group.
    bool IsAtTopLevel() const { return mGroup == nullptr; }
    /// A pointer for the host's or plug-in's use; never read or released here.
    void SetUserData(const void* data) { mUserData = data; }
    const void* GetUserData() const { return mUserData; }
    void SetHidden(bool hidden) { mHidden = hidden; }
    bool IsHidden() const { return mHidden; }
    void SetIsTouched(bool touched) { mTouched = touched; }
    bool IsTouched() const { return mTouched; }

    // --- storage
    /// Size of the value in bytes.
    size_t GetValueSize() const { return mValueSize; }
    /// Copies the value the storage held at construction; answers the bytes copied
    /// (GetValueSize(), fewer for a smaller destination, 0 without a default copy).
    size_t CopyDefaultValue(void* destination, size_t destinationSize);
    /// Copies the storage's current bytes; answers the bytes copied as CopyDefaultValue.
    size_t CopyInstanceValue(void* destination, size_t destinationSize);

    // --- keys (indices are positions in time order; -1 means none)
    int GetNumKeys() const { return mKeys.GetCount(); }
    /// The key at the index; null outside 0 to GetNumKeys() - 1.
    ulkParamKey* GetKey(int index) const;
    /// The truncated time of the key at the index; 0 outside the keys.
    double GetKeyTime(int index) const;
    /// The value bytes of the key at the index; null outside the keys.
    void* GetKeyValue(int index) const;
    /// Index of the first key at the time, or -1.
    int GetKeyIndex(double time) const;
    bool IsKeyTime(double time) const { return GetKeyIndex(time) != -1; }
    /// Key before the one at the time, or the last key before the time; -1 when none.
    int GetPrevKey(double time) const;
    /// Key after the one at the time, or the first key after the time; -1 when none.
    int GetNextKey(double time) const;
    /// Replaces the value of the key at the time (a null value keeps it), or adds a
    /// key there in time order; a new key without value copies its neighbour's.
    /// False when memory ran out (nothing changed) or the time is not finite.
    bool SetKeyTime(double time, const void* value, size_t size);
    /// Replaces the value of the key at the time; false when there is none.
    bool ChangeKeyTime(double time, const void* value, size_t size);
    /// Removes and destroys a key; false for the last remaining key or a bad index.
    bool ClearKey(int index);
    /// Removes the key at the time; false when there is none.
    bool ClearKeyTime(double time);
    /// Sets the active flag of the key at the time, if there is one.
    void SetKeyIsActive(bool active, double time);

    // --- interpolators
    /// Step interpolation: the latest key at or before the time (the first key before all keys).
    static bool sBasicInterpolator(ulkParameter* parameter, double time, void* destination,
                                   size_t size, int channel);
    /// Linear interpolation of one channel's double; a float for size 4, a double for size 8.
    static bool sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                    size_t size, int channel);

  protected:
    ulkParameter(const char* label, const char* id, void* value, size_t size, int numChannels);
    virtual ~ulkParameter();

    static char* _newstr(const char* text);
    void _SetChannelInfo(int channel, const char* label, const char* id);
    static void _AssignValue(int value, void* destination, size_t size);
    static void _AssignValue(double value, void* destination, size_t size);
    static int _AssignValue(const void* source, size_t size, double* value);

    bool Interpolate(double time, void* destination, size_t size, int channel);
    bool InterpolateBasic(double time, void* destination, size_t size, int channel);
    bool InterpolateLinear(double time, void* destination, size_t size, int channel);

    ulkParamKey* _Key(int index) const { return static_cast<ulkParamKey*>(mKeys.GetEntry(index)); }

    char* mLabel;
    char* mID;
    void* mInstanceValue;
    size_t mValueSize;
    void* mDefaultValue;
    ulkParameter* mGroup;
    int mNumChannels;
    char** mChannelLabels;
    char** mChannelIDs;
    ulkList mKeys;
    const void* mUserData;
    bool mHidden;
    bool mTouched;
    ulkInterpolator mInterpolator;

  private:
    mutable int mSearchHint;  // where the last key search ended
};

#endif  // ULK_PARAMS_PARAMETER_H

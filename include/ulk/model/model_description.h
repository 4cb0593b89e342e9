// What an effect model says about itself: its kind (ulkPluginType,
// ulkPluginClass) and the description of each of its inputs and outputs
// (ulkObjectInfo with ulkDataType).
//
// A plug-in fills the description in from its DefineEffect through
// ulkModel_v1::AddInput and AddOutput; the host model owns the ulkObjectInfo
// objects it makes and deletes them when it closes. Hosts read them through
// ulkHostModel::GetInputInfo, GetOutputInfo and GetInputInfoByID. Not
// thread-safe.
#ifndef ULK_MODEL_MODEL_DESCRIPTION_H
#define ULK_MODEL_MODEL_DESCRIPTION_H

#include <cstdint>

#include "ulk/core/list.h"
#include "ulk/export.h"

/// What an effect does with images.
enum ulkPluginType : int32_t {
    kPluginTypeNone = -1,       ///< not set: a model must set a type in DefineIdentity
    kPluginTypeFilter = 0,      ///< one input, one output
    kPluginTypeCompositor = 1,  ///< two inputs (foreground, background), one output
    kPluginTypeTitle = 2        ///< makes its output; describes itself in DefineEffect
};

/// The kind of media an effect works on.
enum ulkPluginClass : int32_t {
    kPluginClassImage = 0  ///< images (ulkImage)
};

/// Data type of an input or output.
enum ulkDataType : int32_t {
    kDataTypeNone = -1,   ///< not set
    kDataTypeDefault = 0  ///< the model's own media class (images)
};

/// One input or output of a model: its number, display name, identifier, data
/// type and whether it is optional. The object owns copies of its name and
/// identifier (ordinary new/delete). It is not copied: two objects would share
/// the texts.
class ULK_API ulkObjectInfo : public ulkNode {
  public:
    /// Number 0, no name, no identifier, kDataTypeNone, not optional; in no list.
    ulkObjectInfo();
    /// Releases the name and identifier copies.
    ~ulkObjectInfo();
    ulkObjectInfo(const ulkObjectInfo&) = delete;
    ulkObjectInfo& operator=(const ulkObjectInfo&) = delete;

    // --- setting (the host model does this for AddInput and AddOutput)
    void SetNumber(int number) { mNumber = number; }
    /// Replaces the name with a copy of name (null stores no name).
    void SetName(const char* name);
    /// Replaces the identifier with a copy of id (null stores no identifier).
    void SetID(const char* id);
    void SetDataType(ulkDataType type) { mDataType = type; }
    /// 1 for an optional input; the value is stored as given.
    void SetOptional(unsigned char optional) { mOptional = optional; }

    // --- reading
    /// The number the plug-in gave; the list position, not this number, is the index.
    int GetNumber() const { return mNumber; }
    /// The display name, or null.
    const char* GetName() const { return mName; }
    /// The identifier inputs are looked up by, or null.
    const char* GetID() const { return mID; }
    ulkDataType GetDataType() const { return mDataType; }
    /// The optional flag as stored (1 for an optional input).
    unsigned char IsOptional() const { return mOptional; }

    int32_t mNumber;
    char* mName;
    char* mID;
    ulkDataType mDataType;
    unsigned char mOptional;
};

#endif  // ULK_MODEL_MODEL_DESCRIPTION_H

// ulkPGroup and ulkPGroupEnable: gathering parameters for presentation.
//
// A group has no value and no keys; it lists member parameters for the
// host's user interface. It owns only its list entries, never the members,
// which stay owned by their instance; destroying a group leaves them alive.
// Groups do not nest. A group enable is a boolean marked as the on/off
// switch of a group. One thread at a time.
#ifndef ULK_PARAMS_GROUP_H
#define ULK_PARAMS_GROUP_H

#include "ulk/core/list.h"
#include "ulk/params/boolean.h"
#include "ulk/params/parameter.h"

/// One member of a group: a list node of the group's own pointing at the member.
class ULK_API ulkPGroupEntry : public ulkNode {
  public:
    explicit ulkPGroupEntry(ulkParameter* parameter) : mParameter(parameter) {}
    ulkParameter* GetParameter() const { return mParameter; }

    ulkParameter* mParameter;
};

/// A group of parameters.
class ULK_API ulkPGroup : public ulkParameter {
  public:
    static const char className[];

    /// autoOpen: hint to show the group opened.
    static ulkPGroup* New(const char* label, const char* id, bool autoOpen);

    // --- members
    /// Appends the parameter and links it to this group; false for a null
    /// parameter, a group (groups do not nest) or when memory ran out.
    bool AddParameter(ulkParameter* parameter);
    /// True when the very parameter is a member.
    bool ContainsParameter(const ulkParameter* parameter) const;
    int GetNumParameters() const { return mMembers.GetCount(); }
    /// The member at the index, in adding order; null outside the members.
    ulkParameter* GetParameter(int index) const;
    bool GetAutoOpen() const { return mAutoOpen; }

    // --- parameter
    const char* ClassName() const override { return className; }
    bool IsGroup() override { return true; }
    /// Answers true and does nothing.
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Reads nothing; answers true.
    bool ParseValue(double time, const char* text) override;
    /// Prints nothing; answers true.
    bool WriteValue(double time, ulkFile* file) override;

  protected:
    ulkPGroup(const char* label, const char* id, bool autoOpen);
    ~ulkPGroup() override;

    ulkList mMembers;
    bool mAutoOpen;
};

/// The on/off switch of a group: a boolean in every respect but its identity.
class ULK_API ulkPGroupEnable : public ulkPBoolean {
  public:
    static const char className[];

    /// As ulkPBoolean::New.
    static ulkPGroupEnable* New(const char* label, const char* id, void* value, size_t size);

    const char* ClassName() const override { return className; }
    bool IsGroupEnable() override { return true; }

  protected:
    ulkPGroupEnable(const char* label, const char* id, void* value, size_t size);
    ~ulkPGroupEnable() override;
};

#endif  // ULK_PARAMS_GROUP_H

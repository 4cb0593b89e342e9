// ulkHostModel: the host's handle on one effect model of one plug-in module.
//
// A host constructs one for model number i, opens it with the module's path,
// reads the model's identity and description, creates and deletes instances
// (and overlays) through it and finally closes it. Opening gets the module
// from the registry (ulkDLLMaker), asks the module's factory "ulkNewModel_v1"
// for the plug-in's ulkModel_v1 and lets the plug-in define its identity and
// effect description. Every call into plug-in code goes through this object:
// it switches the module's environment on around the call, records which
// plug-in method runs (ULKState) and keeps the reason of a failure in its
// error record.
//
// Ownership: the model owns its format and input/output descriptions and its
// copy of the module path (from the per-class memory callbacks, which the host
// installs with SetAllocCallback and SetFreeCallback before the first Open); it
// borrows its module from the registry and keeps the identity texts the plug-in
// gives it by pointer. Delete instances and overlays before closing the model.
// Not thread-safe: one thread drives a model at a time.
#ifndef ULK_MODEL_HOST_MODEL_H
#define ULK_MODEL_HOST_MODEL_H

#include <cstddef>
#include <cstdint>

#include "ulk/core/error.h"
#include "ulk/core/host_global.h"
#include "ulk/core/list.h"
#include "ulk/export.h"
#include "ulk/image/image_format.h"
#include "ulk/instance/state.h"
#include "ulk/model/model_description.h"
#include "ulk/modules/dll.h"
#include "ulk/modules/entry_points.h"

class ulkModel_v1;
class ulkInstance_v1;
class ulkHostInstance;
class ulkOverlay_v1;
class ulkHostOverlay;

/// Model-wide callbacks a plug-in model registers for its instances: "the
/// host updated the parameters" and "flush the instance data".
typedef unsigned char (*ulkUpdateParamsCallback)(ulkInstance_v1* instance);
typedef unsigned char (*ulkFlushInstanceDataCallback)(ulkInstance_v1* instance);

class ULK_API ulkHostModel {
  public:
    /// A closed model for model number modelIndex of the module it will open.
    explicit ulkHostModel(short modelIndex);
    /// Closes the model and releases the stored path.
    ~ulkHostModel();
    ulkHostModel(const ulkHostModel&) = delete;
    ulkHostModel& operator=(const ulkHostModel&) = delete;

    // --- opening and closing
    /// Stores a copy of path and opens the model; true when it is open (an open
    /// model stays as it is). False with the reason in the error record: a null
    /// path gives kErrorNullDLLPathname, a refused module or factory none.
    bool Open(const char* path, unsigned char startUpFlag, hostAppInfo* info);
    /// Opens the model with the path stored by an earlier Open.
    bool Open(unsigned char startUpFlag, hostAppInfo* info);
    /// Deletes the plug-in model, empties the description and hands the module
    /// back to the registry. The path and identity fields are kept.
    void Close();

    // --- calls into the plug-in model
    /// The plug-in's DefineIdentity (run by Open).
    bool DefineIdentity();
    /// The plug-in's DefineEffect (run by Open).
    bool DefineEffect();
    /// Whether the plug-in offers a user interface.
    bool HasUI();
    /// The plug-in's initialisation text, or null.
    const char* GetInitString();
    /// A new instance with its parameters defined, or null (reason in the error record).
    ulkHostInstance* NewInstance();
    /// Cleans the instance up, has the plug-in delete its part and destroys it.
    void DeleteInstance(ulkHostInstance* hostInstance);
    /// A new overlay from the module's overlay factory, or null; the model must be open.
    ulkHostOverlay* NewOverlay();
    /// Has the plug-in delete its overlay, then destroys the host overlay (null is ignored).
    void DeleteOverlay(ulkHostOverlay* hostOverlay);

    // --- identity (set by the plug-in; texts are kept by pointer, not copied)
    // The texts live in the plug-in module: read them while the model is open.
    // After Close the getters still answer the last pointers, but once the
    // registry has unloaded the module (kCloseNow) they point nowhere; copy
    // what you need to keep before closing.
    void SetType(ulkPluginType type) { mType = type; }
    void SetName(const char* name) { mName = name; }
    void SetClass(ulkPluginClass pluginClass) { mClass = pluginClass; }
    void SetVendor(const char* vendor) { mVendor = vendor; }
    void SetCategory(const char* category) { mCategory = category; }
    void SetIdentifier(const char* identifier) { mIdentifier = identifier; }
    void SetDescription(const char* description) { mDescription = description; }
    void SetSubType(const char* subType) { mSubType = subType; }
    void SetPluginVersion(float version) { mPluginVersion = version; }
    ulkPluginType GetType() const { return mType; }
    ulkPluginClass GetClass() const { return mClass; }
    const char* GetName() const { return mName; }
    const char* GetVendor() const { return mVendor; }
    const char* GetCategory() const { return mCategory; }
    const char* GetIdentifier() const { return mIdentifier; }
    const char* GetDescription() const { return mDescription; }
    float GetPluginVersion() const { return mPluginVersion; }
    /// Interface version of the open model: 1.0 once opened, 0.0 before.
    float GetULKVersion() const { return mULKVersion; }

    // --- formats
    /// Adds an accepted format; false (kErrorObjectCreation) when it cannot be made.
    bool AddFormat(ulkColorspace colorspace, int bitDepth, const char* order, ulkImgFormat format);
    int GetNumFormats() const { return mFormats.GetCount(); }
    /// The format at index, or null outside the list.
    const ulkImageFormat* GetFormat(int index) const;
    /// Whether format, or kImgFormatAny, is in the list.
    bool AcceptsFormat(ulkImgFormat format) const;

    // --- inputs and outputs (the list position is the index instances use)
    /// Adds an input (the name and id are copied); false (kErrorObjectCreation) on failure.
    bool AddInput(int number, const char* name, const char* id, ulkDataType type,
                  unsigned char optional);
    /// Adds an output (never optional); false (kErrorObjectCreation) on failure.
    bool AddOutput(int number, const char* name, const char* id, ulkDataType type);
    int GetNumInputs() const { return mInputs.GetCount(); }
    int GetNumOutputs() const { return mOutputs.GetCount(); }
    /// The input at index, or null outside the list.
    const ulkObjectInfo* GetInputInfo(int index) const;
    /// The output at index, or null outside the list.
    const ulkObjectInfo* GetOutputInfo(int index) const;
    /// The first input whose identifier equals id exactly, or null.
    const ulkObjectInfo* GetInputInfoByID(const char* id) const;
    /// Number of inputs whose optional flag is 0.
    int GetRequiredInputs() const;
    /// Number of inputs whose optional flag is 1.
    int GetOptionalInputs() const;
    /// Number of outputs whose optional flag is 0.
    int GetRequiredOutputs() const;

    // --- type and class names
    /// "Filter", "Compositor" or "Title"; null for any other value.
    static const char* GetTypeName(ulkPluginType type);
    /// "Image"; null for any other value.
    static const char* GetClassName(ulkPluginClass pluginClass);

    // --- links and counts
    /// The module, while open.
    ulkDLL* GetDLL() const { return mDLL; }
    /// The plug-in's model object, while open.
    ulkModel_v1* GetModel() const { return mModel; }
    /// How many instances made by NewInstance are alive.
    int GetInstanceRefCount() const { return mInstanceRefCount; }

    // --- model-wide instance callbacks (registered by the plug-in model)
    void SetUpdateParamsCallback(ulkUpdateParamsCallback callback) {
        mUpdateParamsCallback = callback;
    }
    ulkUpdateParamsCallback GetUpdateParamsCallback() const { return mUpdateParamsCallback; }
    void SetFlushInstanceDataCallback(ulkFlushInstanceDataCallback callback) {
        mFlushInstanceDataCallback = callback;
    }
    ulkFlushInstanceDataCallback GetFlushInstanceDataCallback() const {
        return mFlushInstanceDataCallback;
    }

    // --- module environment
    /// Switches the module's environment on before plug-in code runs (nothing without a module).
    void SetUp();
    /// Switches it off afterwards (nothing without a module).
    void SetDown();
    /// The module's resource hooks; false without a module.
    bool OpenEnv();
    void CloseEnv();
    bool IsEnvOpen();

    // --- errors
    void ResetError() { mError.ResetError(); }
    /// Resets the record, then sets status.
    void SetError(ulkErrorStatus status);
    /// Status kErrorPlugin with text (no reset).
    void SetPluginError(const char* text) { mError.SetPluginError(text); }
    /// Status kErrorPluginWarning with text (no reset).
    void SetPluginWarning(const char* text) { mError.SetPluginWarning(text); }
    ulkErrorStatus GetError() const { return mError.GetError(); }
    const char* GetErrorString() const { return mError.GetErrorString(); }
    const ulkError* GetErrorObj() const { return &mError; }

    // --- memory from the model's own callbacks
    static void SetAllocCallback(ulkAllocCallback callback) { mAllocCallback = callback; }
    static void SetFreeCallback(ulkFreeCallback callback) { mFreeCallback = callback; }
    /// size bytes (size 0 is passed on); null with kErrorNullCallback or kErrorOutOfMemory.
    void* AllocMem(size_t size);
    /// Releases p (null is ignored); kErrorNullCallback without a release function.
    void FreeMem(void* p);

    static ulkAllocCallback mAllocCallback;
    static ulkFreeCallback mFreeCallback;

  protected:
    /// Deletes every format and input/output description.
    void ClearHostModel();

    ulkDLL* mDLL;
    ulkModel_v1* mModel;
    uint16_t mModelIndex;
    char* mPathname;
    ulkError mError;
    ulkList mFormats;
    ulkList mInputs;
    ulkList mOutputs;
    float mULKVersion;
    ulkPluginType mType;
    const char* mName;
    ulkPluginClass mClass;
    const char* mVendor;
    const char* mCategory;
    const char* mIdentifier;
    const char* mDescription;
    const char* mSubType;
    float mPluginVersion;
    ulkUpdateParamsCallback mUpdateParamsCallback;
    ulkFlushInstanceDataCallback mFlushInstanceDataCallback;
    ULKState::State mState;
    int32_t mInstanceRefCount;

  private:
    /// Close's work without resetting the record: the reason of a failed Open stays.
    void _Release();

    static const char* const sPluginTypeNames[3];
    static const char* const sPluginClassNames[1];
};

#endif  // ULK_MODEL_HOST_MODEL_H

// ulkHostInstance: the host-side wrapper of one effect instance.
//
// The host model makes it (ulkHostModel::NewInstance) around the plug-in's
// ulkInstance_v1 and destroys it (DeleteInstance); hosts never construct,
// copy or delete one themselves. Every call that reaches the plug-in instance
// goes through the wrapper, which resets its error record, switches the
// module's environment on for the length of the call, records the running
// method (ULKState) and turns false answers and, for Execute and
// ShowUIWindow, exceptions into error statuses.
//
// The host sets the render context (frames, fields, aspects, quality), the
// media of each input and output slot and its callbacks, then calls Execute
// once per frame. Before each Execute and ShowUIWindow every parameter writes
// its value at the current time into the plug-in's variables.
//
// Ownership: the wrapper owns its parameters, its slot arrays and its copy of
// the plug-in's instance data. It borrows the host model, the plug-in
// instance (the plug-in model deletes it), the media in its slots, the
// platform UI record and the alternate-frame blob. The static callback slots
// are process-wide; install them before creating instances. One thread uses a
// wrapper at a time; the render flag that Execute sets is process-wide.
#ifndef ULK_INSTANCE_HOST_INSTANCE_H
#define ULK_INSTANCE_HOST_INSTANCE_H

#include <cstddef>
#include <cstdint>

#include "ulk/core/error.h"
#include "ulk/core/host_global.h"
#include "ulk/core/list.h"
#include "ulk/core/types.h"
#include "ulk/export.h"
#include "ulk/image/media_object.h"
#include "ulk/instance/render_context.h"
#include "ulk/instance/state.h"

class ulkHostModel;
class ulkModel_v1;
class ulkInstance_v1;
class ulkImage;
class ulkParameter;
class ulkPGroup;

class ULK_API ulkHostInstance {
  public:
    // --- creation and destruction
    /// A wrapper linked to plugin, with one empty slot per input and output of
    /// model, or null (plugin then stays the caller's). Used by ulkHostModel.
    static ulkHostInstance* New(ulkHostModel* model, ulkInstance_v1* plugin);
    /// Destroys a wrapper and its parameters (null is ignored). Used by ulkHostModel.
    static void Delete(ulkHostInstance* instance);
    ulkHostInstance(const ulkHostInstance&) = delete;
    ulkHostInstance& operator=(const ulkHostInstance&) = delete;
    /// Runs a pending PostProcess.
    void CleanUp();

    // --- links
    ulkHostModel* GetHostModel() const { return mHostModel; }
    ulkInstance_v1* GetPluginInstance() const { return mPluginInstance; }
    /// The plug-in's model object.
    ulkModel_v1* GetModel() const;

    // --- media slots (index 0 to the model's input or output count - 1; media are not owned)
    /// Stores media in input slot index; false for an index outside the slots.
    bool SetInput(int index, ulkMediaObject* media);
    /// Stores media in output slot index; false for an index outside the slots.
    bool SetOutput(int index, ulkMediaObject* media);
    /// The media in input slot index; null when unset or outside the slots.
    ulkMediaObject* GetInput(int index) const;
    /// The media in output slot index; null when unset or outside the slots.
    ulkMediaObject* GetOutput(int index) const;

    // --- calls into the plug-in instance
    /// The plug-in defines its parameters (run by NewInstance).
    bool DefineParameters();
    /// Whether the effect does anything at the current setting.
    bool HasEffect();
    /// Whether the output is the input when the effect does nothing.
    bool InPlace();
    /// Prepares the plug-in for a run of frames; true at once when already prepared.
    /// False: kErrorPreProcess, unless the plug-in recorded its own status.
    bool PreProcess();
    /// Ends a run of frames prepared by PreProcess (nothing when none is pending).
    void PostProcess();
    /// Renders the region (null: the whole of output 0). False with kErrorExecute,
    /// kErrorPreProcess, kErrorUnhandledException or the plug-in's own status.
    bool Execute(const ulkBounds* bounds);
    /// Runs the plug-in's user interface for the region (null: output 0); the
    /// plug-in may draw into the video buffer only during this call.
    bool ShowUIWindow(const ulkBounds* bounds);
    /// The rectangle the plug-in needs from its input.
    void GetInputSize(ulkBounds* bounds);
    /// The rectangle the plug-in produces.
    void GetOutputSize(ulkBounds* bounds);

    // --- state, abort and meter
    /// Whether the guarded method state is running.
    bool IsState(const ULKState::State& state) const { return mState == state; }
    /// Installs the abort callback and its data word (null removes it).
    void SetAbortCallback(ulkAbortCallback callback, void* data);
    /// Installs the meter callback and its data word (the library never calls it).
    void SetMeterCallback(ulkMeterCallback callback, void* data);
    /// Asks the abort callback (with the plug-in's environment off); without one,
    /// the last answer since the start of the current Execute or ShowUIWindow.
    bool Aborted();

    // --- errors
    const ulkError* GetErrorObj() const { return &mError; }
    /// Resets the record, then sets status.
    void SetError(ulkErrorStatus status);
    /// Status kErrorPlugin with text (no reset).
    void SetPluginError(const char* text) { mError.SetPluginError(text); }
    /// Status kErrorPluginWarning with text (no reset).
    void SetPluginWarning(const char* text) { mError.SetPluginWarning(text); }
    ulkErrorStatus GetError() const { return mError.GetError(); }
    const char* GetErrorString() const { return mError.GetErrorString(); }

    // --- render context (every setter stores, every getter returns the field)
    void SetFrameRate(double rate) { mFrameRate = rate; }
    double GetFrameRate() const { return mFrameRate; }
    void SetCurrentFrame(int frame) { mCurrentFrame = frame; }
    int GetCurrentFrame() const { return mCurrentFrame; }
    void SetTotalFrames(int frames) { mTotalFrames = frames; }
    int GetTotalFrames() const { return mTotalFrames; }
    /// Current frame = trunc(total frames x t); fields are ignored.
    void SetTime(double t);
    /// Position of the current frame (or field) in the clip, 0 to 1, to 8 decimals.
    double GetTime() const;
    /// With segmented frames both fields of a frame share its time.
    void SetSegmentedFrames(bool segmented) { mSegmentedFrames = segmented; }
    bool GetSegmentedFrames() const { return mSegmentedFrames; }
    void SetPixelAspect(double aspect) { mPixelAspect = aspect; }
    double GetPixelAspect() const { return mPixelAspect; }
    void SetDisplayAspect(double aspect) { mDisplayAspect = aspect; }
    double GetDisplayAspect() const { return mDisplayAspect; }
    void SetQuality(double quality) { mQuality = quality; }
    double GetQuality() const { return mQuality; }
    void SetVideoType(ulkVideoType type) { mVideoType = type; }
    ulkVideoType GetVideoType() const { return mVideoType; }
    void SetFieldMode(ulkFieldMode mode) { mFieldMode = mode; }
    ulkFieldMode GetFieldMode() const { return mFieldMode; }
    void SetFieldDominance(ulkField field) { mFieldDominance = field; }
    ulkField GetFieldDominance() const { return mFieldDominance; }
    void SetFieldTopness(ulkField field) { mFieldTopness = field; }
    ulkField GetFieldTopness() const { return mFieldTopness; }
    void SetField(ulkField field) { mField = field; }
    ulkField GetField() const { return mField; }
    void SetNumFields(short count) { mNumFields = count; }
    short GetNumFields() const { return mNumFields; }
    void SetInstanceType(ulkInstanceType type) { mInstanceType = type; }
    ulkInstanceType GetInstanceType() const { return mInstanceType; }
    /// Keeps the pointer (not a copy); the host keeps the record alive.
    void SetPlatformUIInfo(ulkPlatformUIInfo* info);
    /// Copies the stored record into out; nothing when none was set.
    void GetPlatformUIInfo(ulkPlatformUIInfo* out) const;
    void SetAltFrameBlob(void* blob) { mAltFrameBlob = blob; }
    void* GetAltFrameBlob() const { return mAltFrameBlob; }
    /// Sets the process-wide play mode (not per instance).
    static void SetPlayMode(ulkPlayMode mode) { ulkSetPlayMode(mode); }

    // --- instance data (the wrapper keeps its own copy of the plug-in's blob)
    /// Copies size bytes of data (null frees the copy); false when memory ran out.
    bool SetInstanceData(void* data, size_t size);
    /// The held copy (or null) and its size; null when size is null.
    const void* GetInstanceData(size_t* size) const;
    /// Frees the held copy.
    void FreeInstanceData();
    void SetInstanceDataModified(bool modified) { mInstanceDataModified = modified; }
    bool GetInstanceDataModified() const { return mInstanceDataModified; }

    // --- services for the plug-in
    /// Memory from the instance callbacks (size 0 is passed on); null with
    /// kErrorNullCallback or kErrorOutOfMemory.
    void* AllocMem(size_t size);
    /// Releases p (null is ignored); kErrorNullCallback without a release function.
    void FreeMem(void* p);
    /// Prints text on the host's console (as data, never as a format); 0 without a callback.
    int ConsolePrintf(const char* text);
    /// Hands value to the host's wait display.
    void DisplayWait(int32_t value);
    /// Draws through the host's callback, only while ShowUIWindow runs.
    void DrawToVideoBuffer(unsigned char* buffer, int32_t a, int32_t b, int32_t c);
    /// The host's alternate frame; false with kErrorNullCallback without a callback.
    bool GetAlternateFrame(unsigned short a, unsigned short b, ulkField field, ulkImage* image);
    /// The host's alternate-frame size; 0 with kErrorNullCallback without a callback.
    size_t GetAlternateFrameSize(ulkField field, size_t* first, size_t* second);

    // --- process-wide callback slots
    static void SetAllocCallback(ulkAllocCallback callback) { mAllocCallback = callback; }
    static void SetFreeCallback(ulkFreeCallback callback) { mFreeCallback = callback; }
    static void SetConsoleCallback(ulkConsoleCallback callback) { mConsoleCallback = callback; }
    static void SetDrawVideoCallback(ulkDrawVideoCallback callback) {
        mDrawVideoCallback = callback;
    }
    static void SetDisplayWaitCallback(ulkDisplayWaitCallback callback) {
        mDisplayWaitCallback = callback;
    }
    static void SetAltFrameCallback(ulkAltFrameCallback callback) { mAltFrameCallback = callback; }
    static void SetAltFrameSizeCallback(ulkAltFrameSizeCallback callback) {
        mAltFrameSizeCallback = callback;
    }

    // --- parameters (owned by the instance; groups and members alike, in adding order)
    /// Adds parameter (to group too, when given); null for null or a parameter already added.
    ulkParameter* AddParameter(ulkParameter* parameter, ulkPGroup* group);
    int GetNumParameters() const { return mParameters.GetCount(); }
    /// The parameter at index, or null outside the list.
    ulkParameter* GetParameter(int index) const;
    /// The first parameter whose identifier equals id exactly, or null.
    ulkParameter* FindParameter(const char* id) const;
    /// Number of parameters in no group.
    int GetNumTopLevelParameters() const;
    /// The index-th parameter in no group, or null.
    ulkParameter* GetTopLevelParameter(int index) const;
    /// Sum of the value sizes of every parameter that is not a group.
    size_t GetMaxParamSize() const;
    /// Removes key index of parameter.
    bool ClearKey(ulkParameter* parameter, int index);
    void SetHostParametersModified(bool modified) { mHostParametersModified = modified; }
    bool GetHostParametersModified() const { return mHostParametersModified; }
    /// Every parameter writes its value at time into its storage.
    void Evaluate(double time);
    /// Every parameter writes its value at GetTime() into its storage.
    void Evaluate();
    /// Calls the model's update-params callback with the plug-in instance; false without one.
    bool UpdateParams();
    /// Calls the model's flush-instance-data callback; false without one.
    bool FlushInstanceData();
    bool HasUpdateParamsCallback() const;
    bool HasFlushInstanceDataCallback() const;

    static ulkAllocCallback mAllocCallback;
    static ulkFreeCallback mFreeCallback;
    static ulkConsoleCallback mConsoleCallback;
    static ulkDrawVideoCallback mDrawVideoCallback;
    static ulkDisplayWaitCallback mDisplayWaitCallback;
    static ulkAltFrameCallback mAltFrameCallback;
    static ulkAltFrameSizeCallback mAltFrameSizeCallback;

  protected:
    ulkHostInstance();
    ~ulkHostInstance();

    ulkHostModel* mHostModel;
    ulkInstance_v1* mPluginInstance;
    ulkList mParameters;
    ulkMediaObject** mInputs;
    ulkMediaObject** mOutputs;
    int32_t mNumInputs;   // slots in mInputs, fixed by _Init
    int32_t mNumOutputs;  // slots in mOutputs, fixed by _Init
    ulkError mError;
    uint32_t mFlags;
    bool mAborted;
    double mFrameRate;
    int32_t mCurrentFrame;
    int32_t mTotalFrames;
    bool mSegmentedFrames;
    double mPixelAspect;
    double mDisplayAspect;
    double mQuality;
    ulkVideoType mVideoType;
    ulkFieldMode mFieldMode;
    ulkField mFieldDominance;
    ulkField mFieldTopness;
    ulkField mField;
    int16_t mNumFields;
    ulkInstanceType mInstanceType;
    bool mDrawAllowed;
    ulkMeterCallback mMeterCallback;
    void* mMeterData;
    ulkAbortCallback mAbortCallback;
    void* mAbortData;
    ulkPlatformUIInfo* mPlatformUIInfo;
    bool mHasPlatformUIInfo;
    unsigned char* mInstanceData;
    uint64_t mInstanceDataSize;
    bool mInstanceDataModified;
    bool mHostParametersModified;
    void* mAltFrameBlob;
    ULKState::State mState;

  private:
    /// Makes the slot arrays; true when both exist.
    bool _Init();
    /// Resets the record (the host reads the error through the other operations).
    void ResetError() { mError.ResetError(); }
    /// Output 0 as an image, or null when it is missing or not an image.
    ulkImage* _OutputImage() const;
    /// Deletes every parameter (destruction).
    void _DeleteParameters();
};

#endif  // ULK_INSTANCE_HOST_INSTANCE_H

// ulkInstance_v1: the base class of a plug-in's effect instances.
//
// The plug-in's model (ulkModel_v1::NewInstance) makes objects of a class
// derived from ulkInstance_v1; the library wraps each in a ulkHostInstance
// and from then on drives it only through the virtual operations below. Every
// plug-in supplies Execute; the other operations have working defaults.
//
// In the other direction the non-virtual members reach what the host offers:
// the render context, the inputs and outputs, the parameters, memory, the
// console and error reporting. Each forwards to the host-side twin, which
// ulkHostInstance::New sets before the first virtual call (DefineParameters);
// do not use them from the constructor. The object owns nothing of the host's.
// One thread uses an instance at a time.
#ifndef ULK_INSTANCE_INSTANCE_H
#define ULK_INSTANCE_INSTANCE_H

#include <cstddef>
#include <cstdint>

#include "ulk/core/error.h"
#include "ulk/core/types.h"
#include "ulk/export.h"
#include "ulk/image/media_object.h"
#include "ulk/instance/host_instance.h"
#include "ulk/instance/render_context.h"

class ulkModel_v1;
class ulkImage;
class ulkParameter;
class ulkPGroup;

class ULK_API ulkInstance_v1 {
  public:
    /// Not linked to a host instance.
    ulkInstance_v1() : mHostInstance(nullptr) {}
    /// Refers to the same host instance as source until linked to its own.
    ulkInstance_v1(const ulkInstance_v1& source) = default;
    ulkInstance_v1& operator=(const ulkInstance_v1& source) = default;
    /// Releases nothing.
    virtual ~ulkInstance_v1() {}

    // --- what a plug-in instance supplies
    /// Renders the region of the outputs; true when done.
    virtual bool Execute(const ulkBounds* bounds) = 0;
    /// Makes and adds the parameters; false discards the instance. Default: none, true.
    virtual bool DefineParameters() { return true; }
    /// False when the effect has nothing to do at the current setting. Default true.
    virtual bool HasEffect() { return true; }
    /// True when the output is the input (no copy needed when there is no effect). Default false.
    virtual bool InPlace() { return false; }
    /// Prepares a run of frames; false stops the Execute that asked for it. Default true.
    virtual bool PreProcess() { return true; }
    /// Ends a run of frames. Default: nothing.
    virtual void PostProcess() {}
    /// Runs the user interface; the answer goes to the host. Default false (none).
    virtual bool ShowUIWindow(const ulkBounds* bounds);
    /// The rectangle needed from the input. Default: all zero (null is ignored).
    virtual void GetInputSize(ulkBounds* bounds);
    /// The rectangle produced on the output. Default: all zero (null is ignored).
    virtual void GetOutputSize(ulkBounds* bounds);
    /// Makes a copy of source in *copy. Default: *copy = null, true.
    virtual bool CopyInstance(const ulkInstance_v1* source, ulkInstance_v1** copy);

    // --- fields
    /// True when the field mode is 0, else when the field topness equals the field.
    bool IsTopField() const;

    // --- errors (forwarded to the host instance)
    void SetError(ulkErrorStatus status) { mHostInstance->SetError(status); }
    void SetPluginError(const char* text) { mHostInstance->SetPluginError(text); }
    void SetPluginWarning(const char* text) { mHostInstance->SetPluginWarning(text); }
    ulkErrorStatus GetError() const { return mHostInstance->GetError(); }
    const char* GetErrorString() const { return mHostInstance->GetErrorString(); }

    // --- links, media, abort
    /// Asks the host whether to stop rendering.
    bool Aborted() { return mHostInstance->Aborted(); }
    /// The media of input slot index, or null.
    ulkMediaObject* GetInput(int index) const { return mHostInstance->GetInput(index); }
    /// The media of output slot index, or null.
    ulkMediaObject* GetOutput(int index) const { return mHostInstance->GetOutput(index); }
    /// The plug-in model that made this instance.
    ulkModel_v1* GetModel() const { return mHostInstance->GetModel(); }

    // --- render context (read-only)
    /// Position of the frame (or field) being rendered, 0 to 1.
    double GetTime() const { return mHostInstance->GetTime(); }
    int GetCurrentFrame() const { return mHostInstance->GetCurrentFrame(); }
    int GetTotalFrames() const { return mHostInstance->GetTotalFrames(); }
    double GetQuality() const { return mHostInstance->GetQuality(); }
    double GetFrameRate() const { return mHostInstance->GetFrameRate(); }
    double GetPixelAspect() const { return mHostInstance->GetPixelAspect(); }
    double GetDisplayAspect() const { return mHostInstance->GetDisplayAspect(); }
    ulkFieldMode GetFieldMode() const { return mHostInstance->GetFieldMode(); }
    ulkField GetFieldDominance() const { return mHostInstance->GetFieldDominance(); }
    ulkField GetFieldTopness() const { return mHostInstance->GetFieldTopness(); }
    ulkVideoType GetVideoType() const { return mHostInstance->GetVideoType(); }
    short GetNumFields() const { return mHostInstance->GetNumFields(); }
    ulkField GetField() const { return mHostInstance->GetField(); }
    /// Copies the host's platform record into out (nothing when the host set none).
    void GetPlatformUIInfo(ulkPlatformUIInfo* out) const { mHostInstance->GetPlatformUIInfo(out); }
    ulkInstanceType GetInstanceType() const { return mHostInstance->GetInstanceType(); }

    // --- memory, console, drawing
    /// Memory from the host's instance callbacks.
    void* AllocMem(size_t size) { return mHostInstance->AllocMem(size); }
    void FreeMem(void* p) { mHostInstance->FreeMem(p); }
    /// Prints text on the host's console; compose the message first.
    int ConsolePrintf(const char* text) { return mHostInstance->ConsolePrintf(text); }
    void DisplayWait(int32_t value) { mHostInstance->DisplayWait(value); }
    /// Draws into the host's video buffer; effective only inside ShowUIWindow.
    void DrawToVideoBuffer(unsigned char* buffer, int32_t a, int32_t b, int32_t c) {
        mHostInstance->DrawToVideoBuffer(buffer, a, b, c);
    }

    // --- alternate frames
    size_t GetAlternateFrameSize(ulkField field, size_t* first, size_t* second) {
        return mHostInstance->GetAlternateFrameSize(field, first, second);
    }
    /// Note the order: image before field here, field before image on the host side.
    bool GetAlternateFrame(unsigned short a, unsigned short b, ulkImage* image, ulkField field) {
        return mHostInstance->GetAlternateFrame(a, b, field, image);
    }

    // --- instance data the host stores with the effect (the host keeps a copy)
    bool SetInstanceData(void* data, size_t size) {
        return mHostInstance->SetInstanceData(data, size);
    }
    const void* GetInstanceData(size_t* size) const { return mHostInstance->GetInstanceData(size); }
    void SetInstanceDataModified(bool modified) {
        mHostInstance->SetInstanceDataModified(modified);
    }

    // --- parameters (the instance owns what is added)
    /// Adds parameter (to group too, when given); call from DefineParameters.
    ulkParameter* AddParameter(ulkParameter* parameter, ulkPGroup* group) {
        return mHostInstance->AddParameter(parameter, group);
    }
    int GetNumParameters() const { return mHostInstance->GetNumParameters(); }
    ulkParameter* GetParameter(int index) const { return mHostInstance->GetParameter(index); }
    ulkParameter* FindParameter(const char* id) const { return mHostInstance->FindParameter(id); }
    void SetHostParametersModified(bool modified) {
        mHostInstance->SetHostParametersModified(modified);
    }
    bool GetHostParametersModified() const { return mHostInstance->GetHostParametersModified(); }

    /// The host-side twin; set by ulkHostInstance::New.
    ulkHostInstance* mHostInstance;
};

#endif  // ULK_INSTANCE_INSTANCE_H

// ulkModel_v1: the base class of a plug-in's effect models.
//
// A plug-in module's factory "ulkNewModel_v1" makes one object of a class
// derived from ulkModel_v1 for a model index. The host model (ulkHostModel)
// attaches itself to it and calls the virtual operations: DefineIdentity
// (name and type at least), DefineEffect (formats, inputs, outputs; the
// default suits filters and compositors), NewInstance and DeleteInstance. The
// non-virtual operations forward to the attached host model; use them from
// DefineIdentity on, never from the constructor. The host model destroys the
// object through its virtual destructor when it closes; the object owns
// nothing of the host's. Used by the thread that drives its host model.
#ifndef ULK_MODEL_MODEL_H
#define ULK_MODEL_MODEL_H

#include <cstddef>

#include "ulk/core/error.h"
#include "ulk/export.h"
#include "ulk/image/image_format.h"
#include "ulk/model/host_model.h"
#include "ulk/model/model_description.h"

class ulkInstance_v1;

class ULK_API ulkModel_v1 {
  public:
    /// Not attached to a host model.
    ulkModel_v1() : mHostModel(nullptr) {}
    /// Refers to the same host model as source.
    ulkModel_v1(const ulkModel_v1& source) = default;
    ulkModel_v1& operator=(const ulkModel_v1& source) = default;
    /// Releases nothing of the host model.
    virtual ~ulkModel_v1() {}

    // --- what a plug-in model supplies
    /// Sets at least the name and the type; false refuses the model.
    virtual bool DefineIdentity() = 0;
    /// A new instance of the plug-in's instance class, or null.
    virtual ulkInstance_v1* NewInstance() = 0;
    /// Describes formats, inputs and outputs. The default adds any 8-bit RGB
    /// format, the inputs of a filter ("Input") or compositor ("Foreground",
    /// "Background") and the output "Output"; it answers false for other types.
    virtual bool DefineEffect();
    /// Destroys an instance made by NewInstance (null is ignored).
    virtual void DeleteInstance(ulkInstance_v1* instance);
    /// A text the host may use to initialise the effect; null by default.
    virtual const char* GetInitString() { return nullptr; }
    /// Whether the effect has a user interface; false by default.
    virtual bool HasUI() { return false; }
    /// Lists the host may ask for; the library never calls them. Null by default.
    virtual const char** UseHardwareList() { return nullptr; }
    virtual const char** UseLibraryList() { return nullptr; }

    // --- identity (forwarded to the host model; texts must outlive the open model)
    void SetType(ulkPluginType type) { mHostModel->SetType(type); }
    void SetName(const char* name) { mHostModel->SetName(name); }
    void SetClass(ulkPluginClass pluginClass) { mHostModel->SetClass(pluginClass); }
    void SetVendor(const char* vendor) { mHostModel->SetVendor(vendor); }
    void SetCategory(const char* category) { mHostModel->SetCategory(category); }
    void SetIdentifier(const char* identifier) { mHostModel->SetIdentifier(identifier); }
    void SetDescription(const char* description) { mHostModel->SetDescription(description); }
    void SetSubType(const char* subType) { mHostModel->SetSubType(subType); }
    void SetPluginVersion(float version) { mHostModel->SetPluginVersion(version); }

    // --- description (forwarded to the host model)
    /// Adds an accepted format.
    bool AddFormat(ulkColorspace colorspace, int bitDepth, const char* order, ulkImgFormat format) {
        return mHostModel->AddFormat(colorspace, bitDepth, order, format);
    }
    /// Adds an input; optional 1 makes it optional.
    bool AddInput(int number, const char* name, const char* id, ulkDataType type,
                  unsigned char optional) {
        return mHostModel->AddInput(number, name, id, type, optional);
    }
    /// Adds a required input.
    bool AddInput(int number, const char* name, const char* id, ulkDataType type) {
        return mHostModel->AddInput(number, name, id, type, 0);
    }
    /// Adds an output.
    bool AddOutput(int number, const char* name, const char* id, ulkDataType type) {
        return mHostModel->AddOutput(number, name, id, type);
    }
    const ulkObjectInfo* GetInputInfo(int index) const { return mHostModel->GetInputInfo(index); }
    const ulkObjectInfo* GetInputInfoByID(const char* id) const {
        return mHostModel->GetInputInfoByID(id);
    }

    // --- model-wide instance callbacks (false when not attached)
    bool SetUpdateParamsCallback(ulkUpdateParamsCallback callback);
    bool SetFlushInstanceDataCallback(ulkFlushInstanceDataCallback callback);

    // --- errors (forwarded to the host model)
    void SetError(ulkErrorStatus status) { mHostModel->SetError(status); }
    void SetPluginError(const char* text) { mHostModel->SetPluginError(text); }
    void SetPluginWarning(const char* text) { mHostModel->SetPluginWarning(text); }
    ulkErrorStatus GetError() { return mHostModel->GetError(); }
    const char* GetErrorString() const { return mHostModel->GetErrorString(); }

    // --- memory from the host model's callbacks
    void* AllocMem(size_t size) { return mHostModel->AllocMem(size); }
    void FreeMem(void* p) { mHostModel->FreeMem(p); }

    /// The host model this object is attached to; set by ulkHostModel::Open.
    ulkHostModel* mHostModel;
};

#endif  // ULK_MODEL_MODEL_H

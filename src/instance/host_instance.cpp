#include "ulk/instance/host_instance.h"

#include <new>

#include "core/process_modes.h"
#include "ulk/image/image.h"
#include "ulk/instance/instance.h"
#include "ulk/model/host_model.h"

namespace {

// Bit of mFlags: the plug-in's PreProcess succeeded and its PostProcess is pending.
const uint32_t kPreProcessed = 1u;

// Runs one call into plug-in code inside the module's environment. An exception
// leaves without the closing SetDown, on its way to the host's caller.
template <typename Call>
bool InModule(ulkHostModel* model, Call call) {
    model->SetUp();
    const bool result = call();
    model->SetDown();
    return result;
}

// The same for the plug-in's Execute and ShowUIWindow, where an exception of
// any type is trapped: status 23 on the instance, answer false.
template <typename Call>
bool Trapped(ulkHostInstance* instance, ulkHostModel* model, Call call) {
    return InModule(model, [&] {
        try {
            return call();
        } catch (...) {
            instance->SetError(kErrorUnhandledException);
            return false;
        }
    });
}

// bounds, or else the whole of output 0 written into whole; null when there
// is no output image to take the size of.
const ulkBounds* BoundsOrWholeOutput(const ulkHostInstance& instance, const ulkBounds* bounds,
                                     ulkBounds* whole) {
    if (bounds) return bounds;
    const ulkImage* output = dynamic_cast<const ulkImage*>(instance.GetOutput(0));
    if (!output) return nullptr;
    *whole = {0, 0, output->GetWidth() - 1, output->GetHeight() - 1};
    return whole;
}

}  // namespace

ulkHostInstance::ulkHostInstance()
    : mHostModel(nullptr),
      mPluginInstance(nullptr),
      mParameters(4),
      mInputs(nullptr),
      mOutputs(nullptr),
      mNumInputs(0),
      mNumOutputs(0),
      mFlags(0),
      mAborted(false),
      mFrameRate(0.0),
      mCurrentFrame(0),
      mTotalFrames(0),
      mSegmentedFrames(false),
      mPixelAspect(1.0),
      mDisplayAspect(1.0),
      mQuality(1.0),
      // The host sets the video type and field topness before it renders;
      // until then the instance counts whole frames and every field is on top.
      mVideoType(kVideoTypeProgressive),
      mFieldMode(kFieldModeFrames),
      mFieldDominance(kFieldOne),
      mFieldTopness(kFieldOne),
      mField(kFieldOne),
      mNumFields(1),
      mInstanceType(kInstanceTypeNone),
      mDrawAllowed(false),
      mMeterCallback(nullptr),
      mMeterData(nullptr),
      mAbortCallback(nullptr),
      mAbortData(nullptr),
      mPlatformUIInfo(nullptr),
      mHasPlatformUIInfo(false),
      mInstanceData(nullptr),
      mInstanceDataSize(0),
      mInstanceDataModified(false),
      mHostParametersModified(false),
      mAltFrameBlob(nullptr),
      mState(ULKState::kStateIdle) {}

ulkHostInstance::~ulkHostInstance() {
    _DeleteParameters();
    delete[] mInputs;
    delete[] mOutputs;
    delete[] mInstanceData;
}

// ------------------------------------------------------------------ creation and destruction

ulkHostInstance* ulkHostInstance::New(ulkHostModel* model, ulkInstance_v1* plugin) {
    if (!model || !plugin) return nullptr;
    ulkHostInstance* instance = new (std::nothrow) ulkHostInstance;
    if (!instance) return nullptr;

    instance->mPluginInstance = plugin;
    plugin->mHostInstance = instance;
    instance->mHostModel = model;
    if (!instance->_Init()) {
        // The plug-in instance goes back to the caller unlinked, not pointing at freed memory.
        plugin->mHostInstance = nullptr;
        delete instance;
        return nullptr;
    }
    return instance;
}

void ulkHostInstance::Delete(ulkHostInstance* instance) {
    delete instance;
}

bool ulkHostInstance::_Init() {
    const int inputs = mHostModel->GetNumInputs();
    const int outputs = mHostModel->GetNumOutputs();
    mInputs = new (std::nothrow) ulkMediaObject*[inputs]();
    mOutputs = new (std::nothrow) ulkMediaObject*[outputs]();
    if (!mInputs || !mOutputs) return false;
    mNumInputs = inputs;
    mNumOutputs = outputs;
    return true;
}

void ulkHostInstance::CleanUp() {
    ResetError();
    if (mFlags & kPreProcessed) PostProcess();
}

ulkModel_v1* ulkHostInstance::GetModel() const {
    return mHostModel->GetModel();
}

// ------------------------------------------------------------------ media slots

bool ulkHostInstance::SetInput(int index, ulkMediaObject* media) {
    if (index < 0 || index >= mNumInputs) return false;
    mInputs[index] = media;
    return true;
}

bool ulkHostInstance::SetOutput(int index, ulkMediaObject* media) {
    if (index < 0 || index >= mNumOutputs) return false;
    mOutputs[index] = media;
    return true;
}

ulkMediaObject* ulkHostInstance::GetInput(int index) const {
    if (index < 0 || index >= mNumInputs) return nullptr;
    return mInputs[index];
}

ulkMediaObject* ulkHostInstance::GetOutput(int index) const {
    if (index < 0 || index >= mNumOutputs) return nullptr;
    return mOutputs[index];
}

ulkImage* ulkHostInstance::_OutputImage() const {
    return dynamic_cast<ulkImage*>(GetOutput(0));
}

// ------------------------------------------------------------------ errors

void ulkHostInstance::SetError(ulkErrorStatus status) {
    mError.ResetError();
    mError.SetError(status);
}

// ------------------------------------------------------------------ calls into the plug-in

bool ulkHostInstance::DefineParameters() {
    ULKState guard(ULKState::kStateDefineParameters, mState);
    ResetError();
    return InModule(mHostModel, [this] { return mPluginInstance->DefineParameters(); });
}

bool ulkHostInstance::HasEffect() {
    ResetError();
    return InModule(mHostModel, [this] { return mPluginInstance->HasEffect(); });
}

bool ulkHostInstance::InPlace() {
    ResetError();
    return InModule(mHostModel, [this] { return mPluginInstance->InPlace(); });
}

bool ulkHostInstance::PreProcess() {
    ResetError();
    if (mFlags & kPreProcessed) return true;

    // Modules read the render flag: final rendering (play mode 0) or playback (1).
    const int32_t playMode = ulk::GetPlayModeValue();
    if (playMode == kPlayModePlay)
        ulk::SetRenderFlag(0);
    else if (playMode == kPlayModeRender)
        ulk::SetRenderFlag(1);

    if (InModule(mHostModel, [this] { return mPluginInstance->PreProcess(); })) {
        mFlags |= kPreProcessed;
        return true;
    }
    if (mError.GetError() == kErrorNone) mError.SetError(kErrorPreProcess);
    return false;
}

void ulkHostInstance::PostProcess() {
    if (mFlags & kPreProcessed) {
        mHostModel->SetUp();
        mPluginInstance->PostProcess();
        mHostModel->SetDown();
    }
    mFlags &= ~kPreProcessed;
}

bool ulkHostInstance::Execute(const ulkBounds* bounds) {
    ULKState guard(ULKState::kStateExecute, mState);
    ResetError();
    Evaluate();
    mAborted = false;

    ulkBounds whole;
    bounds = BoundsOrWholeOutput(*this, bounds, &whole);
    if (!bounds) {
        mError.SetError(kErrorExecute);
        return false;
    }

    if (!HasEffect()) {
        if (InPlace()) return true;
        // Nothing to render: the output is a copy of the input.
        const ulkImage* input = dynamic_cast<const ulkImage*>(GetInput(0));
        ulkImage* output = _OutputImage();
        if (!input || !output || !output->Copy(input, bounds)) {
            if (mError.GetError() == kErrorNone) mError.SetError(kErrorExecute);
            return false;
        }
        return true;
    }

    ulk::SetRenderFlag(1);
    bool preProcessedHere = false;
    if (!(mFlags & kPreProcessed)) {
        ulk::SetRenderFlag(0);
        if (!PreProcess()) {
            if (mError.GetError() == kErrorNone) mError.SetError(kErrorPreProcess);
            return false;
        }
        preProcessedHere = true;
        ulk::SetRenderFlag(1);
    }

    const bool result = Trapped(this, mHostModel, [&] { return mPluginInstance->Execute(bounds); });

    if (preProcessedHere) PostProcess();

    if (!result && mError.GetError() == kErrorNone) mError.SetError(kErrorExecute);
    return result;
}

bool ulkHostInstance::ShowUIWindow(const ulkBounds* bounds) {
    ULKState guard(ULKState::kStateShowUIWindow, mState);
    ResetError();
    Evaluate();
    mAborted = false;

    ulkBounds whole;
    bounds = BoundsOrWholeOutput(*this, bounds, &whole);
    if (!bounds) return false;

    mDrawAllowed = true;
    const bool result =
        Trapped(this, mHostModel, [&] { return mPluginInstance->ShowUIWindow(bounds); });
    mDrawAllowed = false;
    return result;
}

void ulkHostInstance::GetInputSize(ulkBounds* bounds) {
    ResetError();
    mHostModel->SetUp();
    mPluginInstance->GetInputSize(bounds);
    mHostModel->SetDown();
}

void ulkHostInstance::GetOutputSize(ulkBounds* bounds) {
    ResetError();
    mHostModel->SetUp();
    mPluginInstance->GetOutputSize(bounds);
    mHostModel->SetDown();
}

// ------------------------------------------------------------------ abort and meter

void ulkHostInstance::SetAbortCallback(ulkAbortCallback callback, void* data) {
    mAbortCallback = callback;
    mAbortData = data;
}

void ulkHostInstance::SetMeterCallback(ulkMeterCallback callback, void* data) {
    mMeterCallback = callback;
    mMeterData = data;
}

bool ulkHostInstance::Aborted() {
    if (mAbortCallback) {
        mHostModel->SetDown();
        mAborted = mAbortCallback(mPluginInstance, mAbortData);
        mHostModel->SetUp();
    }
    return mAborted;
}

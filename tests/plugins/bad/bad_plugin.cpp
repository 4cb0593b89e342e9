// Plug-ins that get things wrong, for the host-survival tests. See bad_plugin.h.
//
// Compile definitions select what the whole module does wrong:
//   BAD_START_UP_FAILS   ulkStartUp_v1 answers false
//   BAD_NO_FACTORY       no ulkNewModel_v1 and no ulkNewOverlay_v1
//   BAD_NUM_MODELS=n     ulkNumModels_v1 answers n (0, or a negative count)
#include <stdexcept>

#include "bad_plugin.h"
#include "ulk/ulk.h"

namespace {

ulkHostAttributeCallback gHost = nullptr;
int gLiveObjects = 0;

void Report(BadReport event) {
    if (gHost) gHost(static_cast<ulkHostAttribute>(event), nullptr);
}

// Counts itself and holds a block of the host's allocator for its owner.
template <typename Owner>
class Scratch {
  public:
    Scratch() { ++gLiveObjects; }
    ~Scratch() { --gLiveObjects; }
    void Take(Owner& owner) {
        if (!mBlock) mBlock = owner.AllocMem(64);
    }
    void Give(Owner& owner) {
        if (mBlock) owner.FreeMem(mBlock);
        mBlock = nullptr;
    }

  private:
    void* mBlock = nullptr;
};

class BadInstance : public ulkInstance_v1 {
  public:
    explicit BadInstance(int behaviour) : mBehaviour(behaviour) {}
    ~BadInstance() override { mScratch.Give(*this); }

    bool DefineParameters() override {
        mScratch.Take(*this);
        AddParameter(ulkPNumber::New("Gain", "gain", &mGain, sizeof mGain, 0.0, 2.0, 0.1,
                                     kPNumberReal, false),
                     nullptr);
        AddParameter(ulkPString::New("Label", "label", nullptr, 32, kPStringTypeDefault), nullptr);
        if (mBehaviour == kBadParamsThrow) throw 21;
        return mBehaviour != kBadParamsFalse;
    }
    bool HasEffect() override {
        if (mBehaviour == kBadHasEffectThrows) throw std::logic_error(BAD_HAS_EFFECT_TEXT);
        return true;
    }
    bool PreProcess() override {
        Report(kBadReportPreProcess);
        return mBehaviour != kBadPreProcessFalse;
    }
    void PostProcess() override { Report(kBadReportPostProcess); }
    bool Execute(const ulkBounds*) override {
        Report(kBadReportExecute);
        Throw();
        return true;
    }
    bool ShowUIWindow(const ulkBounds*) override {
        Throw();
        return true;
    }

  private:
    void Throw() {
        switch (mBehaviour) {
            case kBadExecuteThrowsInt:
                throw 7;
            case kBadExecuteThrowsStd:
                throw std::runtime_error("render failed");
            case kBadExecuteThrowsText:
                throw "render failed";
            default:
                break;
        }
    }

    int mBehaviour;
    double mGain = 1.0;
    Scratch<ulkInstance_v1> mScratch;
};

class BadModelObject : public ulkModel_v1 {
  public:
    explicit BadModelObject(int behaviour) : mBehaviour(behaviour) {}
    ~BadModelObject() override { mScratch.Give(*this); }

    bool DefineIdentity() override {
        mScratch.Take(*this);
        if (mBehaviour != kBadNoName) SetName("Bad filter");
        if (mBehaviour != kBadNoType) SetType(kPluginTypeFilter);
        return true;
    }
    bool DefineEffect() override {
        const bool defined = ulkModel_v1::DefineEffect();
        return defined && mBehaviour != kBadEffectFalse;
    }
    ulkInstance_v1* NewInstance() override { return new BadInstance(mBehaviour); }

  private:
    int mBehaviour;
    Scratch<ulkModel_v1> mScratch;
};

class BadOverlay : public ulkOverlay_v1 {
  public:
    explicit BadOverlay(int behaviour) : mBehaviour(behaviour) {}
    ~BadOverlay() override { mScratch.Give(*this); }

    void DefineOverlay() override {
        mScratch.Take(*this);
        if (mBehaviour != kBadOverlayNoMode) ulkOverlay_v1::DefineOverlay();
        if (mBehaviour == kBadOverlayThrows) throw std::logic_error(BAD_OVERLAY_TEXT);
    }
    void Draw(bool) override {}
    bool OnMouseDown(double, double, uint32_t) override { return GetMode() == 0; }
    bool OnMouseMove(double, double, uint32_t) override { return false; }
    bool OnMouseUp(double, double, uint32_t) override { return false; }

  private:
    int mBehaviour;
    Scratch<ulkOverlay_v1> mScratch;
};

}  // namespace

ULK_PLUGIN_EXPORT bool ulkStartUp_v1(unsigned char*) {
#ifdef BAD_START_UP_FAILS
    return false;
#else
    return true;
#endif
}

ULK_PLUGIN_EXPORT void ulkShutDown_v1(void) {
    Report(kBadReportShutDown);
    gHost = nullptr;
}

ULK_PLUGIN_EXPORT void ulkGetModelAttributes_v1ext(int, int32_t attribute, void* value) {
    if (attribute == kAttributeHostCallback)
        gHost = reinterpret_cast<ulkHostAttributeCallback>(value);
}

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
#ifdef BAD_NUM_MODELS
    return BAD_NUM_MODELS;
#else
    return kBadModelCount;
#endif
}

#ifndef BAD_NO_FACTORY
ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    if (modelIndex == kBadFactoryNull) return nullptr;
    if (modelIndex == kBadFactoryThrows) throw 3;
    return new BadModelObject(modelIndex);
}

ULK_PLUGIN_EXPORT ulkOverlay_v1* ulkNewOverlay_v1(unsigned short modelIndex) {
    return new BadOverlay(modelIndex);
}

ULK_PLUGIN_EXPORT int BadLiveObjects(void) {
    return gLiveObjects;
}
#endif

// One module, many faulty models: the model index chooses where it fails.
#include <stdexcept>

#include "model_faults.h"
#include "ulk/ulk.h"

namespace {

int gLiveInstances = 0;
int gModelsOpened = 0;

class FaultInstance : public ulkInstance_v1 {
  public:
    explicit FaultInstance(int behaviour) : mBehaviour(behaviour) { ++gLiveInstances; }
    ~FaultInstance() override { --gLiveInstances; }

    bool DefineParameters() override {
        switch (mBehaviour) {
            case kFaultParamsFalse:
                return false;
            case kFaultParamsError:
                SetPluginError(FAULT_PARAMS_TEXT);
                return false;
            case kFaultParamsThrow:
                throw std::runtime_error("parameters");
            default:
                return true;
        }
    }
    bool Execute(const ulkBounds*) override { return true; }

  private:
    int mBehaviour;
};

class FaultyModel : public ulkModel_v1 {
  public:
    explicit FaultyModel(int behaviour) : mBehaviour(behaviour) {}

    bool DefineIdentity() override {
        switch (mBehaviour) {
            case kFaultNoName:
                SetType(kPluginTypeFilter);
                return true;
            case kFaultNoType:
                SetName("Nameless type");
                return true;
            case kFaultIdentityError:
                SetName("Unlicensed");
                SetType(kPluginTypeFilter);
                SetPluginError(FAULT_IDENTITY_TEXT);
                return false;
            case kFaultIdentityFalse:
                return false;
            case kFaultDefaultTitle:
                SetName("Title without description");
                SetType(kPluginTypeTitle);
                return true;
            default:
                SetName("Fault filter");
                SetType(kPluginTypeFilter);
                return true;
        }
    }
    bool DefineEffect() override {
        if (mBehaviour == kFaultEffectThrows) throw std::runtime_error("effect");
        if (mBehaviour == kFaultEffectWarning) {
            SetPluginWarning(FAULT_EFFECT_TEXT);
            return false;
        }
        return ulkModel_v1::DefineEffect();
    }
    ulkInstance_v1* NewInstance() override {
        if (mBehaviour == kFaultNoInstance) return nullptr;
        return new FaultInstance(mBehaviour);
    }
    bool HasUI() override { return mBehaviour == kFaultWithUI ? true : ulkModel_v1::HasUI(); }
    const char* GetInitString() override {
        return mBehaviour == kFaultWithUI ? "init:with-ui" : ulkModel_v1::GetInitString();
    }

  private:
    int mBehaviour;
};

// The plain model keeps every default of the base class.
class PlainModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Plain");
        SetType(kPluginTypeFilter);
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new FaultInstance(kFaultPlain); }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return kFaultEffectThrows + 1;
}

ULK_PLUGIN_EXPORT void ulkSetAttribute(int, int32_t attribute, void*, void*) {
    if (attribute == kAttributeModelOpened) ++gModelsOpened;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    switch (modelIndex) {
        case kFaultFactoryNull:
            return nullptr;
        case kFaultFactoryThrows:
            throw std::runtime_error("factory");
        case kFaultPlain:
            return new PlainModel;
        default:
            return new FaultyModel(modelIndex);
    }
}

ULK_PLUGIN_EXPORT int FaultLiveInstances(void) {
    return gLiveInstances;
}

ULK_PLUGIN_EXPORT int FaultModelsOpened(void) {
    return gModelsOpened;
}

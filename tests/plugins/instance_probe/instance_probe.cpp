// A filter whose answers a test chooses and which records what it saw.
#include <stdexcept>

#include "probe_control.h"

namespace {

ProbeControl gControl;
ulkModeFunction gRenderFlag = nullptr;

class ProbeInstance : public ulkInstance_v1 {
  public:
    bool HasEffect() override {
        Record('H');
        return gControl.hasEffect;
    }
    bool InPlace() override {
        Record('I');
        return gControl.inPlace;
    }
    bool PreProcess() override {
        Record('P');
        if (gControl.preProcessWarning) SetPluginWarning(gControl.preProcessWarning);
        return gControl.preProcess;
    }
    void PostProcess() override { Record('O'); }

    bool Execute(const ulkBounds* bounds) override {
        Record('E');
        gControl.bounds = *bounds;
        CallServices();
        if (gControl.executeThrows) throw std::runtime_error("probe");
        if (ulkImage* out = dynamic_cast<ulkImage*>(GetOutput(0))) Fill(out);
        if (gControl.executeError) SetPluginError(gControl.executeError);
        return gControl.execute;
    }

    bool ShowUIWindow(const ulkBounds* bounds) override {
        Record('U');
        gControl.bounds = *bounds;
        CallServices();
        if (gControl.showUIThrows) throw 42;  // not even a std::exception
        return gControl.showUI;
    }

  private:
    void Record(char call) {
        if (gControl.numEvents >= 32) return;
        ProbeEvent& event = gControl.events[gControl.numEvents++];
        event.call = call;
        event.renderFlag = gRenderFlag ? gRenderFlag() : -1;
        event.state = ULKState::kStateIdle;
        for (int32_t s = ULKState::kStateIdle; s <= ULKState::kStateShowUIWindow; ++s)
            if (mHostInstance->IsState(static_cast<ULKState::State>(s))) event.state = s;
    }

    void CallServices() {
        if (gControl.actions & kProbeDraw) DrawToVideoBuffer(gControl.drawBuffer, 1, 2, 3);
        if (gControl.actions & kProbeAbort) gControl.aborted = Aborted();
        if (gControl.actions & kProbeAltFrame)
            gControl.altFrame =
                GetAlternateFrame(3, 7, dynamic_cast<ulkImage*>(GetInput(0)), kFieldTwo);
        if (gControl.actions & kProbeConsole) gControl.console = ConsolePrintf("100% done");
    }

    static void Fill(ulkImage* out) {
        for (int c = 0; c < out->GetNumChannels(); ++c)
            for (int y = 0; y < out->GetHeight(); ++y)
                for (int x = 0;; ++x) {
                    auto* sample = static_cast<unsigned char*>(out->GetPixelPtr(x, y, c));
                    if (!sample) break;
                    *sample = gControl.fill;
                }
    }
};

class ProbeModelClass : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Probe");
        SetType(kPluginTypeFilter);
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new ProbeInstance; }
};

// Overrides only what it must, so the base class answers everything else.
class MinimalInstance : public ulkInstance_v1 {
  public:
    bool Execute(const ulkBounds*) override { return true; }
};

class MinimalModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Minimal");
        SetType(kPluginTypeFilter);
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new MinimalInstance; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 2;
}

ULK_PLUGIN_EXPORT void ulkSetAttribute(int, int32_t attribute, void* value, void*) {
    if (attribute == kAttributeRenderFlagFunction)
        gRenderFlag = reinterpret_cast<ulkModeFunction>(value);
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    switch (modelIndex) {
        case kProbeModel:
            return new ProbeModelClass;
        case kMinimalModel:
            return new MinimalModel;
        default:
            return nullptr;
    }
}

ULK_PLUGIN_EXPORT ProbeControl* ProbeGetControl(void) {
    return &gControl;
}

ULK_PLUGIN_EXPORT int32_t ProbeRenderFlag(void) {
    return gRenderFlag ? gRenderFlag() : -1;
}

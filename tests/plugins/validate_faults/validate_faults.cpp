// One module, one filter per fault ulk-validate must report; the model index picks it.
#include <chrono>
#include <cstdint>
#include <cstring>
#include <stdexcept>
#include <thread>

#include "ulk/ulk.h"
#include "validate_faults.h"

namespace {

// First byte of row y of an interleaved image: the lowest of its channels' addresses.
uint8_t* RowStart(ulkImage* image, int y) {
    uint8_t* start = nullptr;
    for (int c = 0; c < image->GetNumChannels(); ++c) {
        auto* p = static_cast<uint8_t*>(image->GetRowPtr(y, c));
        if (!start || p < start) start = p;
    }
    return start;
}

size_t RowBytes(ulkImage* image) {
    return static_cast<size_t>(image->GetWidth()) * static_cast<size_t>(image->GetPixelDelta(0));
}

class FaultFilter : public ulkInstance_v1 {
  public:
    explicit FaultFilter(int fault) : mFault(fault) {}

    bool DefineParameters() override {
        if (mFault != kValidateTwinParams) return true;
        for (double* value : {&mFirst, &mSecond}) {
            ulkParameter* p = ulkPNumber::New("Amount", "amount", value, sizeof *value, 0.0, 1.0,
                                              0.1, kPNumberReal, false);
            if (!AddParameter(p, nullptr)) {
                ulkParameter::Delete(p);
                return false;
            }
        }
        return true;
    }

    bool Execute(const ulkBounds*) override {
        auto* in = static_cast<ulkImage*>(GetInput(0));
        auto* out = static_cast<ulkImage*>(GetOutput(0));
        if (!in || !out) return false;
        for (int y = 0; y < out->GetHeight(); ++y)
            std::memcpy(RowStart(out, y), RowStart(in, y), RowBytes(out));
        switch (mFault) {
            case kValidateRowOverrun:
                for (int y = 0; y < out->GetHeight(); ++y) RowStart(out, y)[RowBytes(out)] ^= 0xFF;
                break;
            case kValidateNullWrite:
                *static_cast<volatile uint8_t*>(mNowhere) = 1;
                break;
            case kValidateEndless:
                for (;;) std::this_thread::sleep_for(std::chrono::milliseconds(10));
            case kValidateLeak:
                AllocMem(48);
                break;
            case kValidateInputWrite:
                RowStart(in, in->GetHeight() - 1)[0] ^= 0xFF;
                break;
            case kValidateThrows:
                throw std::runtime_error("lookup table missing");
            default:
                break;
        }
        return true;
    }

  private:
    int mFault;
    void* volatile mNowhere = nullptr;
    double mFirst = 0.5, mSecond = 0.5;
};

const char* const kNames[kValidateModelCount] = {"Clean",   "Row overrun", "Null write",
                                                 "Endless", "Leak",        "Scribbler",
                                                 "Thrower", "Twin params", "Overlay overrun"};
const char* const kIds[kValidateModelCount] = {
    "test.validate.clean",   "test.validate.overrun", "test.validate.null",
    "test.validate.endless", "test.validate.leak",    "test.validate.scribbler",
    "test.validate.thrower", "test.validate.twins",   "test.validate.overlay"};

class FaultModel : public ulkModel_v1 {
  public:
    explicit FaultModel(int fault) : mFault(fault) {}

    bool DefineIdentity() override {
        SetName(kNames[mFault]);
        SetIdentifier(kIds[mFault]);
        SetType(kPluginTypeFilter);
        return true;
    }
    bool DefineEffect() override {
        return AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatRGBA) &&
               AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatBGR) &&
               AddInput(0, "Input", "input", kDataTypeDefault) &&
               AddOutput(0, "Output", "output", kDataTypeDefault);
    }
    ulkInstance_v1* NewInstance() override { return new FaultFilter(mFault); }

  private:
    int mFault;
};

// Draws one row too many: the row below the surface's last.
class OverrunOverlay : public ulkOverlay_v1 {
  public:
    void DefineOverlay() override { AddMode("Only"); }
    void Draw(bool) override {
        ulkImage* surface = GetOverlayBuffer();
        if (!surface) return;
        std::memset(RowStart(surface, 0) + surface->GetRowDelta(0) * surface->GetHeight(), 0xFF, 4);
    }
    bool OnMouseDown(double, double, uint32_t) override { return false; }
    bool OnMouseMove(double, double, uint32_t) override { return false; }
    bool OnMouseUp(double, double, uint32_t) override { return false; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return kValidateModelCount;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex < kValidateModelCount ? new FaultModel(modelIndex) : nullptr;
}

ULK_PLUGIN_EXPORT ulkOverlay_v1* ulkNewOverlay_v1(unsigned short modelIndex) {
    return modelIndex == kValidateOverlayOverrun ? new OverrunOverlay : nullptr;
}

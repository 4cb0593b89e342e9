// "Levels": a filter with a few parameters (two of them in a group) that
// scales the colour of RGBA pixels by its gain.
#include <algorithm>

#include "param_probe.h"

namespace {

ParamProbeRecord gRecord;

class LevelsInstance : public ulkInstance_v1 {
  public:
    LevelsInstance() : mValues{1.0, 0, false, {0.0, 0.0, 0.0}} { gRecord.live = &mValues; }
    ~LevelsInstance() override {
        if (gRecord.live == &mValues) gRecord.live = nullptr;
    }

    bool DefineParameters() override {
        ulkParameter* gain =
            AddParameter(ulkPNumber::New("Gain", "gain", &mValues.gain, sizeof mValues.gain, 0.0,
                                         4.0, 0.1, kPNumberReal, false),
                         nullptr);
        ulkPGroup* advanced = ulkPGroup::New("Advanced", "advanced", false);
        AddParameter(advanced, nullptr);
        AddParameter(ulkPNumber::New("Steps", "steps", &mValues.steps, sizeof mValues.steps, 0.0,
                                     10.0, 1.0, kPNumberInteger, false),
                     advanced);
        AddParameter(
            ulkPBoolean::New("Enabled", "enabled", &mValues.enabled, sizeof mValues.enabled),
            advanced);
        AddParameter(ulkPColorRGB::New("Tint", "tint", &mValues.tint, sizeof mValues.tint),
                     nullptr);
        // Adding one parameter twice is refused; the set stays as it was.
        gRecord.secondAdd = AddParameter(gain, nullptr);
        return gain && GetNumParameters() == 5;
    }

    bool Execute(const ulkBounds* bounds) override {
        if (gRecord.executes < 16) gRecord.seen[gRecord.executes] = mValues;
        ++gRecord.executes;

        const ulkImage* in = dynamic_cast<ulkImage*>(GetInput(0));
        const ulkImage* out = dynamic_cast<ulkImage*>(GetOutput(0));
        if (!in || !out || out->GetImgFormat() != kImgFormatRGBA) return false;
        for (int y = bounds->top; y <= bounds->bottom; ++y)
            for (int x = bounds->left; x <= bounds->right; ++x)
                for (int c = 0; c < 4; ++c) {
                    const auto* src = static_cast<const unsigned char*>(in->GetPixelPtr(x, y, c));
                    auto* dst = static_cast<unsigned char*>(out->GetPixelPtr(x, y, c));
                    const double scaled = c == 3 ? *src : *src * mValues.gain + 0.5;
                    *dst = static_cast<unsigned char>(std::min(255.0, scaled));
                }
        return true;
    }

  private:
    LevelsValues mValues;
};

unsigned char UpdateParams(ulkInstance_v1* instance) {
    ++gRecord.updates;
    gRecord.updated = instance;
    return 1;
}

class LevelsModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Levels");
        SetType(kPluginTypeFilter);
        return SetUpdateParamsCallback(&UpdateParams);
    }
    ulkInstance_v1* NewInstance() override { return new LevelsInstance; }
};

}  // namespace

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex == 0 ? new LevelsModel : nullptr;
}

ULK_PLUGIN_EXPORT ParamProbeRecord* ParamProbeGetRecord(void) {
    return &gRecord;
}

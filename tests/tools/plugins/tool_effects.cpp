// Effects that put ulk-render's own duties to the test: a filter that takes BGRA only (so
// frames must be reordered for it), a filter that fails on a chosen frame, and one that
// takes a format no frame can be converted to.
#include "ulk/ulk.h"

namespace {

ulkImage* Image(ulkMediaObject* media) {
    return dynamic_cast<ulkImage*>(media);
}

// Copies input 0 to output 0 sample by sample, clearing the channel of type cleared.
bool CopyClearing(ulkInstance_v1* instance, ulkImgChannel cleared) {
    ulkImage* in = Image(instance->GetInput(0));
    ulkImage* out = Image(instance->GetOutput(0));
    if (!in || !out || in->GetImgFormat() != out->GetImgFormat()) {
        instance->SetPluginError("needs an input and an output of one format");
        return false;
    }
    for (int c = 0; c < out->GetNumChannels(); ++c)
        for (int y = 0; y < out->GetHeight(); ++y)
            for (int x = 0; x < out->GetWidth(); ++x) {
                const auto value = *static_cast<unsigned char*>(in->GetPixelPtr(x, y, c));
                *static_cast<unsigned char*>(out->GetPixelPtr(x, y, c)) =
                    out->GetChannelType(c) == cleared ? 0 : value;
            }
    return true;
}

class ClearRedInstance : public ulkInstance_v1 {
  public:
    bool Execute(const ulkBounds*) override { return CopyClearing(this, kImgChannelRV); }
};

// Takes BGRA only and clears red: with frames handed over unconverted, blue would go.
class ClearRedModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Clear Red");
        SetType(kPluginTypeFilter);
        SetIdentifier("org.ulk.tests.clear-red");
        return true;
    }
    bool DefineEffect() override {
        return AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatBGRA) &&
               AddInput(0, "Input", "input", kDataTypeDefault) &&
               AddOutput(0, "Output", "output", kDataTypeDefault);
    }
    ulkInstance_v1* NewInstance() override { return new ClearRedInstance; }
};

class FailAtInstance : public ulkInstance_v1 {
  public:
    bool DefineParameters() override {
        ulkParameter* frame =
            ulkPNumber::New("Failing Frame", "fail_frame", &mFailFrame, sizeof mFailFrame, -1,
                            1000000, 1, kPNumberInteger, false);
        return frame && AddParameter(frame, nullptr) != nullptr;
    }
    bool Execute(const ulkBounds*) override {
        if (GetCurrentFrame() == mFailFrame) {
            SetPluginError("the disk of frames ran dry");
            return false;
        }
        return CopyClearing(this, kImgChannelNone);
    }

  private:
    int mFailFrame = -1;
};

class FailAtModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Fail At");
        SetType(kPluginTypeFilter);
        SetIdentifier("org.ulk.tests.fail-at");
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new FailAtInstance; }
};

class YuvOnlyModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("YUV Only");
        SetType(kPluginTypeFilter);
        return true;
    }
    bool DefineEffect() override {
        return AddFormat(kColorspaceYUV, 8, nullptr, kImgFormatUYVY) &&
               AddInput(0, "Input", "input", kDataTypeDefault) &&
               AddOutput(0, "Output", "output", kDataTypeDefault);
    }
    ulkInstance_v1* NewInstance() override { return new ClearRedInstance; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 3;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    switch (modelIndex) {
        case 0:
            return new ClearRedModel;
        case 1:
            return new FailAtModel;
        case 2:
            return new YuvOnlyModel;
        default:
            return nullptr;
    }
}

// Levels: gain, offset, gamma, tint and invert on chosen channels.
//
// The smallest useful filter, and the place to start reading the samples. It
// shows the whole shape of a plug-in module:
//
//   - a model (ulkModel_v1) that names the effect and lists the formats it
//     accepts;
//   - an instance (ulkInstance_v1) that defines its parameters over its own
//     member variables - before every Execute the host writes the values for
//     the frame being rendered into them - and renders a region;
//   - the two entry points the library looks up by name.
//
// Each selected channel value v (0..1) becomes
//
//     v' = clamp(v * gain * tint + offset) ^ (1 / gamma), then 1 - v' if inverted
//
// where the tint applies to red, green and blue only. The filter works pixel
// by pixel, so it runs in place: a host may pass one image as input and
// output. When the settings change nothing, HasEffect says so and, since
// InPlace is true, the host skips the frame altogether.
#include <cmath>
#include <vector>

#include "common/pixels.h"
#include "ulk/ulk.h"

using namespace ulk_samples;

namespace {

// The channel list; the value of the list parameter is an index into it.
enum ChannelChoice {
    kChannelsRGB = 0,
    kChannelsRed,
    kChannelsGreen,
    kChannelsBlue,
    kChannelsAlpha
};
const char* const kChannelItems[] = {"RGB", "Red", "Green", "Blue", "Alpha", nullptr};

class LevelsInstance : public ulkInstance_v1 {
  public:
    bool DefineParameters() override {
        // Each parameter writes into the member given as its storage; the value the
        // member holds now becomes the parameter's default.
        return AddParam(this, ulkPNumber::New("Gain", "gain", &mGain, sizeof mGain, 0.0, 4.0, 0.01,
                                              kPNumberReal, false)) &&
               AddParam(this, ulkPNumber::New("Gamma", "gamma", &mGamma, sizeof mGamma, 0.1, 5.0,
                                              0.01, kPNumberReal, false)) &&
               AddParam(this, ulkPNumber::New("Offset", "offset", &mOffset, sizeof mOffset, -1.0,
                                              1.0, 0.01, kPNumberReal, false)) &&
               AddParam(this, ulkPColorRGB::New("Tint", "tint", &mTint, sizeof mTint)) &&
               AddParam(this, ulkPBoolean::New("Invert", "invert", &mInvert, sizeof mInvert)) &&
               AddParam(this, ulkPList::New("Channels", "channels", &mChannels, sizeof mChannels,
                                            kChannelItems, kPListTypeDefault));
    }

    bool HasEffect() override {
        const bool neutralTint = mChannels == kChannelsAlpha ||
                                 (mTint.red == 1.0 && mTint.green == 1.0 && mTint.blue == 1.0);
        return !(mGain == 1.0 && mGamma == 1.0 && mOffset == 0.0 && !mInvert && neutralTint);
    }

    // Every output pixel depends on the input pixel at the same place only.
    bool InPlace() override { return true; }
    void GetInputSize(ulkBounds*) override {}  // the region asked for is the region needed
    void GetOutputSize(ulkBounds*) override {}

    bool Execute(const ulkBounds* bounds) override {
        PixelView in, out;
        if (!BindOrFail(this, &in, GetInput(0)) || !BindOrFail(this, &out, GetOutput(0)))
            return false;
        if (!in.SameSize(out)) {
            SetPluginError("Levels: input and output differ in size");
            return false;
        }
        ulkBounds region;
        if (!ClipRegion(bounds, out.Width(), out.Height(), &region)) return true;

        // The per-channel factors, decided once per frame.
        bool selected[4];
        for (int c = 0; c < 4; ++c)
            selected[c] = mChannels == kChannelsRGB ? c != kAlpha : c == mChannels - kChannelsRed;
        const double tint[4] = {mTint.red, mTint.green, mTint.blue, 1.0};
        float scale[4];
        for (int c = 0; c < 4; ++c) scale[c] = static_cast<float>(mGain * tint[c]);
        const float offset = static_cast<float>(mOffset);
        const bool applyGamma = mGamma != 1.0;
        const float inverseGamma = static_cast<float>(1.0 / mGamma);

        const int count = region.right - region.left + 1;
        std::vector<float> row(static_cast<size_t>(count) * 4);
        for (int y = region.top; y <= region.bottom; ++y) {
            if (Aborted()) return false;
            in.ReadRow(region.left, y, count, row.data());
            for (int i = 0; i < count; ++i) {
                float* pixel = &row[static_cast<size_t>(i) * 4];
                for (int c = 0; c < 4; ++c) {
                    if (!selected[c]) continue;
                    float v = Clamp01(pixel[c] * scale[c] + offset);
                    if (applyGamma) v = std::pow(v, inverseGamma);
                    pixel[c] = mInvert ? 1.0f - v : v;
                }
            }
            out.WriteRow(region.left, y, count, row.data());
        }
        return true;
    }

  private:
    double mGain = 1.0;
    double mGamma = 1.0;
    double mOffset = 0.0;
    ulkColorRGB mTint = {1.0, 1.0, 1.0};
    bool mInvert = false;
    int mChannels = kChannelsRGB;
};

class LevelsModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Levels");
        SetType(kPluginTypeFilter);
        SetVendor("ULK Samples");
        SetCategory("Colour");
        SetIdentifier("com.ulk.samples.levels");
        SetDescription("Gain, gamma, offset, tint and invert on chosen channels");
        SetPluginVersion(1.0f);
        return true;
    }

    // The default description would accept any 8-bit format; list the ones the
    // filter really handles, then its input and output.
    bool DefineEffect() override {
        return AddSampleFormats(this) && AddInput(0, "Input", "input", kDataTypeDefault) &&
               AddOutput(0, "Output", "output", kDataTypeDefault);
    }

    ulkInstance_v1* NewInstance() override { return new LevelsInstance; }
};

}  // namespace

// The module offers one model.
ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 1;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex == 0 ? new LevelsModel : nullptr;
}

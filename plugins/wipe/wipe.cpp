// Wipe: a transition between two images.
//
// A compositor takes two inputs: here input 0 ("Foreground") is the outgoing
// picture and input 1 ("Background") the incoming one. "Progress" runs from 0,
// all foreground, to 1, all background, and is normally animated with two
// keys. The transitions:
//
//   Dissolve     the two pictures cross-fade;
//   Wipe Left    the background slides in from the right edge towards the left;
//   Wipe Right   the background slides in from the left edge towards the right;
//   Circle       the background appears in a circle growing from "Centre".
//
// Every transition gives each pixel a threshold d in 0..1, the progress at
// which the pixel turns over; "Softness" widens that moment into a ramp (as a
// fraction of the picture), and the progress is stretched by the softness so
// that 0 and 1 still show the two pictures untouched. At progress 0 the
// effect reports that it has nothing to do, and the host simply copies the
// foreground.
#include <algorithm>
#include <cmath>
#include <vector>

#include "common/pixels.h"
#include "ulk/ulk.h"

using namespace ulk_samples;

namespace {

enum Transition { kDissolve = 0, kWipeLeft, kWipeRight, kCircle };
const char* const kTransitionItems[] = {"Dissolve", "Wipe Left", "Wipe Right", "Circle", nullptr};

class WipeInstance : public ulkInstance_v1 {
  public:
    bool DefineParameters() override {
        return AddParam(this,
                        ulkPList::New("Transition", "transition", &mTransition, sizeof mTransition,
                                      kTransitionItems, kPListTypeDefault)) &&
               AddParam(this, ulkPNumber::New("Progress", "progress", &mProgress, sizeof mProgress,
                                              0.0, 1.0, 0.01, kPNumberReal, false)) &&
               AddParam(this, ulkPPoint2D::New("Centre", "centre", &mCentre, sizeof mCentre)) &&
               AddParam(this, ulkPNumber::New("Softness", "softness", &mSoftness, sizeof mSoftness,
                                              0.0, 1.0, 0.01, kPNumberReal, false));
    }

    // At progress 0 the output is the foreground: the host copies it.
    bool HasEffect() override { return mProgress > 0.0; }
    void GetInputSize(ulkBounds*) override {}  // both inputs: the region asked for
    void GetOutputSize(ulkBounds*) override {}

    bool Execute(const ulkBounds* bounds) override {
        PixelView from, to, out;
        if (!BindOrFail(this, &from, GetInput(0)) || !BindOrFail(this, &to, GetInput(1)) ||
            !BindOrFail(this, &out, GetOutput(0)))
            return false;
        if (!from.SameSize(out) || !to.SameSize(out)) {
            SetPluginError("Wipe: inputs and output differ in size");
            return false;
        }
        ulkBounds region;
        if (!ClipRegion(bounds, out.Width(), out.Height(), &region)) return true;

        const double width = out.Width(), height = out.Height();
        // Circle: distances in square pixels, measured to the farthest corner so
        // that progress 1 covers the whole picture.
        const double aspect = GetPixelAspect() > 0.0 ? GetPixelAspect() : 1.0;
        const double cx = mCentre.x * width, cy = mCentre.y * height;
        const double farX = std::max(cx, width - cx) * aspect, farY = std::max(cy, height - cy);
        const double farthest = std::max(std::sqrt(farX * farX + farY * farY), 1e-9);

        const double softness = std::clamp(mSoftness, 0.0, 1.0);
        const double progress = std::clamp(mProgress, 0.0, 1.0) * (1.0 + softness);

        // The share of the background at a pixel whose threshold is d.
        auto mixFor = [&](double d) -> float {
            if (mTransition == kDissolve) return static_cast<float>(mProgress);
            if (softness <= 0.0) return progress > d ? 1.0f : 0.0f;
            const double t = std::clamp((progress - d) / softness, 0.0, 1.0);
            return static_cast<float>(t * t * (3.0 - 2.0 * t));  // smoothstep
        };

        const int count = region.right - region.left + 1;
        std::vector<float> a(static_cast<size_t>(count) * 4), b(a.size());
        for (int y = region.top; y <= region.bottom; ++y) {
            if (Aborted()) return false;
            from.ReadRow(region.left, y, count, a.data());
            to.ReadRow(region.left, y, count, b.data());
            const double py = y + 0.5;
            for (int i = 0; i < count; ++i) {
                const double px = region.left + i + 0.5;  // pixel centre
                double d = 0.0;
                switch (mTransition) {
                    case kWipeLeft:
                        d = 1.0 - px / width;
                        break;
                    case kWipeRight:
                        d = px / width;
                        break;
                    case kCircle: {
                        const double dx = (px - cx) * aspect, dy = py - cy;
                        d = std::sqrt(dx * dx + dy * dy) / farthest;
                        break;
                    }
                    default:
                        break;
                }
                const float mix = mixFor(d);
                float* p = &a[static_cast<size_t>(i) * 4];
                const float* q = &b[static_cast<size_t>(i) * 4];
                for (int c = 0; c < 4; ++c) p[c] += (q[c] - p[c]) * mix;
            }
            out.WriteRow(region.left, y, count, a.data());
        }
        return true;
    }

  private:
    int mTransition = kWipeLeft;
    double mProgress = 0.0;
    ulkPoint2D mCentre = {0.5, 0.5};
    double mSoftness = 0.05;
};

class WipeModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Wipe");
        SetType(kPluginTypeCompositor);
        SetVendor("ULK Samples");
        SetCategory("Transition");
        SetIdentifier("com.ulk.samples.wipe");
        SetDescription("Dissolve, wipes and an iris circle between two pictures");
        SetPluginVersion(1.0f);
        return true;
    }

    bool DefineEffect() override {
        return AddSampleFormats(this) &&
               AddInput(0, "Foreground", "foreground", kDataTypeDefault) &&
               AddInput(1, "Background", "background", kDataTypeDefault) &&
               AddOutput(0, "Output", "output", kDataTypeDefault);
    }

    ulkInstance_v1* NewInstance() override { return new WipeInstance; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 1;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex == 0 ? new WipeModel : nullptr;
}

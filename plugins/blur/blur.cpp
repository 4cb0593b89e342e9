// Blur: a Gaussian blur whose cost does not grow with the radius.
//
// A true Gaussian costs O(radius) per pixel. Instead this filter runs three
// box blurs in each direction: by the central limit theorem a box convolved
// with itself three times is already very close to a Gaussian, and a box blur
// is a running sum - add the sample entering the window, subtract the one
// leaving it - so each pass costs the same at radius 2 or 200. The three box
// widths are chosen so that their combined variance equals sigma squared
// (W. Jarosz, "Fast Image Convolutions"; I. Kutskir's box sizes), with the
// "Radius" parameter as sigma in pixels.
//
// The blur is separable: the horizontal passes run row by row into a float
// buffer, then the vertical passes run over strips of columns of that buffer.
// Samples beyond the image edge repeat the edge pixel, so a flat image stays
// flat. Colour and alpha are blurred alike, which is right for premultiplied
// images, the usual form of images between effects.
//
// The radius is animatable: give it keys and the host interpolates it
// linearly for every frame. GetInputSize tells the host how far around a
// region the filter reads.
#include <algorithm>
#include <cmath>
#include <vector>

#include "common/pixels.h"
#include "ulk/ulk.h"

using namespace ulk_samples;

namespace {

/// Radii of the three boxes whose succession approximates a Gaussian of sigma.
struct BoxRadii {
    int r[3];
    int Extent() const { return r[0] + r[1] + r[2]; }
};

BoxRadii BoxesForSigma(double sigma) {
    const int passes = 3;
    // Ideal (real) box width for n equal boxes of variance sigma^2 / n each.
    const double ideal = std::sqrt(12.0 * sigma * sigma / passes + 1.0);
    int lower = static_cast<int>(std::floor(ideal));
    if (lower % 2 == 0) --lower;  // box widths must be odd to stay centred
    const int upper = lower + 2;
    // How many boxes take the lower width so that the variances add up to sigma^2.
    const double m =
        (12.0 * sigma * sigma - passes * lower * lower - 4.0 * passes * lower - 3.0 * passes) /
        (-4.0 * lower - 4.0);
    const int lowerCount = std::min(passes, std::max(0, static_cast<int>(std::lround(m))));
    BoxRadii radii;
    for (int i = 0; i < passes; ++i) radii.r[i] = ((i < lowerCount ? lower : upper) - 1) / 2;
    return radii;
}

/// One box pass over n elements of `lanes` interleaved floats each (element i,
/// lane l at src[i * lanes + l]): dst[i] is the mean of src[i - r .. i + r],
/// indexes clamped to 0..n-1. The sum runs in doubles so it does not drift.
void BoxPass(const float* src, float* dst, int n, int lanes, int r, double* sum) {
    const double norm = 1.0 / (2 * r + 1);
    auto at = [&](int i, int lane) {
        return src[static_cast<size_t>(std::clamp(i, 0, n - 1)) * lanes + lane];
    };
    for (int lane = 0; lane < lanes; ++lane) {
        double s = 0.0;
        for (int k = -r; k <= r; ++k) s += at(k, lane);
        sum[lane] = s;
    }
    for (int i = 0; i < n; ++i) {
        float* out = dst + static_cast<size_t>(i) * lanes;
        for (int lane = 0; lane < lanes; ++lane) {
            out[lane] = static_cast<float>(sum[lane] * norm);
            sum[lane] += at(i + r + 1, lane) - at(i - r, lane);
        }
    }
}

/// Three box passes; the result ends in data, scratch holds as many floats.
void ThreeBoxes(float* data, float* scratch, int n, int lanes, const BoxRadii& radii, double* sum) {
    BoxPass(data, scratch, n, lanes, radii.r[0], sum);
    BoxPass(scratch, data, n, lanes, radii.r[1], sum);
    BoxPass(data, scratch, n, lanes, radii.r[2], sum);
    std::copy(scratch, scratch + static_cast<size_t>(n) * lanes, data);
}

// Columns per vertical strip: a strip's rows stay in cache while the running
// sums walk down it.
const int kStripColumns = 32;
const int kMaxLanes = kStripColumns * 4;

class BlurInstance : public ulkInstance_v1 {
  public:
    bool DefineParameters() override {
        return AddParam(this, ulkPNumber::New("Radius", "radius", &mRadius, sizeof mRadius, 0.0,
                                              250.0, 0.5, kPNumberReal, false));
    }

    // Below half a pixel the boxes are all one pixel wide: nothing to do, and
    // the host then copies the input to the output itself.
    bool HasEffect() override { return BoxesForSigma(mRadius).Extent() > 0; }

    // The output region needs the input region grown by the blur's reach.
    void GetInputSize(ulkBounds* bounds) override {
        if (!bounds) return;
        const int extent = BoxesForSigma(mRadius).Extent();
        bounds->left -= extent;
        bounds->top -= extent;
        bounds->right += extent;
        bounds->bottom += extent;
    }
    void GetOutputSize(ulkBounds*) override {}  // the region asked for is produced

    bool Execute(const ulkBounds* bounds) override {
        PixelView in, out;
        if (!BindOrFail(this, &in, GetInput(0)) || !BindOrFail(this, &out, GetOutput(0)))
            return false;
        if (!in.SameSize(out)) {
            SetPluginError("Blur: input and output differ in size");
            return false;
        }
        ulkBounds region;
        if (!ClipRegion(bounds, out.Width(), out.Height(), &region)) return true;

        // The source window: the region grown by the blur's reach, inside the image.
        // Results near a window side that is not an image edge are off, but no
        // further in than the reach, so the region itself comes out exact.
        const BoxRadii radii = BoxesForSigma(mRadius);
        ulkBounds window = region;
        GetInputSize(&window);
        ClipRegion(&window, in.Width(), in.Height(), &window);
        const int width = window.right - window.left + 1;
        const int height = window.bottom - window.top + 1;

        // Working memory comes from the host, which may keep its own pools.
        const size_t planeFloats = static_cast<size_t>(width) * height * 4;
        const size_t scratchFloats =
            std::max(static_cast<size_t>(width) * 4, static_cast<size_t>(height) * kMaxLanes);
        float* plane = static_cast<float*>(AllocMem(planeFloats * sizeof(float)));
        float* scratch = static_cast<float*>(AllocMem(scratchFloats * 2 * sizeof(float)));
        if (!plane || !scratch) {
            // AllocMem recorded why; FreeMem clears the record, so put it back after.
            const ulkErrorStatus reason = GetError();
            if (plane) FreeMem(plane);
            if (scratch) FreeMem(scratch);
            SetError(reason);
            return false;
        }
        float* strip = scratch + scratchFloats;
        std::vector<double> sum(kMaxLanes);

        // Horizontal: each source row into the plane, blurred along x.
        bool ok = true;
        for (int y = 0; y < height && ok; ++y) {
            float* row = plane + static_cast<size_t>(y) * width * 4;
            in.ReadRow(window.left, window.top + y, width, row);
            ThreeBoxes(row, scratch, width, 4, radii, sum.data());
            ok = !Aborted();
        }

        // Vertical: strips of columns gathered from the plane, blurred along y and
        // written out for the rows of the region.
        const int firstColumn = region.left - window.left;
        const int lastColumn = region.right - window.left;
        for (int x0 = firstColumn; x0 <= lastColumn && ok; x0 += kStripColumns) {
            const int columns = std::min(kStripColumns, lastColumn - x0 + 1);
            const int lanes = columns * 4;
            for (int y = 0; y < height; ++y)
                std::copy_n(plane + (static_cast<size_t>(y) * width + x0) * 4, lanes,
                            strip + static_cast<size_t>(y) * lanes);
            ThreeBoxes(strip, scratch, height, lanes, radii, sum.data());
            for (int y = region.top; y <= region.bottom; ++y)
                out.WriteRow(window.left + x0, y, columns,
                             strip + static_cast<size_t>(y - window.top) * lanes);
            ok = !Aborted();
        }

        FreeMem(plane);
        FreeMem(scratch);
        return ok;
    }

  private:
    double mRadius = 5.0;
};

class BlurModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Gaussian Blur");
        SetType(kPluginTypeFilter);
        SetVendor("ULK Samples");
        SetCategory("Blur");
        SetIdentifier("com.ulk.samples.blur");
        SetDescription("Separable Gaussian blur, three running-sum box passes per direction");
        SetPluginVersion(1.0f);
        return true;
    }

    bool DefineEffect() override {
        return AddSampleFormats(this) && AddInput(0, "Input", "input", kDataTypeDefault) &&
               AddOutput(0, "Output", "output", kDataTypeDefault);
    }

    ulkInstance_v1* NewInstance() override { return new BlurInstance; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 1;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex == 0 ? new BlurModel : nullptr;
}

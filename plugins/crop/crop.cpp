// Crop: keeps a rectangle of the picture and clears the rest, with an overlay
// to edit the rectangle on the viewer.
//
// The rectangle is a ulkPRect2D in picture units, 0..1 across and down, so
// one setting fits every resolution; its corners may come in either order. A
// pixel is kept when its centre lies inside; every other pixel becomes
// transparent black. The filter reads only the kept rectangle, and says so in
// GetInputSize; GetOutputSize gives the rectangle that is not cleared.
//
// The overlay (exported through ulkNewOverlay_v1) draws the rectangle and its
// corner handles into the host's overlay buffer and edits the rectangle with
// the mouse, in one of two modes:
//
//   Move     drag inside the rectangle to move it, keeping its size;
//   Resize   drag a corner handle to move that corner.
//
// Each drag sets a key at the instance's current time, so cropping can be
// animated straight from the viewer. Mouse positions are surface pixels, and
// the video rectangle the host reports maps them onto the picture.
#include <algorithm>
#include <cmath>
#include <cstdint>
#include <vector>

#include "common/pixels.h"
#include "ulk/ulk.h"

using namespace ulk_samples;

namespace {

const char* const kRectID = "rect";

/// The rectangle with its corners in order: x1 <= x2, y1 <= y2.
ulkRect2D Ordered(const ulkRect2D& r) {
    return {std::min(r.x1, r.x2), std::min(r.y1, r.y2), std::max(r.x1, r.x2), std::max(r.y1, r.y2)};
}

/// The pixels of a width x height picture whose centres lie in the rectangle;
/// false when there are none. Pixel x is kept when x1 <= (x + 0.5) / width < x2.
bool KeptPixels(const ulkRect2D& rect, int width, int height, ulkBounds* kept) {
    const ulkRect2D r = Ordered(rect);
    auto first = [](double edge, int size) {
        return static_cast<int>(std::ceil(std::clamp(edge, 0.0, 1.0) * size - 0.5));
    };
    kept->left = first(r.x1, width);
    kept->top = first(r.y1, height);
    kept->right = first(r.x2, width) - 1;
    kept->bottom = first(r.y2, height) - 1;
    return kept->left <= kept->right && kept->top <= kept->bottom;
}

class CropInstance : public ulkInstance_v1 {
  public:
    bool DefineParameters() override {
        return AddParam(this, ulkPRect2D::New("Rectangle", kRectID, &mRect, sizeof mRect));
    }

    // A rectangle that covers the picture changes nothing; the host then copies
    // the input (InPlace stays false: input and output are separate images).
    bool HasEffect() override {
        const ulkRect2D r = Ordered(mRect);
        return !(r.x1 <= 0.0 && r.y1 <= 0.0 && r.x2 >= 1.0 && r.y2 >= 1.0);
    }

    // Both sizes are the asked region narrowed to the kept rectangle.
    void GetInputSize(ulkBounds* bounds) override { NarrowToKept(bounds); }
    void GetOutputSize(ulkBounds* bounds) override { NarrowToKept(bounds); }

    bool Execute(const ulkBounds* bounds) override {
        PixelView in, out;
        if (!BindOrFail(this, &in, GetInput(0)) || !BindOrFail(this, &out, GetOutput(0)))
            return false;
        if (!in.SameSize(out)) {
            SetPluginError("Crop: input and output differ in size");
            return false;
        }
        ulkBounds region;
        if (!ClipRegion(bounds, out.Width(), out.Height(), &region)) return true;
        ulkBounds kept;
        const bool any = KeptPixels(mRect, out.Width(), out.Height(), &kept);

        const int count = region.right - region.left + 1;
        std::vector<float> row(static_cast<size_t>(count) * 4);
        for (int y = region.top; y <= region.bottom; ++y) {
            std::fill(row.begin(), row.end(), 0.0f);
            const int from = std::max(region.left, kept.left);
            const int to = std::min(region.right, kept.right);
            if (any && y >= kept.top && y <= kept.bottom && from <= to)
                in.ReadRow(from, y, to - from + 1,
                           &row[static_cast<size_t>(from - region.left) * 4]);
            out.WriteRow(region.left, y, count, row.data());
        }
        return true;
    }

  private:
    void NarrowToKept(ulkBounds* bounds) {
        if (!bounds) return;
        ulkImage* frame = dynamic_cast<ulkImage*>(GetOutput(0));
        if (!frame) frame = dynamic_cast<ulkImage*>(GetInput(0));
        if (!frame) return;  // the picture size is not known yet
        ulkBounds kept;
        if (!KeptPixels(mRect, frame->GetWidth(), frame->GetHeight(), &kept)) {
            *bounds = ulkBounds{0, 0, -1, -1};
            return;
        }
        bounds->left = std::max(bounds->left, kept.left);
        bounds->top = std::max(bounds->top, kept.top);
        bounds->right = std::min(bounds->right, kept.right);
        bounds->bottom = std::min(bounds->bottom, kept.bottom);
    }

    ulkRect2D mRect = {0.1, 0.1, 0.9, 0.9};
};

class CropModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Crop");
        SetType(kPluginTypeFilter);
        SetVendor("ULK Samples");
        SetCategory("Transform");
        SetIdentifier("com.ulk.samples.crop");
        SetDescription("Keeps a rectangle of the picture, editable on the viewer");
        SetPluginVersion(1.0f);
        return true;
    }

    bool DefineEffect() override {
        return AddSampleFormats(this) && AddInput(0, "Input", "input", kDataTypeDefault) &&
               AddOutput(0, "Output", "output", kDataTypeDefault);
    }

    ulkInstance_v1* NewInstance() override { return new CropInstance; }
};

// ---------------------------------------------------------------- the overlay

enum OverlayMode { kModeMove = 0, kModeResize = 1 };
const float kOutline[4] = {1.0f, 0.75f, 0.0f, 1.0f};  // amber, opaque
const int kHandleHalf = 3;                            // handles are 7 x 7 pixels
const double kGrabDistance = 8.0;                     // surface pixels

class CropOverlay : public ulkOverlay_v1 {
  public:
    void DefineOverlay() override {
        AddMode("Move");
        AddMode("Resize");
    }

    void Draw(bool) override {
        ulkImage* buffer = GetOverlayBuffer();
        ulkPRect2D* param = RectParameter();
        PixelView surface;
        if (!buffer || !param || !surface.Bind(buffer)) return;
        const ulkRect2D r = Ordered(param->GetValue(GetInstance()->GetTime()));
        const Mapping m = GetMapping();
        // Outline on the first and last kept pixel of each side.
        const int x1 = static_cast<int>(std::lround(m.ToSurfaceX(r.x1)));
        const int y1 = static_cast<int>(std::lround(m.ToSurfaceY(r.y1)));
        const int x2 = static_cast<int>(std::lround(m.ToSurfaceX(r.x2))) - 1;
        const int y2 = static_cast<int>(std::lround(m.ToSurfaceY(r.y2))) - 1;
        for (int x = x1; x <= x2; ++x) {
            Plot(surface, x, y1);
            Plot(surface, x, y2);
        }
        for (int y = y1; y <= y2; ++y) {
            Plot(surface, x1, y);
            Plot(surface, x2, y);
        }
        const int cornersX[2] = {x1, x2}, cornersY[2] = {y1, y2};
        for (int cx : cornersX)
            for (int cy : cornersY)
                for (int dy = -kHandleHalf; dy <= kHandleHalf; ++dy)
                    for (int dx = -kHandleHalf; dx <= kHandleHalf; ++dx)
                        Plot(surface, cx + dx, cy + dy);
    }

    bool OnMouseDown(double x, double y, uint32_t) override {
        mDrag = kNone;
        ulkPRect2D* param = RectParameter();
        if (!param) return false;
        const Mapping m = GetMapping();
        mStart = param->GetValue(GetInstance()->GetTime());
        mStartU = m.ToPictureX(x);
        mStartV = m.ToPictureY(y);
        if (GetMode() == kModeResize) {
            // The nearest corner within reach; bit 0 picks x2 over x1, bit 1 y2 over y1.
            double best = kGrabDistance;
            for (int corner = 0; corner < 4; ++corner) {
                const double cx = m.ToSurfaceX(corner & 1 ? mStart.x2 : mStart.x1);
                const double cy = m.ToSurfaceY(corner & 2 ? mStart.y2 : mStart.y1);
                const double distance = std::hypot(cx - x, cy - y);
                if (distance <= best) {
                    best = distance;
                    mDrag = kCorner0 + corner;
                }
            }
        } else {
            const ulkRect2D r = Ordered(mStart);
            if (mStartU >= r.x1 && mStartU <= r.x2 && mStartV >= r.y1 && mStartV <= r.y2)
                mDrag = kWhole;
        }
        return mDrag != kNone;
    }

    bool OnMouseMove(double x, double y, uint32_t) override { return DragTo(x, y); }

    bool OnMouseUp(double x, double y, uint32_t) override {
        const bool handled = DragTo(x, y);
        mDrag = kNone;
        return handled;
    }

  private:
    // What a drag holds: nothing, the whole rectangle, or corner 0..3 (kCorner0 + corner).
    static const int kNone = -1, kWhole = 0, kCorner0 = 1;

    // Surface pixels <-> picture units, through the video rectangle.
    struct Mapping {
        double left, top, width, height;
        double ToSurfaceX(double u) const { return left + u * width; }
        double ToSurfaceY(double v) const { return top + v * height; }
        double ToPictureX(double x) const { return (x - left) / width; }
        double ToPictureY(double y) const { return (y - top) / height; }
    };

    Mapping GetMapping() {
        ulkBounds video = {0, 0, 0, 0};
        GetVidRect(video);
        return {double(video.left), double(video.top),
                std::max(1.0, double(video.right) - video.left + 1),
                std::max(1.0, double(video.bottom) - video.top + 1)};
    }

    static void Plot(const PixelView& surface, int x, int y) {
        if (x >= 0 && y >= 0 && x < surface.Width() && y < surface.Height())
            surface.Put(x, y, kOutline);
    }

    ulkPRect2D* RectParameter() {
        ulkInstance_v1* instance = GetInstance();
        ulkParameter* param = instance ? instance->FindParameter(kRectID) : nullptr;
        return param && param->IsRect2D() ? static_cast<ulkPRect2D*>(param) : nullptr;
    }

    // Applies the drag so far to the rectangle as it was at mouse-down and keys it.
    bool DragTo(double x, double y) {
        ulkPRect2D* param = RectParameter();
        if (mDrag == kNone || !param) return false;
        const Mapping m = GetMapping();
        const double u = std::clamp(m.ToPictureX(x), 0.0, 1.0);
        const double v = std::clamp(m.ToPictureY(y), 0.0, 1.0);
        ulkRect2D r = mStart;
        if (mDrag == kWhole) {
            // Move by the mouse's travel, but no further than the picture's edges.
            const ulkRect2D o = Ordered(mStart);
            const double du = std::clamp(m.ToPictureX(x) - mStartU, -o.x1, 1.0 - o.x2);
            const double dv = std::clamp(m.ToPictureY(y) - mStartV, -o.y1, 1.0 - o.y2);
            r = {mStart.x1 + du, mStart.y1 + dv, mStart.x2 + du, mStart.y2 + dv};
        } else {
            const int corner = mDrag - kCorner0;
            (corner & 1 ? r.x2 : r.x1) = u;
            (corner & 2 ? r.y2 : r.y1) = v;
        }
        ulkInstance_v1* instance = GetInstance();
        param->SetValue(instance->GetTime(), r);
        instance->SetHostParametersModified(true);  // tell the host to redraw and save
        return true;
    }

    int mDrag = kNone;
    ulkRect2D mStart = {0, 0, 0, 0};
    double mStartU = 0.0, mStartV = 0.0;
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 1;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex == 0 ? new CropModel : nullptr;
}

ULK_PLUGIN_EXPORT ulkOverlay_v1* ulkNewOverlay_v1(unsigned short modelIndex) {
    return modelIndex == 0 ? new CropOverlay : nullptr;
}

// A filter with a "Centre" point parameter and the overlays a host shows for it.
//
// Model 0's overlay has modes of its own ("Move", "Frame"), draws the outline
// of the video rectangle into the overlay buffer and drags the bound
// instance's centre with the mouse. Model 1's overlay implements only what it
// must, so the base's defaults answer everything else. Model 2 has no overlay.
#include <cstdint>
#include <cstdio>

#include "ulk/instance/instance.h"
#include "ulk/model/model.h"
#include "ulk/ulk.h"

namespace {

// Outline colour, in the buffer's BGRA order.
const unsigned char kOutline[4] = {0x20, 0x80, 0xF0, 0xFF};

class CentreInstance : public ulkInstance_v1 {
  public:
    bool DefineParameters() override {
        ulkPPoint2D* centre = ulkPPoint2D::New("Centre", "centre", &mCentre, sizeof mCentre);
        return centre && AddParameter(centre, nullptr) != nullptr;
    }
    bool Execute(const ulkBounds*) override { return true; }

    ulkPoint2D mCentre = {0.5, 0.5};
};

class CentreModel : public ulkModel_v1 {
  public:
    explicit CentreModel(unsigned short index) : mIndex(index) {}
    bool DefineIdentity() override {
        SetName(mIndex == 0 ? "Centre Drag" : mIndex == 1 ? "Centre Plain" : "Centre Bare");
        SetType(kPluginTypeFilter);
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new CentreInstance; }

    unsigned short mIndex;
};

// Puts one outline pixel, honouring the surface's row delta.
void Plot(ulkImage* buffer, int x, int y) {
    if (x < 0 || y < 0 || x >= buffer->GetWidth() || y >= buffer->GetHeight()) return;
    unsigned char* row = static_cast<unsigned char*>(buffer->GetRowPtr(y, 0));
    for (int c = 0; c < 4; ++c) row[x * 4 + c] = kOutline[c];
}

class DragOverlay : public ulkOverlay_v1 {
  public:
    void DefineOverlay() override {
        AddMode("Move");
        AddMode("Frame");
    }

    void Draw(bool) override {
        ulkImage* buffer = GetOverlayBuffer();
        if (!buffer) return;
        ulkBounds video;
        GetVidRect(video);
        for (int x = video.left; x <= video.right; ++x) {
            Plot(buffer, x, video.top);
            Plot(buffer, x, video.bottom);
        }
        for (int y = video.top; y <= video.bottom; ++y) {
            Plot(buffer, video.left, y);
            Plot(buffer, video.right, y);
        }
    }

    bool OnMouseDown(double x, double y, uint32_t) override {
        mDragging = MoveCentre(x, y);
        return mDragging;
    }
    bool OnMouseMove(double x, double y, uint32_t) override {
        return mDragging && MoveCentre(x, y);
    }
    bool OnMouseUp(double x, double y, uint32_t) override {
        if (!mDragging) return false;
        mDragging = false;
        return MoveCentre(x, y);
    }
    // Reports every notification through the error record, where the host sees it.
    void OnModeChanged(int mode) override {
        char text[64];
        std::snprintf(text, sizeof text, "mode %d, change %d", mode, ++mModeChanges);
        SetPluginWarning(text);
    }

  private:
    // Sets a key of the bound instance's centre at its current time: the
    // mouse position inside the video rectangle, 0 to 1 across it.
    bool MoveCentre(double x, double y) {
        ulkInstance_v1* instance = GetInstance();
        if (!instance) return false;
        ulkParameter* parameter = instance->FindParameter("centre");
        if (!parameter || !parameter->IsPoint2D()) return false;
        ulkCoordinateConverter converter;
        GetConverter(converter);
        const ulkBounds& video = converter.mVidRect;
        const double width = video.right - video.left + 1;
        const double height = video.bottom - video.top + 1;
        ulkPoint2D point = {(x - video.left) / width, (y - video.top) / height};
        static_cast<ulkPPoint2D*>(parameter)->SetValue(instance->GetTime(), point);
        return true;
    }

    bool mDragging = false;
    int mModeChanges = 0;
};

class PlainOverlay : public ulkOverlay_v1 {
  public:
    void Draw(bool) override {}
    bool OnMouseDown(double, double, uint32_t) override { return true; }
    bool OnMouseMove(double, double, uint32_t) override { return true; }
    bool OnMouseUp(double, double, uint32_t) override { return true; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 3;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex < 3 ? new CentreModel(modelIndex) : nullptr;
}

#ifndef OVERLAY_PLUGIN_NO_FACTORY
ULK_PLUGIN_EXPORT ulkOverlay_v1* ulkNewOverlay_v1(unsigned short modelIndex) {
    if (modelIndex == 0) return new DragOverlay;
    if (modelIndex == 1) return new PlainOverlay;
    return nullptr;
}
#endif

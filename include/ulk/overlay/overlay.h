// ulkOverlay_v1: the base of a plug-in's overlay.
//
// A plug-in derives its overlay from this class, implements Draw and the three
// mouse operations it must answer, overrides the other events it cares about,
// and returns a new object from its ulkNewOverlay_v1 entry point:
//
//   class MyOverlay : public ulkOverlay_v1 {
//       void DefineOverlay() override { AddMode("Move"); AddMode("Scale"); }
//       void Draw(bool) override { ulkImage* buffer = GetOverlayBuffer(); ... }
//       bool OnMouseDown(double x, double y, uint32_t flags) override { ... }
//       ...
//   };
//   ULK_PLUGIN_EXPORT ulkOverlay_v1* ulkNewOverlay_v1(unsigned short) { return new MyOverlay; }
//
// The host side (ulkHostOverlay) owns the object and deletes it through its
// virtual destructor. The non-virtual members forward to the host overlay, so
// the plug-in reaches the surface, the bound effect instance, the modes, host
// memory and the error record. An overlay is attached to its host overlay
// only by ulkHostModel::NewOverlay; until then (and in an overlay made any
// other way) the forwarding members answer null, false, 0 or kErrorNone and
// do nothing.
//
// Threads: called on the host's user-interface thread only.
#ifndef ULK_OVERLAY_OVERLAY_H
#define ULK_OVERLAY_OVERLAY_H

#include <cstddef>
#include <cstdint>

#include "ulk/core/error.h"
#include "ulk/core/types.h"
#include "ulk/export.h"
#include "ulk/overlay/overlay_context.h"

class ulkHostOverlay;
class ulkImage;
class ulkInstance_v1;

class ULK_API ulkOverlay_v1 {
  public:
    /// An overlay not yet attached to a host overlay.
    ulkOverlay_v1() : mHostOverlay(nullptr) {}
    ulkOverlay_v1(const ulkOverlay_v1&) = default;
    ulkOverlay_v1& operator=(const ulkOverlay_v1&) = default;
    /// Nothing to release here.
    virtual ~ulkOverlay_v1();

    // --- drawing and events (the meaning of coordinates, flags and keys is the host's)
    /// Draws the overlay, usually into GetOverlayBuffer().
    virtual void Draw(bool flag) = 0;
    /// A button went down at (x, y); answer true when handled.
    virtual bool OnMouseDown(double x, double y, uint32_t flags) = 0;
    /// The mouse moved with a button down.
    virtual bool OnMouseMove(double x, double y, uint32_t flags) = 0;
    /// The button went up.
    virtual bool OnMouseUp(double x, double y, uint32_t flags) = 0;
    /// False here.
    virtual bool OnMouseOver(double x, double y, uint32_t flags);
    /// False here.
    virtual bool OnMouseIdle(double x, double y, uint32_t flags);
    /// False here.
    virtual bool OnKeyDown(int key, uint32_t flags);
    /// False here.
    virtual bool OnKeyUp(int key, uint32_t flags);
    /// The host's native window changed; nothing here.
    virtual void OnNewNativeWindow(void* window);
    /// The host made mode current; nothing here.
    virtual void OnModeChanged(int mode);
    /// Adds the overlay's modes with AddMode; here the single mode "ULK Plug-in Overlay".
    virtual void DefineOverlay();

    // --- the surface
    /// The platform window the overlay is shown in.
    void* GetNativeWindow();
    /// The surface's OpenGL context, or null.
    void* GetOpenGLContext();
    /// The rectangle of the video on the surface.
    void GetVidRect(ulkBounds& rect);
    /// Video rectangle and surface size.
    void GetConverter(ulkCoordinateConverter& converter);
    /// The host's image of the surface (BGRA, 8 bits, the surface's row delta); owned
    /// by the host, valid until the next call.
    ulkImage* GetOverlayBuffer();

    // --- the effect instance and the modes
    /// The plug-in instance the host bound to this overlay, or null.
    ulkInstance_v1* GetInstance();
    /// Appends a mode.
    void AddMode(const char* name);
    /// The current mode.
    int GetMode();

    // --- host memory
    /// size bytes from the host's overlay allocator; null (status 10 or 7) when it gave none.
    void* AllocMem(size_t size);
    /// Gives memory from AllocMem back.
    void FreeMem(void* block);

    // --- errors, recorded in the host overlay
    /// Replaces the record with status.
    void SetError(ulkErrorStatus status);
    /// Records an error with the plug-in's own text.
    void SetPluginError(const char* text);
    /// Records a warning with the plug-in's own text.
    void SetPluginWarning(const char* text);
    /// The current status.
    ulkErrorStatus GetError();
    /// The text for the current status.
    const char* GetErrorString() const;

    /// The host-side twin; set by ulkHostModel::NewOverlay.
    ulkHostOverlay* mHostOverlay;
};

#endif  // ULK_OVERLAY_OVERLAY_H

// ulkBaseOverlayContext: the drawing surface a host gives an overlay.
//
// A host derives from this class to describe where an overlay draws: the pixel
// memory of the surface (4 channels of 8 bits in BGRA order) with its width,
// height and row delta, the native window, an optional OpenGL context and the
// rectangle the video occupies on the surface. The context does not own the
// host overlay it is bound to, nor the other way round.
//
// Binding. A context and a ulkHostOverlay are bound one to one. Either side can
// bind (SetOverlay here, ulkHostOverlay::SetContext there), either side can
// release both ends (ReleaseOverlay() here, ulkHostOverlay::ReleaseContext()
// there), and either may be destroyed first: the destructor of each tells the
// other side to drop its pointer. A context bound to one overlay releases it in
// favour of a new one; an overlay already bound to another context is refused.
//
// Liveness. A context carries a 64-bit marker, live from construction until
// its destructor runs, so a host can test a pointer it still holds with
// IsGoodContext. A copy of a context starts unbound; assigning one context to
// another leaves the target's binding as it was.
//
// Threads: a context is used by the host's user-interface thread only.
#ifndef ULK_OVERLAY_OVERLAY_CONTEXT_H
#define ULK_OVERLAY_OVERLAY_CONTEXT_H

#include <cstdint>

#include "ulk/core/types.h"
#include "ulk/export.h"

class ulkHostOverlay;

/// Liveness marker of host overlays and overlay contexts while they live.
constexpr uint64_t kOverlayLiveMarker = 0xFFFFFFFF900D900DULL;
/// Liveness marker of host overlays and overlay contexts once destroyed.
constexpr uint64_t kOverlayDeadMarker = 0xFFFFFFFFDEADDEADULL;

/// What ulkHostOverlay::GetConverter fills: the video rectangle on the surface
/// and the surface's size, from which the user converts between viewer and
/// video coordinates.
struct ulkCoordinateConverter {
    ulkBounds mVidRect;
    int32_t mWidth;
    int32_t mHeight;
};

class ULK_API ulkBaseOverlayContext {
  public:
    /// An unbound, live context.
    ulkBaseOverlayContext();
    /// A live context that is not bound to source's overlay (an overlay has one context).
    ulkBaseOverlayContext(const ulkBaseOverlayContext& source);
    /// Keeps this context's own binding and marker: there is nothing else to copy.
    ulkBaseOverlayContext& operator=(const ulkBaseOverlayContext& source);
    /// Tells a bound overlay to drop this context, then marks the context dead.
    virtual ~ulkBaseOverlayContext();

    // --- the surface (implemented by the host)
    /// Pixel memory of the surface: rows of GetWidth() BGRA pixels, 8 bits per sample.
    virtual unsigned char* GetBuffer() = 0;
    /// The platform window the overlay is shown in.
    virtual void* GetNativeWindow() = 0;
    /// Fills rect with the rectangle the video occupies on the surface.
    virtual void GetVidRect(ulkBounds& rect) = 0;
    /// Surface width in pixels.
    virtual short GetWidth() = 0;
    /// Surface height in pixels.
    virtual short GetHeight() = 0;
    /// Bytes from one row of the surface to the next.
    virtual short GetRowDelta() = 0;
    /// The OpenGL context of the surface; null here (no OpenGL).
    virtual void* GetOpenGLContext();

    // --- liveness
    /// True from construction until the destructor runs.
    bool IsGoodContext() const { return mMagic == kOverlayLiveMarker; }

    // --- binding
    /// True while an overlay is bound.
    bool HasOverlay() const { return mOverlay != nullptr; }
    /// The bound overlay, or null.
    ulkHostOverlay* GetOverlay() { return mOverlay; }
    /// Binds overlay on both sides, first releasing another bound overlay; null only
    /// releases. An overlay already bound to another context is refused (nothing changes).
    void SetOverlay(ulkHostOverlay* overlay);
    /// Ends the binding on both sides; nothing when unbound.
    void ReleaseOverlay();
    /// Notification from the bound overlay that it dropped this context: clears only
    /// this side (the argument is not used).
    void ReleaseOverlay(const ulkHostOverlay* overlay);

    ulkHostOverlay* mOverlay;
    uint64_t mMagic;
};

#endif  // ULK_OVERLAY_OVERLAY_CONTEXT_H

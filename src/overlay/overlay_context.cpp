#include "ulk/overlay/overlay_context.h"

#include "ulk/overlay/host_overlay.h"

ulkBaseOverlayContext::ulkBaseOverlayContext() : mOverlay(nullptr), mMagic(kOverlayLiveMarker) {}

// A copy never takes over the source's overlay: the overlay points back to the
// source only, and a second context holding it would be left dangling when the
// overlay goes away.
ulkBaseOverlayContext::ulkBaseOverlayContext(const ulkBaseOverlayContext&)
    : mOverlay(nullptr), mMagic(kOverlayLiveMarker) {}

ulkBaseOverlayContext& ulkBaseOverlayContext::operator=(const ulkBaseOverlayContext&) {
    return *this;
}

ulkBaseOverlayContext::~ulkBaseOverlayContext() {
    if (mOverlay) mOverlay->ReleaseContext(this);
    mOverlay = nullptr;
    // The marker is read through pointers the host kept after destruction, so
    // the store must not be dropped as dead at the end of the object's life.
    *static_cast<volatile uint64_t*>(&mMagic) = kOverlayDeadMarker;
}

void* ulkBaseOverlayContext::GetOpenGLContext() {
    return nullptr;
}

void ulkBaseOverlayContext::SetOverlay(ulkHostOverlay* overlay) {
    // An overlay keeps the first context it was bound to; binding it here as
    // well would leave this context pointing at an overlay that never tells it
    // when it goes away.
    if (overlay && overlay->GetContext() && overlay->GetContext() != this) return;
    if (mOverlay && mOverlay != overlay) ReleaseOverlay();
    if (!mOverlay && overlay) {
        mOverlay = overlay;
        overlay->SetContext(this);  // calls back SetOverlay, which finds the binding complete
    }
}

void ulkBaseOverlayContext::ReleaseOverlay() {
    if (!mOverlay) return;
    ulkHostOverlay* old = mOverlay;
    mOverlay = nullptr;
    old->ReleaseContext(this);
}

void ulkBaseOverlayContext::ReleaseOverlay(const ulkHostOverlay*) {
    mOverlay = nullptr;
}

// ulkHostOverlay: the host-side object of one interactive overlay.
//
// An overlay is a picture a plug-in draws over the host's viewer (handles,
// outlines, guides) that reacts to the mouse and the keyboard. The host gets
// one from ulkHostModel::NewOverlay and gives it back to
// ulkHostModel::DeleteOverlay. In between it binds a drawing context
// (SetContext, or ulkBaseOverlayContext::SetOverlay) and the effect instance
// whose parameters the overlay edits (SetInstance), then forwards drawing,
// mouse and key events, each answered by the plug-in's ulkOverlay_v1.
//
// Ownership: the host overlay owns the plug-in's overlay object, its modes and
// the image through which the plug-in sees the surface; it borrows the context
// and the instance. Binding with a context is dropped on either side's
// destruction. Overlays are not copied.
//
// Errors: operations reset the overlay's error record unless noted; the
// plug-in records its own errors and warnings through ulkOverlay_v1.
// Exceptions from plug-in code pass through to the caller.
//
// Threads: an overlay is driven by the host's user-interface thread. The
// memory callback slots are process-wide and unsynchronised.
#ifndef ULK_OVERLAY_HOST_OVERLAY_H
#define ULK_OVERLAY_HOST_OVERLAY_H

#include <cstddef>
#include <cstdint>

#include "ulk/core/error.h"
#include "ulk/core/host_global.h"
#include "ulk/core/list.h"
#include "ulk/core/types.h"
#include "ulk/export.h"
#include "ulk/overlay/overlay_context.h"

class ulkHostInstance;
class ulkImage;
class ulkInstance_v1;
class ulkOverlay_v1;

class ULK_API ulkHostOverlay {
  public:
    // --- lifetime
    /// An unbound overlay with no plug-in overlay, no modes, mode 0, and an overlay
    /// buffer image in BGRA, RGB, 8 bits.
    ulkHostOverlay();
    /// Drops the context binding, marks the overlay dead, deletes the modes, the
    /// overlay buffer image and the plug-in overlay.
    virtual ~ulkHostOverlay();
    ulkHostOverlay(const ulkHostOverlay&) = delete;
    ulkHostOverlay& operator=(const ulkHostOverlay&) = delete;
    /// True from construction until the destructor runs.
    bool IsGoodOverlay() const { return mMagic == kOverlayLiveMarker; }

    // --- the drawing context
    /// Binds context on both sides when no context is bound; otherwise (or for null)
    /// nothing changes.
    void SetContext(ulkBaseOverlayContext* context);
    /// Ends the binding on both sides; nothing when unbound.
    void ReleaseContext();
    /// Notification from the bound context that it dropped this overlay: clears only
    /// this side (the argument is not used).
    void ReleaseContext(ulkBaseOverlayContext* context);
    /// The bound context, or null.
    ulkBaseOverlayContext* GetContext() { return mContext; }

    // --- the effect instance
    /// Binds the instance whose parameters the overlay edits (not owned).
    void SetInstance(ulkHostInstance* instance);
    /// Unbinds the instance.
    void ReleaseInstance();
    /// The plug-in instance of the bound instance, or null.
    ulkInstance_v1* GetInstance();

    // --- the plug-in overlay
    /// Stores overlay (a previous one is not deleted) and, when its host link names
    /// this overlay, lets it define its modes (DefineOverlay).
    void SetPlugInOverlay(ulkOverlay_v1* overlay);
    /// Deletes the plug-in overlay, if any.
    void DeletePlugInOverlay();
    /// The plug-in overlay, or null.
    ulkOverlay_v1* GetPlugInOverlay() { return mPlugInOverlay; }

    // --- events (false and nothing done without a plug-in overlay)
    /// Asks the plug-in to draw; the argument's meaning is the host's.
    void Draw(bool flag);
    /// A button went down at (x, y); true when the plug-in handled it.
    bool OnMouseDown(double x, double y, uint32_t flags);
    /// The mouse moved with a button down; true when handled.
    bool OnMouseMove(double x, double y, uint32_t flags);
    /// The button went up; true when handled.
    bool OnMouseUp(double x, double y, uint32_t flags);
    /// The mouse moved with no button down; true when handled.
    bool OnMouseOver(double x, double y, uint32_t flags);
    /// The mouse rests at (x, y); true when handled.
    bool OnMouseIdle(double x, double y, uint32_t flags);
    /// A key went down; true when handled.
    bool OnKeyDown(int key, uint32_t flags);
    /// A key went up; true when handled.
    bool OnKeyUp(int key, uint32_t flags);
    /// Tells the plug-in the context's native window changed.
    void OnNewNativeWindow();

    // --- the surface (null, or the record unchanged, without a context)
    /// The context's native window.
    void* GetNativeWindow();
    /// The context's OpenGL context.
    void* GetOpenGLContext();
    /// The rectangle of the video on the surface (the error record is not reset).
    void GetVidRect(ulkBounds& rect) const;
    /// Video rectangle and surface size (the error record is not reset).
    void GetConverter(ulkCoordinateConverter& converter) const;
    /// The overlay's image re-aimed at the context's current surface: 4 channels,
    /// BGRA, 8 bits, the context's size and row delta. The same image every call;
    /// the overlay owns it.
    ulkImage* GetOverlayBuffer();

    // --- modes
    /// Appends a mode named name; false for a null name or when memory ran out.
    bool AddMode(const char* name);
    /// Makes mode current (not checked against the count) and tells the plug-in.
    void SetMode(int mode);
    /// The current mode.
    int GetMode();
    /// How many modes the overlay has.
    int GetNumModes();
    /// Copies the name of mode index into buffer: at most size - 1 characters, NUL-padded
    /// to size bytes. A bad index, a size below 1 or a null buffer writes nothing.
    void GetModeName(int index, char* buffer, int size);

    // --- memory for the plug-in (the error record is not reset)
    /// Installs the overlay's allocator (independent of the other classes').
    static void SetAllocCallback(ulkAllocCallback callback) { mAllocCallback = callback; }
    /// Installs the overlay's release function.
    static void SetFreeCallback(ulkFreeCallback callback) { mFreeCallback = callback; }
    /// size bytes from the overlay's allocator (0 is passed on); null with status 10
    /// without an allocator, status 7 when it gave none.
    void* AllocMem(size_t size);
    /// Gives block back to the release function (null is not passed on); status 10
    /// without one.
    void FreeMem(void* block);

    // --- errors
    /// Back to kErrorNone.
    void ResetError() { mError.ResetError(); }
    /// Resets the record, then sets status.
    void SetError(ulkErrorStatus status);
    /// Status kErrorPlugin with the plug-in's text.
    void SetPluginError(const char* text) { mError.SetPluginError(text); }
    /// Status kErrorPluginWarning with the plug-in's text.
    void SetPluginWarning(const char* text) { mError.SetPluginWarning(text); }
    /// The current status.
    ulkErrorStatus GetError() { return mError.GetError(); }
    /// The text for the current status (see ulkError::GetErrorString).
    const char* GetErrorString() const { return mError.GetErrorString(); }
    /// The whole record.
    const ulkError* GetErrorObj() { return &mError; }

    ulkBaseOverlayContext* mContext;
    ulkOverlay_v1* mPlugInOverlay;
    ulkHostInstance* mHostInstance;
    ulkImage* mOverlayBuffer;
    int32_t mMode;
    ulkList mModes;
    uint64_t mMagic;
    ulkError mError;

    static ulkAllocCallback mAllocCallback;
    static ulkFreeCallback mFreeCallback;
};

#endif  // ULK_OVERLAY_HOST_OVERLAY_H

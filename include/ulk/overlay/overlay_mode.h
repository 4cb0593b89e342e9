// ulkOverlayMode: one named mode of an overlay.
//
// A host overlay keeps its modes in a ulkList, addressed by index from 0 in
// the order they were added (ulkHostOverlay::AddMode); the host shows their
// names and switches between them with ulkHostOverlay::SetMode. A mode owns a
// copy of its name. Modes are created and deleted by their host overlay only.
#ifndef ULK_OVERLAY_OVERLAY_MODE_H
#define ULK_OVERLAY_OVERLAY_MODE_H

#include "ulk/core/list.h"
#include "ulk/export.h"

class ULK_API ulkOverlayMode : public ulkNode {
  public:
    /// A mode holding a copy of name (null, or no memory for the copy, gives an empty name).
    explicit ulkOverlayMode(const char* name);
    /// Releases the copy of the name.
    virtual ~ulkOverlayMode();
    ulkOverlayMode(const ulkOverlayMode&) = delete;
    ulkOverlayMode& operator=(const ulkOverlayMode&) = delete;

    /// The mode's name; never null.
    const char* GetName() const { return mName ? mName : ""; }

    char* mName;
};

#endif  // ULK_OVERLAY_OVERLAY_MODE_H

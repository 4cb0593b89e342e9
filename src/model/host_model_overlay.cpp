// The overlay operations of ulkHostModel: making an overlay from the module's
// overlay factory and deleting it again inside the module's environment.
#include <new>

#include "ulk/model/host_model.h"
#include "ulk/modules/dll.h"
#include "ulk/modules/entry_points.h"
#include "ulk/overlay/host_overlay.h"
#include "ulk/overlay/overlay.h"

ulkHostOverlay* ulkHostModel::NewOverlay() {
    // A closed model has no module to ask.
    if (!mDLL) return nullptr;
    ulkNewOverlayProc factory =
        reinterpret_cast<ulkNewOverlayProc>(const_cast<void*>(mDLL->GetSymbol("ulkNewOverlay_v1")));
    if (!factory) return nullptr;
    ulkOverlay_v1* pluginOverlay = factory(mModelIndex);
    if (!pluginOverlay) return nullptr;

    ulkHostOverlay* hostOverlay = new (std::nothrow) ulkHostOverlay;
    if (!hostOverlay) {
        // Without a host side nobody else would ever delete the plug-in's object.
        SetUp();
        delete pluginOverlay;
        SetDown();
        return nullptr;
    }
    // The link goes in first: SetPlugInOverlay lets the plug-in define its
    // modes only when the overlay names this host overlay as its twin.
    pluginOverlay->mHostOverlay = hostOverlay;
    try {
        hostOverlay->SetPlugInOverlay(pluginOverlay);
    } catch (...) {
        // The host never gets this overlay and could not delete it: both halves
        // go as DeleteOverlay takes them, then the plug-in's exception passes on.
        DeleteOverlay(hostOverlay);
        throw;
    }
    return hostOverlay;
}

void ulkHostModel::DeleteOverlay(ulkHostOverlay* hostOverlay) {
    if (!hostOverlay) return;
    SetUp();
    hostOverlay->DeletePlugInOverlay();
    SetDown();
    delete hostOverlay;
}

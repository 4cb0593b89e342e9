#include "ulk/overlay/overlay.h"

#include "ulk/overlay/host_overlay.h"

ulkOverlay_v1::~ulkOverlay_v1() {}

bool ulkOverlay_v1::OnMouseOver(double, double, uint32_t) {
    return false;
}
bool ulkOverlay_v1::OnMouseIdle(double, double, uint32_t) {
    return false;
}
bool ulkOverlay_v1::OnKeyDown(int, uint32_t) {
    return false;
}
bool ulkOverlay_v1::OnKeyUp(int, uint32_t) {
    return false;
}
void ulkOverlay_v1::OnNewNativeWindow(void*) {}
void ulkOverlay_v1::OnModeChanged(int) {}
void ulkOverlay_v1::DefineOverlay() {
    AddMode("ULK Plug-in Overlay");
}

// Every forwarding member tolerates a missing host overlay: an overlay the
// plug-in made itself, or one used before NewOverlay attached it, must not
// reach through a null link.

void* ulkOverlay_v1::GetNativeWindow() {
    return mHostOverlay ? mHostOverlay->GetNativeWindow() : nullptr;
}

void* ulkOverlay_v1::GetOpenGLContext() {
    return mHostOverlay ? mHostOverlay->GetOpenGLContext() : nullptr;
}

void ulkOverlay_v1::GetVidRect(ulkBounds& rect) {
    if (mHostOverlay) mHostOverlay->GetVidRect(rect);
}

void ulkOverlay_v1::GetConverter(ulkCoordinateConverter& converter) {
    if (mHostOverlay) mHostOverlay->GetConverter(converter);
}

ulkImage* ulkOverlay_v1::GetOverlayBuffer() {
    return mHostOverlay ? mHostOverlay->GetOverlayBuffer() : nullptr;
}

ulkInstance_v1* ulkOverlay_v1::GetInstance() {
    return mHostOverlay ? mHostOverlay->GetInstance() : nullptr;
}

void ulkOverlay_v1::AddMode(const char* name) {
    if (mHostOverlay) mHostOverlay->AddMode(name);
}

int ulkOverlay_v1::GetMode() {
    return mHostOverlay ? mHostOverlay->GetMode() : 0;
}

void* ulkOverlay_v1::AllocMem(size_t size) {
    return mHostOverlay ? mHostOverlay->AllocMem(size) : nullptr;
}

void ulkOverlay_v1::FreeMem(void* block) {
    if (mHostOverlay) mHostOverlay->FreeMem(block);
}

void ulkOverlay_v1::SetError(ulkErrorStatus status) {
    if (mHostOverlay) mHostOverlay->SetError(status);
}

void ulkOverlay_v1::SetPluginError(const char* text) {
    if (mHostOverlay) mHostOverlay->SetPluginError(text);
}

void ulkOverlay_v1::SetPluginWarning(const char* text) {
    if (mHostOverlay) mHostOverlay->SetPluginWarning(text);
}

ulkErrorStatus ulkOverlay_v1::GetError() {
    return mHostOverlay ? mHostOverlay->GetError() : kErrorNone;
}

const char* ulkOverlay_v1::GetErrorString() const {
    return mHostOverlay ? mHostOverlay->GetErrorString() : ulkError::GetMessage(kErrorNone);
}

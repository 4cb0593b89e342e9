#include "ulk/overlay/host_overlay.h"

#include <new>

#include "core/class_memory.h"
#include "core/text.h"
#include "ulk/image/image.h"
#include "ulk/image/image_format.h"
#include "ulk/instance/host_instance.h"
#include "ulk/overlay/overlay.h"
#include "ulk/overlay/overlay_mode.h"

ulkAllocCallback ulkHostOverlay::mAllocCallback = nullptr;
ulkFreeCallback ulkHostOverlay::mFreeCallback = nullptr;

ulkHostOverlay::ulkHostOverlay()
    : mContext(nullptr),
      mPlugInOverlay(nullptr),
      mHostInstance(nullptr),
      mOverlayBuffer(ulkImage::New()),
      mMode(0),
      mModes(10),
      mMagic(kOverlayLiveMarker) {
    if (mOverlayBuffer) {
        ulkImageFormat format;
        format.SetFormat(kImgFormatBGRA);
        format.SetColorspace(kColorspaceRGB);
        format.SetBitDepth(8);
        mOverlayBuffer->SetFormat(&format);
    }
    mError.ResetError();
}

ulkHostOverlay::~ulkHostOverlay() {
    if (mContext) mContext->ReleaseOverlay(this);
    mContext = nullptr;
    // Hosts test pointers they kept with IsGoodOverlay; the store must survive
    // the end of the object's life.
    *static_cast<volatile uint64_t*>(&mMagic) = kOverlayDeadMarker;
    while (ulkNode* mode = mModes.RemTail()) delete static_cast<ulkOverlayMode*>(mode);
    ulkImage::Delete(mOverlayBuffer);
    mOverlayBuffer = nullptr;
    DeletePlugInOverlay();
}

// ------------------------------------------------------------------ binding

void ulkHostOverlay::SetContext(ulkBaseOverlayContext* context) {
    mError.ResetError();
    if (mContext || !context) return;
    mContext = context;
    context->SetOverlay(this);  // calls back SetContext, which finds the binding complete
}

void ulkHostOverlay::ReleaseContext() {
    mError.ResetError();
    if (!mContext) return;
    ulkBaseOverlayContext* old = mContext;
    mContext = nullptr;
    old->ReleaseOverlay(this);
}

void ulkHostOverlay::ReleaseContext(ulkBaseOverlayContext*) {
    mError.ResetError();
    mContext = nullptr;
}

void ulkHostOverlay::SetInstance(ulkHostInstance* instance) {
    mError.ResetError();
    mHostInstance = instance;
}

void ulkHostOverlay::ReleaseInstance() {
    mError.ResetError();
    mHostInstance = nullptr;
}

ulkInstance_v1* ulkHostOverlay::GetInstance() {
    mError.ResetError();
    return mHostInstance ? mHostInstance->GetPluginInstance() : nullptr;
}

// ------------------------------------------------------------------ plug-in overlay

void ulkHostOverlay::SetPlugInOverlay(ulkOverlay_v1* overlay) {
    mError.ResetError();
    mPlugInOverlay = overlay;
    if (overlay && overlay->mHostOverlay == this) overlay->DefineOverlay();
}

void ulkHostOverlay::DeletePlugInOverlay() {
    mError.ResetError();
    ulkOverlay_v1* overlay = mPlugInOverlay;
    mPlugInOverlay = nullptr;
    delete overlay;
}

// ------------------------------------------------------------------ events

void ulkHostOverlay::Draw(bool flag) {
    mError.ResetError();
    if (mPlugInOverlay) mPlugInOverlay->Draw(flag);
}

bool ulkHostOverlay::OnMouseDown(double x, double y, uint32_t flags) {
    mError.ResetError();
    return mPlugInOverlay ? mPlugInOverlay->OnMouseDown(x, y, flags) : false;
}

bool ulkHostOverlay::OnMouseMove(double x, double y, uint32_t flags) {
    mError.ResetError();
    return mPlugInOverlay ? mPlugInOverlay->OnMouseMove(x, y, flags) : false;
}

bool ulkHostOverlay::OnMouseUp(double x, double y, uint32_t flags) {
    mError.ResetError();
    return mPlugInOverlay ? mPlugInOverlay->OnMouseUp(x, y, flags) : false;
}

bool ulkHostOverlay::OnMouseOver(double x, double y, uint32_t flags) {
    mError.ResetError();
    return mPlugInOverlay ? mPlugInOverlay->OnMouseOver(x, y, flags) : false;
}

bool ulkHostOverlay::OnMouseIdle(double x, double y, uint32_t flags) {
    mError.ResetError();
    return mPlugInOverlay ? mPlugInOverlay->OnMouseIdle(x, y, flags) : false;
}

bool ulkHostOverlay::OnKeyDown(int key, uint32_t flags) {
    mError.ResetError();
    return mPlugInOverlay ? mPlugInOverlay->OnKeyDown(key, flags) : false;
}

bool ulkHostOverlay::OnKeyUp(int key, uint32_t flags) {
    mError.ResetError();
    return mPlugInOverlay ? mPlugInOverlay->OnKeyUp(key, flags) : false;
}

void ulkHostOverlay::OnNewNativeWindow() {
    mError.ResetError();
    if (mPlugInOverlay) mPlugInOverlay->OnNewNativeWindow(GetNativeWindow());
}

// ------------------------------------------------------------------ surface

void* ulkHostOverlay::GetNativeWindow() {
    mError.ResetError();
    return mContext ? mContext->GetNativeWindow() : nullptr;
}

void* ulkHostOverlay::GetOpenGLContext() {
    mError.ResetError();
    return mContext ? mContext->GetOpenGLContext() : nullptr;
}

void ulkHostOverlay::GetVidRect(ulkBounds& rect) const {
    if (mContext) mContext->GetVidRect(rect);
}

void ulkHostOverlay::GetConverter(ulkCoordinateConverter& converter) const {
    if (!mContext) return;
    mContext->GetVidRect(converter.mVidRect);
    converter.mHeight = mContext->GetHeight();
    converter.mWidth = mContext->GetWidth();
}

ulkImage* ulkHostOverlay::GetOverlayBuffer() {
    mError.ResetError();
    if (!mContext || !mOverlayBuffer) return nullptr;
    mOverlayBuffer->SetNumChannels(4);
    mOverlayBuffer->SetSize(mContext->GetWidth(), mContext->GetHeight());
    mOverlayBuffer->SetRowDelta(mContext->GetRowDelta());
    mOverlayBuffer->SetData(mContext->GetBuffer());
    return mOverlayBuffer;
}

// ------------------------------------------------------------------ modes

bool ulkHostOverlay::AddMode(const char* name) {
    mError.ResetError();
    if (!name) return false;
    ulkOverlayMode* mode = new (std::nothrow) ulkOverlayMode(name);
    if (!mode) return false;
    if (!mode->mName || !mModes.AddTail(mode)) {
        delete mode;
        return false;
    }
    return true;
}

void ulkHostOverlay::SetMode(int mode) {
    mError.ResetError();
    mMode = mode;
    if (mPlugInOverlay) mPlugInOverlay->OnModeChanged(mode);
}

int ulkHostOverlay::GetMode() {
    mError.ResetError();
    return mMode;
}

int ulkHostOverlay::GetNumModes() {
    mError.ResetError();
    return mModes.GetCount();
}

void ulkHostOverlay::GetModeName(int index, char* buffer, int size) {
    mError.ResetError();
    if (!buffer || size < 1 || index < 0 || index >= mModes.GetCount()) return;
    const ulkOverlayMode* mode = static_cast<const ulkOverlayMode*>(mModes.GetEntry(index));
    ulk::CopyPadded(buffer, mode->GetName(), static_cast<size_t>(size));
}

// ------------------------------------------------------------------ memory and errors

void* ulkHostOverlay::AllocMem(size_t size) {
    return ulk::AllocReporting(mAllocCallback, size, mError);
}

void ulkHostOverlay::FreeMem(void* block) {
    ulk::FreeReporting(mFreeCallback, block, mError);
}

void ulkHostOverlay::SetError(ulkErrorStatus status) {
    mError.ResetError();
    mError.SetError(status);
}

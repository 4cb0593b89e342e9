// The host overlay on its own: surface image, converter, modes, memory and errors.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>

#include "memory_context.h"
#include "ulk/image/image.h"
#include "ulk/overlay/host_overlay.h"

TEST(HostOverlay, OverlayBufferFollowsTheContextSurface) {
    MemoryContext context(5, 3, 24);  // rows padded by 4 bytes
    ulkHostOverlay overlay;
    EXPECT_EQ(overlay.GetOverlayBuffer(), nullptr);  // no context yet

    overlay.SetContext(&context);
    ulkImage* image = overlay.GetOverlayBuffer();
    ASSERT_NE(image, nullptr);
    EXPECT_EQ(image->GetImgFormat(), kImgFormatBGRA);
    EXPECT_EQ(image->GetColorspace(), kColorspaceRGB);
    EXPECT_EQ(image->GetFormat()->GetBitDepth(), 8);
    EXPECT_EQ(image->GetNumChannels(), 4);
    EXPECT_EQ(image->GetWidth(), 5);
    EXPECT_EQ(image->GetHeight(), 3);
    EXPECT_EQ(image->GetRowDelta(0), 24);
    EXPECT_EQ(image->GetChannelPtr(0), context.GetBuffer());
    // BGRA: blue first, alpha last; the pixel lands where the context expects it.
    *static_cast<unsigned char*>(image->GetPixelPtr(4, 2, image->GetChannel(kImgChannelBU))) = 0x11;
    *static_cast<unsigned char*>(image->GetPixelPtr(4, 2, image->GetChannel(kImgChannelA))) = 0x44;
    EXPECT_EQ(context.Sample(4, 2, 0), 0x11);
    EXPECT_EQ(context.Sample(4, 2, 3), 0x44);

    context.Resize(7, 6, 40);
    ulkImage* again = overlay.GetOverlayBuffer();
    EXPECT_EQ(again, image);
    EXPECT_EQ(again->GetWidth(), 7);
    EXPECT_EQ(again->GetHeight(), 6);
    EXPECT_EQ(again->GetRowDelta(0), 40);
    EXPECT_EQ(again->GetChannelPtr(0), context.GetBuffer());
}

TEST(HostOverlay, SurfaceQueriesGoToTheContext) {
    MemoryContext plain(20, 10, 80);
    GLMemoryContext gl(30, -2, 120);
    ulkHostOverlay overlay;

    ulkBounds rect = {9, 9, 9, 9};
    ulkCoordinateConverter converter = {{9, 9, 9, 9}, 9, 9};
    overlay.GetVidRect(rect);  // no context: records untouched
    overlay.GetConverter(converter);
    EXPECT_EQ(rect.left, 9);
    EXPECT_EQ(converter.mWidth, 9);
    EXPECT_EQ(overlay.GetOpenGLContext(), nullptr);

    overlay.SetContext(&plain);
    EXPECT_EQ(overlay.GetNativeWindow(), &plain.mWindowToken);
    EXPECT_EQ(overlay.GetOpenGLContext(), nullptr);
    overlay.GetVidRect(rect);
    EXPECT_EQ(rect.left, 2);
    EXPECT_EQ(rect.bottom, 12);
    overlay.GetConverter(converter);
    EXPECT_EQ(converter.mVidRect.top, 3);
    EXPECT_EQ(converter.mVidRect.right, 17);
    EXPECT_EQ(converter.mWidth, 20);
    EXPECT_EQ(converter.mHeight, 10);

    overlay.ReleaseContext();
    overlay.SetContext(&gl);
    EXPECT_EQ(overlay.GetOpenGLContext(), &gl.mGLToken);
    overlay.GetConverter(converter);
    EXPECT_EQ(converter.mWidth, 30);
    EXPECT_EQ(converter.mHeight, -2);  // a short widened with its sign
}

TEST(HostOverlay, ModesAndTheirNames) {
    ulkHostOverlay overlay;
    EXPECT_EQ(overlay.GetNumModes(), 0);
    EXPECT_EQ(overlay.GetMode(), 0);
    EXPECT_TRUE(overlay.AddMode("Move"));
    EXPECT_TRUE(overlay.AddMode("ULK Plug-in Overlay"));
    EXPECT_FALSE(overlay.AddMode(nullptr));
    EXPECT_EQ(overlay.GetNumModes(), 2);

    char buffer[64];
    std::memset(buffer, 'x', sizeof buffer);
    overlay.GetModeName(1, buffer, 64);
    EXPECT_STREQ(buffer, "ULK Plug-in Overlay");
    for (int i = 20; i < 64; ++i) EXPECT_EQ(buffer[i], '\0') << i;

    std::memset(buffer, 'x', sizeof buffer);
    overlay.GetModeName(1, buffer, 4);
    EXPECT_STREQ(buffer, "ULK");
    EXPECT_EQ(buffer[4], 'x');  // never more than size bytes

    std::memset(buffer, 'x', sizeof buffer);
    overlay.GetModeName(2, buffer, 64);  // index == count
    overlay.GetModeName(-1, buffer, 64);
    overlay.GetModeName(0, buffer, 0);
    overlay.GetModeName(0, nullptr, 64);
    EXPECT_EQ(buffer[0], 'x');

    overlay.GetModeName(0, buffer, 1);
    EXPECT_EQ(buffer[0], '\0');
    EXPECT_EQ(buffer[1], 'x');

    overlay.SetMode(7);  // not checked against the count; no plug-in to tell
    EXPECT_EQ(overlay.GetMode(), 7);
}

namespace {

int gAllocCalls = 0;
size_t gLastSize = 99;
void* gFreed = nullptr;
void* CountingAlloc(size_t size) {
    ++gAllocCalls;
    gLastSize = size;
    return std::malloc(size ? size : 1);
}
void* FailingAlloc(size_t) {
    return nullptr;
}
void RecordingFree(void* p) {
    gFreed = p;
    std::free(p);
}

}  // namespace

TEST(HostOverlay, MemoryCallbacksReportIntoTheRecord) {
    ulkHostOverlay overlay;
    ulkHostOverlay::SetAllocCallback(nullptr);
    ulkHostOverlay::SetFreeCallback(nullptr);
    EXPECT_EQ(overlay.AllocMem(16), nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorNullCallback);
    EXPECT_STREQ(overlay.GetErrorString(), "ULK_ERROR: Null Callback Function");
    overlay.ResetError();
    overlay.FreeMem(nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorNullCallback);

    // The status does not reset the record first: a plug-in's text survives beside it.
    overlay.SetPluginError("bad handle");
    ulkHostOverlay::SetAllocCallback(FailingAlloc);
    EXPECT_EQ(overlay.AllocMem(16), nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorOutOfMemory);
    EXPECT_STREQ(overlay.GetErrorString(), "ULK_ERROR: Out of memory");
    EXPECT_STREQ(overlay.GetErrorObj()->mPluginError, "bad handle");

    overlay.ResetError();
    ulkHostOverlay::SetAllocCallback(CountingAlloc);
    ulkHostOverlay::SetFreeCallback(RecordingFree);
    void* block = overlay.AllocMem(0);  // size 0 is passed on
    EXPECT_NE(block, nullptr);
    EXPECT_EQ(gAllocCalls, 1);
    EXPECT_EQ(gLastSize, 0u);
    overlay.FreeMem(block);
    EXPECT_EQ(gFreed, block);
    gFreed = nullptr;
    overlay.FreeMem(nullptr);  // null is not passed on
    EXPECT_EQ(gFreed, nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorNone);

    overlay.SetError(kErrorGeneric);  // resets the texts, then sets the status
    EXPECT_STREQ(overlay.GetErrorObj()->mPluginError, ulkError::GetMessage(kErrorPlugin));
    overlay.GetMode();  // an ordinary operation starts from a clean record
    EXPECT_EQ(overlay.GetError(), kErrorNone);
    ulkHostOverlay::SetAllocCallback(nullptr);
    ulkHostOverlay::SetFreeCallback(nullptr);
}

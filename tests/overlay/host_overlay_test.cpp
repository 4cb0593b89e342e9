// The host overlay on its own: surface image, converter, modes, memory and errors.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>

#include "memory_context.h"
#include "ulk/image/image.h"
#include "ulk/overlay/host_overlay.h"

namespace {

TEST(HostOverlay, OverlayBufferAndConverterFollowTheContext) {
    ulkHostOverlay overlay;
    ulkCoordinateConverter converter = {{9, 9, 9, 9}, 9, 9};
    overlay.GetConverter(converter);  // no context: no buffer, record untouched
    EXPECT_EQ(converter.mWidth, 9);
    EXPECT_EQ(overlay.GetOverlayBuffer(), nullptr);

    GLMemoryContext context(5, 3, 24);  // rows padded by 4 bytes
    overlay.SetContext(&context);
    ulkImage* image = overlay.GetOverlayBuffer();
    ASSERT_NE(image, nullptr);
    EXPECT_EQ(image->GetImgFormat(), kImgFormatBGRA);
    EXPECT_EQ(image->GetFormat()->GetBitDepth(), 8);
    // BGRA: blue first, alpha last; the pixel lands where the context expects it.
    *static_cast<unsigned char*>(image->GetPixelPtr(4, 2, image->GetChannel(kImgChannelBU))) = 0x11;
    *static_cast<unsigned char*>(image->GetPixelPtr(4, 2, image->GetChannel(kImgChannelA))) = 0x44;
    EXPECT_EQ(context.Sample(4, 2, 0), 0x11);
    EXPECT_EQ(context.Sample(4, 2, 3), 0x44);

    context.Resize(7, -2, 40);
    EXPECT_EQ(overlay.GetOverlayBuffer(), image);  // the same image, new geometry
    EXPECT_EQ(image->GetWidth(), 7);
    EXPECT_EQ(image->GetRowDelta(0), 40);
    EXPECT_EQ(image->GetChannelPtr(0), context.GetBuffer());
    EXPECT_EQ(overlay.GetNativeWindow(), &context.mWindowToken);
    EXPECT_EQ(overlay.GetOpenGLContext(), &context.mGLToken);
    overlay.GetConverter(converter);
    EXPECT_EQ(converter.mVidRect.top, 3);
    EXPECT_EQ(converter.mVidRect.right, 17);
    EXPECT_EQ(converter.mWidth, 7);
    EXPECT_EQ(converter.mHeight, -2);  // a short widened with its sign
}

TEST(HostOverlay, ModesAndTheirNames) {
    ulkHostOverlay overlay;
    EXPECT_TRUE(overlay.AddMode("Move"));
    EXPECT_TRUE(overlay.AddMode("ULK Plug-in Overlay"));
    EXPECT_FALSE(overlay.AddMode(nullptr));
    EXPECT_EQ(overlay.GetNumModes(), 2);

    char buffer[64];
    std::memset(buffer, 'x', sizeof buffer);
    overlay.GetModeName(1, buffer, 64);
    EXPECT_STREQ(buffer, "ULK Plug-in Overlay");
    for (int i = 20; i < 64; ++i) EXPECT_EQ(buffer[i], '\0') << i;  // padded to the size
    // Truncated to size - 1 characters, never a byte more; bad arguments write nothing.
    const struct {
        int index, size;
        const char* text;  // null: nothing written
    } rows[] = {{1, 4, "ULK"}, {0, 1, ""}, {2, 64, nullptr}, {-1, 64, nullptr}, {0, 0, nullptr}};
    for (const auto& row : rows) {
        std::memset(buffer, 'x', sizeof buffer);
        overlay.GetModeName(row.index, buffer, row.size);
        if (row.text) {
            EXPECT_STREQ(buffer, row.text) << row.index << "/" << row.size;
            EXPECT_EQ(buffer[row.size], 'x') << row.index << "/" << row.size;
        } else {
            EXPECT_EQ(buffer[0], 'x') << row.index << "/" << row.size;
        }
    }
    overlay.GetModeName(0, nullptr, 64);
    overlay.SetMode(7);  // not checked against the count; no plug-in to tell
    EXPECT_EQ(overlay.GetMode(), 7);
}

void* gFreed = nullptr;

TEST(HostOverlay, MemoryCallbacksReportIntoTheRecord) {
    ulkHostOverlay overlay;
    EXPECT_EQ(overlay.AllocMem(16), nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorNullCallback);
    overlay.ResetError();
    overlay.FreeMem(nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorNullCallback);

    // The status does not reset the record first: a plug-in's text survives beside it.
    overlay.SetPluginError("bad handle");
    ulkHostOverlay::SetAllocCallback([](size_t) -> void* { return nullptr; });
    EXPECT_EQ(overlay.AllocMem(16), nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorOutOfMemory);
    EXPECT_STREQ(overlay.GetErrorObj()->mPluginError, "bad handle");

    overlay.ResetError();
    ulkHostOverlay::SetAllocCallback([](size_t size) { return std::malloc(size ? size : 1); });
    ulkHostOverlay::SetFreeCallback([](void* p) {
        gFreed = p;
        std::free(p);
    });
    void* block = overlay.AllocMem(0);
    EXPECT_NE(block, nullptr);
    overlay.FreeMem(block);
    EXPECT_EQ(gFreed, block);
    gFreed = nullptr;
    overlay.FreeMem(nullptr);  // null is not passed on
    EXPECT_EQ(gFreed, nullptr);
    EXPECT_EQ(overlay.GetError(), kErrorNone);
    overlay.SetError(kErrorGeneric);
    overlay.GetMode();  // an ordinary operation starts from a clean record
    EXPECT_EQ(overlay.GetError(), kErrorNone);
    ulkHostOverlay::SetAllocCallback(nullptr);
    ulkHostOverlay::SetFreeCallback(nullptr);
}

}  // namespace

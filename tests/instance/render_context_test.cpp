// The render context of an instance and the host callbacks a plug-in reaches
// through it, exercised on the probe module's instance.
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <string>

#include "probe_fixture.h"

namespace {

using RenderContextTest = ProbeTest;

TEST_F(RenderContextTest, ContextStartsWithItsDocumentedValues) {
    EXPECT_DOUBLE_EQ(mInstance->GetFrameRate(), 0.0);
    EXPECT_EQ(mInstance->GetCurrentFrame(), 0);
    EXPECT_EQ(mInstance->GetTotalFrames(), 0);
    EXPECT_FALSE(mInstance->GetSegmentedFrames());
    EXPECT_DOUBLE_EQ(mInstance->GetPixelAspect(), 1.0);
    EXPECT_DOUBLE_EQ(mInstance->GetDisplayAspect(), 1.0);
    EXPECT_DOUBLE_EQ(mInstance->GetQuality(), 1.0);
    EXPECT_EQ(mInstance->GetFieldMode(), 0);
    EXPECT_EQ(mInstance->GetFieldDominance(), 1);
    EXPECT_EQ(mInstance->GetField(), 1);
    EXPECT_EQ(mInstance->GetNumFields(), 1);
    EXPECT_EQ(mInstance->GetInstanceType(), -1);
    EXPECT_FALSE(mInstance->GetInstanceDataModified());
    EXPECT_EQ(mInstance->GetAltFrameBlob(), nullptr);
    EXPECT_TRUE(mInstance->IsState(ULKState::kStateIdle));

    // Host-owned values are stored whatever they are.
    mInstance->SetVideoType(static_cast<ulkVideoType>(0x7FFFFFF0));
    mInstance->SetInstanceType(static_cast<ulkInstanceType>(-12345));
    EXPECT_EQ(mInstance->GetVideoType(), 0x7FFFFFF0);
    EXPECT_EQ(mInstance->GetPluginInstance()->GetInstanceType(), -12345);
}

TEST_F(RenderContextTest, ProgressiveTimeIsFrameOverFramesMinusOne) {
    mInstance->SetVideoType(kVideoTypeProgressive);
    mInstance->SetTotalFrames(11);
    mInstance->SetCurrentFrame(5);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.5);
    mInstance->SetTotalFrames(4);
    mInstance->SetCurrentFrame(1);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.33333333);  // quantised to 8 places
    EXPECT_DOUBLE_EQ(mInstance->GetPluginInstance()->GetTime(), 0.33333333);
    for (int frames : {0, 1}) {
        mInstance->SetTotalFrames(frames);
        mInstance->SetCurrentFrame(0);
        EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.0) << frames;
    }
    // Fields do not matter for progressive video.
    mInstance->SetTotalFrames(3);
    mInstance->SetCurrentFrame(2);
    mInstance->SetField(kFieldTwo);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 1.0);
}

TEST_F(RenderContextTest, InterlacedTimeCountsFields) {
    mInstance->SetVideoType(kVideoTypeInterlaced);
    mInstance->SetTotalFrames(10);
    mInstance->SetFieldDominance(kFieldOne);
    mInstance->SetField(kFieldOne);
    mInstance->SetCurrentFrame(0);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.0);
    mInstance->SetCurrentFrame(9);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.94736842);  // 18 / 19
    mInstance->SetField(kFieldTwo);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 1.0);
    mInstance->SetSegmentedFrames(true);  // both fields share the frame's time
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.94736842);
    mInstance->SetField(kFieldOne);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.94736842);

    mInstance->SetSegmentedFrames(false);
    mInstance->SetTotalFrames(1);
    mInstance->SetCurrentFrame(0);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 0.0);
    mInstance->SetField(kFieldTwo);
    EXPECT_DOUBLE_EQ(mInstance->GetTime(), 1.0);
}

TEST_F(RenderContextTest, SetTimeScalesByTheFrameCount) {
    mInstance->SetTotalFrames(11);
    mInstance->SetTime(0.5);
    EXPECT_EQ(mInstance->GetCurrentFrame(), 5);
    mInstance->SetTotalFrames(10);
    mInstance->SetTime(1.0);
    EXPECT_EQ(mInstance->GetCurrentFrame(), 10);  // one past the last frame
    mInstance->SetTime(0.99);
    EXPECT_EQ(mInstance->GetCurrentFrame(), 9);
}

TEST_F(RenderContextTest, TopFieldFollowsFieldModeAndTopness) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    mInstance->SetFieldMode(kFieldModeFrames);
    mInstance->SetFieldTopness(kFieldTwo);
    mInstance->SetField(kFieldOne);
    EXPECT_TRUE(plugin->IsTopField());  // whole frames: always on top
    mInstance->SetFieldMode(kFieldModeFields);
    EXPECT_FALSE(plugin->IsTopField());
    mInstance->SetField(kFieldTwo);
    EXPECT_TRUE(plugin->IsTopField());
    EXPECT_EQ(plugin->GetFieldTopness(), kFieldTwo);
    mInstance->SetNumFields(2);
    EXPECT_EQ(plugin->GetNumFields(), 2);
}

TEST_F(RenderContextTest, PlatformRecordIsCopiedOnRequest) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    ulkPlatformUIInfo out;
    std::memset(out.bytes, 0xEE, sizeof out.bytes);
    plugin->GetPlatformUIInfo(&out);
    for (unsigned char byte : out.bytes) EXPECT_EQ(byte, 0xEE);  // none set: untouched

    ulkPlatformUIInfo info;
    for (int i = 0; i < 16; ++i) info.bytes[i] = static_cast<unsigned char>(i * 3);
    mInstance->SetPlatformUIInfo(&info);
    info.bytes[15] = 99;  // the pointer is kept, not a copy
    plugin->GetPlatformUIInfo(&out);
    EXPECT_EQ(out.bytes[1], 3);
    EXPECT_EQ(out.bytes[15], 99);
}

TEST_F(RenderContextTest, InstanceDataIsAPrivateCopy) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    size_t size = 123;
    EXPECT_EQ(plugin->GetInstanceData(&size), nullptr);
    EXPECT_EQ(size, 0u);

    char data[8] = "abcdefg";
    ASSERT_TRUE(plugin->SetInstanceData(data, 8));
    const void* held = plugin->GetInstanceData(&size);
    ASSERT_NE(held, nullptr);
    EXPECT_NE(held, static_cast<const void*>(data));
    EXPECT_EQ(size, 8u);
    EXPECT_EQ(plugin->GetInstanceData(nullptr), nullptr);

    char same[8] = "ABCDEFG";
    ASSERT_TRUE(plugin->SetInstanceData(same, 8));
    EXPECT_EQ(plugin->GetInstanceData(&size), held);  // the held buffer is reused
    EXPECT_STREQ(static_cast<const char*>(held), "ABCDEFG");

    ASSERT_TRUE(plugin->SetInstanceData(data, 3));
    EXPECT_EQ(std::memcmp(mInstance->GetInstanceData(&size), "abc", 3), 0);
    EXPECT_EQ(size, 3u);
    EXPECT_FALSE(mInstance->GetInstanceDataModified());
    plugin->SetInstanceDataModified(true);
    EXPECT_TRUE(mInstance->GetInstanceDataModified());

    EXPECT_TRUE(plugin->SetInstanceData(nullptr, 3));
    EXPECT_EQ(mInstance->GetInstanceData(&size), nullptr);
    EXPECT_EQ(size, 0u);
    ASSERT_TRUE(plugin->SetInstanceData(data, 2));
    mInstance->FreeInstanceData();
    EXPECT_EQ(mInstance->GetInstanceData(&size), nullptr);
}

size_t gLastAllocSize = 99;

TEST_F(RenderContextTest, MemoryReportsMissingCallbacksAndExhaustion) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    EXPECT_EQ(plugin->AllocMem(16), nullptr);
    EXPECT_EQ(mInstance->GetError(), kErrorNullCallback);
    EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: Null Callback Function");
    plugin->FreeMem(nullptr);
    EXPECT_EQ(mInstance->GetError(), kErrorNullCallback);

    ulkHostInstance::SetAllocCallback([](size_t size) -> void* {
        gLastAllocSize = size;
        return size == 0 ? nullptr : std::malloc(size);
    });
    ulkHostInstance::SetFreeCallback(&std::free);
    void* block = plugin->AllocMem(32);
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
    plugin->FreeMem(block);
    plugin->FreeMem(nullptr);
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
    EXPECT_EQ(plugin->AllocMem(0), nullptr);  // size 0 reaches the callback
    EXPECT_EQ(gLastAllocSize, 0u);
    EXPECT_EQ(mInstance->GetError(), kErrorOutOfMemory);
    EXPECT_STREQ(mInstance->GetErrorString(), "ULK_ERROR: Out of memory");
}

std::string gConsole;
int gWaitValue = 0;
int gDraws = 0;
int gDrawArgs[3] = {};
unsigned char* gDrawBuffer = nullptr;

int Console(const char* format, ...) {
    char text[256];
    va_list args;
    va_start(args, format);
    const int n = std::vsnprintf(text, sizeof text, format, args);
    va_end(args);
    gConsole += text;
    return n;
}

void Draw(unsigned char* buffer, int32_t a, int32_t b, int32_t c) {
    ++gDraws;
    gDrawBuffer = buffer;
    gDrawArgs[0] = a;
    gDrawArgs[1] = b;
    gDrawArgs[2] = c;
}

TEST_F(RenderContextTest, ConsoleAndWaitDisplayReachTheHost) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    EXPECT_EQ(plugin->ConsolePrintf("nobody listens"), 0);
    plugin->DisplayWait(5);  // no callback: nothing happens

    gConsole.clear();
    ulkHostInstance::SetConsoleCallback(&Console);
    ulkHostInstance::SetDisplayWaitCallback([](int32_t value) { gWaitValue = value; });
    mControl->actions = kProbeConsole;
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(gConsole, "100% done");  // the '%' is printed, not interpreted
    EXPECT_EQ(mControl->console, 9);
    plugin->DisplayWait(-4);
    EXPECT_EQ(gWaitValue, -4);
}

TEST_F(RenderContextTest, DrawingReachesTheHostOnlyDuringShowUIWindow) {
    gDraws = 0;
    ulkHostInstance::SetDrawVideoCallback(&Draw);
    mControl->actions = kProbeDraw;
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(gDraws, 0);
    mInstance->DrawToVideoBuffer(mControl->drawBuffer, 1, 2, 3);
    EXPECT_EQ(gDraws, 0);

    ASSERT_TRUE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(gDraws, 1);
    EXPECT_EQ(gDrawBuffer, mControl->drawBuffer);
    EXPECT_EQ(gDrawArgs[0], 1);
    EXPECT_EQ(gDrawArgs[1], 2);
    EXPECT_EQ(gDrawArgs[2], 3);

    ulkHostInstance::SetDrawVideoCallback(nullptr);
    EXPECT_TRUE(mInstance->ShowUIWindow(nullptr));  // no callback: nothing drawn, no status
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
    EXPECT_EQ(gDraws, 1);
}

struct AbortLog {
    int calls = 0;
    ulkInstance_v1* instance = nullptr;
    bool answer = true;
};

TEST_F(RenderContextTest, AbortedAsksTheCallbackOrKeepsTheLastAnswer) {
    mControl->actions = kProbeAbort;
    mControl->aborted = true;
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_FALSE(mControl->aborted);  // no callback: cleared at the start of Execute

    AbortLog log;
    mInstance->SetAbortCallback(
        [](ulkInstance_v1* instance, void* data) {
            auto* abortLog = static_cast<AbortLog*>(data);
            ++abortLog->calls;
            abortLog->instance = instance;
            return abortLog->answer;
        },
        &log);
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_TRUE(mControl->aborted);
    EXPECT_EQ(log.calls, 1);
    EXPECT_EQ(log.instance, mInstance->GetPluginInstance());

    // Removed again: the stored answer stays until the next Execute clears it.
    mInstance->SetAbortCallback(nullptr, nullptr);
    EXPECT_TRUE(mInstance->Aborted());
    ASSERT_TRUE(mInstance->ShowUIWindow(nullptr));
    EXPECT_FALSE(mInstance->Aborted());
    mInstance->SetMeterCallback([](ulkInstance_v1*, void*) { return true; }, &log);
    EXPECT_EQ(log.calls, 1);  // the meter is never called by the library
}

struct AltFrameCall {
    ulkHostInstance* host = nullptr;
    unsigned a = 0, b = 0;
    ulkField field = kFieldOne;
    ulkImage* image = nullptr;
} gAltFrame;

TEST_F(RenderContextTest, AlternateFramesReachTheHostInItsArgumentOrder) {
    mControl->actions = kProbeAltFrame;
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_FALSE(mControl->altFrame);
    EXPECT_EQ(mInstance->GetError(), kErrorNullCallback);  // recorded during a successful Execute

    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    EXPECT_FALSE(plugin->GetAlternateFrame(1, 2, mIn.get(), kFieldOne));
    EXPECT_EQ(mInstance->GetError(), kErrorNullCallback);
    size_t first = 0, second = 0;
    EXPECT_EQ(plugin->GetAlternateFrameSize(kFieldOne, &first, &second), 0u);
    EXPECT_EQ(mInstance->GetError(), kErrorNullCallback);

    ulkHostInstance::SetAltFrameCallback([](ulkHostInstance* host, unsigned short a,
                                            unsigned short b, ulkField field, ulkImage* image) {
        gAltFrame = {host, a, b, field, image};
        return true;
    });
    ulkHostInstance::SetAltFrameSizeCallback(
        [](ulkHostInstance*, ulkField field, size_t* w, size_t* h) -> size_t {
            *w = 640;
            *h = 480;
            return static_cast<size_t>(field) * 1000;
        });
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_TRUE(mControl->altFrame);
    EXPECT_EQ(gAltFrame.host, mInstance);
    EXPECT_EQ(gAltFrame.a, 3u);
    EXPECT_EQ(gAltFrame.b, 7u);
    EXPECT_EQ(gAltFrame.field, kFieldTwo);
    EXPECT_EQ(gAltFrame.image, mIn.get());
    EXPECT_EQ(plugin->GetAlternateFrameSize(kFieldTwo, &first, &second), 2000u);
    EXPECT_EQ(first, 640u);
    EXPECT_EQ(second, 480u);
}

}  // namespace

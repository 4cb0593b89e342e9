// The render context of an instance and the host callbacks a plug-in reaches
// through it, exercised on the probe module's instance.
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <string>

#include "probe_fixture.h"

namespace {

using RenderContextTest = ProbeTest;

TEST_F(RenderContextTest, TimeCountsFramesOrFields) {
    struct Row {
        ulkVideoType video;
        int total, frame;
        ulkField dominance, field;
        bool segmented;
        double time;
    };
    const ulkVideoType P = kVideoTypeProgressive, I = kVideoTypeInterlaced;
    const ulkField F1 = kFieldOne, F2 = kFieldTwo;
    const Row rows[] = {
        {P, 11, 5, F1, F1, false, 0.5},       {P, 4, 1, F1, F1, false, 0.33333333},  // 8 places
        {P, 0, 0, F1, F1, false, 0.0},        {P, 1, 0, F1, F1, false, 0.0},
        {P, 3, 2, F1, F2, false, 1.0},  // fields do not matter for progressive video
        {I, 10, 0, F1, F1, false, 0.0},       {I, 10, 9, F1, F1, false, 0.94736842},  // 18/19
        {I, 10, 9, F1, F2, false, 1.0},       {I, 10, 9, F2, F1, false, 1.0},
        {I, 10, 9, F1, F2, true, 0.94736842},  // both fields share the frame's time
        {I, 1, 0, F1, F1, false, 0.0},        {I, 1, 0, F1, F2, false, 1.0},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(testing::Message() << row.video << " " << row.total << " " << row.frame << " "
                                        << row.dominance << row.field << row.segmented);
        mInstance->SetVideoType(row.video);
        mInstance->SetTotalFrames(row.total);
        mInstance->SetCurrentFrame(row.frame);
        mInstance->SetFieldDominance(row.dominance);
        mInstance->SetField(row.field);
        mInstance->SetSegmentedFrames(row.segmented);
        EXPECT_DOUBLE_EQ(mInstance->GetTime(), row.time);
        EXPECT_DOUBLE_EQ(mInstance->GetPluginInstance()->GetTime(), row.time);
    }
    // SetTime scales by the frame count and truncates; 1.0 is one past the last frame.
    const struct {
        int total;
        double time;
        int frame;
    } times[] = {{11, 0.5, 5}, {10, 1.0, 10}, {10, 0.99, 9}};
    for (const auto& t : times) {
        mInstance->SetTotalFrames(t.total);
        mInstance->SetTime(t.time);
        EXPECT_EQ(mInstance->GetCurrentFrame(), t.frame) << t.time;
    }
}

TEST_F(RenderContextTest, TopFieldFollowsFieldModeAndTopness) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    mInstance->SetFieldTopness(kFieldTwo);
    const struct {
        ulkFieldMode mode;
        ulkField field;
        bool top;
    } rows[] = {{kFieldModeFrames, kFieldOne, true},  // whole frames: always on top
                {kFieldModeFields, kFieldOne, false},
                {kFieldModeFields, kFieldTwo, true}};
    for (const auto& row : rows) {
        mInstance->SetFieldMode(row.mode);
        mInstance->SetField(row.field);
        EXPECT_EQ(plugin->IsTopField(), row.top) << row.mode << row.field;
    }
}

TEST_F(RenderContextTest, PlatformRecordAndInstanceData) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    ulkPlatformUIInfo out, info;
    std::memset(out.bytes, 0xEE, sizeof out.bytes);
    plugin->GetPlatformUIInfo(&out);
    EXPECT_EQ(out.bytes[0], 0xEE);  // none set: untouched
    std::memset(info.bytes, 3, sizeof info.bytes);
    mInstance->SetPlatformUIInfo(&info);
    info.bytes[15] = 99;  // the pointer is kept, not a copy
    plugin->GetPlatformUIInfo(&out);
    EXPECT_EQ(out.bytes[1], 3);
    EXPECT_EQ(out.bytes[15], 99);

    size_t size = 123;
    EXPECT_EQ(plugin->GetInstanceData(&size), nullptr);
    EXPECT_EQ(size, 0u);
    char data[8] = "abcdefg";
    ASSERT_TRUE(plugin->SetInstanceData(data, 8));
    const void* held = plugin->GetInstanceData(&size);
    EXPECT_NE(held, static_cast<const void*>(data));  // a private copy
    EXPECT_EQ(size, 8u);
    char same[8] = "ABCDEFG";
    ASSERT_TRUE(plugin->SetInstanceData(same, 8));
    EXPECT_EQ(plugin->GetInstanceData(&size), held);  // the held buffer is reused
    EXPECT_STREQ(static_cast<const char*>(held), "ABCDEFG");
    ASSERT_TRUE(plugin->SetInstanceData(data, 3));
    EXPECT_EQ(std::memcmp(mInstance->GetInstanceData(&size), "abc", 3), 0);
    EXPECT_EQ(size, 3u);
    plugin->SetInstanceDataModified(true);
    EXPECT_TRUE(mInstance->GetInstanceDataModified());
    EXPECT_TRUE(plugin->SetInstanceData(nullptr, 3));
    EXPECT_EQ(mInstance->GetInstanceData(&size), nullptr);
    EXPECT_EQ(size, 0u);
    ASSERT_TRUE(plugin->SetInstanceData(data, 2));
    mInstance->FreeInstanceData();
    EXPECT_EQ(mInstance->GetInstanceData(&size), nullptr);
}

TEST_F(RenderContextTest, MemoryReportsMissingCallbacksAndExhaustion) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    EXPECT_EQ(plugin->AllocMem(16), nullptr);
    EXPECT_EQ(mInstance->GetError(), kErrorNullCallback);
    plugin->FreeMem(nullptr);
    EXPECT_EQ(mInstance->GetError(), kErrorNullCallback);

    ulkHostInstance::SetAllocCallback(
        [](size_t size) -> void* { return size == 0 ? nullptr : std::malloc(size); });
    ulkHostInstance::SetFreeCallback(&std::free);
    void* block = plugin->AllocMem(32);
    ASSERT_NE(block, nullptr);
    plugin->FreeMem(block);
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
    EXPECT_EQ(plugin->AllocMem(0), nullptr);  // size 0 reaches the callback
    EXPECT_EQ(mInstance->GetError(), kErrorOutOfMemory);
}

std::string gConsole;
int gWaitValue = 0;
int gDraws = 0;
unsigned char* gDrawBuffer = nullptr;
int gDrawSum = 0;

int Console(const char* format, ...) {
    char text[256];
    va_list args;
    va_start(args, format);
    const int n = std::vsnprintf(text, sizeof text, format, args);
    va_end(args);
    gConsole += text;
    return n;
}

TEST_F(RenderContextTest, ConsoleWaitAndDrawingReachTheHost) {
    ulkInstance_v1* plugin = mInstance->GetPluginInstance();
    mControl->actions = kProbeConsole | kProbeDraw;
    ASSERT_TRUE(mInstance->Execute(nullptr));  // no callbacks: nothing happens
    EXPECT_EQ(mControl->console, 0);
    plugin->DisplayWait(5);

    gConsole.clear();
    gDraws = 0;
    ulkHostInstance::SetConsoleCallback(&Console);
    ulkHostInstance::SetDisplayWaitCallback([](int32_t value) { gWaitValue = value; });
    ulkHostInstance::SetDrawVideoCallback(
        [](unsigned char* buffer, int32_t a, int32_t b, int32_t c) {
            ++gDraws;
            gDrawBuffer = buffer;
            gDrawSum = a * 100 + b * 10 + c;
        });
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_EQ(gConsole, "100% done");  // the '%' is printed, not interpreted
    EXPECT_EQ(mControl->console, 9);
    plugin->DisplayWait(-4);
    EXPECT_EQ(gWaitValue, -4);

    // Drawing reaches the host only during ShowUIWindow.
    mInstance->DrawToVideoBuffer(mControl->drawBuffer, 1, 2, 3);
    EXPECT_EQ(gDraws, 0);
    ASSERT_TRUE(mInstance->ShowUIWindow(nullptr));
    EXPECT_EQ(gDraws, 1);
    EXPECT_EQ(gDrawBuffer, mControl->drawBuffer);
    EXPECT_EQ(gDrawSum, 123);
    ulkHostInstance::SetDrawVideoCallback(nullptr);
    EXPECT_TRUE(mInstance->ShowUIWindow(nullptr));  // no callback: nothing drawn, no status
    EXPECT_EQ(mInstance->GetError(), kErrorNone);
}

struct AbortLog {
    int calls = 0;
    ulkInstance_v1* instance = nullptr;
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
            return true;
        },
        &log);
    ASSERT_TRUE(mInstance->Execute(nullptr));
    EXPECT_TRUE(mControl->aborted);
    EXPECT_EQ(log.calls, 1);
    EXPECT_EQ(log.instance, mInstance->GetPluginInstance());

    // Removed again: the stored answer stays until the next call clears it.
    mInstance->SetAbortCallback(nullptr, nullptr);
    EXPECT_TRUE(mInstance->Aborted());
    ASSERT_TRUE(mInstance->ShowUIWindow(nullptr));
    EXPECT_FALSE(mInstance->Aborted());
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
    EXPECT_EQ(first + second, 1120u);
}

}  // namespace

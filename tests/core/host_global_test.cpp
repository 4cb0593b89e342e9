// Host services: allocator, console, description texts and versions.
#include <gtest/gtest.h>

#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <set>
#include <string>

#include "ulk/core/host_global.h"

namespace {

std::set<void*> gLive;
int gAllocCalls = 0;
std::string gConsole;

void* CountingAlloc(size_t size) {
    ++gAllocCalls;
    void* p = std::malloc(size);
    gLive.insert(p);
    return p;
}

void CountingFree(void* p) {
    gLive.erase(p);
    std::free(p);
}

int FormattingConsole(const char* format, ...) {
    char buffer[256];
    va_list args;
    va_start(args, format);
    const int n = std::vsnprintf(buffer, sizeof buffer, format, args);
    va_end(args);
    gConsole += buffer;
    return n;
}

class HostGlobalTest : public ::testing::Test {
protected:
    void SetUp() override { Install(); }
    void TearDown() override {
        Install();
        ulkHostGlobal::FreeULKGlobalMemory();
        EXPECT_TRUE(gLive.empty()) << "host texts leaked";
        ulkHostGlobal::SetAllocCallback(nullptr);
        ulkHostGlobal::SetFreeCallback(nullptr);
        ulkHostGlobal::SetConsoleCallback(nullptr);
    }
    static void Install() {
        ulkHostGlobal::SetAllocCallback(&CountingAlloc);
        ulkHostGlobal::SetFreeCallback(&CountingFree);
    }
};

TEST_F(HostGlobalTest, MemoryGoesThroughTheHost) {
    gAllocCalls = 0;
    EXPECT_EQ(ulkGlobal::AllocMem(0), nullptr);
    EXPECT_EQ(gAllocCalls, 0);
    void* p = ulkGlobal::AllocMem(16);
    EXPECT_EQ(gLive.count(p), 1u);
    ulkGlobal::FreeMem(p);
    EXPECT_TRUE(gLive.empty());
    ulkGlobal::FreeMem(nullptr);

    ulkHostGlobal::SetAllocCallback(nullptr);
    ulkHostGlobal::SetFreeCallback(nullptr);
    EXPECT_EQ(ulkHostGlobal::AllocMem(8), nullptr);
    ulkHostGlobal::FreeMem(&gAllocCalls);  // no release function: nothing happens
}

TEST_F(HostGlobalTest, ConsoleTextIsNeverAFormat) {
    EXPECT_EQ(ulkGlobal::ConsolePrintf("ignored"), 0);
    ulkHostGlobal::SetConsoleCallback(&FormattingConsole);
    gConsole.clear();
    EXPECT_EQ(ulkGlobal::ConsolePrintf("100% done %s %n\n"), 16);
    EXPECT_EQ(gConsole, "100% done %s %n\n");
}

TEST_F(HostGlobalTest, HostDescriptionIsCopiedAndBounded) {
    char info[32] = "-", vendor[4] = "-", app[32] = "-", version[32] = "-";
    ulkHostGlobal::GetHostDescription(info, 32, vendor, 4, app, 32, version, 32);
    EXPECT_STREQ(info, "-");  // nothing stored yet

    ulkHostGlobal::SetHostDescription("Editor host", "VendorName", "Cutter", "2.1");
    ulkGlobal::GetHostDescription(info, 32, vendor, 4, app, 32, version, 32);
    EXPECT_STREQ(info, "Editor host");
    EXPECT_STREQ(vendor, "Ven");
    EXPECT_STREQ(app, "Cutter");
    EXPECT_STREQ(version, "2.1");

    // A null appname keeps the old one; the replaced texts go back to the host.
    ulkHostGlobal::SetHostDescription("Editor host 2", "V", nullptr, "2.2");
    EXPECT_EQ(gLive.size(), 4u);
    std::memset(app, 0, sizeof app);
    ulkHostGlobal::GetHostDescription(nullptr, 0, nullptr, 0, app, 32, nullptr, 0);
    EXPECT_STREQ(app, "Cutter");

    ulkHostGlobal::FreeULKGlobalMemory();
    std::strcpy(app, "-");
    ulkHostGlobal::GetHostDescription(nullptr, 0, nullptr, 0, app, 32, nullptr, 0);
    EXPECT_STREQ(app, "-");

    // Without an allocator nothing is stored.
    ulkHostGlobal::SetAllocCallback(nullptr);
    ulkHostGlobal::SetHostDescription("a", "b", "c", "d");
    ulkHostGlobal::GetHostDescription(info, 32, nullptr, 0, app, 32, nullptr, 0);
    EXPECT_STREQ(app, "-");
}

TEST_F(HostGlobalTest, VersionTextsAreAlwaysTerminated) {
    char line[64];
    std::memset(line, 'x', sizeof line);
    ulkVersion version{};
    ulkHostGlobal::GetLibraryVersion(line, sizeof line, &version);
    EXPECT_STREQ(line, "ULK Library Version 1.05\n");
    EXPECT_EQ(std::strlen(line), 25u);
    EXPECT_EQ(line[63], '\0');  // padded
    EXPECT_EQ(version.major, 1);
    EXPECT_EQ(version.minor, 5);
    EXPECT_EQ(version.beta, 0);

    char small[8];
    ulkHostGlobal::GetLibraryVersion(small, sizeof small, &version);
    EXPECT_STREQ(small, "ULK Lib");
    char untouched = 'u';
    ulkHostGlobal::GetLibraryVersion(&untouched, 0, &version);
    EXPECT_EQ(untouched, 'u');

    char host[16] = "-";
    ulkVersion stored{};
    ulkHostGlobal::GetHostLibraryVersion(host, sizeof host, &stored);
    EXPECT_STREQ(host, "-");  // no text stored yet
    ulkHostGlobal::SetHostLibraryVersion("HostKit 9.9", 4, ulkVersion{2, 3, 1, 0});
    ulkHostGlobal::SetHostLibraryVersion("HostKit 10.0", 4, ulkVersion{2, 4, 0, 0});
    EXPECT_EQ(gLive.size(), 1u);  // the replaced text was released
    ulkGlobal::GetHostLibraryVersion(host, sizeof host, &stored);
    EXPECT_STREQ(host, "Host");
    EXPECT_EQ(stored.minor, 4);
    ulkHostGlobal::GetHostLibraryVersion(host, 3, nullptr);
    EXPECT_STREQ(host, "Ho");
}

}  // namespace

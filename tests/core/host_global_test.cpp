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

std::set<void*> gLive;  // blocks the host handed out and has not got back
std::string gConsole;

void* CountingAlloc(size_t size) {
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
    void SetUp() override {
        ulkHostGlobal::SetAllocCallback(&CountingAlloc);
        ulkHostGlobal::SetFreeCallback(&CountingFree);
    }
    void TearDown() override {
        SetUp();
        ulkHostGlobal::FreeULKGlobalMemory();
        EXPECT_TRUE(gLive.empty()) << "host texts leaked";
        ulkHostGlobal::SetAllocCallback(nullptr);
        ulkHostGlobal::SetFreeCallback(nullptr);
        ulkHostGlobal::SetConsoleCallback(nullptr);
    }
};

}  // namespace

TEST_F(HostGlobalTest, MemoryAndConsoleGoThroughTheHost) {
    EXPECT_EQ(ulkGlobal::AllocMem(0), nullptr);
    void* p = ulkGlobal::AllocMem(16);
    EXPECT_EQ(gLive.count(p), 1u);
    ulkGlobal::FreeMem(p);
    EXPECT_TRUE(gLive.empty());
    ulkHostGlobal::SetAllocCallback(nullptr);
    ulkHostGlobal::SetFreeCallback(nullptr);
    EXPECT_EQ(ulkHostGlobal::AllocMem(8), nullptr);
    ulkHostGlobal::FreeMem(&gConsole);  // no release function: nothing happens

    // The text is never a format.
    EXPECT_EQ(ulkGlobal::ConsolePrintf("ignored"), 0);
    ulkHostGlobal::SetConsoleCallback(&FormattingConsole);
    gConsole.clear();
    EXPECT_EQ(ulkGlobal::ConsolePrintf("100% done %s %n\n"), 16);
    EXPECT_EQ(gConsole, "100% done %s %n\n");
}

TEST_F(HostGlobalTest, HostDescriptionIsCopiedBoundedAndReleased) {
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
    EXPECT_TRUE(gLive.empty());
    std::strcpy(app, "-");
    ulkHostGlobal::GetHostDescription(nullptr, 0, nullptr, 0, app, 32, nullptr, 0);
    EXPECT_STREQ(app, "-");
}

TEST_F(HostGlobalTest, VersionTextsAreAlwaysTerminated) {
    char line[64];
    std::memset(line, 'x', sizeof line);
    ulkVersion version{};
    ulkHostGlobal::GetLibraryVersion(line, sizeof line, &version);
    EXPECT_STREQ(line, "ULK Library Version 1.05\n");
    EXPECT_EQ(line[63], '\0');  // padded
    EXPECT_EQ(version.minor, 5);
    char small[8], untouched = 'u';
    ulkHostGlobal::GetLibraryVersion(small, sizeof small, nullptr);
    ulkHostGlobal::GetLibraryVersion(&untouched, 0, nullptr);
    EXPECT_STREQ(small, "ULK Lib");
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

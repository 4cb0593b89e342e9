#include "ulk_tools/progress.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <stdlib.h>
#include <unistd.h>

#include <cstdio>
#include <string>

using namespace ulk_tools;

TEST(Progress, LineShowsBarCountSpeedAndTimeLeft) {
    EXPECT_EQ(FormatProgress(12, 48, 0.5),
              "[#####               ] 12/48 frames  24.0 fps  0:02 left");
    // Nothing done yet: no speed to speak of.
    EXPECT_EQ(FormatProgress(0, 10, 3.0), "[                    ] 0/10 frames");
    EXPECT_EQ(FormatProgress(10, 10, 2.0),
              "[####################] 10/10 frames  5.0 fps  0:00 left");
    // Out-of-range counts are clamped rather than drawing past the bar.
    EXPECT_EQ(FormatProgress(15, 10, 0.0), "[####################] 10/10 frames");

    EXPECT_EQ(FormatDuration(0), "0:00");
    EXPECT_EQ(FormatDuration(61.2), "1:02");
    EXPECT_EQ(FormatDuration(3600 * 2 + 5), "2:00:05");
    EXPECT_EQ(FormatDuration(-3), "0:00");
}

TEST(Progress, DrawsNothingOffATerminalOrWhenQuiet) {
    FILE* log = std::tmpfile();
    ASSERT_NE(log, nullptr);
    {
        ProgressBar bar(5, false, log);
        EXPECT_FALSE(bar.Visible());
        for (int i = 1; i <= 5; ++i) bar.Update(i);
        bar.Finish();
    }
    {
        ProgressBar quiet(5, true, log);
        EXPECT_FALSE(quiet.Visible());
        quiet.Update(5);
    }
    EXPECT_EQ(std::ftell(log), 0);
    std::fclose(log);
}

TEST(Progress, DrawsInPlaceOnATerminalAndEndsTheLine) {
    const int master = posix_openpt(O_RDWR | O_NOCTTY);
    ASSERT_GE(master, 0);
    ASSERT_EQ(grantpt(master), 0);
    ASSERT_EQ(unlockpt(master), 0);
    FILE* terminal = std::fopen(ptsname(master), "w");
    ASSERT_NE(terminal, nullptr);
    {
        ProgressBar bar(5, false, terminal);
        EXPECT_TRUE(bar.Visible());
        for (int i = 1; i <= 5; ++i) bar.Update(i);
        bar.Finish();
        bar.Finish();  // once only
    }
    std::fclose(terminal);
    std::string shown;
    char buffer[4096];
    ssize_t count = 0;
    while ((count = read(master, buffer, sizeof buffer)) > 0) {
        shown.append(buffer, static_cast<size_t>(count));
        if (shown.find('\n') != std::string::npos) break;
    }
    close(master);
    EXPECT_EQ(shown.rfind("\r[", 0), 0u) << shown;
    EXPECT_NE(shown.find("[####################] 5/5 frames"), std::string::npos) << shown;
    EXPECT_EQ(shown.find('\n'), shown.size() - 1) << shown;  // exactly one line end, last
}

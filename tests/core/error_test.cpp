// The error record: which text each status shows, bounded and null-safe texts, copies.
#include <gtest/gtest.h>

#include <string>

#include "ulk/core/error.h"

TEST(ErrorTest, StatusSelectsText) {
    ulkError error;
    EXPECT_STREQ(error.GetErrorString(), "ULK_ERROR: No Error");
    error.SetPluginError("bad radius");
    error.SetPluginWarning("slow path");
    error.SetSystemError("disk gone");
    EXPECT_EQ(error.GetError(), kErrorSystem);
    // Plug-in error and warning and the system text (status 9) show what was stored;
    // every other status its fixed message, whatever texts are stored.
    const struct {
        int32_t status;
        const char* text;
    } cases[] = {{kErrorPlugin, "bad radius"},
                 {kErrorPluginWarning, "slow path"},
                 {kErrorOpenDLL, "disk gone"},
                 {kErrorSystem, "ULK_ERROR: OS System Error"},
                 {kErrorExecute, "ULK_ERROR: Execute failed"},
                 {kErrorUnhandledException, "ULK_ERROR: Unhandled Exception caught from plug-in"},
                 {99, "ULK_ERROR: Generic ULK Error"}};
    ulkError copy = error;
    error.ResetError();
    for (const auto& c : cases) {
        copy.SetError(static_cast<ulkErrorStatus>(c.status));
        EXPECT_STREQ(copy.GetErrorString(), c.text) << c.status;
    }
    // Reset puts the fixed messages back in the three texts.
    error.SetError(kErrorOpenDLL);
    EXPECT_STREQ(error.GetErrorString(), "ULK_ERROR: OS System Error");
    error.SetError(kErrorPluginWarning);
    EXPECT_STREQ(error.GetErrorString(), "ULK_WARNING: Plug-in Supplied Warning");
    EXPECT_EQ(ulkError::GetMessage(24), nullptr);
    EXPECT_EQ(ulkError::GetMessage(-1), nullptr);
}

TEST(ErrorTest, TextsAreBoundedAndNullSafe) {
    ulkError error;
    const std::string longText(300, 'e');
    error.SetPluginError(longText.c_str());
    EXPECT_EQ(std::string(error.GetErrorString()), longText.substr(0, 255));
    error.SetPluginError(nullptr);
    error.SetPluginWarning(nullptr);
    error.SetSystemError(nullptr);
    EXPECT_STREQ(error.mPluginError, "");
    EXPECT_STREQ(error.mPluginWarning, "");
    EXPECT_STREQ(error.mSystemError, "");
}

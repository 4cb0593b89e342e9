// The error record: messages, texts, truncation and copies.
#include <gtest/gtest.h>

#include <string>

#include "ulk/core/error.h"

namespace {

TEST(ErrorTest, StatusSelectsText) {
    ulkError error;
    EXPECT_EQ(error.GetError(), kErrorNone);
    EXPECT_STREQ(error.GetErrorString(), "ULK_ERROR: No Error");

    error.SetPluginError("bad radius");
    EXPECT_EQ(error.GetError(), kErrorPlugin);
    EXPECT_STREQ(error.GetErrorString(), "bad radius");
    error.SetError(kErrorExecute);
    EXPECT_STREQ(error.GetErrorString(), "ULK_ERROR: Execute failed");
    error.SetError(kErrorPlugin);  // the plain record keeps its texts
    EXPECT_STREQ(error.GetErrorString(), "bad radius");

    error.SetPluginWarning("slow path");
    EXPECT_STREQ(error.GetErrorString(), "slow path");
    EXPECT_STREQ(error.mPluginError, "bad radius");

    error.SetSystemError("disk gone");
    EXPECT_EQ(error.GetError(), kErrorSystem);
    EXPECT_STREQ(error.GetErrorString(), "ULK_ERROR: OS System Error");
    error.SetError(kErrorOpenDLL);
    EXPECT_STREQ(error.GetErrorString(), "disk gone");

    error.ResetError();
    error.SetError(kErrorOpenDLL);
    EXPECT_STREQ(error.GetErrorString(), "ULK_ERROR: OS System Error");
    error.SetError(kErrorUnhandledException);
    EXPECT_STREQ(error.GetErrorString(), "ULK_ERROR: Unhandled Exception caught from plug-in");
    error.SetError(kErrorPluginWarning);
    EXPECT_STREQ(error.GetErrorString(), "ULK_WARNING: Plug-in Supplied Warning");
}

TEST(ErrorTest, TextsAreBoundedAndNullSafe) {
    ulkError error;
    const std::string longText(300, 'e');
    error.SetPluginError(longText.c_str());
    EXPECT_EQ(std::string(error.GetErrorString()), longText.substr(0, 255));
    error.SetPluginError(nullptr);
    EXPECT_STREQ(error.GetErrorString(), "");
    error.SetPluginWarning(nullptr);
    EXPECT_STREQ(error.mPluginWarning, "");
    error.SetSystemError(nullptr);
    EXPECT_STREQ(error.mSystemError, "");

    // A status outside the table still answers a text, never garbage.
    error.SetError(static_cast<ulkErrorStatus>(99));
    EXPECT_NE(error.GetErrorString(), nullptr);
    EXPECT_EQ(ulkError::GetMessage(99), nullptr);
    EXPECT_EQ(ulkError::GetMessage(-1), nullptr);
    EXPECT_STREQ(ulkError::GetMessage(22), "ULK_ERROR: NULL DLL Pathname");
}

TEST(ErrorTest, CopiesAreIndependent) {
    ulkError source;
    source.SetPluginError("first");
    ulkError copy;
    copy = source;
    source.SetPluginError("second");
    source.SetError(kErrorGeneric);
    EXPECT_EQ(copy.GetError(), kErrorPlugin);
    EXPECT_STREQ(copy.GetErrorString(), "first");
}

}  // namespace

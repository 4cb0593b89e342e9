#include "ulk/core/error.h"

#include "core/text.h"

namespace {

const char* const kMessages[ulkError::kStatusCount] = {
    "ULK_ERROR: No Error",
    "ULK_ERROR: Plug-in Supplied Error",
    "ULK_WARNING: Plug-in Supplied Warning",
    "ULK_ERROR: OS System Error",
    "ULK_ERROR: Generic ULK Error",
    "ULK_ERROR: Not Implemented",
    "ULK_ERROR: Not Supported",
    "ULK_ERROR: Out of memory",
    "ULK_ERROR: Object Creation Failed",
    "ULK_ERROR: Error while opening DLL",
    "ULK_ERROR: Null Callback Function",
    "ULK_ERROR: Required function not found",
    "ULK_ERROR: StartUp failed",
    "ULK_ERROR: DefineIdentity failed",
    "ULK_ERROR: DefineEffect failed",
    "ULK_ERROR: DefineParameters failed",
    "ULK_ERROR: NewInstance failed",
    "ULK_ERROR: PreProcess failed",
    "ULK_ERROR: Execute failed",
    "ULK_ERROR: ShowUIWindow failed",
    "ULK_ERROR: Illegal Method call",
    "ULK_ERROR: ULK Library Method called in invalid plug-in method",
    "ULK_ERROR: NULL DLL Pathname",
    "ULK_ERROR: Unhandled Exception caught from plug-in",
};

}  // namespace

const char* ulkError::GetMessage(int32_t status) {
    if (status < 0 || status >= kStatusCount) return nullptr;
    return kMessages[status];
}

void ulkError::ResetError() {
    mStatus = kErrorNone;
    ulk::CopyTerminated(mPluginError, kMessages[kErrorPlugin], kTextSize);
    ulk::CopyTerminated(mPluginWarning, kMessages[kErrorPluginWarning], kTextSize);
    ulk::CopyTerminated(mSystemError, kMessages[kErrorSystem], kTextSize);
}

void ulkError::SetPluginError(const char* text) {
    mStatus = kErrorPlugin;
    ulk::CopyTerminated(mPluginError, text, kTextSize);
}

void ulkError::SetPluginWarning(const char* text) {
    mStatus = kErrorPluginWarning;
    ulk::CopyTerminated(mPluginWarning, text, kTextSize);
}

void ulkError::SetSystemError(const char* text) {
    mStatus = kErrorSystem;
    ulk::CopyTerminated(mSystemError, text, kTextSize);
}

const char* ulkError::GetErrorString() const {
    switch (mStatus) {
        case kErrorPlugin: return mPluginError;
        case kErrorPluginWarning: return mPluginWarning;
        case kErrorOpenDLL: return mSystemError;
        default: {
            // A status outside the table (a host may store any value) has no
            // message of its own; the generic one stands in rather than null.
            const char* message = GetMessage(mStatus);
            return message ? message : kMessages[kErrorGeneric];
        }
    }
}

// ulkError: the error record of every host-side object that calls plug-in code.
//
// Operations report failure by their return value (false or null) and leave
// the reason here: a status code and, for plug-in errors, plug-in warnings and
// system errors, a text of at most 255 characters. The host reads the record
// after a failed call; a plug-in writes into it through its plug-in-side base
// (ulkModel_v1, ulkInstance_v1, ulkOverlay_v1). A record is a plain value that
// owns no memory; copying copies the status and all three texts.
#ifndef ULK_CORE_ERROR_H
#define ULK_CORE_ERROR_H

#include <cstdint>

#include "ulk/export.h"

/// Status codes of an error record; each has a fixed message (ulkError::GetMessage).
enum ulkErrorStatus : int32_t {
    kErrorNone = 0,
    kErrorPlugin = 1,
    kErrorPluginWarning = 2,
    kErrorSystem = 3,
    kErrorGeneric = 4,
    kErrorNotImplemented = 5,
    kErrorNotSupported = 6,
    kErrorOutOfMemory = 7,
    kErrorObjectCreation = 8,
    kErrorOpenDLL = 9,
    kErrorNullCallback = 10,
    kErrorFunctionNotFound = 11,
    kErrorStartUp = 12,
    kErrorDefineIdentity = 13,
    kErrorDefineEffect = 14,
    kErrorDefineParameters = 15,
    kErrorNewInstance = 16,
    kErrorPreProcess = 17,
    kErrorExecute = 18,
    kErrorShowUIWindow = 19,
    kErrorIllegalMethod = 20,
    kErrorInvalidPluginMethod = 21,
    kErrorNullDLLPathname = 22,
    kErrorUnhandledException = 23
};

class ULK_API ulkError {
public:
    /// Size of each text field, terminator included.
    static const int kTextSize = 256;
    /// Number of status codes with a message (0 to 23).
    static const int kStatusCount = 24;

    /// A record in the reset state.
    ulkError() { ResetError(); }

    /// Status kErrorNone; each text back to its code's fixed message.
    void ResetError();
    /// Sets the status only; the texts stay as they are.
    void SetError(ulkErrorStatus status) { mStatus = status; }
    /// Status kErrorPlugin with the plug-in's text (null stores an empty text).
    void SetPluginError(const char* text);
    /// Status kErrorPluginWarning with the plug-in's text (null stores an empty text).
    void SetPluginWarning(const char* text);
    /// Status kErrorSystem with a system text (null stores an empty text).
    void SetSystemError(const char* text);

    /// The current status.
    ulkErrorStatus GetError() const { return mStatus; }
    /// The text for the current status: the plug-in's error (1) or warning (2),
    /// the system text (9), otherwise the status's fixed message. Valid while
    /// the record lives and is not changed; never null.
    const char* GetErrorString() const;

    /// The fixed message of a status, or null outside 0 to 23.
    static const char* GetMessage(int32_t status);

    ulkErrorStatus mStatus;
    char mPluginError[kTextSize];
    char mPluginWarning[kTextSize];
    char mSystemError[kTextSize];
};

#endif  // ULK_CORE_ERROR_H

// The entry points a plug-in module exports, and what the library hands it.
//
// A plug-in module is a shared library that exports some of these C functions
// (all are optional) under exactly these names; mark each definition with
// ULK_PLUGIN_EXPORT:
//
//   ULK_PLUGIN_EXPORT bool ulkStartUp_v1(unsigned char* startUpArg);
//   ULK_PLUGIN_EXPORT void ulkShutDown_v1(void);
//   ULK_PLUGIN_EXPORT int ulkNumModels_v1(void);
//   ULK_PLUGIN_EXPORT void ulkSetAttribute(int zero, int32_t attribute, void* value, void* output8);
//   ULK_PLUGIN_EXPORT void ulkGetModelAttributes_v1ext(int zero, int32_t attribute, void* value);
//   ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex);
//   ULK_PLUGIN_EXPORT ulkOverlay_v1* ulkNewOverlay_v1(unsigned short modelIndex);
//
// Missing ones behave as: start-up succeeds, nothing is shut down, the module
// offers one model, attributes are not sent, no model or overlay can be made.
#ifndef ULK_MODULES_ENTRY_POINTS_H
#define ULK_MODULES_ENTRY_POINTS_H

#include <cstdint>

#include "ulk/export.h"

class ulkModel_v1;
class ulkOverlay_v1;

/// A record the host defines for its plug-ins; the library passes it on unread.
struct hostAppInfo;

/// Host attributes a plug-in can ask the host about through the callback it
/// receives as attribute 15. Only the host and the plug-in interpret them; any
/// 32-bit value may be passed.
enum ulkHostAttribute : int32_t {
    kHostAttributeNone = 0
};

/// The host's attribute callback: answers whether it filled the value.
typedef unsigned char (*ulkHostAttributeCallback)(ulkHostAttribute attribute, void* value);

/// Functions handed to a module as attributes 0 (render flag), 3 (optical-flow
/// mode) and 14 (play mode); each call reads the value of that moment.
typedef int32_t (*ulkModeFunction)(void);

// Types of the entry points, as the library calls them.
typedef bool (*ulkStartUpProc)(unsigned char* startUpArg);
typedef void (*ulkShutDownProc)(void);
typedef int (*ulkNumModelsProc)(void);
typedef void (*ulkSetAttributeProc)(int zero, int32_t attribute, void* value, void* output8);
typedef void (*ulkGetModelAttributesProc)(int zero, int32_t attribute, void* value);
typedef ulkModel_v1* (*ulkNewModelProc)(unsigned short modelIndex);
typedef ulkOverlay_v1* (*ulkNewOverlayProc)(unsigned short modelIndex);

/// Attribute numbers the library sends to modules.
enum ulkModuleAttribute : int32_t {
    kAttributeRenderFlagFunction = 0,   ///< ulkSetAttribute: ulkModeFunction
    kAttributeHostAppInfo = 1,          ///< ulkSetAttribute: hostAppInfo*
    kAttributeModelOpened = 2,          ///< ulkSetAttribute: null, once per model opened
    kAttributeOpticalFlowFunction = 3,  ///< ulkSetAttribute: ulkModeFunction
    kAttributePlayModeFunction = 14,    ///< ulkGetModelAttributes_v1ext: ulkModeFunction
    kAttributeHostCallback = 15         ///< ulkGetModelAttributes_v1ext: ulkHostAttributeCallback
};

/// Installs the process-wide host attribute callback that every later module
/// start-up hands to the module (null removes it).
ULK_API void InstallHostAttributeCallback(ulkHostAttributeCallback callback);

#endif  // ULK_MODULES_ENTRY_POINTS_H

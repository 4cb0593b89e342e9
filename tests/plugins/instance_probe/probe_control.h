// The control block of the instance_probe test module. The module exports
// ProbeGetControl(); a test sets what the probe's instance answers and reads
// back what the instance saw: the order of its calls, the render flag and the
// instance state at each, and what the host's services answered it.
#ifndef ULK_TESTS_PROBE_CONTROL_H
#define ULK_TESTS_PROBE_CONTROL_H

#include <cstdint>

#include "ulk/ulk.h"

/// Model indexes of the module.
enum ProbeModel {
    kProbeModel = 0,   // a filter driven by the control block
    kMinimalModel = 1  // a filter whose instance overrides only Execute
};

/// Host services the probe calls from its Execute and ShowUIWindow.
enum ProbeAction : uint32_t {
    kProbeDraw = 1u,      // DrawToVideoBuffer(buffer, 1, 2, 3)
    kProbeAbort = 2u,     // Aborted()
    kProbeAltFrame = 4u,  // GetAlternateFrame(3, 7, input 0, kFieldTwo)
    kProbeConsole = 8u,   // ConsolePrintf("100% done")
};

/// One call into the probe instance.
struct ProbeEvent {
    char call;           // 'P' PreProcess, 'E' Execute, 'O' PostProcess, 'U' ShowUIWindow,
                         // 'H' HasEffect, 'I' InPlace
    int32_t renderFlag;  // the render flag read through the module's attribute 0
    int32_t state;       // the host instance's ULKState::State
};

struct ProbeControl {
    // --- what the probe answers
    bool hasEffect = true;
    bool inPlace = false;
    bool preProcess = true;
    bool execute = true;
    bool executeThrows = false;
    bool showUI = true;
    bool showUIThrows = false;
    const char* executeError = nullptr;       // recorded with SetPluginError before answering
    const char* preProcessWarning = nullptr;  // recorded with SetPluginWarning before answering
    uint32_t actions = 0;                     // ProbeAction bits
    unsigned char fill = 0x5A;                // Execute writes this into every output sample

    // --- what the probe saw
    int numEvents = 0;
    ProbeEvent events[32] = {};
    ulkBounds bounds = {-1, -1, -1, -1};  // the last region handed to Execute or ShowUIWindow
    bool aborted = false;
    bool altFrame = false;
    int console = -1;
    unsigned char drawBuffer[4] = {9, 9, 9, 9};
};

typedef ProbeControl* (*ProbeGetControlProc)(void);
/// The render flag as the module reads it (attribute 0).
typedef int32_t (*ProbeRenderFlagProc)(void);

#endif  // ULK_TESTS_PROBE_CONTROL_H

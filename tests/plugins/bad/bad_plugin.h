// The bad plug-in corpus: one source built into several modules. The model
// index chooses which plug-in call misbehaves; compile definitions choose what
// a whole module gets wrong (start-up, missing factory, nonsense model count).
//
// Every plug-in object takes a block from its host's per-class allocator
// (model: in DefineIdentity, instance: in DefineParameters, overlay: in
// DefineOverlay) and gives it back in its destructor, so a host counting live
// blocks sees any plug-in object the library forgot to delete. Events the
// library cannot be asked about afterwards (the module's shut-down, a
// PostProcess after a throw) are reported through the host attribute callback.
#ifndef ULK_TESTS_BAD_PLUGIN_H
#define ULK_TESTS_BAD_PLUGIN_H

enum BadModel {
    kBadPlain = 0,               // a working filter with a scratch block everywhere
    kBadFactoryNull = 1,         // the factory answers null
    kBadFactoryThrows = 2,       // the factory throws an int
    kBadNoName = 3,              // DefineIdentity true without a name
    kBadNoType = 4,              // DefineIdentity true without a type
    kBadEffectFalse = 5,         // DefineEffect false after adding a format and an input
    kBadParamsThrow = 6,         // DefineParameters adds parameters, then throws an int
    kBadParamsFalse = 7,         // DefineParameters adds parameters, then answers false
    kBadExecuteThrowsInt = 8,    // Execute and ShowUIWindow throw an int
    kBadExecuteThrowsStd = 9,    // ... a std::runtime_error
    kBadExecuteThrowsText = 10,  // ... a const char*
    kBadPreProcessFalse = 11,    // PreProcess false
    kBadHasEffectThrows = 12,    // HasEffect throws a std::logic_error
    kBadOverlayNoMode = 13,      // an overlay whose DefineOverlay adds no mode
    kBadOverlayThrows = 14,      // an overlay whose DefineOverlay throws after adding a mode
    kBadModelCount = 15
};

// What HasEffect and DefineOverlay throw (std::logic_error's text).
#define BAD_HAS_EFFECT_TEXT "has-effect refuses"
#define BAD_OVERLAY_TEXT "overlay refuses"

// Host attribute numbers the modules report with; the value is null.
enum BadReport {
    kBadReportShutDown = 0x42414400,  // ulkShutDown_v1 ran
    kBadReportExecute = 0x42414401,   // the plug-in's Execute was entered
    kBadReportPreProcess = 0x42414402,
    kBadReportPostProcess = 0x42414403
};

// Extra export of every module that has a factory: live plug-in objects.
typedef int (*BadLiveObjectsProc)(void);

#endif  // ULK_TESTS_BAD_PLUGIN_H

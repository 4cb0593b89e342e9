// The record of the param_probe test module: its "Levels" filter scales the
// colour of RGBA pixels by a keyframed gain, and records what its parameter
// variables held at each Execute.
#ifndef ULK_TESTS_PARAM_PROBE_H
#define ULK_TESTS_PARAM_PROBE_H

#include "ulk/ulk.h"

/// The plug-in variables the parameters write into.
struct LevelsValues {
    double gain;       // "gain": real number 0 to 4, default 1
    int steps;         // "steps": integer number 0 to 10, in group "advanced"
    bool enabled;      // "enabled": boolean, in group "advanced"
    ulkColorRGB tint;  // "tint": RGB colour
};

struct ParamProbeRecord {
    int executes = 0;
    LevelsValues seen[16] = {};         // the variables at each Execute
    ulkParameter* secondAdd = nullptr;  // what adding "gain" a second time answered
    int updates = 0;                    // calls of the update-params callback
    ulkInstance_v1* updated = nullptr;  // the instance it was called with
    LevelsValues* live = nullptr;       // the variables of the newest instance
};

typedef ParamProbeRecord* (*ParamProbeRecordProc)(void);

#endif  // ULK_TESTS_PARAM_PROBE_H

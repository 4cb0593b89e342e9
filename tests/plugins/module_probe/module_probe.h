// What the module_probe test plug-ins record about the calls they receive.
// The test passes a ModuleProbe as the start-up argument; the module keeps
// the pointer and writes into it until it is unloaded.
#ifndef ULK_TEST_MODULE_PROBE_H
#define ULK_TEST_MODULE_PROBE_H

#include <cstdint>

struct ModuleProbe {
    // What the module answers.
    bool startUpResult = true;
    int numModels = 1;

    // What it received.
    int startUps = 0;
    int shutDowns = 0;
    int numModelsCalls = 0;
    int attributes[16] = {};
    int attributeCount = 0;
    int32_t (*renderFlag)() = nullptr;
    int32_t (*opticalFlow)() = nullptr;
    int32_t (*playMode)() = nullptr;
    void* hostInfo = nullptr;
    void* hostCallback = nullptr;
};

#endif  // ULK_TEST_MODULE_PROBE_H

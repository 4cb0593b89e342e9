// A module with every start-up entry point; it records what it receives in
// the ModuleProbe given as its start-up argument.
#include <cstdint>

#include "module_probe.h"
#include "ulk/export.h"

namespace {
ModuleProbe* gProbe = nullptr;

void Record(int32_t attribute) {
    if (gProbe && gProbe->attributeCount < 16) gProbe->attributes[gProbe->attributeCount++] = attribute;
}
}  // namespace

ULK_PLUGIN_EXPORT bool ulkStartUp_v1(unsigned char* startUpArg) {
    gProbe = reinterpret_cast<ModuleProbe*>(startUpArg);
    if (!gProbe) return true;
    ++gProbe->startUps;
    return gProbe->startUpResult;
}

ULK_PLUGIN_EXPORT void ulkShutDown_v1(void) {
    if (gProbe) ++gProbe->shutDowns;
}

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    if (!gProbe) return 1;
    ++gProbe->numModelsCalls;
    return gProbe->numModels;
}

ULK_PLUGIN_EXPORT void ulkSetAttribute(int, int32_t attribute, void* value, void* output8) {
    Record(attribute);
    if (!gProbe) return;
    if (output8) static_cast<unsigned char*>(output8)[7] = 0;  // the 8 bytes are writable
    if (attribute == 0) gProbe->renderFlag = reinterpret_cast<int32_t (*)()>(value);
    if (attribute == 1) gProbe->hostInfo = value;
    if (attribute == 3) gProbe->opticalFlow = reinterpret_cast<int32_t (*)()>(value);
}

ULK_PLUGIN_EXPORT void ulkGetModelAttributes_v1ext(int, int32_t attribute, void* value) {
    Record(attribute);
    if (!gProbe) return;
    if (attribute == 14) gProbe->playMode = reinterpret_cast<int32_t (*)()>(value);
    if (attribute == 15) gProbe->hostCallback = value;
}

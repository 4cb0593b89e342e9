// The process-wide modes as the library reads and writes them internally.
// Relaxed atomics: separate instances may render on separate threads without
// a data race; nothing orders other memory by them.
#ifndef ULK_SRC_CORE_PROCESS_MODES_H
#define ULK_SRC_CORE_PROCESS_MODES_H

#include <cstdint>

namespace ulk {

int32_t GetRenderFlag();
void SetRenderFlag(int32_t flag);
int32_t GetOpticalFlowMode();
int32_t GetPlayModeValue();

// GetRenderFlag, GetOpticalFlowMode and GetPlayModeValue are also the
// functions handed to modules at start-up (attributes 0, 3 and 14): they read
// the value of the moment on every call.

}  // namespace ulk

#endif  // ULK_SRC_CORE_PROCESS_MODES_H

#include "core/process_modes.h"

#include <atomic>

#include "ulk/core/host_global.h"

namespace {

std::atomic<int32_t> gPlayMode{1};
std::atomic<int32_t> gOpticalFlowMode{1};
std::atomic<int32_t> gRenderFlag{1};

}  // namespace

void ulkSetPlayMode(ulkPlayMode mode) {
    gPlayMode.store(mode, std::memory_order_relaxed);
}

ulkPlayMode ulkGetPlayMode() {
    return static_cast<ulkPlayMode>(gPlayMode.load(std::memory_order_relaxed));
}

void ULKSetOpticalFlowMode(int32_t mode) {
    gOpticalFlowMode.store(mode, std::memory_order_relaxed);
}

namespace ulk {

int32_t GetRenderFlag() {
    return gRenderFlag.load(std::memory_order_relaxed);
}

void SetRenderFlag(int32_t flag) {
    gRenderFlag.store(flag, std::memory_order_relaxed);
}

int32_t GetOpticalFlowMode() {
    return gOpticalFlowMode.load(std::memory_order_relaxed);
}

int32_t GetPlayModeValue() {
    return gPlayMode.load(std::memory_order_relaxed);
}

}  // namespace ulk

// The render context of ulkHostInstance, its instance-data copy and the host
// callbacks a plug-in instance reaches through it.
#include <cmath>
#include <cstring>
#include <limits>
#include <new>

#include "core/class_memory.h"
#include "ulk/instance/host_instance.h"
#include "ulk/model/host_model.h"

ulkAllocCallback ulkHostInstance::mAllocCallback = nullptr;
ulkFreeCallback ulkHostInstance::mFreeCallback = nullptr;
ulkConsoleCallback ulkHostInstance::mConsoleCallback = nullptr;
ulkDrawVideoCallback ulkHostInstance::mDrawVideoCallback = nullptr;
ulkDisplayWaitCallback ulkHostInstance::mDisplayWaitCallback = nullptr;
ulkAltFrameCallback ulkHostInstance::mAltFrameCallback = nullptr;
ulkAltFrameSizeCallback ulkHostInstance::mAltFrameSizeCallback = nullptr;

namespace {

// Truncation toward zero to a signed 32-bit value; values beyond the range
// (or not finite) saturate instead of being undefined.
int32_t TruncToInt32(double value) {
    if (std::isnan(value)) return 0;
    if (value >= static_cast<double>(std::numeric_limits<int32_t>::max()))
        return std::numeric_limits<int32_t>::max();
    if (value <= static_cast<double>(std::numeric_limits<int32_t>::min()))
        return std::numeric_limits<int32_t>::min();
    return static_cast<int32_t>(value);
}

}  // namespace

// ------------------------------------------------------------------ time

double ulkHostInstance::GetTime() const {
    // Frames, or two fields per frame for interlaced video. 64-bit arithmetic
    // gives the 32-bit results for every frame count a clip can have.
    const int64_t perFrame = mVideoType == 0 ? 1 : 2;
    int64_t span = (static_cast<int64_t>(mTotalFrames) - 1) * perFrame;
    int64_t position = static_cast<int64_t>(mCurrentFrame) * perFrame;
    if (perFrame == 2) {
        // The second field lies half a frame later, unless both fields share the frame.
        if (!mSegmentedFrames && mFieldDominance != mField) position += 1;
        span += 1;
    }
    const double t = span > 0 ? static_cast<double>(position) / static_cast<double>(span) : 0.0;
    // Quantised as key times are, so a key set at this time is found again.
    return std::trunc(t * 100000000.0) / 100000000.0;
}

void ulkHostInstance::SetTime(double t) {
    mCurrentFrame = TruncToInt32(static_cast<double>(mTotalFrames) * t);
}

// ------------------------------------------------------------------ platform record

void ulkHostInstance::SetPlatformUIInfo(ulkPlatformUIInfo* info) {
    mPlatformUIInfo = info;
    mHasPlatformUIInfo = info != nullptr;
}

void ulkHostInstance::GetPlatformUIInfo(ulkPlatformUIInfo* out) const {
    if (!out || !mHasPlatformUIInfo || !mPlatformUIInfo) return;
    std::memcpy(out, mPlatformUIInfo, sizeof(ulkPlatformUIInfo));
}

// ------------------------------------------------------------------ instance data

bool ulkHostInstance::SetInstanceData(void* data, size_t size) {
    if (data && mInstanceData && mInstanceDataSize == size) {
        // Same size: the held buffer is reused (data may even be that buffer).
        std::memmove(mInstanceData, data, size);
        return true;
    }
    FreeInstanceData();
    if (!data) return true;

    unsigned char* copy = new (std::nothrow) unsigned char[size > 0 ? size : 1];
    if (!copy) return false;
    std::memcpy(copy, data, size);
    mInstanceData = copy;
    mInstanceDataSize = size;
    return true;
}

const void* ulkHostInstance::GetInstanceData(size_t* size) const {
    if (!size) return nullptr;
    *size = static_cast<size_t>(mInstanceDataSize);
    return mInstanceData;
}

void ulkHostInstance::FreeInstanceData() {
    delete[] mInstanceData;
    mInstanceData = nullptr;
    mInstanceDataSize = 0;
}

// ------------------------------------------------------------------ services for the plug-in

void* ulkHostInstance::AllocMem(size_t size) {
    ResetError();
    return ulk::AllocReporting(mAllocCallback, size, mError);
}

void ulkHostInstance::FreeMem(void* p) {
    ResetError();
    ulk::FreeReporting(mFreeCallback, p, mError);
}

int ulkHostInstance::ConsolePrintf(const char* text) {
    mHostModel->SetDown();
    // The plug-in's text is data: a '%' in it is printed, never interpreted.
    const int result = mConsoleCallback ? mConsoleCallback("%s", text ? text : "") : 0;
    mHostModel->SetUp();
    return result;
}

void ulkHostInstance::DisplayWait(int32_t value) {
    ResetError();
    mHostModel->SetDown();
    if (mDisplayWaitCallback) mDisplayWaitCallback(value);
    mHostModel->SetUp();
}

void ulkHostInstance::DrawToVideoBuffer(unsigned char* buffer, int32_t a, int32_t b, int32_t c) {
    ResetError();
    mHostModel->SetDown();
    if (mDrawAllowed && mDrawVideoCallback) mDrawVideoCallback(buffer, a, b, c);
    mHostModel->SetUp();
}

bool ulkHostInstance::GetAlternateFrame(unsigned short a, unsigned short b, ulkField field,
                                        ulkImage* image) {
    if (!mAltFrameCallback) {
        mError.SetError(kErrorNullCallback);
        return false;
    }
    return mAltFrameCallback(this, a, b, field, image);
}

size_t ulkHostInstance::GetAlternateFrameSize(ulkField field, size_t* first, size_t* second) {
    if (!mAltFrameSizeCallback) {
        mError.SetError(kErrorNullCallback);
        return 0;
    }
    return mAltFrameSizeCallback(this, field, first, second);
}

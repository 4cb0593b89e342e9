// A small host for the sample plug-in tests: it installs the services a host
// installs before opening modules, opens a sample's model and one instance,
// and holds images over its own pixel memory, with padded rows, so that the
// tests see exactly what a plug-in wrote and where.
#ifndef ULK_TESTS_SAMPLES_SAMPLE_HOST_H
#define ULK_TESTS_SAMPLES_SAMPLE_HOST_H

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "test_paths.h"
#include "ulk/ulk.h"

/// R, G, B, A sample values, whatever the order in memory.
using Rgba = std::array<int, 4>;

/// Byte position of R, G, B and A inside a pixel, written out by hand for the
/// formats the samples accept (not asked of the library under test).
inline std::array<int, 4> OrderOf(ulkImgFormat format) {
    switch (format) {
        case kImgFormatBGRA:
            return {2, 1, 0, 3};
        case kImgFormatARGB:
            return {1, 2, 3, 0};
        default:
            return {0, 1, 2, 3};  // RGBA
    }
}

/// An image over memory of its own: rows of width pixels plus `padding` bytes
/// filled with a marker that no plug-in may overwrite.
class HostImage {
  public:
    static constexpr unsigned char kPadMarker = 0xA5;

    HostImage(ulkImgFormat format, int width, int height, int bits = 8, int padding = 0)
        : mFormat(format),
          mWidth(width),
          mHeight(height),
          mBytes(bits / 8),
          mRowDelta(width * 4 * (bits / 8) + padding),
          mPixels(static_cast<size_t>(mRowDelta) * height, kPadMarker),
          mImage(ulkImage::New()) {
        ulkImageFormat description;
        description.SetFormat(format);
        description.SetBitDepth(bits);
        mImage->SetFormat(&description);
        mImage->SetSize(width, height);
        mImage->SetRowDelta(mRowDelta);
        mImage->SetData(mPixels.data());
        Fill({0, 0, 0, 0});
    }
    ~HostImage() { ulkImage::Delete(mImage); }
    HostImage(const HostImage&) = delete;
    HostImage& operator=(const HostImage&) = delete;

    ulkImage* get() const { return mImage; }
    int width() const { return mWidth; }
    int height() const { return mHeight; }
    int maxValue() const { return mBytes == 1 ? 255 : 65535; }

    Rgba Get(int x, int y) const {
        Rgba value;
        const auto order = OrderOf(mFormat);
        for (int c = 0; c < 4; ++c) value[c] = Sample(x, y, order[c]);
        return value;
    }
    void Put(int x, int y, const Rgba& value) {
        const auto order = OrderOf(mFormat);
        for (int c = 0; c < 4; ++c) SetSample(x, y, order[c], value[c]);
    }
    void Fill(const Rgba& value) {
        for (int y = 0; y < mHeight; ++y)
            for (int x = 0; x < mWidth; ++x) Put(x, y, value);
    }
    /// True when every padding byte still holds the marker.
    bool PaddingIntact() const {
        const size_t used = static_cast<size_t>(mWidth) * 4 * mBytes;
        for (int y = 0; y < mHeight; ++y)
            for (size_t i = used; i < static_cast<size_t>(mRowDelta); ++i)
                if (mPixels[static_cast<size_t>(y) * mRowDelta + i] != kPadMarker) return false;
        return true;
    }

  private:
    size_t Offset(int x, int y, int sample) const {
        return static_cast<size_t>(y) * mRowDelta + (static_cast<size_t>(x) * 4 + sample) * mBytes;
    }
    int Sample(int x, int y, int sample) const {
        const unsigned char* p = &mPixels[Offset(x, y, sample)];
        if (mBytes == 1) return *p;
        uint16_t v;
        std::memcpy(&v, p, 2);
        return v;
    }
    void SetSample(int x, int y, int sample, int value) {
        unsigned char* p = &mPixels[Offset(x, y, sample)];
        if (mBytes == 1) {
            *p = static_cast<unsigned char>(value);
        } else {
            const uint16_t v = static_cast<uint16_t>(value);
            std::memcpy(p, &v, 2);
        }
    }

    ulkImgFormat mFormat;
    int mWidth, mHeight, mBytes, mRowDelta;
    std::vector<unsigned char> mPixels;
    ulkImage* mImage;
};

/// One opened sample model and one instance of it, closed again on destruction.
class SampleEffect {
  public:
    explicit SampleEffect(const std::string& name) : mModel(0) {
        mOpened = mModel.Open(SamplePluginPath(name).c_str(), 0, nullptr);
        if (mOpened) mInstance = mModel.NewInstance();
        if (mInstance) {
            mInstance->SetVideoType(kVideoTypeProgressive);
            mInstance->SetTotalFrames(1);
            mInstance->SetCurrentFrame(0);
        }
    }
    ~SampleEffect() {
        if (mInstance) mModel.DeleteInstance(mInstance);
        mModel.Close();
    }
    SampleEffect(const SampleEffect&) = delete;
    SampleEffect& operator=(const SampleEffect&) = delete;

    bool ok() const { return mOpened && mInstance != nullptr; }
    ulkHostModel& model() { return mModel; }
    ulkHostInstance* instance() const { return mInstance; }

    template <typename Kind>
    Kind* Param(const char* id) const {
        return dynamic_cast<Kind*>(mInstance->FindParameter(id));
    }

    /// Sets the frame being rendered out of `frames` (the parameters' time follows).
    void SetFrame(int frame, int frames) {
        mInstance->SetTotalFrames(frames);
        mInstance->SetCurrentFrame(frame);
    }

    /// Runs a filter from `in` to `out` over the whole output.
    bool Run(HostImage& in, HostImage& out) {
        return mInstance->SetInput(0, in.get()) && mInstance->SetOutput(0, out.get()) &&
               mInstance->Execute(nullptr);
    }

  private:
    ulkHostModel mModel;
    bool mOpened = false;
    ulkHostInstance* mInstance = nullptr;
};

/// Installs the host services for each test and puts the process-wide ones back.
class SampleTest : public ::testing::Test {
  protected:
    void SetUp() override {
        mSavedMaxDLLs = ulkDLLMaker::mMaxDLLs;
        ulkDLLMaker::SetActiveDLLs(4);  // a test may hold several samples at once
        ulkHostModel::SetAllocCallback(&std::malloc);
        ulkHostModel::SetFreeCallback(&std::free);
        ulkHostInstance::SetAllocCallback(&std::malloc);
        ulkHostInstance::SetFreeCallback(&std::free);
        ulkHostOverlay::SetAllocCallback(&std::malloc);
        ulkHostOverlay::SetFreeCallback(&std::free);
    }
    void TearDown() override {
        ulkHostModel::SetAllocCallback(nullptr);
        ulkHostModel::SetFreeCallback(nullptr);
        ulkHostInstance::SetAllocCallback(nullptr);
        ulkHostInstance::SetFreeCallback(nullptr);
        ulkHostOverlay::SetAllocCallback(nullptr);
        ulkHostOverlay::SetFreeCallback(nullptr);
        ulkDLLMaker::SetActiveDLLs(mSavedMaxDLLs);
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);  // every model was closed
    }

  private:
    int16_t mSavedMaxDLLs = 1;
};

/// The formats every sample accepts, for parameterised tests.
const ulkImgFormat kSampleFormats[] = {kImgFormatRGBA, kImgFormatBGRA, kImgFormatARGB};

#endif  // ULK_TESTS_SAMPLES_SAMPLE_HOST_H

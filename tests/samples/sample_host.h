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
#include <initializer_list>
#include <memory>
#include <string>
#include <utility>
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
    ulkImgFormat format() const { return mFormat; }
    unsigned char* data() { return mPixels.data(); }
    int width() const { return mWidth; }
    int height() const { return mHeight; }

    Rgba Get(int x, int y) const {
        Rgba value;
        for (int c = 0; c < 4; ++c) {
            uint16_t v = mPixels[Offset(x, y, c)];
            if (mBytes == 2) std::memcpy(&v, &mPixels[Offset(x, y, c)], 2);
            value[c] = v;
        }
        return value;
    }
    void Put(int x, int y, const Rgba& value) {
        for (int c = 0; c < 4; ++c) {
            const uint16_t v = static_cast<uint16_t>(value[c]);
            if (mBytes == 2) std::memcpy(&mPixels[Offset(x, y, c)], &v, 2);
            if (mBytes == 1) mPixels[Offset(x, y, c)] = static_cast<unsigned char>(v);
        }
    }
    /// Puts pixel(x, y) everywhere.
    template <typename Pixel>
    void Paint(Pixel pixel) {
        for (int y = 0; y < mHeight; ++y)
            for (int x = 0; x < mWidth; ++x) Put(x, y, pixel(x, y));
    }
    void Fill(const Rgba& value) {
        Paint([&](int, int) { return value; });
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
    /// Where channel c (0: R, 1: G, 2: B, 3: A) of pixel (x, y) lies.
    size_t Offset(int x, int y, int c) const {
        return static_cast<size_t>(y) * mRowDelta +
               (static_cast<size_t>(x) * 4 + OrderOf(mFormat)[c]) * mBytes;
    }

    ulkImgFormat mFormat;
    int mWidth, mHeight, mBytes, mRowDelta;
    std::vector<unsigned char> mPixels;
    ulkImage* mImage;
};

/// One opened sample model and one instance of it, closed again on destruction.
class SampleEffect {
  public:
    explicit SampleEffect(const std::string& name) : SampleEffect(SamplePluginPath(name), 0) {}
    /// Model `number` of the module at path.
    SampleEffect(const std::string& path, short number) : mModel(number) {
        mOpened = mModel.Open(path.c_str(), 0, nullptr);
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

    /// Sets parameters from their text, as a host's settings would.
    bool Set(std::initializer_list<std::pair<const char*, const char*>> settings) {
        for (const auto& [id, text] : settings) {
            ulkParameter* param = mInstance->FindParameter(id);
            if (!param || !param->ParseValue(0.0, text)) return false;
        }
        return true;
    }
    bool Set(const char* id, const char* text) { return Set({{id, text}}); }

    /// Runs the effect from the inputs into out over region (null: the whole output).
    bool Run(const std::vector<HostImage*>& inputs, HostImage& out,
             const ulkBounds* region = nullptr) {
        for (size_t i = 0; i < inputs.size(); ++i)
            if (!mInstance->SetInput(static_cast<int>(i), inputs[i]->get())) return false;
        return mInstance->SetOutput(0, out.get()) && mInstance->Execute(region);
    }
    bool Run(HostImage& in, HostImage& out) { return Run({&in}, out); }

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
        Install(&std::malloc, &std::free);
    }
    void TearDown() override {
        Install(nullptr, nullptr);
        ulkDLLMaker::SetActiveDLLs(mSavedMaxDLLs);
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);  // every model was closed
    }

  private:
    static void Install(ulkAllocCallback alloc, ulkFreeCallback release) {
        ulkHostModel::SetAllocCallback(alloc);
        ulkHostModel::SetFreeCallback(release);
        ulkHostInstance::SetAllocCallback(alloc);
        ulkHostInstance::SetFreeCallback(release);
        ulkHostOverlay::SetAllocCallback(alloc);
        ulkHostOverlay::SetFreeCallback(release);
    }
    int16_t mSavedMaxDLLs = 1;
};

/// Checks every pixel of image against expected(x, y), stopping at the first
/// difference, and that no padding byte was written.
template <typename Expected>
void ExpectPixels(const HostImage& image, Expected expected) {
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
            ASSERT_EQ(image.Get(x, y), Rgba(expected(x, y))) << "at " << x << "," << y;
    EXPECT_TRUE(image.PaddingIntact());
}

/// The formats every sample accepts, for parameterised tests.
const ulkImgFormat kSampleFormats[] = {kImgFormatRGBA, kImgFormatBGRA, kImgFormatARGB};

#endif  // ULK_TESTS_SAMPLES_SAMPLE_HOST_H

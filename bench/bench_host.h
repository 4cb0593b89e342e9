// What every benchmark host sets up: the host services a host installs before
// it opens modules, the benchmark module's models, one opened effect with one
// instance, RGBA images over memory of their own, and animated parameters.
#ifndef ULK_BENCH_BENCH_HOST_H
#define ULK_BENCH_BENCH_HOST_H

#include <cstdlib>
#include <string>

#include "ulk/ulk.h"

namespace ulk_bench {

/// The models of bench/plugins/bench_effect.
enum BenchModel : short {
    kModelNull = 0,    ///< no parameters, touches no pixel
    kModelNull32 = 1,  ///< 32 real numbers p0..p31, touches no pixel
    kModelPass32 = 2,  ///< the same 32 numbers, copies its input to its output
};

/// The benchmark module in the build tree.
inline std::string BenchPluginPath() {
    return ULK_BENCH_PLUGIN_DIR "/bench_effect.so";
}

/// Installs the per-class memory callbacks and lets the registry hold
/// maxModules modules at once. Call before opening anything.
inline void InstallHostServices(short maxModules = 4) {
    ulkHostGlobal::SetAllocCallback(&std::malloc);
    ulkHostGlobal::SetFreeCallback(&std::free);
    ulkHostModel::SetAllocCallback(&std::malloc);
    ulkHostModel::SetFreeCallback(&std::free);
    ulkHostInstance::SetAllocCallback(&std::malloc);
    ulkHostInstance::SetFreeCallback(&std::free);
    ulkHostOverlay::SetAllocCallback(&std::malloc);
    ulkHostOverlay::SetFreeCallback(&std::free);
    if (ulkDLLMaker::mMaxDLLs < maxModules) ulkDLLMaker::SetActiveDLLs(maxModules);
}

/// An RGBA 8-bit image over 64-byte aligned memory of its own, tight rows.
class Image {
  public:
    Image(int width, int height)
        : mBytes(static_cast<size_t>(width) * height * 4),
          mPixels(static_cast<unsigned char*>(std::aligned_alloc(64, (mBytes + 63) / 64 * 64))),
          mImage(ulkImage::New()) {
        for (size_t i = 0; i < mBytes; ++i) mPixels[i] = static_cast<unsigned char>(i * 7);
        ulkImageFormat format;
        format.SetFormat(kImgFormatRGBA);
        format.SetBitDepth(8);
        mImage->SetFormat(&format);
        mImage->SetSize(width, height);
        mImage->SetData(mPixels);
    }
    ~Image() {
        ulkImage::Delete(mImage);
        std::free(mPixels);
    }
    Image(const Image&) = delete;
    Image& operator=(const Image&) = delete;

    ulkImage* get() const { return mImage; }
    unsigned char* pixels() const { return mPixels; }
    size_t bytes() const { return mBytes; }

  private:
    size_t mBytes;
    unsigned char* mPixels;
    ulkImage* mImage;
};

/// One opened model of a module and one instance of it, with a 1x1 input and
/// output, closed again on destruction.
class Effect {
  public:
    Effect(const std::string& path, short modelIndex) : mModel(modelIndex), mIn(1, 1), mOut(1, 1) {
        if (mModel.Open(path.c_str(), 0, nullptr)) mInstance = mModel.NewInstance();
        if (!mInstance) return;
        mInstance->SetVideoType(kVideoTypeProgressive);
        mInstance->SetFrameRate(25.0);
        mInstance->SetTotalFrames(1);
        mInstance->SetInput(0, mIn.get());
        mInstance->SetOutput(0, mOut.get());
    }
    ~Effect() {
        if (mInstance) mModel.DeleteInstance(mInstance);
        mModel.Close();
    }
    Effect(const Effect&) = delete;
    Effect& operator=(const Effect&) = delete;

    bool ok() const { return mInstance != nullptr; }
    ulkHostInstance* instance() const { return mInstance; }

  private:
    ulkHostModel mModel;
    Image mIn, mOut;
    ulkHostInstance* mInstance = nullptr;
};

/// Gives each real-number parameter of the instance keys at `keys` evenly
/// spread times from 0 to 1 with alternating values, so that evaluation
/// between them interpolates. Answers how many parameters were animated.
inline int AnimateNumbers(ulkHostInstance* instance, int keys) {
    int animated = 0;
    for (int i = 0; i < instance->GetNumParameters(); ++i) {
        auto* number = dynamic_cast<ulkPNumber*>(instance->GetParameter(i));
        if (!number) continue;
        for (int k = 0; k < keys; ++k)
            number->SetValue(keys > 1 ? double(k) / (keys - 1) : 0.0, k % 2 ? 10.0 + i : -10.0);
        ++animated;
    }
    return animated;
}

}  // namespace ulk_bench

#endif  // ULK_BENCH_BENCH_HOST_H

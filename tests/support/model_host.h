// A small host for the model and instance suites: it installs the services a
// host installs before it opens models, lets a test hold several modules and
// puts every process-wide setting back afterwards; plus 8-bit images that own
// their pixels for the length of a test.
#ifndef ULK_TESTS_MODEL_HOST_H
#define ULK_TESTS_MODEL_HOST_H

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "test_paths.h"
#include "ulk/ulk.h"

class ModelHostTest : public ::testing::Test {
  protected:
    void SetUp() override {
        mSavedMaxDLLs = ulkDLLMaker::mMaxDLLs;
        mSavedCloseMode = ulkDLLMaker::mCloseMode;
        mSavedPlayMode = ulkGetPlayMode();
        ulkDLLMaker::SetActiveDLLs(4);
        ulkDLLMaker::SetDefaultCloseMode(kCloseNow);
        ulkHostModel::SetAllocCallback(&std::malloc);
        ulkHostModel::SetFreeCallback(&std::free);
    }

    void TearDown() override {
        ulkHostModel::SetAllocCallback(nullptr);
        ulkHostModel::SetFreeCallback(nullptr);
        ulkHostInstance::SetAllocCallback(nullptr);
        ulkHostInstance::SetFreeCallback(nullptr);
        ulkHostInstance::SetConsoleCallback(nullptr);
        ulkHostInstance::SetDrawVideoCallback(nullptr);
        ulkHostInstance::SetDisplayWaitCallback(nullptr);
        ulkHostInstance::SetAltFrameCallback(nullptr);
        ulkHostInstance::SetAltFrameSizeCallback(nullptr);
        ulkSetPlayMode(mSavedPlayMode);
        ulkDLLMaker::SetDefaultCloseMode(mSavedCloseMode);
        ulkDLLMaker::SetActiveDLLs(mSavedMaxDLLs);
        // Every test closes what it opened: no module outlives it.
        EXPECT_EQ(ulkDLLMaker::GetNumLoaded(), 0);
    }

    /// An exported extra of the model's module (a test hook), or null.
    template <typename Proc>
    static Proc ModuleSymbol(const ulkHostModel& model, const char* name) {
        if (!model.GetDLL()) return nullptr;
        return reinterpret_cast<Proc>(const_cast<void*>(model.GetDLL()->GetSymbol(name)));
    }

  private:
    int16_t mSavedMaxDLLs = 1;
    ulkCloseMode_t mSavedCloseMode = kCloseNow;
    ulkPlayMode mSavedPlayMode = kPlayModePlay;
};

/// An 8-bit image of the given format with a buffer of its own.
class TestImage {
  public:
    TestImage(ulkImgFormat format, int width, int height) : mImage(ulkImage::New()) {
        ulkImageFormat description;
        description.SetFormat(format);
        description.SetBitDepth(8);
        mImage->SetFormat(&description);
        mImage->SetSize(width, height);
        mBuffer = static_cast<unsigned char*>(mImage->CreateBuffer());
    }
    ~TestImage() {
        mImage->FreeBuffer(mBuffer);
        ulkImage::Delete(mImage);
    }
    TestImage(const TestImage&) = delete;
    TestImage& operator=(const TestImage&) = delete;

    ulkImage* get() const { return mImage; }
    unsigned char* bytes() const { return mBuffer; }
    size_t size() const {
        return static_cast<size_t>(mImage->GetRowDelta(0)) *
               static_cast<size_t>(mImage->GetHeight());
    }
    /// Fills byte i with seed + 7 i (mod 256): every byte differs from its neighbours.
    void FillPattern(int seed) {
        for (size_t i = 0; i < size(); ++i) mBuffer[i] = static_cast<unsigned char>(seed + 7 * i);
    }
    void Fill(unsigned char value) { std::memset(mBuffer, value, size()); }
    std::vector<unsigned char> Bytes() const {
        return std::vector<unsigned char>(mBuffer, mBuffer + size());
    }

  private:
    ulkImage* mImage;
    unsigned char* mBuffer = nullptr;
};

#endif  // ULK_TESTS_MODEL_HOST_H

// Reads typed values off the front of a fuzzer's input; past its end every value is 0.
#ifndef ULK_FUZZ_INPUT_H
#define ULK_FUZZ_INPUT_H

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

class FuzzInput {
  public:
    FuzzInput(const uint8_t* data, size_t size) : mData(data), mSize(size) {}

    template <typename T>
    T Take() {
        T value{};
        const size_t n = sizeof(T) < mSize ? sizeof(T) : mSize;
        std::memcpy(&value, mData, n);
        mData += n;
        mSize -= n;
        return value;
    }
    /// The next text, up to a NUL byte or the end.
    std::string TakeText() {
        const void* nul = std::memchr(mData, 0, mSize);
        const size_t n =
            nul ? static_cast<size_t>(static_cast<const uint8_t*>(nul) - mData) : mSize;
        std::string text(reinterpret_cast<const char*>(mData), n);
        const size_t used = nul ? n + 1 : n;
        mData += used;
        mSize -= used;
        return text;
    }
    size_t Remaining() const { return mSize; }

  private:
    const uint8_t* mData;
    size_t mSize;
};

#endif  // ULK_FUZZ_INPUT_H

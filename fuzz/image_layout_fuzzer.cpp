// Image layout arithmetic: format code, bit depth, size and row delta from fuzz bytes, then
// CreateBuffer, a sample written through every pointer GetPixelPtr gives at the corners (a
// row's pointer must be its first pixel's), a Copy between two such images, FreeBuffer.
// AddressSanitizer reports any pointer the library computes outside its own buffer.
#include <cstdint>
#include <cstdlib>

#include "fuzz_input.h"
#include "ulk/ulk.h"

namespace {

// Sides up to 255 pixels: enough for every rounding case, small enough to stay fast.
struct Shape {
    int32_t format;
    int32_t bits;
    int width;
    int height;
    bool hasRowDelta;
    int32_t rowDelta;
};

Shape TakeShape(FuzzInput& input) {
    Shape shape;
    shape.format = input.Take<int8_t>();
    const uint8_t depth = input.Take<uint8_t>();
    shape.bits = depth < 200 ? 8 << (depth % 3) : depth - 200;  // mostly 8, 16, 32
    shape.width = input.Take<int16_t>() % 256;
    shape.height = input.Take<int16_t>() % 256;
    const uint8_t flags = input.Take<uint8_t>();
    shape.hasRowDelta = flags & 1;
    shape.rowDelta = input.Take<int16_t>();
    if (flags & 2) shape.rowDelta *= 16;  // rows far apart
    return shape;
}

class FuzzImage {
  public:
    explicit FuzzImage(const Shape& shape) : mImage(ulkImage::New()) {
        if (!mImage) return;
        ulkImageFormat format;
        format.SetFormat(static_cast<ulkImgFormat>(shape.format));
        format.SetBitDepth(shape.bits);
        mImage->SetFormat(&format);
        mImage->SetSize(shape.width, shape.height);
        if (shape.hasRowDelta) mImage->SetRowDelta(shape.rowDelta);
        mBuffer = mImage->CreateBuffer();
    }
    ~FuzzImage() {
        if (!mImage) return;
        mImage->FreeBuffer(mBuffer);
        ulkImage::Delete(mImage);
    }
    FuzzImage(const FuzzImage&) = delete;
    FuzzImage& operator=(const FuzzImage&) = delete;

    ulkImage* get() const { return mImage; }
    bool HasData() const { return mImage && mBuffer; }

    /// Writes through every non-null pixel pointer at the corners and the middle column.
    void TouchCorners() {
        const int w = mImage->GetWidth(), h = mImage->GetHeight();
        const int xs[] = {0, w - 1, w / 2 - 1, w / 2}, ys[] = {0, h - 1};
        for (int channel = -1; channel <= ulkImage::kMaxChannels; ++channel) {
            // A whole sample for whole-byte depths; one byte for the odd ones.
            const int bits = mImage->GetChannelSize(channel);
            const int bytes = bits > 0 && bits % 8 == 0 ? bits / 8 : 1;
            for (int y : ys) {
                for (int x : xs) Touch(mImage->GetPixelPtr(x, y, channel), bytes);
                // A row starts at its first pixel.
                void* first = mImage->GetPixelPtr(0, y, channel);
                if (first && mImage->GetRowPtr(y, channel) != first) std::abort();
            }
        }
    }

  private:
    static void Touch(void* pointer, int bytes) {
        if (!pointer) return;
        auto* p = static_cast<volatile unsigned char*>(pointer);
        for (int i = 0; i < (bytes > 0 ? bytes : 1); ++i)
            p[i] = static_cast<unsigned char>(p[i] + 1);
    }

    ulkImage* mImage;
    void* mBuffer = nullptr;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    FuzzInput input(data, size);
    const Shape first = TakeShape(input);
    Shape second = first;
    const uint8_t variant = input.Take<uint8_t>();
    if (variant & 1) second.rowDelta = input.Take<int16_t>();
    if (variant & 2) second.hasRowDelta = !second.hasRowDelta;
    if (variant & 4) second = TakeShape(input);

    FuzzImage to(first), from(second);
    if (to.HasData()) to.TouchCorners();
    if (from.HasData()) from.TouchCorners();
    if (to.get() && from.get()) {
        const ulkBounds region = {0, 0, first.width - 1, first.height - 1};
        to.get()->Copy(from.get(), &region);
        to.get()->Copy(to.get(), nullptr);
    }
    return 0;
}

#include "ulk_tools/validate_image.h"

#include <algorithm>

namespace ulk_tools {

namespace {

// The pattern changes from byte to byte, so a plug-in that writes one constant (zero, 255)
// over a guard cannot leave it looking untouched.
uint8_t GuardByte(size_t index) {
    return static_cast<uint8_t>(0xA5 ^ (index * 131));
}

// A small fast generator: the pixels only need to look unlike the guards and differ per seed.
// "1 byte", "3 bytes".
std::string ByteCount(size_t count) {
    return std::to_string(count) + (count == 1 ? " byte" : " bytes");
}

uint32_t NextRandom(uint32_t* state) {
    *state ^= *state << 13;
    *state ^= *state >> 17;
    *state ^= *state << 5;
    return *state;
}

}  // namespace

GuardedBuffer::GuardedBuffer(size_t rowBytes, size_t rowDelta, int rows, uint32_t seed)
    : mRowBytes(rowBytes), mRowDelta(rowDelta < rowBytes ? rowBytes : rowDelta), mRows(rows) {
    mBytes.resize(2 * kGuardBytes + mRowDelta * static_cast<size_t>(rows));
    uint32_t state = seed * 2654435761u + 1;
    for (size_t i = 0; i < mBytes.size(); ++i)
        mBytes[i] = IsGuard(i) ? GuardByte(i) : static_cast<uint8_t>(NextRandom(&state) >> 24);
}

bool GuardedBuffer::IsGuard(size_t index) const {
    if (index < kGuardBytes) return true;
    const size_t offset = index - kGuardBytes;
    if (offset >= mRowDelta * static_cast<size_t>(mRows)) return true;
    return offset % mRowDelta >= mRowBytes;
}

std::string GuardedBuffer::Where(size_t index) const {
    if (index < kGuardBytes) return ByteCount(kGuardBytes - index) + " before the first row";
    const size_t offset = index - kGuardBytes;
    const size_t row = offset / mRowDelta;
    const size_t column = offset % mRowDelta;
    if (row >= static_cast<size_t>(mRows))
        return ByteCount(offset - mRowDelta * mRows + mRowDelta - mRowBytes + 1) +
               " after the end of the last row";
    if (column >= mRowBytes)
        return ByteCount(column - mRowBytes + 1) + " after the end of row " + std::to_string(row);
    return "row " + std::to_string(row) + ", byte " + std::to_string(column);
}

std::string GuardedBuffer::GuardDamage() const {
    size_t first = mBytes.size(), count = 0;
    for (size_t i = 0; i < mBytes.size(); ++i) {
        if (!IsGuard(i) || mBytes[i] == GuardByte(i)) continue;
        if (count++ == 0) first = i;
    }
    if (count == 0) return std::string();
    return ByteCount(count) + ", the first " + Where(first);
}

std::string GuardedBuffer::Difference(const std::vector<uint8_t>& before) const {
    if (before.size() != mBytes.size()) return "its size changed";
    for (size_t i = 0; i < mBytes.size(); ++i)
        if (before[i] != mBytes[i]) return "first at " + Where(i);
    return std::string();
}

void GuardedBuffer::RepairGuards() {
    for (size_t i = 0; i < mBytes.size(); ++i)
        if (IsGuard(i)) mBytes[i] = GuardByte(i);
}

void GuardedBuffer::Restore(const std::vector<uint8_t>& bytes) {
    // Copied in place: the image points into this memory.
    if (bytes.size() == mBytes.size()) std::copy(bytes.begin(), bytes.end(), mBytes.begin());
}

size_t GuardedImage::PixelBytes(ulkImgFormat format, int bitDepth) {
    const size_t samples = format == kImgFormatRGB || format == kImgFormatBGR ? 3 : 4;
    return samples * static_cast<size_t>(bitDepth / 8);
}

GuardedImage::GuardedImage(ulkImgFormat format, int bitDepth, int width, int height,
                           uint32_t seed) {
    const size_t rowBytes = PixelBytes(format, bitDepth) * static_cast<size_t>(width);
    const size_t rowDelta = (rowBytes + 15) / 16 * 16 + 32;
    mBuffer = GuardedBuffer(rowBytes, rowDelta, height, seed);
    mImage.reset(ulkImage::New());
    if (!mImage) return;
    ulkImageFormat pixelFormat;
    pixelFormat.SetFormat(format);
    pixelFormat.SetBitDepth(bitDepth);
    mImage->SetFormat(&pixelFormat);
    mImage->SetSize(width, height);
    mImage->SetRowDelta(static_cast<int>(rowDelta));
    mImage->SetData(mBuffer.Pixels());
}

}  // namespace ulk_tools

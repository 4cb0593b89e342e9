#include "ulk/image/image_format.h"

#include <cstring>
#include <new>

namespace {

struct FormatRow {
    const char* order;
    ulkColorspace colorspace;
};

// Rows for format codes 1 to 14. Formats 13 and 14 share the texts of 10 and 9:
// only the code tells them apart.
const FormatRow kFormatTable[14] = {
    {"RGB", kColorspaceRGB},  {"RGBA", kColorspaceRGB}, {"BGR", kColorspaceRGB},
    {"ABGR", kColorspaceRGB}, {"ARGB", kColorspaceRGB}, {"BGRA", kColorspaceRGB},
    {"YUV", kColorspaceYUV},  {"???", kColorspaceYUV},  {"YUYV", kColorspaceYUV},
    {"UYVY", kColorspaceYUV}, {"YUVA", kColorspaceYUV}, {"AVUY", kColorspaceYUV},
    {"UYVY", kColorspaceYUV}, {"YUYV", kColorspaceYUV},
};

}  // namespace

ulkImageFormat::ulkImageFormat()
    : mFormat(static_cast<ulkImgFormat>(-1)),
      mColorspace(static_cast<ulkColorspace>(-1)),
      mBitDepth(8),
      mOrder(nullptr) {}

ulkImageFormat::ulkImageFormat(const ulkImageFormat& source) : ulkImageFormat() {
    Copy(&source);
}

ulkImageFormat::~ulkImageFormat() {
    delete[] mOrder;
    mOrder = nullptr;
}

ulkImageFormat& ulkImageFormat::operator=(const ulkImageFormat& source) {
    Copy(&source);
    return *this;
}

void ulkImageFormat::SetFormat(ulkImgFormat format) {
    mFormat = format;
    if (format < 1 || format > 14) return;
    const FormatRow& row = kFormatTable[format - 1];
    SetColorspace(row.colorspace);
    SetOrder(row.order);
}

void ulkImageFormat::SetOrder(const char* text) {
    // The copy is made before the old text is released, so a text that is (or lies
    // inside) this format's own is never read after release.
    char* copy = nullptr;
    if (text) {
        const size_t size = std::strlen(text) + 1;
        copy = new (std::nothrow) char[size];
        if (copy) std::memcpy(copy, text, size);
    }
    delete[] mOrder;
    mOrder = copy;
}

bool ulkImageFormat::IsCompatible(const ulkImageFormat* other) const {
    if (!other) return false;
    if (other->mColorspace != mColorspace) return false;
    if (other->mBitDepth != 0 && mBitDepth != 0 && other->mBitDepth != mBitDepth) return false;
    if (!other->mOrder || !mOrder) return true;
    return std::strcmp(other->mOrder, mOrder) == 0;
}

void ulkImageFormat::Copy(const ulkImageFormat* source) {
    // Copying onto itself would reset the order text and colour space through
    // SetFormat before reading them back: keep the format as it is instead.
    if (!source || source == this) return;
    SetFormat(source->GetFormat());
    SetColorspace(source->GetColorspace());
    SetBitDepth(source->GetBitDepth());
    SetOrder(source->GetOrder());
}

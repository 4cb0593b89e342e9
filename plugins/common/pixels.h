// Pixel access and small helpers shared by the sample plug-ins.
//
// The samples work on interleaved RGB images with alpha (RGBA, BGRA, ARGB) at
// 8 or 16 bits per sample. They never assume an order or a tight row: a
// PixelView asks the image where each channel lives (GetChannel finds the slot
// of red, green, blue and alpha, GetChannelPtr gives the channel's sample in
// pixel (0, 0)) and how far apart pixels and rows lie (GetPixelDelta,
// GetRowDelta). A host may hand over rows padded beyond width x 4 samples, or
// an image that views part of a larger frame; this addressing copes with both.
//
// Effects read rows into normalised floats, four per pixel in R, G, B, A
// order, work on those and write them back. So an effect is written once and
// runs on every accepted order and depth.
//
// Header-only on purpose: each sample is one module and links nothing but
// libulk.
#ifndef ULK_SAMPLES_PIXELS_H
#define ULK_SAMPLES_PIXELS_H

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "ulk/ulk.h"

namespace ulk_samples {

/// Positions of the channels in the samples' float pixels.
enum Channel { kRed = 0, kGreen = 1, kBlue = 2, kAlpha = 3 };

/// Declares the formats the samples accept: RGBA, BGRA and ARGB at 8 and 16 bits.
/// Call from DefineEffect.
inline bool AddSampleFormats(ulkModel_v1* model) {
    const ulkImgFormat formats[] = {kImgFormatRGBA, kImgFormatBGRA, kImgFormatARGB};
    const int depths[] = {8, 16};
    for (int depth : depths)
        for (ulkImgFormat format : formats)
            if (!model->AddFormat(kColorspaceRGB, depth, nullptr, format)) return false;
    return true;
}

/// Hands a new parameter to the instance, which then owns it; a parameter the
/// instance refuses (or could not be made) is released here. False on failure.
inline bool AddParam(ulkInstance_v1* instance, ulkParameter* parameter,
                     ulkPGroup* group = nullptr) {
    if (!parameter) return false;
    if (!instance->AddParameter(parameter, group)) {
        ulkParameter::Delete(parameter);
        return false;
    }
    return true;
}

/// The part of the region (null: the whole image) that lies inside a width x
/// height image; false when nothing is left. Right and bottom are inclusive,
/// as everywhere in ULK.
inline bool ClipRegion(const ulkBounds* region, int width, int height, ulkBounds* clipped) {
    const ulkBounds whole = {0, 0, width - 1, height - 1};
    if (!region) region = &whole;
    clipped->left = std::max(region->left, 0);
    clipped->top = std::max(region->top, 0);
    clipped->right = std::min(region->right, width - 1);
    clipped->bottom = std::min(region->bottom, height - 1);
    return clipped->left <= clipped->right && clipped->top <= clipped->bottom;
}

inline float Clamp01(float v) {
    return v < 0.0f ? 0.0f : (v > 1.0f ? 1.0f : v);
}

/// A view of one image's red, green, blue and alpha samples.
class PixelView {
  public:
    /// Binds the view to media; false when it is not an image this view can
    /// address (not RGB, not 8 or 16 bits, or missing a colour channel). An
    /// image without alpha reads as opaque and keeps no alpha on writing.
    bool Bind(ulkMediaObject* media) {
        mImage = dynamic_cast<ulkImage*>(media);
        if (!mImage || mImage->GetColorspace() != kColorspaceRGB) return false;
        const ulkImgChannel types[4] = {kImgChannelRV, kImgChannelG, kImgChannelBU, kImgChannelA};
        for (int c = 0; c < 4; ++c) {
            const int slot = mImage->GetChannel(types[c]);
            if (slot < 0) {
                if (c == kAlpha) {
                    mBase[c] = nullptr;
                    continue;
                }
                return false;
            }
            const int bits = mImage->GetChannelSize(slot);
            if (bits != 8 && bits != 16) return false;
            if (c > 0 && bits != mBits) return false;  // one depth for every channel
            mBits = bits;
            mBase[c] = static_cast<unsigned char*>(mImage->GetChannelPtr(slot));
            mPixelDelta[c] = mImage->GetPixelDelta(slot);
            mRowDelta[c] = mImage->GetRowDelta(slot);
            if (!mBase[c]) return false;
        }
        mMax = mBits == 8 ? 255.0f : 65535.0f;
        return true;
    }

    ulkImage* Image() const { return mImage; }
    int Width() const { return mImage->GetWidth(); }
    int Height() const { return mImage->GetHeight(); }
    bool SameSize(const PixelView& other) const {
        return Width() == other.Width() && Height() == other.Height();
    }

    /// Reads count pixels of row y, from column x on, into rgba (4 floats a pixel).
    void ReadRow(int x, int y, int count, float* rgba) const {
        for (int c = 0; c < 4; ++c) {
            const unsigned char* p = Sample(c, x, y);
            float* out = rgba + c;
            if (!p) {  // no alpha channel: opaque
                for (int i = 0; i < count; ++i, out += 4) *out = 1.0f;
                continue;
            }
            const float scale = 1.0f / mMax;
            const int step = mPixelDelta[c];
            if (mBits == 8) {
                for (int i = 0; i < count; ++i, p += step, out += 4) *out = *p * scale;
            } else {
                for (int i = 0; i < count; ++i, p += step, out += 4) {
                    uint16_t v;
                    std::memcpy(&v, p, sizeof v);  // rows need not be 2-byte aligned
                    *out = v * scale;
                }
            }
        }
    }

    /// Writes count pixels to row y from column x on; values are clamped to 0..1
    /// and rounded to the nearest sample value.
    void WriteRow(int x, int y, int count, const float* rgba) const {
        for (int c = 0; c < 4; ++c) {
            unsigned char* p = Sample(c, x, y);
            if (!p) continue;
            const float* in = rgba + c;
            const int step = mPixelDelta[c];
            if (mBits == 8) {
                for (int i = 0; i < count; ++i, p += step, in += 4)
                    *p = static_cast<unsigned char>(Clamp01(*in) * mMax + 0.5f);
            } else {
                for (int i = 0; i < count; ++i, p += step, in += 4) {
                    const uint16_t v = static_cast<uint16_t>(Clamp01(*in) * mMax + 0.5f);
                    std::memcpy(p, &v, sizeof v);
                }
            }
        }
    }

    /// Writes one pixel (x, y must lie inside the image).
    void Put(int x, int y, const float rgba[4]) const { WriteRow(x, y, 1, rgba); }

  private:
    unsigned char* Sample(int c, int x, int y) const {
        if (!mBase[c]) return nullptr;
        return mBase[c] + static_cast<ptrdiff_t>(mPixelDelta[c]) * x +
               static_cast<ptrdiff_t>(mRowDelta[c]) * y;
    }

    ulkImage* mImage = nullptr;
    unsigned char* mBase[4] = {nullptr, nullptr, nullptr, nullptr};
    int mPixelDelta[4] = {0, 0, 0, 0};
    int mRowDelta[4] = {0, 0, 0, 0};
    int mBits = 8;
    float mMax = 255.0f;
};

/// Binds view to media, or records why not in the instance's error record.
inline bool BindOrFail(ulkInstance_v1* instance, PixelView* view, ulkMediaObject* media) {
    if (view->Bind(media)) return true;
    instance->SetPluginError(
        "unsupported image: the samples take RGBA, BGRA or ARGB at 8 or 16 bits");
    return false;
}

}  // namespace ulk_samples

#endif  // ULK_SAMPLES_PIXELS_H

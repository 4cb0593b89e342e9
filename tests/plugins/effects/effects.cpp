// Three small effects on 8-bit images, in the form a plug-in author would
// write them: model 0 "Invert" (a filter with the default description),
// model 1 "Mix" (a compositor with the default description) and model 2
// "Title" (a title that describes its own formats and outputs).
#include "ulk/ulk.h"

namespace {

// Channels 0 to 3 of the packed 4:2:2 formats step over pairs of pixels.
bool IsPackedPair(const ulkImage* image, int channel) {
    switch (image->GetImgFormat()) {
        case kImgFormatYUV422:
        case kImgFormatYUYV:
        case kImgFormatUYVY:
        case kImgFormatUYVYAlpha:
        case kImgFormatYUYVAlpha:
            return channel < 4;
        default:
            return false;
    }
}

// Calls visit(channel, x, y) for every sample of the region, in the image's own steps.
template <typename Visit>
void ForEachSample(const ulkImage* image, const ulkBounds* region, Visit visit) {
    for (int c = 0; c < image->GetNumChannels(); ++c) {
        const bool pairs = IsPackedPair(image, c);
        const int left = pairs ? region->left / 2 : region->left;
        const int right = pairs ? region->right / 2 : region->right;
        for (int y = region->top; y <= region->bottom; ++y)
            for (int x = left; x <= right; ++x) visit(c, x, y);
    }
}

// The 8-bit sample of channel c at (x, y).
unsigned char& Sample(const ulkImage* image, int x, int y, int c) {
    return *static_cast<unsigned char*>(image->GetPixelPtr(x, y, c));
}

ulkImage* InputImage(ulkInstance_v1* instance, int index) {
    return dynamic_cast<ulkImage*>(instance->GetInput(index));
}

ulkImage* OutputImage(ulkInstance_v1* instance) {
    return dynamic_cast<ulkImage*>(instance->GetOutput(0));
}

// ---------------------------------------------------------------- Invert

class InvertInstance : public ulkInstance_v1 {
  public:
    bool Execute(const ulkBounds* bounds) override {
        const ulkImage* in = InputImage(this, 0);
        const ulkImage* out = OutputImage(this);
        if (!in || !out || in->GetImgFormat() != out->GetImgFormat()) {
            SetPluginError("Invert needs an input and an output image of one format");
            return false;
        }
        ForEachSample(out, bounds, [&](int c, int x, int y) {
            const unsigned char value = Sample(in, x, y, c);
            const bool alpha = out->GetChannelType(c) == kImgChannelA;
            Sample(out, x, y, c) = alpha ? value : static_cast<unsigned char>(255 - value);
        });
        return true;
    }
};

class InvertModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Invert");
        SetType(kPluginTypeFilter);
        SetVendor("ULK Tests");
        SetCategory("Colour");
        SetIdentifier("org.ulk.tests.invert");
        SetDescription("Inverts every colour channel and keeps alpha");
        SetPluginVersion(2.5f);
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new InvertInstance; }
};

// ---------------------------------------------------------------- Mix

class MixInstance : public ulkInstance_v1 {
  public:
    bool Execute(const ulkBounds* bounds) override {
        const ulkImage* fg = InputImage(this, 0);
        const ulkImage* bg = InputImage(this, 1);
        const ulkImage* out = OutputImage(this);
        if (!fg || !bg || !out) {
            SetPluginError("Mix needs two inputs and an output");
            return false;
        }
        ForEachSample(out, bounds, [&](int c, int x, int y) {
            const int sum = Sample(fg, x, y, c) + Sample(bg, x, y, c);
            Sample(out, x, y, c) = static_cast<unsigned char>((sum + 1) / 2);
        });
        return true;
    }
};

class MixModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Mix");
        SetType(kPluginTypeCompositor);
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new MixInstance; }
};

// ---------------------------------------------------------------- Title

class TitleInstance : public ulkInstance_v1 {
  public:
    bool Execute(const ulkBounds* bounds) override {
        const ulkImage* out = OutputImage(this);
        if (!out) return false;
        const bool yuv = out->GetColorspace() == kColorspaceYUV;
        ForEachSample(out, bounds, [&](int c, int x, int y) {
            Sample(out, x, y, c) = ValueFor(out->GetChannelType(c), yuv);
        });
        return true;
    }

  private:
    // An orange card: R 200, G 100, B 50, opaque; in YUV, Y 235 and U, V 128.
    static unsigned char ValueFor(ulkImgChannel type, bool yuv) {
        switch (type) {
            case kImgChannelA:
                return 255;
            case kImgChannelRV:
                return yuv ? 128 : 200;
            case kImgChannelG:
                return 100;
            case kImgChannelBU:
                return yuv ? 128 : 50;
            case kImgChannelY0:
            case kImgChannelY1:
                return 235;
            default:
                return 0;
        }
    }
};

class TitleModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Title");
        SetType(kPluginTypeTitle);
        SetSubType("card");
        return true;
    }
    bool DefineEffect() override {
        AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatRGBA);
        AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatBGRA);
        AddFormat(kColorspaceRGB, 8, nullptr, kImgFormatRGB);
        AddFormat(kColorspaceYUV, 8, nullptr, kImgFormatUYVY);
        AddInput(0, "Matte", "matte", kDataTypeDefault, 1);
        return AddOutput(0, "Title", "title", kDataTypeDefault);
    }
    ulkInstance_v1* NewInstance() override { return new TitleInstance; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 3;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    switch (modelIndex) {
        case 0:
            return new InvertModel;
        case 1:
            return new MixModel;
        case 2:
            return new TitleModel;
        default:
            return nullptr;
    }
}

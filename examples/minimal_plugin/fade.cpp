// A complete ULK plug-in: one filter that fades its input towards black.
#include <ulk/ulk.h>

class FadeInstance : public ulkInstance_v1 {
public:
    bool DefineParameters() override {
        // The library writes the animated value into mAmount before every Execute.
        return AddParameter(ulkPNumber::New("Amount", "amount", &mAmount, sizeof mAmount, 0.0, 1.0,
                                            0.01, kPNumberReal, false),
                            nullptr) != nullptr;
    }

    bool Execute(const ulkBounds*) override {
        auto* in = static_cast<ulkImage*>(GetInput(0));
        auto* out = static_cast<ulkImage*>(GetOutput(0));
        if (in->GetImgFormat() != kImgFormatRGBA || out->GetImgFormat() != kImgFormatRGBA) {
            SetPluginError("fade: only RGBA images");
            return false;
        }
        for (int y = 0; y < in->GetHeight(); ++y) {
            auto* src = static_cast<const unsigned char*>(in->GetRowPtr(y, 0));
            auto* dst = static_cast<unsigned char*>(out->GetRowPtr(y, 0));
            for (int x = 0; x < in->GetWidth() * 4; ++x)
                dst[x] = (x % 4 == 3) ? src[x] : static_cast<unsigned char>(src[x] * (1.0 - mAmount));
        }
        return true;
    }

private:
    double mAmount = 0.5;
};

class FadeModel : public ulkModel_v1 {
public:
    bool DefineIdentity() override {
        SetName("Fade");
        SetType(kPluginTypeFilter);
        SetVendor("ULK examples");
        SetIdentifier("com.ulk.examples.fade");
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new FadeInstance; }
};

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short) {
    return new FadeModel;
}

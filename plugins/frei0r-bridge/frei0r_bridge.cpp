// The frei0r bridge: every frei0r effect installed on the machine as a ULK model.
//
// At start-up the bridge searches the frei0r folders (see SearchFolders),
// opens each effect module once and offers one model per usable effect, in
// file-name order. A model describes the effect from its frei0r plug-in info;
// an instance turns each frei0r parameter into a ULK parameter of the
// matching kind, so that the host can key-frame it, and hands frei0r the
// values at the instance's time before every update.
//
//   frei0r                     ULK
//   filter                     filter, input "Input"
//   source                     title, no input
//   mixer2 / mixer3            compositor with two / three inputs
//   RGBA8888 / BGRA8888        RGBA / BGRA at 8 bits
//   PACKED32                   RGBA, BGRA, ARGB, ABGR at 8 bits (byte order is irrelevant)
//   double                     real number 0..1
//   bool                       boolean
//   color                      RGB colour
//   position                   2D point
//   string                     string of 256 bytes
#include <algorithm>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "frame_buffer.h"
#include "frei0r_library.h"
#include "ulk/ulk.h"

using namespace frei0r_bridge;

namespace {

// The effects found at start-up; they stay loaded until shut-down.
std::vector<std::unique_ptr<Frei0rLibrary>> gEffects;
bool gDiscovered = false;

void Discover() {
    if (gDiscovered) return;
    gDiscovered = true;
    gEffects = DiscoverEffects(SearchFolders());
}

int NumInputs(const f0r_plugin_info_t& info) {
    switch (info.plugin_type) {
        case F0R_PLUGIN_TYPE_SOURCE:
            return 0;
        case F0R_PLUGIN_TYPE_MIXER2:
            return 2;
        case F0R_PLUGIN_TYPE_MIXER3:
            return 3;
        default:
            return 1;
    }
}

/// The ULK formats that lay an effect's colour model out in memory.
std::vector<ulkImgFormat> FormatsFor(int colorModel) {
    switch (colorModel) {
        case F0R_COLOR_MODEL_RGBA8888:
            return {kImgFormatRGBA};
        case F0R_COLOR_MODEL_BGRA8888:
            return {kImgFormatBGRA};
        default:  // PACKED32: the effect treats all four bytes alike
            return {kImgFormatRGBA, kImgFormatBGRA, kImgFormatARGB, kImgFormatABGR};
    }
}

/// The variables the ULK parameters write into; one per frei0r parameter,
/// only the member of its type is used.
struct ParamValue {
    double number = 0.0;
    bool flag = false;
    ulkColorRGB color = {0.0, 0.0, 0.0};
    ulkPoint2D point = {0.0, 0.0};
    char text[256] = {};
};

class Frei0rInstance : public ulkInstance_v1 {
  public:
    explicit Frei0rInstance(Frei0rLibrary* library) : mLibrary(library) {}
    ~Frei0rInstance() override {
        if (mFrei0r) mLibrary->destruct(mFrei0r);
    }

    bool DefineParameters() override {
        const std::vector<ParamInfo>& params = mLibrary->Params();
        // Sized once: the parameters keep pointers into it.
        mValues.reset(new ParamValue[params.size()]);
        for (size_t i = 0; i < params.size(); ++i) {
            if (!AddParam(params[i], &mValues[i])) return false;
        }
        return true;
    }

    // Both are whatever region the host asks for: frei0r renders whole frames.
    void GetInputSize(ulkBounds*) override {}
    void GetOutputSize(ulkBounds*) override {}

    bool Execute(const ulkBounds*) override {
        const f0r_plugin_info_t& info = mLibrary->Info();
        const int inputs = NumInputs(info);
        ulkImage* output = dynamic_cast<ulkImage*>(GetOutput(0));
        if (!Accepts(output)) return Fail("the output is not an 8-bit image in a format it takes");
        ulkImage* input[3] = {nullptr, nullptr, nullptr};
        for (int i = 0; i < inputs; ++i) {
            input[i] = dynamic_cast<ulkImage*>(GetInput(i));
            if (!Accepts(input[i]) || input[i]->GetImgFormat() != output->GetImgFormat() ||
                input[i]->GetWidth() != output->GetWidth() ||
                input[i]->GetHeight() != output->GetHeight())
                return Fail("every input must be an image of the output's format and size");
        }

        const int width = PaddedSize(output->GetWidth()), height = PaddedSize(output->GetHeight());
        if (!mFrei0r || width != mWidth || height != mHeight) {
            // frei0r instances have a fixed frame size: make a new one.
            if (mFrei0r) mLibrary->destruct(mFrei0r);
            mFrei0r = mLibrary->construct(width, height);
            mWidth = width;
            mHeight = height;
            if (!mFrei0r) {
                const std::string text = std::string("frei0r effect ") + mLibrary->Identifier() +
                                         " could not be constructed at " + std::to_string(width) +
                                         "x" + std::to_string(height);
                SetPluginError(text.c_str());
                return false;
            }
        }
        PassParameters();

        const uint32_t* frames[3] = {nullptr, nullptr, nullptr};
        bool outputIsInput = false;
        for (int i = 0; i < inputs; ++i) {
            frames[i] = mInputs[i].Bind(input[i], width, height, true, false);
            if (!frames[i]) return Fail("out of memory");
            outputIsInput = outputIsInput ||
                            FrameBuffer::PixelStart(input[i]) == FrameBuffer::PixelStart(output);
        }
        // frei0r reads its inputs while it writes: never let it work in place.
        uint32_t* out = mOutput.Bind(output, width, height, false, outputIsInput);
        if (!out) return Fail("out of memory");

        // frei0r's time is in seconds.
        const double rate = GetFrameRate() > 0.0 ? GetFrameRate() : 25.0;
        const double seconds = GetCurrentFrame() / rate;
        const bool mixer = inputs >= 2;
        if (mixer || !mLibrary->update)
            mLibrary->update2(mFrei0r, seconds, frames[0], frames[1], frames[2], out);
        else
            mLibrary->update(mFrei0r, seconds, frames[0], out);
        mOutput.CopyOut();
        return true;
    }

  private:
    bool Accepts(const ulkImage* image) const {
        if (!image || image->GetNumChannels() != 4 || !FrameBuffer::PixelStart(image)) return false;
        for (int c = 0; c < 4; ++c)
            if (image->GetChannelSize(c) != 8 || image->GetPixelDelta(c) != 4) return false;
        const std::vector<ulkImgFormat> formats = FormatsFor(mLibrary->Info().color_model);
        return std::find(formats.begin(), formats.end(), image->GetImgFormat()) != formats.end();
    }

    bool Fail(const char* why) {
        const std::string text = mLibrary->Identifier() + ": " + why;
        SetPluginError(text.c_str());
        return false;
    }

    /// Makes the ULK parameter for a frei0r one, starting at frei0r's default.
    bool AddParam(const ParamInfo& param, ParamValue* value) {
        const char* label = param.name.c_str();
        const char* id = param.identifier.c_str();
        const ParamDefault& d = param.defaults;
        ulkParameter* made = nullptr;
        switch (param.type) {
            case F0R_PARAM_BOOL:
                value->flag = d.number >= 0.5;
                made = ulkPBoolean::New(label, id, &value->flag, sizeof value->flag);
                break;
            case F0R_PARAM_DOUBLE:
                value->number = std::clamp(d.number, 0.0, 1.0);
                made = ulkPNumber::New(label, id, &value->number, sizeof value->number, 0.0, 1.0,
                                       0.01, kPNumberReal, false);
                break;
            case F0R_PARAM_COLOR:
                value->color = {d.color[0], d.color[1], d.color[2]};
                made = ulkPColorRGB::New(label, id, &value->color, sizeof value->color);
                break;
            case F0R_PARAM_POSITION:
                value->point = {d.position[0], d.position[1]};
                made = ulkPPoint2D::New(label, id, &value->point, sizeof value->point);
                break;
            case F0R_PARAM_STRING:
                std::strncpy(value->text, d.text.c_str(), sizeof value->text - 1);
                made = ulkPString::New(label, id, value->text, sizeof value->text,
                                       kPStringTypeDefault);
                break;
        }
        if (!made) return false;
        if (!AddParameter(made, nullptr)) {
            ulkParameter::Delete(made);
            return false;
        }
        return true;
    }

    /// The library has just written the values at the instance's time into
    /// mValues; frei0r gets them in its own types.
    void PassParameters() {
        const std::vector<ParamInfo>& params = mLibrary->Params();
        for (size_t i = 0; i < params.size(); ++i) {
            const ParamValue& v = mValues[i];
            const int index = static_cast<int>(i);
            switch (params[i].type) {
                case F0R_PARAM_BOOL: {
                    f0r_param_bool flag = v.flag ? 1.0 : 0.0;
                    mLibrary->setParamValue(mFrei0r, &flag, index);
                    break;
                }
                case F0R_PARAM_DOUBLE: {
                    f0r_param_double number = v.number;
                    mLibrary->setParamValue(mFrei0r, &number, index);
                    break;
                }
                case F0R_PARAM_COLOR: {
                    f0r_param_color_t color = {static_cast<float>(v.color.red),
                                               static_cast<float>(v.color.green),
                                               static_cast<float>(v.color.blue)};
                    mLibrary->setParamValue(mFrei0r, &color, index);
                    break;
                }
                case F0R_PARAM_POSITION: {
                    f0r_param_position_t position = {v.point.x, v.point.y};
                    mLibrary->setParamValue(mFrei0r, &position, index);
                    break;
                }
                case F0R_PARAM_STRING: {
                    // frei0r takes the address of a char pointer and copies the text.
                    f0r_param_string text = mValues[i].text;
                    mLibrary->setParamValue(mFrei0r, &text, index);
                    break;
                }
            }
        }
    }

    Frei0rLibrary* mLibrary;
    std::unique_ptr<ParamValue[]> mValues;
    f0r_instance_t mFrei0r = nullptr;
    int mWidth = 0, mHeight = 0;  // the padded size mFrei0r was made for
    FrameBuffer mInputs[3], mOutput;
};

class Frei0rModel : public ulkModel_v1 {
  public:
    explicit Frei0rModel(Frei0rLibrary* library) : mLibrary(library) {}

    bool DefineIdentity() override {
        const f0r_plugin_info_t& info = mLibrary->Info();
        // Identity texts are kept by pointer: frei0r's own texts and the
        // library object's strings live as long as the bridge is loaded.
        SetName(info.name ? info.name : mLibrary->Stem().c_str());
        SetVendor(info.author ? info.author : "");
        SetCategory("frei0r");
        SetIdentifier(mLibrary->Identifier().c_str());
        SetDescription(info.explanation ? info.explanation : "");
        const std::string version =
            std::to_string(info.major_version) + "." + std::to_string(info.minor_version);
        SetPluginVersion(std::stof(version));
        switch (NumInputs(info)) {
            case 0:
                SetType(kPluginTypeTitle);
                break;
            case 1:
                SetType(kPluginTypeFilter);
                break;
            default:
                SetType(kPluginTypeCompositor);
                break;
        }
        return true;
    }

    bool DefineEffect() override {
        for (ulkImgFormat format : FormatsFor(mLibrary->Info().color_model))
            if (!AddFormat(kColorspaceRGB, 8, nullptr, format)) return false;
        bool ok = true;
        switch (NumInputs(mLibrary->Info())) {
            case 1:
                ok = AddInput(0, "Input", "input", kDataTypeDefault);
                break;
            case 2:
                ok = AddInput(0, "Foreground", "foreground", kDataTypeDefault) &&
                     AddInput(1, "Background", "background", kDataTypeDefault);
                break;
            case 3:
                ok = AddInput(0, "Input 1", "input1", kDataTypeDefault) &&
                     AddInput(1, "Input 2", "input2", kDataTypeDefault) &&
                     AddInput(2, "Input 3", "input3", kDataTypeDefault);
                break;
        }
        return ok && AddOutput(0, "Output", "output", kDataTypeDefault);
    }

    ulkInstance_v1* NewInstance() override { return new Frei0rInstance(mLibrary); }

  private:
    Frei0rLibrary* mLibrary;
};

}  // namespace

ULK_PLUGIN_EXPORT bool ulkStartUp_v1(unsigned char*) {
    Discover();
    return true;
}

// Runs every f0r_deinit and closes the effects; a later start-up searches again.
ULK_PLUGIN_EXPORT void ulkShutDown_v1(void) {
    gEffects.clear();
    gDiscovered = false;
}

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    Discover();
    return static_cast<int>(std::min<size_t>(gEffects.size(), 0xFFFF));
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    Discover();
    return modelIndex < gEffects.size() ? new Frei0rModel(gEffects[modelIndex].get()) : nullptr;
}

// Generator: test patterns with a line of text.
//
// A title effect makes its picture from nothing: it has no input and one
// output, so it overrides DefineEffect (the default description knows only
// filters and compositors). The patterns:
//
//   Colour Bars    seven 75% bars: white, yellow, cyan, green, magenta, red, blue;
//   Checkerboard   square cells of "Cell Size" pixels, "Colour A" in the top-left cell;
//   Gradient       from "Colour A" to "Colour B" along "Angle" (0: left to right,
//                  90: top to bottom).
//
// Over the pattern it writes "Text" with a 5x7 bitmap font for ASCII 32 to
// 126, each dot "Text Size" pixels square, the text block centred on
// "Position" (0..1 across the picture). The text parameters sit in a group,
// which hosts show as one foldable section. The output is opaque.
#include <cmath>
#include <cstring>
#include <vector>

#include "common/pixels.h"
#include "ulk/ulk.h"

using namespace ulk_samples;

namespace {

// ---------------------------------------------------------------- the font

// 5x7 glyphs for ASCII 32 to 126: five columns, left to right; bit 0 of a
// column is the top row, bit 6 the bottom one.
const int kGlyphWidth = 5, kGlyphHeight = 7, kAdvance = kGlyphWidth + 1;
const unsigned char kFont[95][kGlyphWidth] = {
    {0x00, 0x00, 0x00, 0x00, 0x00},  // ' '
    {0x00, 0x00, 0x5F, 0x00, 0x00},  // !
    {0x00, 0x07, 0x00, 0x07, 0x00},  // "
    {0x14, 0x7F, 0x14, 0x7F, 0x14},  // #
    {0x24, 0x2A, 0x7F, 0x2A, 0x12},  // $
    {0x23, 0x13, 0x08, 0x64, 0x62},  // %
    {0x36, 0x49, 0x55, 0x22, 0x50},  // &
    {0x00, 0x05, 0x03, 0x00, 0x00},  // '
    {0x00, 0x1C, 0x22, 0x41, 0x00},  // (
    {0x00, 0x41, 0x22, 0x1C, 0x00},  // )
    {0x08, 0x2A, 0x1C, 0x2A, 0x08},  // *
    {0x08, 0x08, 0x3E, 0x08, 0x08},  // +
    {0x00, 0x50, 0x30, 0x00, 0x00},  // ,
    {0x08, 0x08, 0x08, 0x08, 0x08},  // -
    {0x00, 0x60, 0x60, 0x00, 0x00},  // .
    {0x20, 0x10, 0x08, 0x04, 0x02},  // /
    {0x3E, 0x51, 0x49, 0x45, 0x3E},  // 0
    {0x00, 0x42, 0x7F, 0x40, 0x00},  // 1
    {0x42, 0x61, 0x51, 0x49, 0x46},  // 2
    {0x21, 0x41, 0x45, 0x4B, 0x31},  // 3
    {0x18, 0x14, 0x12, 0x7F, 0x10},  // 4
    {0x27, 0x45, 0x45, 0x45, 0x39},  // 5
    {0x3C, 0x4A, 0x49, 0x49, 0x30},  // 6
    {0x01, 0x71, 0x09, 0x05, 0x03},  // 7
    {0x36, 0x49, 0x49, 0x49, 0x36},  // 8
    {0x06, 0x49, 0x49, 0x29, 0x1E},  // 9
    {0x00, 0x36, 0x36, 0x00, 0x00},  // :
    {0x00, 0x56, 0x36, 0x00, 0x00},  // ;
    {0x08, 0x14, 0x22, 0x41, 0x00},  // <
    {0x14, 0x14, 0x14, 0x14, 0x14},  // =
    {0x00, 0x41, 0x22, 0x14, 0x08},  // >
    {0x02, 0x01, 0x51, 0x09, 0x06},  // ?
    {0x32, 0x49, 0x79, 0x41, 0x3E},  // @
    {0x7E, 0x11, 0x11, 0x11, 0x7E},  // A
    {0x7F, 0x49, 0x49, 0x49, 0x36},  // B
    {0x3E, 0x41, 0x41, 0x41, 0x22},  // C
    {0x7F, 0x41, 0x41, 0x22, 0x1C},  // D
    {0x7F, 0x49, 0x49, 0x49, 0x41},  // E
    {0x7F, 0x09, 0x09, 0x01, 0x01},  // F
    {0x3E, 0x41, 0x41, 0x51, 0x32},  // G
    {0x7F, 0x08, 0x08, 0x08, 0x7F},  // H
    {0x00, 0x41, 0x7F, 0x41, 0x00},  // I
    {0x20, 0x40, 0x41, 0x3F, 0x01},  // J
    {0x7F, 0x08, 0x14, 0x22, 0x41},  // K
    {0x7F, 0x40, 0x40, 0x40, 0x40},  // L
    {0x7F, 0x02, 0x04, 0x02, 0x7F},  // M
    {0x7F, 0x04, 0x08, 0x10, 0x7F},  // N
    {0x3E, 0x41, 0x41, 0x41, 0x3E},  // O
    {0x7F, 0x09, 0x09, 0x09, 0x06},  // P
    {0x3E, 0x41, 0x51, 0x21, 0x5E},  // Q
    {0x7F, 0x09, 0x19, 0x29, 0x46},  // R
    {0x46, 0x49, 0x49, 0x49, 0x31},  // S
    {0x01, 0x01, 0x7F, 0x01, 0x01},  // T
    {0x3F, 0x40, 0x40, 0x40, 0x3F},  // U
    {0x1F, 0x20, 0x40, 0x20, 0x1F},  // V
    {0x7F, 0x20, 0x18, 0x20, 0x7F},  // W
    {0x63, 0x14, 0x08, 0x14, 0x63},  // X
    {0x03, 0x04, 0x78, 0x04, 0x03},  // Y
    {0x61, 0x51, 0x49, 0x45, 0x43},  // Z
    {0x00, 0x7F, 0x41, 0x41, 0x00},  // [
    {0x02, 0x04, 0x08, 0x10, 0x20},  // backslash
    {0x00, 0x41, 0x41, 0x7F, 0x00},  // ]
    {0x04, 0x02, 0x01, 0x02, 0x04},  // ^
    {0x40, 0x40, 0x40, 0x40, 0x40},  // _
    {0x00, 0x01, 0x02, 0x04, 0x00},  // `
    {0x20, 0x54, 0x54, 0x54, 0x78},  // a
    {0x7F, 0x48, 0x44, 0x44, 0x38},  // b
    {0x38, 0x44, 0x44, 0x44, 0x20},  // c
    {0x38, 0x44, 0x44, 0x48, 0x7F},  // d
    {0x38, 0x54, 0x54, 0x54, 0x18},  // e
    {0x08, 0x7E, 0x09, 0x01, 0x02},  // f
    {0x0C, 0x52, 0x52, 0x52, 0x3E},  // g
    {0x7F, 0x08, 0x04, 0x04, 0x78},  // h
    {0x00, 0x44, 0x7D, 0x40, 0x00},  // i
    {0x20, 0x40, 0x44, 0x3D, 0x00},  // j
    {0x7F, 0x10, 0x28, 0x44, 0x00},  // k
    {0x00, 0x41, 0x7F, 0x40, 0x00},  // l
    {0x7C, 0x04, 0x18, 0x04, 0x78},  // m
    {0x7C, 0x08, 0x04, 0x04, 0x78},  // n
    {0x38, 0x44, 0x44, 0x44, 0x38},  // o
    {0x7C, 0x14, 0x14, 0x14, 0x08},  // p
    {0x08, 0x14, 0x14, 0x18, 0x7C},  // q
    {0x7C, 0x08, 0x04, 0x04, 0x08},  // r
    {0x48, 0x54, 0x54, 0x54, 0x20},  // s
    {0x04, 0x3F, 0x44, 0x40, 0x20},  // t
    {0x3C, 0x40, 0x40, 0x20, 0x7C},  // u
    {0x1C, 0x20, 0x40, 0x20, 0x1C},  // v
    {0x3C, 0x40, 0x30, 0x40, 0x3C},  // w
    {0x44, 0x28, 0x10, 0x28, 0x44},  // x
    {0x0C, 0x50, 0x50, 0x50, 0x3C},  // y
    {0x44, 0x64, 0x54, 0x4C, 0x44},  // z
    {0x00, 0x08, 0x36, 0x41, 0x00},  // {
    {0x00, 0x00, 0x7F, 0x00, 0x00},  // |
    {0x00, 0x41, 0x36, 0x08, 0x00},  // }
    {0x08, 0x04, 0x08, 0x10, 0x08},  // ~
};

/// The glyph of a character; characters outside the font show as '?'.
const unsigned char* Glyph(char ch) {
    const int code = static_cast<unsigned char>(ch);
    return kFont[(code >= 32 && code <= 126 ? code : '?') - 32];
}

// ---------------------------------------------------------------- the effect

enum Pattern { kColourBars = 0, kCheckerboard, kGradient };
const char* const kPatternItems[] = {"Colour Bars", "Checkerboard", "Gradient", nullptr};

// 75% bars, left to right.
const float kBars[7][3] = {{0.75f, 0.75f, 0.75f}, {0.75f, 0.75f, 0.0f}, {0.0f, 0.75f, 0.75f},
                           {0.0f, 0.75f, 0.0f},   {0.75f, 0.0f, 0.75f}, {0.75f, 0.0f, 0.0f},
                           {0.0f, 0.0f, 0.75f}};

const size_t kTextSize = 128;  // bytes of the text parameter, terminator included

void SetPixel(float* p, const ulkColorRGB& colour) {
    p[kRed] = static_cast<float>(colour.red);
    p[kGreen] = static_cast<float>(colour.green);
    p[kBlue] = static_cast<float>(colour.blue);
    p[kAlpha] = 1.0f;
}

class GeneratorInstance : public ulkInstance_v1 {
  public:
    bool DefineParameters() override {
        if (!AddParam(this, ulkPList::New("Pattern", "pattern", &mPattern, sizeof mPattern,
                                          kPatternItems, kPListTypeDefault)) ||
            !AddParam(this,
                      ulkPColorRGB::New("Colour A", "colour_a", &mColourA, sizeof mColourA)) ||
            !AddParam(this,
                      ulkPColorRGB::New("Colour B", "colour_b", &mColourB, sizeof mColourB)) ||
            !AddParam(this, ulkPNumber::New("Cell Size", "cell_size", &mCellSize, sizeof mCellSize,
                                            1.0, 1024.0, 1.0, kPNumberInteger, false)) ||
            !AddParam(this, ulkPNumber::New("Angle", "angle", &mAngle, sizeof mAngle, 0.0, 360.0,
                                            1.0, kPNumberReal, false)))
            return false;

        // The text settings, grouped: the group is added first, then its members.
        ulkPGroup* group = ulkPGroup::New("Text", "text_group", true);
        if (!AddParam(this, group)) return false;
        return AddParam(this,
                        ulkPString::New("Text", "text", mText, kTextSize, kPStringTypeDefault),
                        group) &&
               AddParam(this,
                        ulkPColorRGB::New("Text Colour", "text_colour", &mTextColour,
                                          sizeof mTextColour),
                        group) &&
               AddParam(this,
                        ulkPNumber::New("Text Size", "text_size", &mTextScale, sizeof mTextScale,
                                        1.0, 32.0, 1.0, kPNumberInteger, false),
                        group) &&
               AddParam(this,
                        ulkPPoint2D::New("Position", "position", &mPosition, sizeof mPosition),
                        group);
    }

    // No input: the generator needs nothing (an empty rectangle), and it
    // produces whatever region it is asked for.
    void GetInputSize(ulkBounds* bounds) override {
        if (bounds) *bounds = ulkBounds{0, 0, -1, -1};
    }
    void GetOutputSize(ulkBounds*) override {}

    bool Execute(const ulkBounds* bounds) override {
        PixelView out;
        if (!BindOrFail(this, &out, GetOutput(0))) return false;
        ulkBounds region;
        if (!ClipRegion(bounds, out.Width(), out.Height(), &region)) return true;

        const int count = region.right - region.left + 1;
        std::vector<float> row(static_cast<size_t>(count) * 4);
        const Gradient gradient = MakeGradient(out.Width(), out.Height());
        const TextBlock text = LayOutText(out.Width(), out.Height());
        for (int y = region.top; y <= region.bottom; ++y) {
            if (Aborted()) return false;
            for (int i = 0; i < count; ++i)
                PatternPixel(region.left + i, y, out.Width(), gradient, &row[i * size_t{4}]);
            DrawTextRow(text, y, region.left, count, row.data());
            out.WriteRow(region.left, y, count, row.data());
        }
        return true;
    }

  private:
    // Gradient position t = (dot(pixel centre, direction) - low) / span, 0..1
    // between the two corners that lie furthest back and furthest ahead.
    struct Gradient {
        double dx, dy, low, span;
    };

    Gradient MakeGradient(int width, int height) const {
        const double radians = mAngle * 3.14159265358979323846 / 180.0;
        Gradient g = {std::cos(radians), std::sin(radians), 0.0, 0.0};
        double low = 0.0, high = 0.0;
        const double corners[4][2] = {
            {0, 0}, {double(width), 0}, {0, double(height)}, {double(width), double(height)}};
        for (int i = 0; i < 4; ++i) {
            const double p = corners[i][0] * g.dx + corners[i][1] * g.dy;
            low = i == 0 ? p : std::min(low, p);
            high = i == 0 ? p : std::max(high, p);
        }
        g.low = low;
        g.span = high > low ? high - low : 1.0;
        return g;
    }

    void PatternPixel(int x, int y, int width, const Gradient& gradient, float* p) const {
        switch (mPattern) {
            case kCheckerboard: {
                const int cell = mCellSize > 0 ? mCellSize : 1;
                SetPixel(p, (x / cell + y / cell) % 2 == 0 ? mColourA : mColourB);
                break;
            }
            case kGradient: {
                const double t =
                    ((x + 0.5) * gradient.dx + (y + 0.5) * gradient.dy - gradient.low) /
                    gradient.span;
                const ulkColorRGB c = {mColourA.red + (mColourB.red - mColourA.red) * t,
                                       mColourA.green + (mColourB.green - mColourA.green) * t,
                                       mColourA.blue + (mColourB.blue - mColourA.blue) * t};
                SetPixel(p, c);
                break;
            }
            default: {  // colour bars
                const float* bar = kBars[static_cast<long long>(x) * 7 / width];
                p[kRed] = bar[0];
                p[kGreen] = bar[1];
                p[kBlue] = bar[2];
                p[kAlpha] = 1.0f;
                break;
            }
        }
    }

    // Where the text lands: its top-left pixel, its length and the dot size.
    struct TextBlock {
        int left, top, length, scale;
    };

    TextBlock LayOutText(int width, int height) const {
        TextBlock t;
        t.length = static_cast<int>(std::strlen(mText));  // the last byte is always 0
        t.scale = mTextScale > 0 ? mTextScale : 1;
        // The block ends with the last glyph, not with its spacing column.
        const double blockWidth = (t.length * kAdvance - 1) * t.scale;
        const double blockHeight = kGlyphHeight * t.scale;
        t.left = static_cast<int>(std::lround(mPosition.x * width - blockWidth / 2));
        t.top = static_cast<int>(std::lround(mPosition.y * height - blockHeight / 2));
        return t;
    }

    // Paints the text's dots that fall on row y, columns x0 .. x0 + count - 1.
    void DrawTextRow(const TextBlock& t, int y, int x0, int count, float* row) const {
        if (t.length == 0 || y < t.top || y >= t.top + kGlyphHeight * t.scale) return;
        const int glyphRow = (y - t.top) / t.scale;
        const int first = std::max(x0, t.left);
        const int last = std::min(x0 + count - 1, t.left + t.length * kAdvance * t.scale - 1);
        for (int x = first; x <= last; ++x) {
            const int dot = (x - t.left) / t.scale;  // dot column within the whole line
            const int column = dot % kAdvance;
            if (column >= kGlyphWidth) continue;  // spacing between glyphs
            const unsigned char bits = Glyph(mText[dot / kAdvance])[column];
            if (bits & (1u << glyphRow))
                SetPixel(&row[static_cast<size_t>(x - x0) * 4], mTextColour);
        }
    }

    int mPattern = kColourBars;
    ulkColorRGB mColourA = {1.0, 1.0, 1.0};
    ulkColorRGB mColourB = {0.0, 0.0, 0.0};
    int mCellSize = 32;
    double mAngle = 0.0;
    char mText[kTextSize] = {};
    ulkColorRGB mTextColour = {1.0, 1.0, 1.0};
    int mTextScale = 4;
    ulkPoint2D mPosition = {0.5, 0.5};
};

class GeneratorModel : public ulkModel_v1 {
  public:
    bool DefineIdentity() override {
        SetName("Generator");
        SetType(kPluginTypeTitle);
        SetVendor("ULK Samples");
        SetCategory("Generate");
        SetIdentifier("com.ulk.samples.generator");
        SetDescription("Colour bars, checkerboard or gradient with a line of text");
        SetPluginVersion(1.0f);
        return true;
    }

    // A title describes itself: the formats, no input, one output.
    bool DefineEffect() override {
        return AddSampleFormats(this) && AddOutput(0, "Output", "output", kDataTypeDefault);
    }

    ulkInstance_v1* NewInstance() override { return new GeneratorInstance; }
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return 1;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex == 0 ? new GeneratorModel : nullptr;
}

// The bridge's models: which installed effects it offers and how it describes
// them, seen through a host model and instance. The expected descriptions come
// from the effects' own sources.
#include <algorithm>
#include <set>

#include "frei0r_host.h"

namespace {

using Frei0rModels = Frei0rTest;

// Every installed module becomes a model or is named on the console as left
// out; Debian's effects are all plain frei0r 1 modules, so none is.
TEST_F(Frei0rModels, EveryInstalledEffectIsOfferedInFileNameOrder) {
    std::set<std::string> installed;
    const char* home = std::getenv("HOME");
    const std::string folders[] = {std::string(home ? home : "/nonexistent") + "/.frei0r-1/lib",
                                   "/usr/local/lib/frei0r-1", "/usr/lib/frei0r-1"};
    for (const std::string& folder : folders) {
        std::error_code error;
        for (const auto& entry : fs::directory_iterator(folder, error))
            if (entry.path().extension() == ".so")
                installed.insert(entry.path().filename().string());
    }
    ASSERT_GT(installed.size(), 100u) << "frei0r-plugins is not installed";
    const auto numbers = BridgeModelNumbers();
    const auto leftOut = Console::Lines("left out");
    EXPECT_EQ(numbers.size() + leftOut.size(), installed.size());
    EXPECT_TRUE(leftOut.empty()) << leftOut.front();
    EXPECT_EQ(numbers.at("frei0r.B") + 1, numbers.at("frei0r.G"));  // "B.so" < "G.so"
    EXPECT_LT(numbers.at("frei0r.blend"), numbers.at("frei0r.brightness"));
    EXPECT_EQ(BridgeModelNumbers(), numbers);  // stable from load to load
}

// Identity from the plug-in info; the frei0r plug-in type and colour model
// decide the kind of effect, its inputs and its formats.
TEST_F(Frei0rModels, DescribeThemselvesFromThePluginInfo) {
    const std::vector<ulkImgFormat> rgba = {kImgFormatRGBA}, bgra = {kImgFormatBGRA};
    const struct {
        const char* identifier;
        ulkPluginType type;
        int inputs;
        std::vector<ulkImgFormat> formats;  // sorted
    } effects[] = {
        {"frei0r.brightness", kPluginTypeFilter, 1, rgba},
        {"frei0r.pixeliz0r",  // PACKED32
         kPluginTypeFilter,
         1,
         {kImgFormatRGBA, kImgFormatABGR, kImgFormatARGB, kImgFormatBGRA}},
        {"frei0r.xfade0r", kPluginTypeCompositor, 2, bgra},
        {"frei0r.composition", kPluginTypeCompositor, 2, rgba},  // f0r_update2 only
        {"frei0r.RGB", kPluginTypeCompositor, 3, rgba},          // mixer3
        {"frei0r.onecol0r", kPluginTypeTitle, 0, bgra},          // source
    };
    for (const auto& e : effects) {
        SCOPED_TRACE(e.identifier);
        BridgeEffect effect(e.identifier);
        ASSERT_TRUE(effect.ok());
        ulkHostModel& model = effect.model();
        EXPECT_STREQ(model.GetIdentifier(), e.identifier);
        EXPECT_STREQ(model.GetCategory(), "frei0r");
        EXPECT_EQ(model.GetType(), e.type);
        EXPECT_EQ(model.GetNumInputs(), e.inputs);
        EXPECT_EQ(model.GetNumOutputs(), 1);
        std::vector<ulkImgFormat> formats;
        for (int i = 0; i < model.GetNumFormats(); ++i) {
            EXPECT_EQ(model.GetFormat(i)->GetBitDepth(), 8);
            formats.push_back(model.GetFormat(i)->GetFormat());
        }
        std::sort(formats.begin(), formats.end());
        EXPECT_EQ(formats, e.formats);
    }
    BridgeEffect blend("frei0r.blend");
    ASSERT_TRUE(blend.ok());
    EXPECT_STREQ(blend.model().GetName(), "blend");
    EXPECT_STREQ(blend.model().GetVendor(), "Jean-Sebastien Senecal");
    EXPECT_FLOAT_EQ(blend.model().GetPluginVersion(), 0.2f);
}

// Each frei0r type becomes its ULK kind, starting at the effect's default;
// names become identifiers in lower case with underscores.
TEST_F(Frei0rModels, ParametersOfEachKindWithTheEffectsDefaults) {
    BridgeEffect brightness("frei0r.brightness"), onecol("frei0r.onecol0r"),
        curves("frei0r.curves");  // made, never executed: it hangs on its defaults
    ASSERT_TRUE(brightness.ok() && onecol.ok() && curves.ok());
    auto* number = brightness.Param<ulkPNumber>("brightness");
    ASSERT_NE(number, nullptr);
    EXPECT_STREQ(number->GetLabel(), "Brightness");
    EXPECT_EQ(number->GetMinimum(), 0.0);
    EXPECT_EQ(number->GetMaximum(), 1.0);
    EXPECT_DOUBLE_EQ(number->GetDefaultValue(), 0.5);
    EXPECT_NE(onecol.Param<ulkPColorRGB>("color"), nullptr);
    EXPECT_EQ(curves.instance()->GetNumParameters(), 16);
    EXPECT_NE(curves.Param<ulkPBoolean>("show_curves"), nullptr);
    EXPECT_NE(curves.Param<ulkPNumber>("point_5_output_value"), nullptr);
    EXPECT_NE(curves.Param<ulkPString>("b__zier_spline"), nullptr);  // "Bézier spline"
}

// FREI0R_PATH replaces the default folders; the first folder wins a name, and
// modules that are not frei0r effects are reported and left out.
TEST_F(Frei0rModels, Frei0rPathChoosesTheFoldersSearched) {
    ScratchDir first, second, junk;
    fs::create_symlink("/usr/lib/frei0r-1/invert0r.so", first.path / "invert0r.so");
    fs::copy_file("/usr/lib/frei0r-1/gamma.so", first.path / "gamma.so");
    fs::create_symlink("/usr/lib/frei0r-1/brightness.so", second.path / "gamma.so");  // same name
    fs::copy_file(BridgePath(), junk.path / "ulk.so");  // a ULK module, not frei0r
    WriteFile(junk.path / "broken.so", {'n', 'o', 't', ' ', 'E', 'L', 'F'});
    WriteFile(junk.path / "notes.txt", {'x'});
    using Numbers = std::map<std::string, int>;
    {
        Frei0rPathGuard path(first.path.c_str());
        EXPECT_EQ(BridgeModelNumbers(), (Numbers{{"frei0r.gamma", 0}, {"frei0r.invert0r", 1}}));
    }
    Console::Text().clear();
    {
        const std::string all =
            first.path.string() + ":" + second.path.string() + ":" + junk.path.string();
        Frei0rPathGuard path(all.c_str());
        EXPECT_EQ(BridgeModelNumbers(), (Numbers{{"frei0r.gamma", 0}, {"frei0r.invert0r", 1}}));
        const auto leftOut = Console::Lines("left out");
        ASSERT_EQ(leftOut.size(), 2u) << Console::Text();
        EXPECT_NE(leftOut[0].find("broken.so"), std::string::npos);
        EXPECT_NE(leftOut[1].find("ulk.so"), std::string::npos);
        EXPECT_NE(leftOut[1].find("f0r_init"), std::string::npos);  // says why
        SampleEffect gamma(BridgePath(), 0);
        EXPECT_STREQ(gamma.model().GetName(), "Gamma");  // the first folder's, not brightness
    }
    Frei0rPathGuard nothingUsable(junk.path.c_str());
    EXPECT_TRUE(BridgeModelNumbers().empty());
}

}  // namespace

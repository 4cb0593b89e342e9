// The bridge's models: which installed effects it offers and how it describes
// them, checked through a host model and instance as a host sees them. The
// expected descriptions come from the effects' own sources (frei0r plug-in info).
#include <algorithm>
#include <set>

#include "frei0r_host.h"

namespace {

const char* const kDefaultFolders[] = {"/usr/local/lib/frei0r-1", "/usr/lib/frei0r-1"};

/// Distinct .so file names in the default folders (and $HOME's), counted by the test.
size_t InstalledModuleCount() {
    std::vector<std::string> folders(std::begin(kDefaultFolders), std::end(kDefaultFolders));
    if (const char* home = std::getenv("HOME"))
        folders.push_back(std::string(home) + "/.frei0r-1/lib");
    std::set<std::string> names;
    for (const std::string& folder : folders) {
        std::error_code error;
        for (const auto& entry : fs::directory_iterator(folder, error))
            if (entry.path().extension() == ".so") names.insert(entry.path().filename().string());
    }
    return names.size();
}

/// The model count the bridge reports for the current search path.
int ModelCount() {
    ulkHostModel model(0);
    const int count =
        model.Open(BridgePath().c_str(), 0, nullptr) ? model.GetDLL()->GetNumModels() : -1;
    model.Close();
    return count;
}

std::vector<ulkImgFormat> FormatsOf(const ulkHostModel& model) {
    std::vector<ulkImgFormat> formats;
    for (int i = 0; i < model.GetNumFormats(); ++i) {
        EXPECT_EQ(model.GetFormat(i)->GetBitDepth(), 8);
        formats.push_back(model.GetFormat(i)->GetFormat());
    }
    std::sort(formats.begin(), formats.end());
    return formats;
}

using Frei0rModels = Frei0rTest;

// Every installed module becomes a model or is named on the console as left
// out; the Debian package's effects are all plain frei0r 1 modules.
TEST_F(Frei0rModels, EveryInstalledEffectIsOfferedOrReportedAsLeftOut) {
    const size_t installed = InstalledModuleCount();
    ASSERT_GT(installed, 100u) << "frei0r-plugins is not installed";
    const int models = ModelCount();
    const auto leftOut = ConsoleCapture::Lines("left out");
    EXPECT_EQ(static_cast<size_t>(models) + leftOut.size(), installed);
    EXPECT_TRUE(leftOut.empty()) << leftOut.front();

    // Model numbers follow the file names and do not change between loads.
    const auto first = BridgeModelNumbers();
    EXPECT_EQ(first.size(), static_cast<size_t>(models));
    EXPECT_EQ(first.at("frei0r.B") + 1, first.at("frei0r.G"));  // "B.so" < "G.so" < "R.so"
    EXPECT_LT(first.at("frei0r.blend"), first.at("frei0r.brightness"));
    EXPECT_EQ(BridgeModelNumbers(), first);
}

TEST_F(Frei0rModels, FilterDescribesItselfFromThePluginInfo) {
    BridgeEffect effect("frei0r.brightness");
    ASSERT_TRUE(effect.ok());
    const ulkHostModel& model = effect.model();
    EXPECT_STREQ(model.GetName(), "Brightness");
    EXPECT_STREQ(model.GetVendor(), "Jean-Sebastien Senecal");
    EXPECT_STREQ(model.GetCategory(), "frei0r");
    EXPECT_STREQ(model.GetIdentifier(), "frei0r.brightness");
    EXPECT_FLOAT_EQ(model.GetPluginVersion(), 0.2f);
    EXPECT_EQ(model.GetType(), kPluginTypeFilter);
    EXPECT_EQ(model.GetNumInputs(), 1);
    EXPECT_EQ(model.GetNumOutputs(), 1);
    EXPECT_EQ(FormatsOf(model), std::vector<ulkImgFormat>{kImgFormatRGBA});  // RGBA8888

    // One real number 0..1 starting at the effect's own default.
    ASSERT_EQ(effect.instance()->GetNumParameters(), 1);
    auto* brightness = dynamic_cast<ulkPNumber*>(effect.Param("brightness"));
    ASSERT_NE(brightness, nullptr);
    EXPECT_STREQ(brightness->GetLabel(), "Brightness");
    EXPECT_EQ(brightness->GetType(), kPNumberReal);
    EXPECT_EQ(brightness->GetMinimum(), 0.0);
    EXPECT_EQ(brightness->GetMaximum(), 1.0);
    EXPECT_DOUBLE_EQ(brightness->GetDefaultValue(), 0.5);

    BridgeEffect invert("frei0r.invert0r");
    ASSERT_TRUE(invert.ok());
    EXPECT_STREQ(invert.model().GetVendor(), "Gephex crew");
    EXPECT_FLOAT_EQ(invert.model().GetPluginVersion(), 0.9f);
    EXPECT_EQ(invert.instance()->GetNumParameters(), 0);

    BridgeEffect pixelize("frei0r.pixeliz0r");  // PACKED32: any byte order
    ASSERT_TRUE(pixelize.ok());
    EXPECT_EQ(FormatsOf(pixelize.model()),
              (std::vector<ulkImgFormat>{kImgFormatRGBA, kImgFormatABGR, kImgFormatARGB,
                                         kImgFormatBGRA}));
}

// Names become identifiers: lower case, spaces (and other signs) to underscores.
TEST_F(Frei0rModels, ParameterNamesBecomeIdentifiersOfTheRightKind) {
    BridgeEffect blur("frei0r.squareblur");
    ASSERT_TRUE(blur.ok());
    EXPECT_NE(dynamic_cast<ulkPNumber*>(blur.Param("kernel_size")), nullptr);

    BridgeEffect curves("frei0r.curves");  // made, never executed: it hangs on its defaults
    ASSERT_TRUE(curves.ok());
    EXPECT_NE(dynamic_cast<ulkPBoolean*>(curves.Param("show_curves")), nullptr);
    EXPECT_NE(dynamic_cast<ulkPString*>(curves.Param("b__zier_spline")),
              nullptr);  // "Bézier spline"
    EXPECT_EQ(curves.Param("b__zier_spline")->GetValueSize(), 256u);
    EXPECT_NE(dynamic_cast<ulkPNumber*>(curves.Param("point_5_output_value")), nullptr);
    EXPECT_EQ(curves.instance()->GetNumParameters(), 16);
}

TEST_F(Frei0rModels, MixersAreCompositorsWithTheirInputs) {
    BridgeEffect blend("frei0r.blend");
    ASSERT_TRUE(blend.ok());
    EXPECT_EQ(blend.model().GetType(), kPluginTypeCompositor);
    EXPECT_EQ(blend.model().GetNumInputs(), 2);
    EXPECT_EQ(FormatsOf(blend.model()), std::vector<ulkImgFormat>{kImgFormatRGBA});
    EXPECT_DOUBLE_EQ(dynamic_cast<ulkPNumber*>(blend.Param("blend"))->GetDefaultValue(), 0.5);

    BridgeEffect xfade("frei0r.xfade0r");
    ASSERT_TRUE(xfade.ok());
    EXPECT_EQ(xfade.model().GetType(), kPluginTypeCompositor);
    EXPECT_EQ(FormatsOf(xfade.model()), std::vector<ulkImgFormat>{kImgFormatBGRA});  // BGRA8888
    EXPECT_DOUBLE_EQ(dynamic_cast<ulkPNumber*>(xfade.Param("fader"))->GetDefaultValue(), 0.0);

    // Mixers exporting only f0r_update2 are offered too; mixer3 has three inputs.
    BridgeEffect composition("frei0r.composition");
    EXPECT_TRUE(composition.ok());
    BridgeEffect rgb("frei0r.RGB");
    ASSERT_TRUE(rgb.ok());
    EXPECT_EQ(rgb.model().GetType(), kPluginTypeCompositor);
    EXPECT_EQ(rgb.model().GetNumInputs(), 3);
    EXPECT_EQ(rgb.model().GetNumOutputs(), 1);
}

TEST_F(Frei0rModels, SourcesAreTitlesWithoutInputs) {
    BridgeEffect onecol("frei0r.onecol0r");
    ASSERT_TRUE(onecol.ok());
    EXPECT_EQ(onecol.model().GetType(), kPluginTypeTitle);
    EXPECT_EQ(onecol.model().GetNumInputs(), 0);
    EXPECT_EQ(onecol.model().GetNumOutputs(), 1);
    EXPECT_NE(dynamic_cast<ulkPColorRGB*>(onecol.Param("color")), nullptr);

    BridgeEffect noise("frei0r.nois0r");
    ASSERT_TRUE(noise.ok());
    EXPECT_EQ(noise.model().GetType(), kPluginTypeTitle);
    EXPECT_STREQ(noise.model().GetVendor(), "Martin Bayer");
}

// FREI0R_PATH replaces the default folders; the first folder wins a name, and
// modules that are not frei0r effects are reported and left out.
TEST_F(Frei0rModels, Frei0rPathChoosesTheFoldersSearched) {
    ScratchDir first, second, junk;
    ASSERT_FALSE(first.path().empty());
    fs::create_symlink("/usr/lib/frei0r-1/invert0r.so", first.path() / "invert0r.so");
    fs::copy_file("/usr/lib/frei0r-1/gamma.so", first.path() / "gamma.so");
    // The same name again in the later folder, with another effect behind it.
    fs::create_symlink("/usr/lib/frei0r-1/brightness.so", second.path() / "gamma.so");
    fs::copy_file(BridgePath(), junk.path() / "ulk.so");  // a ULK module, not frei0r
    WriteFile(junk.path() / "broken.so", {'n', 'o', 't', ' ', 'E', 'L', 'F'});
    WriteFile(junk.path() / "notes.txt", {'x'});

    {
        Frei0rPathGuard path(first.path().c_str());
        EXPECT_EQ(ModelCount(), 2);
        const auto numbers = BridgeModelNumbers();
        EXPECT_EQ(numbers.size(), 2u);
        EXPECT_EQ(numbers.count("frei0r.gamma"), 1u);
        EXPECT_EQ(numbers.count("frei0r.invert0r"), 1u);
    }
    ConsoleCapture::Text().clear();
    {
        const std::string all =
            first.path().string() + ":" + second.path().string() + ":" + junk.path().string();
        Frei0rPathGuard path(all.c_str());
        ulkHostModel model(0);  // "gamma" sorts first
        ASSERT_TRUE(model.Open(BridgePath().c_str(), 0, nullptr));
        EXPECT_EQ(model.GetDLL()->GetNumModels(), 2);
        EXPECT_STREQ(model.GetName(), "Gamma");  // from the first folder, not brightness
        model.Close();
    }
    const auto leftOut = ConsoleCapture::Lines("left out");
    ASSERT_EQ(leftOut.size(), 2u) << ConsoleCapture::Text();
    EXPECT_NE(leftOut[0].find("broken.so"), std::string::npos);
    EXPECT_NE(leftOut[1].find("ulk.so"), std::string::npos);
    EXPECT_NE(leftOut[1].find("f0r_init"), std::string::npos);  // says why

    Frei0rPathGuard nothingUsable(junk.path().c_str());
    ulkHostModel none(0);
    EXPECT_FALSE(none.Open(BridgePath().c_str(), 0, nullptr));  // no effects: no model 0
    none.Close();
}

}  // namespace

// ulk-info run as a program: its JSON read back and checked against what the modules define.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "scratch_folder.h"
#include "test_paths.h"
#include "tool_runner.h"

namespace {

using nlohmann::json;

ToolResult RunInfo(const std::vector<std::string>& arguments) {
    static ScratchFolder folder;
    return RunTool(ULK_INFO_PATH, arguments, folder.Path(""));
}

const json* FindParameter(const json& model, const std::string& id) {
    for (const json& parameter : model["parameters"])
        if (parameter["id"] == id) return &parameter;
    return nullptr;
}

bool HasFormat(const json& model, const std::string& name, int depth) {
    for (const json& format : model["formats"])
        if (format["format"] == name && format["bit_depth"] == depth) return true;
    return false;
}

bool SamplesBuilt() {
    return access(SamplePluginPath("levels").c_str(), R_OK) == 0;
}

TEST(UlkInfo, DescribesTheSamplePluginsAsJson) {
    if (!SamplesBuilt()) GTEST_SKIP() << "sample plug-ins not built";
    // The samples by name: the folder also holds the frei0r bridge, whose
    // installed effects are not ours to describe here.
    std::vector<std::string> args = {"--json"};
    for (const char* sample : {"levels", "blur", "wipe", "generator", "crop"})
        args.push_back(SamplePluginPath(sample));
    const ToolResult result = RunInfo(args);
    ASSERT_EQ(result.status, 0) << result.err;
    const json doc = json::parse(result.out);
    std::map<std::string, json> byName;
    ASSERT_EQ(doc["modules"].size(), 5u);
    for (const json& module : doc["modules"]) {
        EXPECT_TRUE(module["ok"].get<bool>()) << module.dump();
        ASSERT_EQ(module["models"].size(), 1u) << module["path"];
        const json& model = module["models"][0];
        byName[model["name"].get<std::string>()] = model;
    }
    ASSERT_EQ(byName.count("Levels"), 1u);

    const json& levels = byName["Levels"];
    EXPECT_EQ(levels["type"], "Filter");
    EXPECT_EQ(levels["class"], "Image");
    EXPECT_EQ(levels["identifier"], "com.ulk.samples.levels");
    EXPECT_EQ(levels["interface_version"], 1.0);
    EXPECT_TRUE(HasFormat(levels, "RGBA", 8));
    EXPECT_TRUE(HasFormat(levels, "BGRA", 16));
    ASSERT_EQ(levels["inputs"].size(), 1u);
    EXPECT_EQ(levels["inputs"][0]["id"], "input");
    EXPECT_EQ(levels["outputs"].size(), 1u);
    EXPECT_FALSE(levels["has_overlay"].get<bool>());
    const json* gain = FindParameter(levels, "gain");
    ASSERT_NE(gain, nullptr);
    EXPECT_EQ((*gain)["kind"], "Number");
    EXPECT_EQ((*gain)["default"], "1");
    EXPECT_EQ((*gain)["minimum"], 0.0);
    EXPECT_EQ((*gain)["maximum"], 4.0);
    const json* channels = FindParameter(levels, "channels");
    ASSERT_NE(channels, nullptr);
    EXPECT_EQ((*channels)["default"], "RGB");
    EXPECT_EQ((*channels)["items"].size(), 5u);
    const json* tint = FindParameter(levels, "tint");
    ASSERT_NE(tint, nullptr);
    EXPECT_EQ((*tint)["default"], "1,1,1");
    ASSERT_EQ((*tint)["channels"].size(), 3u);
    EXPECT_EQ((*tint)["channels"][0]["id"], "red");

    // The compositor's two inputs, the title's none, the crop's overlay, a grouped parameter.
    ASSERT_EQ(byName.count("Wipe"), 1u);
    EXPECT_EQ(byName["Wipe"]["type"], "Compositor");
    EXPECT_EQ(byName["Wipe"]["inputs"].size(), 2u);
    ASSERT_EQ(byName.count("Generator"), 1u);
    EXPECT_EQ(byName["Generator"]["type"], "Title");
    EXPECT_TRUE(byName["Generator"]["inputs"].empty());
    const json* text = FindParameter(byName["Generator"], "text");
    ASSERT_NE(text, nullptr);
    EXPECT_EQ((*text)["group"], "text_group");
    ASSERT_EQ(byName.count("Crop"), 1u);
    EXPECT_TRUE(byName["Crop"]["has_overlay"].get<bool>());
}

TEST(UlkInfo, DescribesEveryModelOfAModule) {
    const ToolResult result = RunInfo({"--json", TestPluginPath("effects")});
    ASSERT_EQ(result.status, 0) << result.err;
    const json models = json::parse(result.out)["modules"][0]["models"];
    ASSERT_EQ(models.size(), 3u);
    EXPECT_EQ(models[0]["name"], "Invert");
    EXPECT_EQ(models[0]["plugin_version"], 2.5);
    EXPECT_TRUE(HasFormat(models[0], "Any", 8));
    EXPECT_EQ(models[1]["type"], "Compositor");
    EXPECT_EQ(models[2]["type"], "Title");
    EXPECT_TRUE(HasFormat(models[2], "UYVY", 8));
    EXPECT_TRUE(models[2]["inputs"][0]["optional"].get<bool>());
}

TEST(UlkInfo, ReportsFailuresAndGoesOn) {
    // A module with failing models, one that does not exist, and a good one after them.
    const ToolResult result = RunInfo({"--json", TestPluginPath("model_faults"),
                                       "/nonexistent/module.so", TestPluginPath("effects")});
    EXPECT_EQ(result.status, 1);
    const json modules = json::parse(result.out)["modules"];
    ASSERT_EQ(modules.size(), 3u);
    EXPECT_FALSE(modules[0]["ok"].get<bool>());
    // Model 4 records its own text; model 13 is a working filter.
    EXPECT_EQ(modules[0]["models"][4]["error"], "no licence for this model");
    EXPECT_EQ(modules[0]["models"][13].count("error"), 0u);
    EXPECT_EQ(modules[0]["models"][13]["type"], "Filter");
    EXPECT_FALSE(modules[1]["ok"].get<bool>());
    EXPECT_NE(modules[1]["error"].get<std::string>().find("cannot load"), std::string::npos);
    EXPECT_TRUE(modules[2]["ok"].get<bool>());
    // Each failure is also one line on stderr.
    EXPECT_NE(result.err.find("model 4: no licence for this model\n"), std::string::npos);
    EXPECT_NE(result.err.find("model 11: the plug-in threw"), std::string::npos);
}

TEST(UlkInfo, TextOutputFoldersAndUsage) {
    // A folder (with a sub-folder) of two modules. Not the whole test-plugin folder: the
    // probe modules there take their start-up argument for a control block of theirs.
    ScratchFolder folder;
    std::filesystem::create_directory(folder.Path("sub"));
    std::filesystem::create_symlink(TestPluginPath("effects"), folder.Path("effects.so"));
    std::filesystem::create_symlink(TestPluginPath("model_faults"),
                                    folder.Path("sub/model_faults.so"));
    const ToolResult text = RunInfo({folder.Path("")});
    EXPECT_NE(text.out.find("effects.so\n  model 0: Invert\n"), std::string::npos);
    EXPECT_NE(text.out.find("FAILED: no licence for this model"), std::string::npos);
    EXPECT_EQ(text.status, 1);  // the folder holds model_faults

    EXPECT_EQ(RunInfo({}).status, 2);
    EXPECT_EQ(RunInfo({"--frobnicate", TestPluginPath("effects")}).status, 2);
    const ToolResult help = RunInfo({"--help"});
    EXPECT_EQ(help.status, 0);
    EXPECT_NE(help.out.find("usage: ulk-info"), std::string::npos);
}

}  // namespace

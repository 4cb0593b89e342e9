// ulk-validate end to end: the built tool over the sample plug-ins, which must pass, and over
// test modules that break one rule per model, each of which must fail under the right check
// while the run goes on.
#include <gtest/gtest.h>

#include <filesystem>
#include <map>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "../plugins/validate_faults/validate_faults.h"
#include "../tools/scratch_folder.h"
#include "../tools/tool_runner.h"
#include "test_paths.h"

namespace {

// What the tool said about one model: its summary line and the names of its failed checks.
struct ModelBlock {
    std::string summary;
    std::vector<std::string> lines;
    std::set<std::string> failed;
};

// Splits the report into per-model blocks, keyed by "<module file> <model index>".
std::map<std::string, ModelBlock> ParseReport(const std::string& out) {
    static const std::regex kCheck("^(PASS|FAIL) ([^:]+)(: .*)?$");
    static const std::regex kSummary("^(PASS|FAIL) (model (\\d+)( \\(.*\\))?|module): .*$");
    std::map<std::string, ModelBlock> blocks;
    std::istringstream lines(out);
    std::string line, module;
    ModelBlock current;
    std::smatch match;
    while (std::getline(lines, line)) {
        if (line.rfind("== ", 0) == 0) {
            module = std::filesystem::path(line.substr(3)).filename().string();
        } else if (std::regex_match(line, match, kSummary)) {
            current.summary = line;
            blocks[module + " " + (match[3].matched ? match[3].str() : "module")] = current;
            current = ModelBlock();
        } else if (std::regex_match(line, match, kCheck)) {
            current.lines.push_back(line);
            if (match[1] == "FAIL") current.failed.insert(match[2]);
        }
    }
    return blocks;
}

class UlkValidateTest : public ::testing::Test {
  protected:
    ToolResult Validate(const std::vector<std::string>& arguments) {
        return RunTool(ULK_VALIDATE_PATH, arguments, mScratch.Path(""));
    }
    ScratchFolder mScratch;
};

TEST_F(UlkValidateTest, SamplePluginsPassEveryCheck) {
    std::vector<std::string> arguments = {"--quick"};
    for (const char* sample : {"levels", "blur", "wipe", "generator", "crop"})
        arguments.push_back(SamplePluginPath(sample));
    if (!std::filesystem::exists(arguments.back())) GTEST_SKIP() << "the samples are not built";
    const ToolResult result = Validate(arguments);
    EXPECT_EQ(result.status, 0) << result.out << result.err;
    EXPECT_EQ(result.out.find("FAIL"), std::string::npos) << result.out;

    const auto blocks = ParseReport(result.out);
    ASSERT_EQ(blocks.size(), 5u) << result.out;
    for (const auto& [model, block] : blocks) {
        EXPECT_EQ(block.summary.rfind("PASS model 0 (", 0), 0u) << block.summary;
        std::set<std::string> names;
        for (const std::string& line : block.lines)
            names.insert(line.substr(5, line.find(':') - 5));
        for (const char* check :
             {"identity", "description", "instance", "parameters", "pre/post-process", "execute",
              "output bounds", "exceptions", "cleanup", "host memory", "identifier unique"})
            EXPECT_EQ(names.count(check), 1u) << model << " lacks " << check;
    }
    // The crop sample is the one with an overlay; the generator the one without inputs.
    EXPECT_EQ(blocks.at("crop.so 0").lines.size(), 16u);
    EXPECT_EQ(result.out.find("PASS overlay events"), result.out.rfind("PASS overlay events"));
}

// Each faulty model fails exactly the check that covers its fault, the clean one passes, and a
// crash or hang in one model does not stop the models after it.
TEST_F(UlkValidateTest, EachFaultFailsItsOwnCheckAndTheRunGoesOn) {
    const ToolResult result =
        Validate({"--quick", "--timeout", "1", TestPluginPath("validate_faults")});
    EXPECT_EQ(result.status, 1) << result.out << result.err;
    const auto blocks = ParseReport(result.out);
    ASSERT_EQ(blocks.size(), static_cast<size_t>(kValidateModelCount)) << result.out;

    const std::map<int, std::string> expected = {{kValidateRowOverrun, "output bounds"},
                                                 {kValidateNullWrite, "execute"},
                                                 {kValidateEndless, "execute"},
                                                 {kValidateLeak, "host memory"},
                                                 {kValidateInputWrite, "input unchanged"},
                                                 {kValidateThrows, "exceptions"},
                                                 {kValidateTwinParams, "parameters"},
                                                 {kValidateOverlayOverrun, "overlay events"}};
    for (int model = 0; model < kValidateModelCount; ++model) {
        const ModelBlock& block = blocks.at("validate_faults.so " + std::to_string(model));
        const auto fault = expected.find(model);
        if (fault == expected.end()) {
            EXPECT_EQ(block.summary.rfind("PASS model 0 (Clean)", 0), 0u) << block.summary;
            continue;
        }
        EXPECT_EQ(block.summary.rfind("FAIL model " + std::to_string(model), 0), 0u)
            << block.summary;
        EXPECT_EQ(block.failed, std::set<std::string>{fault->second}) << block.summary;
    }

    const std::string& out = result.out;
#if defined(__SANITIZE_ADDRESS__)
    // AddressSanitizer reports the fault itself and ends the process with status 1.
    const char* const kCrash = "FAIL model 2 (Null write): exited with status 1 before finishing";
#else
    const char* const kCrash = "FAIL model 2 (Null write): crashed with SIGSEGV during execute";
#endif
    EXPECT_NE(out.find(kCrash), std::string::npos) << out;
    EXPECT_NE(out.find("FAIL model 3 (Endless): timed out after 1 s during execute"),
              std::string::npos)
        << out;
    EXPECT_NE(out.find("FAIL output bounds: RGBA/8 17x9 t=0"), std::string::npos) << out;
    EXPECT_NE(out.find("1 byte after the end of row 0"), std::string::npos) << out;
    EXPECT_NE(out.find("FAIL input unchanged: RGBA/8 17x9 t=0"), std::string::npos) << out;
    EXPECT_NE(out.find("Unhandled Exception"), std::string::npos) << out;
    EXPECT_NE(out.find("instance blocks"), std::string::npos) << out;
    EXPECT_NE(out.find("after the end of the last row of the surface"), std::string::npos) << out;
}

// Models that fail to open or to make an instance are reported as such, and the working
// models of the same module still pass.
TEST_F(UlkValidateTest, ModelsThatFailEarlyAreReportedAndTheOthersStillRun) {
    const ToolResult result = Validate({"--quick", TestPluginPath("model_faults")});
    EXPECT_EQ(result.status, 1) << result.out << result.err;
    const auto blocks = ParseReport(result.out);
    ASSERT_EQ(blocks.size(), 15u) << result.out;
    auto failed = [&](int model) {
        return blocks.at("model_faults.so " + std::to_string(model)).failed;
    };
    for (int model : {0, 1, 4, 5, 7, 14}) EXPECT_EQ(failed(model).count("open"), 1u) << model;
    for (int model : {8, 9, 10, 11}) EXPECT_EQ(failed(model), std::set<std::string>{"instance"});
    EXPECT_NE(result.out.find("no licence for this model"), std::string::npos);
    EXPECT_NE(result.out.find("threw while defining its parameters"), std::string::npos);
    EXPECT_TRUE(failed(12).empty()) << blocks.at("model_faults.so 12").summary;
    EXPECT_TRUE(failed(13).empty()) << blocks.at("model_faults.so 13").summary;
}

TEST_F(UlkValidateTest, UsageErrorsExitWithTwo) {
    EXPECT_EQ(Validate({}).status, 2);
    EXPECT_EQ(Validate({"--timeout", "0", SamplePluginPath("levels")}).status, 2);
    EXPECT_EQ(Validate({"--timeout"}).status, 2);
    EXPECT_EQ(Validate({"--fast", SamplePluginPath("levels")}).status, 2);
    const ToolResult help = Validate({"--help"});
    EXPECT_EQ(help.status, 0);
    EXPECT_NE(help.out.find("usage: ulk-validate"), std::string::npos);
    // A file that is not a module is a failed check, not a usage error.
    const ToolResult missing = Validate({mScratch.Path("none.so")});
    EXPECT_EQ(missing.status, 1);
    EXPECT_NE(missing.out.find("FAIL load: "), std::string::npos) << missing.out;
    EXPECT_NE(missing.out.find("FAIL module"), std::string::npos) << missing.out;
}

// Every module of the bad plug-in corpus is reported, and the tool itself survives each.
TEST_F(UlkValidateTest, EveryBadPluginIsReportedWithoutCrashingTheTool) {
    std::vector<std::string> corpus;
    for (const auto& entry : std::filesystem::directory_iterator(ULK_TEST_PLUGIN_DIR)) {
        const std::string name = entry.path().filename().string();
        if (name.rfind("bad_", 0) == 0 && entry.path().extension() == ".so")
            corpus.push_back(entry.path().string());
    }
    if (corpus.empty()) GTEST_SKIP() << "the bad plug-in corpus is not built";
    for (const std::string& module : corpus) {
        const ToolResult result = Validate({"--quick", "--timeout", "5", module});
        EXPECT_TRUE(result.status == 0 || result.status == 1) << module << "\n" << result.err;
        EXPECT_FALSE(ParseReport(result.out).empty()) << module << "\n" << result.out;
        // A negative model count reads as tens of thousands of models: refused, not opened.
        if (module.find("bad_negative_models") != std::string::npos) {
            EXPECT_NE(result.out.find("FAIL model count: "), std::string::npos) << result.out;
        }
    }
}

}  // namespace

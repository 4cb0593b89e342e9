// ulk-info: describes every effect model of the plug-in modules it is given.
#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "ulk_tools/effect.h"
#include "ulk_tools/model_info.h"

namespace {

const char kUsage[] =
    "usage: ulk-info [--json] PLUGIN...\n"
    "\n"
    "Describes every model of every plug-in module: identity, accepted formats, inputs and\n"
    "outputs, user interface and overlay, and the parameters of a new instance (kind, label,\n"
    "identifier, default value as text, range or items, channels, group). A PLUGIN that is a\n"
    "folder is searched for *.so files.\n"
    "\n"
    "  --json    print JSON instead of text\n"
    "  --help    print this help\n"
    "\n"
    "Modules that fail to load or open are reported and do not stop the scan.\n"
    "Exit status: 0 all described, 1 some failed, 2 usage error.\n"
    "\n"
    "example: ulk-info --json /usr/lib/ulk/plugins\n";

int Usage(const char* message) {
    std::fprintf(stderr, "ulk-info: %s\n(try ulk-info --help)\n", message);
    return 2;
}

}  // namespace

int main(int argc, char** argv) {
    bool json = false;
    std::vector<std::string> arguments;
    for (int i = 1; i < argc; ++i) {
        if (std::strcmp(argv[i], "--help") == 0 || std::strcmp(argv[i], "-h") == 0) {
            std::fputs(kUsage, stdout);
            return 0;
        }
        if (std::strcmp(argv[i], "--json") == 0)
            json = true;
        else if (argv[i][0] == '-' && argv[i][1] != '\0')
            return Usage((std::string("unknown option ") + argv[i]).c_str());
        else
            arguments.push_back(argv[i]);
    }
    if (arguments.empty()) return Usage("no plug-in given");

    const std::vector<std::string> files = ulk_tools::FindModuleFiles(arguments);
    if (files.empty()) return Usage("no plug-in module found");
    // Each module is loaded once while it is described; let several stay loaded.
    ulk_tools::InstallHostServices(static_cast<int>(files.size()) + 1);

    std::vector<ulk_tools::ModuleInfo> modules;
    bool allGood = true;
    for (const std::string& file : files) {
        modules.push_back(ulk_tools::DescribeModule(file));
        const ulk_tools::ModuleInfo& module = modules.back();
        if (module.Ok()) continue;
        allGood = false;
        if (!module.error.empty())
            std::fprintf(stderr, "ulk-info: %s: %s\n", file.c_str(), module.error.c_str());
        for (const ulk_tools::ModelInfo& model : module.models)
            if (!model.error.empty())
                std::fprintf(stderr, "ulk-info: %s: model %d: %s\n", file.c_str(), model.index,
                             model.error.c_str());
    }
    const std::string text =
        json ? ulk_tools::ModulesAsJson(modules) : ulk_tools::ModulesAsText(modules);
    std::fwrite(text.data(), 1, text.size(), stdout);
    ulkHostGlobal::FreeULKGlobalMemory();
    return allGood ? 0 : 1;
}

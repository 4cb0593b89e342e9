// ulk-validate: runs every model of the given plug-in modules through its whole life the way a
// careful host would, and reports one line per check.
#include <unistd.h>

#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "ulk_tools/arguments.h"
#include "ulk_tools/model_info.h"
#include "ulk_tools/validate.h"

namespace {

const char kUsage[] =
    "usage: ulk-validate [--timeout SECONDS] [--quick] PLUGIN...\n"
    "\n"
    "Loads every model of every plug-in module (a folder is searched for *.so) as a careful\n"
    "host would and prints one line per check, PASS or FAIL, then a summary line per model:\n"
    "  identity and description (name, type, formats, inputs for the type), identifiers unique;\n"
    "  an instance and its parameters (identifiers unique, defaults in range, list items, texts);\n"
    "  Execute on every accepted 8- and 16-bit RGB-family format at 1x1, 17x9 and 1920x1080\n"
    "  with padded rows, at times 0, 0.5 and 1 and on both fields, with default and varied\n"
    "  parameters: nothing written outside the output rows, inputs unchanged;\n"
    "  PreProcess/PostProcess runs, CleanUp, exceptions, host memory all given back;\n"
    "  the overlay, when there is one: modes, binding, drawing and mouse events.\n"
    "Each model runs in a process of its own, so a crash or a hang is reported and the run\n"
    "goes on.\n"
    "\n"
    "  --timeout SECONDS  time allowed for one model (default 20)\n"
    "  --quick            skip the 1920x1080 frames\n"
    "  --help             print this help\n"
    "\n"
    "Exit status: 0 every check passed, 1 some check failed, 2 usage error.\n";

int Usage(const std::string& message) {
    std::fprintf(stderr, "ulk-validate: %s\n(try ulk-validate --help)\n", message.c_str());
    return 2;
}

}  // namespace

int main(int argc, char** argv) {
    ulk_tools::ValidateOptions options;
    std::vector<std::string> arguments;
    for (int i = 1; i < argc; ++i) {
        const std::string argument = argv[i];
        if (argument == "--help" || argument == "-h") {
            std::fputs(kUsage, stdout);
            return 0;
        }
        if (argument == "--quick") {
            options.quick = true;
        } else if (argument == "--timeout") {
            if (++i == argc) return Usage("--timeout needs a number of seconds");
            if (!ulk_tools::ParseInt(argv[i], &options.timeoutSeconds) ||
                options.timeoutSeconds < 1 || options.timeoutSeconds > 86400)
                return Usage(std::string("--timeout '") + argv[i] +
                             "': expected whole seconds from 1 to 86400");
        } else if (argument.size() > 1 && argument[0] == '-') {
            return Usage("unknown option " + argument);
        } else {
            arguments.push_back(argument);
        }
    }
    if (arguments.empty()) return Usage("no plug-in given");
    const std::vector<std::string> files = ulk_tools::FindModuleFiles(arguments);
    if (files.empty()) return Usage("no plug-in module found");

    // A status line on a terminal only; logs and pipes get the report alone.
    const bool progress = isatty(STDERR_FILENO) != 0;
    size_t fileNumber = 0;
    ulk_tools::Validator validator(options);
    for (const std::string& file : files) {
        ++fileNumber;
        std::printf("== %s\n", file.c_str());
        std::fflush(stdout);
        validator.ValidateModule(
            file,
            [&](const std::string&, int index, int count) {
                if (!progress) return;
                std::fprintf(stderr, "\r\033[K[%zu/%zu] %s: model %d of %d", fileNumber,
                             files.size(), file.c_str(), index + 1, count);
                std::fflush(stderr);
            },
            [&](const ulk_tools::ModelReport& report) {
                if (progress) std::fputs("\r\033[K", stderr);
                for (const ulk_tools::CheckLine& check : report.checks)
                    std::printf("%s\n", ulk_tools::FormatCheckLine(check).c_str());
                std::printf("%s\n", report.Summary().c_str());
                std::fflush(stdout);
            });
    }
    return validator.AllPassed() ? 0 : 1;
}

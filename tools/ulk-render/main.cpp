// ulk-render: renders one effect over a run of frames.
#include <csignal>
#include <cstdio>
#include <cstring>
#include <string>
#include <thread>

#include "ulk_tools/arguments.h"
#include "ulk_tools/effect.h"
#include "ulk_tools/key_file.h"
#include "ulk_tools/render.h"

namespace {

const char kUsage[] =
    "usage: ulk-render [options] PLUGIN[:MODEL] -o OUTPUT [INPUT...]\n"
    "\n"
    "Renders one effect over frames. MODEL is a model number, name or identifier (default\n"
    "0). Give as many inputs as the model has (optional ones may be left out):\n"
    "  shot.png              one picture, used for every frame\n"
    "  shot.####.exr, %04d   a numbered sequence, read frame by frame\n"
    "  pattern[:WxH]         the built-in test pattern (moves from frame to frame)\n"
    "  -                     raw RGBA frames on standard input (needs --raw)\n"
    "OUTPUT is a file (one frame), a numbered sequence, or - for raw RGBA on standard\n"
    "output; the file name's extension picks the image format.\n"
    "\n"
    "Parameters:\n"
    "  --set ID=TEXT         the value for the whole shot (replaces every key)\n"
    "  --set ID@FRAME=TEXT   a key at frame FRAME (a frame number, not a time: it becomes\n"
    "                        the key time FRAME/(total frames - 1) for progressive video)\n"
    "  --keys FILE           keys from a file, one per line: ID TIME TEXT, where TIME is the\n"
    "                        normalised key time 0..1; '#' starts a comment\n"
    "  --save-keys FILE      write every key of every parameter in the same form\n"
    "  Whole-shot values apply first, then key files, then keys at frames.\n"
    "\n"
    "Frames and render context:\n"
    "  --frames A-B          frames to render (default: the input sequence's frames, else 0;\n"
    "                        with a raw input, until the stream ends)\n"
    "  --total-frames N      frames in the whole clip, for key times (default: B + 1)\n"
    "  --rate FPS            frame rate (default 25)\n"
    "  --video-type T        progressive (default), interlaced, or a number\n"
    "  --fields MODE         field mode: frames (default), fields, or a number\n"
    "  --field-dominance F   1 (default) or 2; the field every frame is rendered as\n"
    "  --pixel-aspect R      pixel aspect ratio (default 1)\n"
    "  --quality Q           render quality handed to the effect (default 1)\n"
    "  --size WxH            frame size for effects without inputs\n"
    "  --raw WxH             size of raw RGBA frames on standard input/output\n"
    "\n"
    "Running:\n"
    "  --threads N           frames rendered at once, each thread with its own instance\n"
    "                        (default 1; 0 = one per processor); the output is the same\n"
    "  -q, --quiet           no progress bar (there is none when stderr is not a terminal)\n"
    "  -h, --help            this help\n"
    "\n"
    "Exit status: 0 rendered, 1 failed (message on stderr), 2 usage error.\n"
    "\n"
    "Examples:\n"
    "  ulk-render levels.so --set gain=1.5 -o out.png in.png\n"
    "  ulk-render levels.so --set gain@0=0 --set gain@47=2 --frames 0-47 \\\n"
    "      -o out/shot.####.png pattern:640x360\n"
    "  ulk-render wipe.so --set progress=0.5 -o mix.####.exr a.####.exr b.####.exr\n"
    "  ulk-render generator.so --size 1920x1080 --frames 0-99 -o card.%04d.png\n"
    "  ffmpeg -i in.mp4 -f rawvideo -pix_fmt rgba - | \\\n"
    "    ulk-render blur.so --raw 1280x720 --set radius=4 -o - - | \\\n"
    "    ffmpeg -f rawvideo -pix_fmt rgba -s 1280x720 -r 25 -i - out.mp4\n";

int Usage(const std::string& message) {
    std::fprintf(stderr, "ulk-render: %s\n(try ulk-render --help)\n", message.c_str());
    return 2;
}

// A named choice or a whole number.
bool ParseChoice(const std::string& text, const char* zero, const char* one, int32_t* value) {
    if (text == zero) {
        *value = 0;
        return true;
    }
    if (text == one) {
        *value = 1;
        return true;
    }
    int number = 0;
    if (!ulk_tools::ParseInt(text, &number)) return false;
    *value = number;
    return true;
}

}  // namespace

int main(int argc, char** argv) {
    ulk_tools::RenderSettings settings;
    std::vector<std::string> positional;
    bool haveOutput = false;
    std::vector<std::string> keyFiles;
    for (int i = 1; i < argc; ++i) {
        std::string arg = argv[i];
        if (arg == "-h" || arg == "--help") {
            std::fputs(kUsage, stdout);
            return 0;
        }
        if (arg == "-q" || arg == "--quiet") {
            settings.quiet = true;
            continue;
        }
        if (arg == "-" || arg[0] != '-') {
            positional.push_back(arg);
            continue;
        }
        // Options with a value: "--name VALUE" or "--name=VALUE".
        std::string name = arg, value;
        const size_t equals = arg.find('=');
        if (arg.rfind("--", 0) == 0 && equals != std::string::npos) {
            name = arg.substr(0, equals);
            value = arg.substr(equals + 1);
        } else if (i + 1 < argc) {
            value = argv[++i];
        } else {
            return Usage(arg + " needs a value");
        }
        std::string error;
        int number = 0;
        int32_t choice = 0;
        const std::string bad = "bad value '" + value + "' for " + name;
        if (name == "-o" || name == "--output") {
            settings.output = value;
            haveOutput = true;
        } else if (name == "--set") {
            ulk_tools::SetArgument set;
            if (!ulk_tools::ParseSetArgument(value, &set, &error)) return Usage(error);
            settings.parameters.sets.push_back(set);
        } else if (name == "--keys") {
            keyFiles.push_back(value);
        } else if (name == "--save-keys") {
            settings.saveKeys = value;
        } else if (name == "--frames") {
            if (!ulk_tools::ParseFrameRange(value, &settings.frames, &error)) return Usage(error);
            settings.hasFrames = true;
        } else if (name == "--total-frames") {
            if (!ulk_tools::ParseInt(value, &settings.totalFrames) || settings.totalFrames < 1)
                return Usage(bad + " (a whole number from 1)");
        } else if (name == "--rate") {
            if (!ulk_tools::ParseDouble(value, &settings.rate) || settings.rate <= 0)
                return Usage(bad + " (frames per second, above 0)");
        } else if (name == "--video-type") {
            if (!ParseChoice(value, "progressive", "interlaced", &choice)) return Usage(bad);
            settings.videoType = static_cast<ulkVideoType>(choice);
        } else if (name == "--fields") {
            if (!ParseChoice(value, "frames", "fields", &choice)) return Usage(bad);
            settings.fieldMode = static_cast<ulkFieldMode>(choice);
        } else if (name == "--field-dominance") {
            if (value != "1" && value != "2") return Usage(bad + " (1 or 2)");
            settings.fieldDominance = value == "1" ? kFieldOne : kFieldTwo;
        } else if (name == "--pixel-aspect") {
            if (!ulk_tools::ParseDouble(value, &settings.pixelAspect) || settings.pixelAspect <= 0)
                return Usage(bad + " (a ratio above 0)");
        } else if (name == "--quality") {
            if (!ulk_tools::ParseDouble(value, &settings.quality)) return Usage(bad);
        } else if (name == "--size") {
            if (!ulk_tools::ParseSize(value, &settings.width, &settings.height, &error))
                return Usage(error);
            settings.hasSize = true;
        } else if (name == "--raw") {
            if (!ulk_tools::ParseSize(value, &settings.rawWidth, &settings.rawHeight, &error))
                return Usage(error);
            settings.raw = true;
        } else if (name == "--threads") {
            if (!ulk_tools::ParseInt(value, &number) || number < 0 || number > 256)
                return Usage(bad + " (0 to 256)");
            settings.threads =
                number > 0 ? number
                           : static_cast<int>(std::max(1u, std::thread::hardware_concurrency()));
        } else {
            return Usage("unknown option " + name);
        }
    }
    if (positional.empty()) return Usage("no plug-in given");
    if (!haveOutput) return Usage("no output given (-o OUTPUT)");
    ulk_tools::SplitEffectArgument(positional[0], &settings.plugin, &settings.model);
    settings.inputs.assign(positional.begin() + 1, positional.end());

    std::string error;
    for (const std::string& path : keyFiles) {
        settings.parameters.keyFiles.push_back({path, {}});
        if (!ulk_tools::ReadKeyFile(path, &settings.parameters.keyFiles.back().keys, &error)) {
            std::fprintf(stderr, "ulk-render: %s\n", error.c_str());
            return 1;
        }
    }

    // A reader that closes the pipe is reported as a failed write, not a silent death.
    std::signal(SIGPIPE, SIG_IGN);
    ulk_tools::InstallHostServices(1);
    ulk_tools::RenderSummary summary;
    const bool ok = ulk_tools::Render(
        settings,
        [](const std::string& note) {
            std::fprintf(stderr, "ulk-render: note: %s\n", note.c_str());
        },
        &summary, &error);
    ulkHostGlobal::FreeULKGlobalMemory();
    if (!ok) {
        std::fprintf(stderr, "ulk-render: %s\n", error.c_str());
        return 1;
    }
    return 0;
}

// Rendering one effect over a run of frames, as an editor would: what ulk-render does.
//
// The inputs are image files (one picture used for every frame), numbered sequences, the
// built-in test pattern or a raw RGBA stream; the output is a file, a sequence or a raw
// stream. Each frame's pictures are converted to a pixel format the effect takes, the
// render context is set for the frame and the effect's Execute renders it.
//
// Several frames can render at once: every worker thread has its own model and instance,
// all opened, set up and given the same parameter values on the calling thread before any
// worker starts; a worker then only reads its frames' inputs, executes its own instance and
// writes its frames. The workers take turns at the raw input stream, so frames are read in
// frame order, and raw output frames are written in frame order, so the result does not
// depend on the number of threads. Pictures are made once per worker and reused; an effect
// that takes RGBA renders straight from and into them.
#ifndef ULK_TOOLS_RENDER_H
#define ULK_TOOLS_RENDER_H

#include <cstdio>
#include <functional>
#include <string>
#include <vector>

#include "ulk/ulk.h"
#include "ulk_tools/arguments.h"
#include "ulk_tools/parameter_settings.h"

namespace ulk_tools {

/// Exactly what to render.
struct RenderSettings {
    std::string plugin;               ///< module path
    std::string model;                ///< model number, name or identifier; "" for model 0
    std::vector<std::string> inputs;  ///< file, sequence, "pattern[:WxH]" or "-" (raw stream)
    std::string output;               ///< file, sequence or "-" (raw stream)
    bool raw = false;                 ///< raw stream size given (--raw WxH)
    int rawWidth = 0, rawHeight = 0;
    bool hasSize = false;  ///< frame size for effects without inputs (--size)
    int width = 0, height = 0;
    ParameterSettings parameters;
    std::string saveKeys;    ///< key file to write after setting up, or ""
    bool hasFrames = false;  ///< --frames given
    FrameRange frames;
    int totalFrames = 0;  ///< frames in the clip; 0: the last frame rendered + 1
    double rate = 25.0;
    ulkVideoType videoType = kVideoTypeProgressive;
    ulkFieldMode fieldMode = kFieldModeFrames;
    ulkField fieldDominance = kFieldOne;
    double pixelAspect = 1.0;
    double quality = 1.0;
    int threads = 1;
    bool quiet = false;          ///< no progress bar
    std::FILE* rawIn = stdin;    ///< where "-" inputs are read
    std::FILE* rawOut = stdout;  ///< where "-" output goes
};

/// What a finished render did.
struct RenderSummary {
    long long frames = 0;  ///< frames rendered
    double seconds = 0;    ///< wall time of the rendering, setup excluded
};

/// Renders. Notes that are not errors (a pixel format converted) go to notice. False with a
/// one-line message on the first failure; every frame written before it is complete.
bool Render(const RenderSettings& settings, const std::function<void(const std::string&)>& notice,
            RenderSummary* summary, std::string* error);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_RENDER_H

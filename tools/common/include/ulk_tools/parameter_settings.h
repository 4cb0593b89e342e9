// Parameter values given on the command line (--set) or in a key file (--keys), applied to
// an instance, and the instance's keys read back for --save-keys.
//
// Order of application: first every "ID=TEXT" (the value for the whole shot: it replaces
// every key of the parameter), then the keys of the key files, then every "ID@FRAME=TEXT"
// (a key at that frame). A key-file time is the normalised position 0..1 the library keys
// on; a --set frame is turned into that position with the instance's own time formula, so
// the render context (total frames, video type) must be set before the settings are applied.
#ifndef ULK_TOOLS_PARAMETER_SETTINGS_H
#define ULK_TOOLS_PARAMETER_SETTINGS_H

#include <string>
#include <vector>

#include "ulk/ulk.h"
#include "ulk_tools/arguments.h"
#include "ulk_tools/key_file.h"

namespace ulk_tools {

/// The keys of one key file.
struct KeyFileKeys {
    std::string path;           ///< names the file in messages
    std::vector<KeyLine> keys;  ///< in file order
};

/// Everything the command line says about parameter values.
struct ParameterSettings {
    std::vector<SetArgument> sets;      ///< --set, in order; time holds a frame number when hasTime
    std::vector<KeyFileKeys> keyFiles;  ///< --keys, in order
};

/// The normalised time of frame for instance (its current frame is left as it was).
double FrameTime(ulkHostInstance* instance, int frame);

/// Applies settings to instance. False with a one-line message naming the parameter (and the
/// key file's line) at the first identifier that is unknown, the first frame that is not a
/// whole number or the first text the parameter does not read.
bool ApplyParameterSettings(ulkHostInstance* instance, const ParameterSettings& settings,
                            std::string* error);

/// Every key of every parameter but groups, parameter by parameter in time order, each with
/// its value in text form: what --save-keys writes and --keys reads back.
std::vector<KeyLine> CollectKeys(ulkHostInstance* instance);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_PARAMETER_SETTINGS_H

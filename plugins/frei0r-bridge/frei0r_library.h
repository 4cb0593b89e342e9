// One frei0r effect module, opened and kept open, and the search that finds them.
//
// frei0r effects are shared libraries exporting plain C functions (frei0r.h).
// A Frei0rLibrary dlopens one, resolves those functions, runs f0r_init and
// reads the plug-in and parameter descriptions once; the ULK models and
// instances then call through its function pointers. The library stays open
// until the object is destroyed, which runs f0r_deinit and dlclose.
#ifndef ULK_FREI0R_BRIDGE_FREI0R_LIBRARY_H
#define ULK_FREI0R_BRIDGE_FREI0R_LIBRARY_H

// frei0r.h declares its functions without C linkage of its own.
extern "C" {
#include <frei0r.h>
}

#include <memory>
#include <string>
#include <vector>

namespace frei0r_bridge {

/// The default value of one parameter, in the widest form of each frei0r type.
struct ParamDefault {
    double number = 0.0;  // double and bool (frei0r stores a bool as a double)
    double color[3] = {0.0, 0.0, 0.0};
    double position[2] = {0.0, 0.0};
    std::string text;
};

/// What the bridge knows about one parameter.
struct ParamInfo {
    int type = F0R_PARAM_DOUBLE;
    std::string name;        // frei0r's name, the ULK label
    std::string identifier;  // lower case, identifier-safe, unique in the effect
    std::string explanation;
    ParamDefault defaults;
};

class Frei0rLibrary {
  public:
    // Functions of the frei0r interface (f0r_update or f0r_update2 may be null).
    using UpdateFn = void (*)(f0r_instance_t, double, const uint32_t*, uint32_t*);
    using Update2Fn = void (*)(f0r_instance_t, double, const uint32_t*, const uint32_t*,
                               const uint32_t*, uint32_t*);
    f0r_instance_t (*construct)(unsigned int, unsigned int) = nullptr;
    void (*destruct)(f0r_instance_t) = nullptr;
    void (*setParamValue)(f0r_instance_t, f0r_param_t, int) = nullptr;
    void (*getParamValue)(f0r_instance_t, f0r_param_t, int) = nullptr;
    UpdateFn update = nullptr;
    Update2Fn update2 = nullptr;

    /// Opens the module at path; null with the reason in *why when it cannot
    /// serve as a model (not loadable, not frei0r, unsupported kind).
    static std::unique_ptr<Frei0rLibrary> Open(const std::string& path, std::string* why);
    ~Frei0rLibrary();
    Frei0rLibrary(const Frei0rLibrary&) = delete;
    Frei0rLibrary& operator=(const Frei0rLibrary&) = delete;

    const f0r_plugin_info_t& Info() const { return mInfo; }
    /// The file name without ".so": the stem of the model identifier.
    const std::string& Stem() const { return mStem; }
    const std::string& Identifier() const { return mIdentifier; }
    /// The parameters; defaults are read from a fresh instance on first call.
    const std::vector<ParamInfo>& Params();

  private:
    Frei0rLibrary() = default;
    void ReadDefaults();

    void* mHandle = nullptr;
    void (*mDeinit)() = nullptr;
    f0r_plugin_info_t mInfo = {};
    std::string mStem, mIdentifier;
    std::vector<ParamInfo> mParams;
    bool mDefaultsRead = false;
};

/// The folders searched for effects: FREI0R_PATH (colon-separated) when set,
/// else $HOME/.frei0r-1/lib, /usr/local/lib/frei0r-1, /usr/lib/frei0r-1.
std::vector<std::string> SearchFolders();

/// Every usable effect in the folders, sorted by file name; of two files with
/// the same name the one in the earlier folder wins. Each module left out is
/// reported on the host console, one line each.
std::vector<std::unique_ptr<Frei0rLibrary>> DiscoverEffects(
    const std::vector<std::string>& folders);

}  // namespace frei0r_bridge

#endif  // ULK_FREI0R_BRIDGE_FREI0R_LIBRARY_H

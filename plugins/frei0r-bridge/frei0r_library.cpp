#include "frei0r_library.h"

#include <dlfcn.h>

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <filesystem>
#include <map>
#include <set>

#include "ulk/ulk.h"

namespace frei0r_bridge {
namespace {

namespace fs = std::filesystem;

template <typename Fn>
Fn Symbol(void* handle, const char* name) {
    return reinterpret_cast<Fn>(dlsym(handle, name));
}

/// Lower case letters, digits and underscores only, so that hosts can use it
/// in saved files and on command lines ("Kernel size" -> "kernel_size").
std::string MakeIdentifier(const std::string& name, int index) {
    std::string id;
    for (unsigned char c : name) id += std::isalnum(c) ? static_cast<char>(std::tolower(c)) : '_';
    if (id.empty()) id = "param" + std::to_string(index);
    return id;
}

std::string TextOr(const char* text, const char* fallback) {
    return text ? text : fallback;
}

// Size of the throw-away instance that the defaults are read from; a
// multiple of 8, as every frame the bridge hands to frei0r.
constexpr unsigned kProbeWidth = 64, kProbeHeight = 64;

}  // namespace

std::unique_ptr<Frei0rLibrary> Frei0rLibrary::Open(const std::string& path, std::string* why) {
    // RTLD_LOCAL: every effect exports the same f0r_* names, which must not
    // resolve to another module's.
    void* handle = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (!handle) {
        const char* error = dlerror();
        *why = error ? error : "cannot be loaded";
        return nullptr;
    }
    std::unique_ptr<Frei0rLibrary> library(new Frei0rLibrary);
    library->mHandle = handle;

    auto init = Symbol<int (*)()>(handle, "f0r_init");
    library->mDeinit = Symbol<void (*)()>(handle, "f0r_deinit");
    auto getInfo = Symbol<void (*)(f0r_plugin_info_t*)>(handle, "f0r_get_plugin_info");
    auto getParamInfo = Symbol<void (*)(f0r_param_info_t*, int)>(handle, "f0r_get_param_info");
    library->construct = Symbol<decltype(construct)>(handle, "f0r_construct");
    library->destruct = Symbol<decltype(destruct)>(handle, "f0r_destruct");
    library->setParamValue = Symbol<decltype(setParamValue)>(handle, "f0r_set_param_value");
    library->getParamValue = Symbol<decltype(getParamValue)>(handle, "f0r_get_param_value");
    library->update = Symbol<UpdateFn>(handle, "f0r_update");
    library->update2 = Symbol<Update2Fn>(handle, "f0r_update2");

    const std::pair<const char*, bool> required[] = {
        {"f0r_init", init != nullptr},
        {"f0r_deinit", library->mDeinit != nullptr},
        {"f0r_get_plugin_info", getInfo != nullptr},
        {"f0r_get_param_info", getParamInfo != nullptr},
        {"f0r_construct", library->construct != nullptr},
        {"f0r_destruct", library->destruct != nullptr},
        {"f0r_set_param_value", library->setParamValue != nullptr},
        {"f0r_get_param_value", library->getParamValue != nullptr},
        {"f0r_update or f0r_update2", library->update || library->update2},
    };
    for (const auto& [name, found] : required) {
        if (!found) {
            library->mDeinit = nullptr;  // never initialised: nothing to undo
            *why = std::string("not a frei0r module (no ") + name + ")";
            return nullptr;
        }
    }
    if (!init()) {
        library->mDeinit = nullptr;
        *why = "f0r_init failed";
        return nullptr;
    }

    f0r_plugin_info_t& info = library->mInfo;
    getInfo(&info);
    if (info.frei0r_version > 1) {
        *why = "frei0r API version " + std::to_string(info.frei0r_version) + " is not supported";
        return nullptr;
    }
    if (info.plugin_type < F0R_PLUGIN_TYPE_FILTER || info.plugin_type > F0R_PLUGIN_TYPE_MIXER3) {
        *why = "unknown plugin type " + std::to_string(info.plugin_type);
        return nullptr;
    }
    if (info.color_model < F0R_COLOR_MODEL_BGRA8888 ||
        info.color_model > F0R_COLOR_MODEL_PACKED32) {
        *why = "unknown colour model " + std::to_string(info.color_model);
        return nullptr;
    }
    // frei0r.h: a host must not call f0r_update for mixers.
    const bool mixer =
        info.plugin_type == F0R_PLUGIN_TYPE_MIXER2 || info.plugin_type == F0R_PLUGIN_TYPE_MIXER3;
    if (mixer && !library->update2) {
        *why = "mixer without f0r_update2";
        return nullptr;
    }
    if (info.num_params < 0) info.num_params = 0;

    std::set<std::string> taken;
    for (int i = 0; i < info.num_params; ++i) {
        f0r_param_info_t paramInfo = {};
        getParamInfo(&paramInfo, i);
        if (paramInfo.type < F0R_PARAM_BOOL || paramInfo.type > F0R_PARAM_STRING) {
            *why = "parameter " + std::to_string(i) + " has unknown type " +
                   std::to_string(paramInfo.type);
            return nullptr;
        }
        ParamInfo param;
        param.type = paramInfo.type;
        param.name = TextOr(paramInfo.name, "");
        param.explanation = TextOr(paramInfo.explanation, "");
        const std::string base = MakeIdentifier(param.name, i);
        param.identifier = base;
        for (int n = 2; taken.count(param.identifier); ++n)
            param.identifier = base + "_" + std::to_string(n);
        taken.insert(param.identifier);
        library->mParams.push_back(std::move(param));
    }

    library->mStem = fs::path(path).stem().string();
    library->mIdentifier = "frei0r." + library->mStem;
    return library;
}

Frei0rLibrary::~Frei0rLibrary() {
    if (mDeinit) mDeinit();
    if (mHandle) dlclose(mHandle);
}

const std::vector<ParamInfo>& Frei0rLibrary::Params() {
    if (!mDefaultsRead) {
        mDefaultsRead = true;
        ReadDefaults();
    }
    return mParams;
}

// Read lazily: constructing an instance of every installed effect at start-up
// would cost time and memory for effects the host never uses.
void Frei0rLibrary::ReadDefaults() {
    if (mParams.empty()) return;
    f0r_instance_t instance = construct(kProbeWidth, kProbeHeight);
    if (!instance) return;  // the ULK parameters keep their zero defaults
    for (size_t i = 0; i < mParams.size(); ++i) {
        ParamDefault& d = mParams[i].defaults;
        const int index = static_cast<int>(i);
        switch (mParams[i].type) {
            case F0R_PARAM_BOOL:
            case F0R_PARAM_DOUBLE: {
                double value = 0.0;
                getParamValue(instance, &value, index);
                d.number = value;
                break;
            }
            case F0R_PARAM_COLOR: {
                f0r_param_color_t value = {0.0f, 0.0f, 0.0f};
                getParamValue(instance, &value, index);
                d.color[0] = value.r;
                d.color[1] = value.g;
                d.color[2] = value.b;
                break;
            }
            case F0R_PARAM_POSITION: {
                f0r_param_position_t value = {0.0, 0.0};
                getParamValue(instance, &value, index);
                d.position[0] = value.x;
                d.position[1] = value.y;
                break;
            }
            case F0R_PARAM_STRING: {
                // The effect hands out a pointer to its own text.
                f0r_param_string value = nullptr;
                getParamValue(instance, &value, index);
                d.text = TextOr(value, "");
                break;
            }
        }
    }
    destruct(instance);
}

std::vector<std::string> SearchFolders() {
    std::vector<std::string> folders;
    if (const char* path = std::getenv("FREI0R_PATH")) {
        std::string list = path;
        size_t start = 0;
        while (start <= list.size()) {
            const size_t end = std::min(list.find(':', start), list.size());
            if (end > start) folders.push_back(list.substr(start, end - start));
            start = end + 1;
        }
        return folders;
    }
    if (const char* home = std::getenv("HOME"))
        folders.push_back(std::string(home) + "/.frei0r-1/lib");
    folders.push_back("/usr/local/lib/frei0r-1");
    folders.push_back("/usr/lib/frei0r-1");
    return folders;
}

std::vector<std::unique_ptr<Frei0rLibrary>> DiscoverEffects(
    const std::vector<std::string>& folders) {
    // File name -> path; the first folder to offer a name keeps it. A sorted
    // map gives stable model numbers whatever order the folders list files in.
    std::map<std::string, std::string> files;
    for (const std::string& folder : folders) {
        std::error_code error;
        for (const auto& entry : fs::directory_iterator(folder, error)) {
            const fs::path& path = entry.path();
            if (path.extension() != ".so" || !entry.is_regular_file(error)) continue;
            files.emplace(path.filename().string(), path.string());
        }
    }
    std::vector<std::unique_ptr<Frei0rLibrary>> effects;
    for (const auto& [name, path] : files) {
        std::string why;
        if (auto library = Frei0rLibrary::Open(path, &why)) {
            effects.push_back(std::move(library));
        } else {
            const std::string line = "frei0r bridge: left out " + path + ": " + why + "\n";
            ulkGlobal::ConsolePrintf(line.c_str());
        }
    }
    return effects;
}

}  // namespace frei0r_bridge

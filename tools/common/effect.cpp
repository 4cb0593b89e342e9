#include "ulk_tools/effect.h"

#include <dlfcn.h>
#include <strings.h>
#include <sys/stat.h>

#include <cstdlib>
#include <exception>

#include "ulk_tools/arguments.h"

namespace ulk_tools {

namespace {

void* Allocate(size_t size) {
    return std::malloc(size);
}

void Release(void* p) {
    std::free(p);
}

bool IsRegularFile(const std::string& path) {
    struct stat info {};
    return stat(path.c_str(), &info) == 0 && S_ISREG(info.st_mode);
}

}  // namespace

void InstallHostServices(int maxModules) {
    ulkHostGlobal::SetAllocCallback(Allocate);
    ulkHostGlobal::SetFreeCallback(Release);
    ulkHostModel::SetAllocCallback(Allocate);
    ulkHostModel::SetFreeCallback(Release);
    ulkHostInstance::SetAllocCallback(Allocate);
    ulkHostInstance::SetFreeCallback(Release);
    ulkHostOverlay::SetAllocCallback(Allocate);
    ulkHostOverlay::SetFreeCallback(Release);
    ulkDLLMaker::SetActiveDLLs(static_cast<short>(maxModules < 1 ? 1 : maxModules));
    ulkSetPlayMode(kPlayModeRender);
}

std::string ModelErrorText(const ulkHostModel& model) {
    if (model.GetError() != kErrorNone) return model.GetErrorString();
    // The registry refuses a module without a status; the loader may know why.
    const char* reason = dlerror();
    return reason ? std::string("cannot load the module: ") + reason
                  : std::string("the module's factory made no model");
}

std::string InstanceErrorText(const ulkHostModel& model) {
    return model.GetError() != kErrorNone
               ? std::string("cannot make an instance: ") + model.GetErrorString()
               : std::string("the plug-in made no instance");
}

LoadedModule::~LoadedModule() {
    if (mDLL) ulkDLLMaker::Close(mDLL, kCloseDefault);
}

bool LoadedModule::Load(const std::string& path, std::string* error) {
    dlerror();
    mDLL = ulkDLLMaker::Open(path.c_str(), &mStartUpFlag, nullptr);
    if (mDLL) return true;
    const char* reason = dlerror();
    *error = path + ": " +
             (reason ? std::string("cannot load the module: ") + reason
                     : std::string("cannot load or start the module"));
    return false;
}

int CountModels(const std::string& path, std::string* error) {
    LoadedModule module;
    return module.Load(path, error) ? module.NumModels() : -1;
}

void SplitEffectArgument(const std::string& argument, std::string* path, std::string* selector) {
    const size_t colon = argument.rfind(':');
    if (colon == std::string::npos || IsRegularFile(argument)) {
        *path = argument;
        selector->clear();
        return;
    }
    *path = argument.substr(0, colon);
    *selector = argument.substr(colon + 1);
}

int FindModel(const std::string& path, const std::string& selector, std::string* error) {
    const int count = CountModels(path, error);
    if (count < 0) return -1;
    int index = 0;
    if (selector.empty() || ParseInt(selector, &index)) {
        if (index >= 0 && index < count) return index;
        *error = path + ": no model " + std::to_string(index) + " (the module has " +
                 std::to_string(count) + ")";
        return -1;
    }
    std::string names;
    for (int i = 0; i < count; ++i) {
        ulkHostModel model(static_cast<short>(i));
        std::string ignored;
        if (!OpenModel(&model, path, &ignored)) continue;
        const char* name = model.GetName();
        const char* id = model.GetIdentifier();
        if ((name && strcasecmp(name, selector.c_str()) == 0) || (id && selector == id)) return i;
        if (name) names += std::string(names.empty() ? "" : ", ") + name;
    }
    *error = path + ": no model named '" + selector + "'" +
             (names.empty() ? std::string() : " (it has: " + names + ")");
    return -1;
}

bool OpenModel(ulkHostModel* model, const std::string& path, std::string* error) {
    dlerror();
    // The library lets exceptions from the plug-in's definitions pass.
    try {
        if (model->Open(path.c_str(), 0, nullptr)) return true;
        *error = ModelErrorText(*model);
    } catch (const std::exception& e) {
        *error = std::string("the plug-in threw while opening the model: ") + e.what();
    } catch (const char* text) {
        *error = std::string("the plug-in threw while opening the model: ") + text;
    } catch (...) {
        *error = "the plug-in threw while opening the model";
    }
    return false;
}

ulkHostInstance* NewInstanceOf(ulkHostModel* model, std::string* thrown) {
    // The library lets exceptions from the plug-in's DefineParameters pass.
    try {
        return model->NewInstance();
    } catch (const std::exception& e) {
        *thrown = std::string("the plug-in threw while defining its parameters: ") + e.what();
    } catch (const char* text) {
        *thrown = std::string("the plug-in threw while defining its parameters: ") + text;
    } catch (...) {
        *thrown = "the plug-in threw while defining its parameters";
    }
    return nullptr;
}

std::string PluginTypeText(ulkPluginType type) {
    const char* name = ulkHostModel::GetTypeName(type);
    return name ? name : std::to_string(static_cast<int32_t>(type));
}

std::string ImageFormatText(int32_t format) {
    static const char* const kNames[] = {"Any",  "RGB",  "RGBA", "BGR",        "ABGR",
                                         "ARGB", "BGRA", "YUV",  "YUV422",     "YUYV",
                                         "UYVY", "YUVA", "AVUY", "UYVY+Alpha", "YUYV+Alpha"};
    if (format >= 0 && format < static_cast<int32_t>(sizeof kNames / sizeof kNames[0]))
        return kNames[format];
    return std::to_string(format);
}

Effect::~Effect() {
    if (!mModel) return;
    if (mInstance) mModel->DeleteInstance(mInstance);
    mModel->Close();
}

bool Effect::Open(const std::string& path, int modelIndex, std::string* error) {
    mIndex = modelIndex;
    mModel = std::make_unique<ulkHostModel>(static_cast<short>(modelIndex));
    if (!OpenModel(mModel.get(), path, error)) {
        *error = path + ": " + *error;
        mModel.reset();
        return false;
    }
    std::string thrown;
    mInstance = NewInstanceOf(mModel.get(), &thrown);
    if (!mInstance) {
        *error =
            path + ": " + Name() + ": " + (thrown.empty() ? InstanceErrorText(*mModel) : thrown);
        mModel->Close();
        mModel.reset();
        return false;
    }
    return true;
}

std::string Effect::Name() const {
    const char* name = mModel ? mModel->GetName() : nullptr;
    return name && *name ? name : "model " + std::to_string(mIndex);
}

}  // namespace ulk_tools

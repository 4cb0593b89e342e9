// Opening effects the way every tool does: host services, model selection and one open
// model with one instance, released in the right order.
//
// InstallHostServices must run once on the main thread before any module is opened: it
// installs the per-class memory callbacks the library needs (the host model copies its
// module path with them) and raises the registry's bound on loaded modules. Effect objects
// are made and destroyed on the main thread; in between one thread at a time may drive one.
#ifndef ULK_TOOLS_EFFECT_H
#define ULK_TOOLS_EFFECT_H

#include <memory>
#include <string>

#include "ulk/ulk.h"

namespace ulk_tools {

/// Installs malloc/free as the library's memory callbacks and lets up to maxModules
/// modules stay loaded at once. Call once, before the first module is opened.
void InstallHostServices(int maxModules);

/// The error record's text of a failed open, with the loader's reason when the module
/// itself could not be loaded ("cannot load the module: <dlerror>"). Call it right after the
/// failed Open, with the module known to load (see CountModels).
std::string ModelErrorText(const ulkHostModel& model);

/// Why NewInstance answered null: the error record's text, or that the plug-in made none.
std::string InstanceErrorText(const ulkHostModel& model);

/// Keeps a module loaded and started while it lives, so that the models opened meanwhile
/// share one start-up (with the start-up flag 0).
class LoadedModule {
  public:
    LoadedModule() = default;
    ~LoadedModule();
    LoadedModule(const LoadedModule&) = delete;
    LoadedModule& operator=(const LoadedModule&) = delete;

    /// Loads and starts path. False with "PATH: reason" when it cannot be.
    bool Load(const std::string& path, std::string* error);
    /// How many models the module offers.
    int NumModels() const { return mDLL ? mDLL->GetNumModels() : 0; }

  private:
    ulkDLL* mDLL = nullptr;
    unsigned char mStartUpFlag = 0;  // the module may keep the pointer while it is loaded
};

/// The number of models path offers, or -1 with a message when the module cannot be loaded
/// or started.
int CountModels(const std::string& path, std::string* error);

/// Splits "PLUGIN[:MODEL]" into the module path and the model selector (empty when none).
/// The text is taken whole when it names an existing file.
void SplitEffectArgument(const std::string& argument, std::string* path, std::string* selector);

/// The index of the model of path that selector names: its number, its name (any case) or
/// its identifier; model 0 for an empty selector. -1 with a message when none matches.
int FindModel(const std::string& path, const std::string& selector, std::string* error);

/// model->Open(path), with the reason of a failure, an exception thrown by the plug-in
/// included, in error.
bool OpenModel(ulkHostModel* model, const std::string& path, std::string* error);

/// model->NewInstance(), with an exception thrown by the plug-in turned into a message in
/// thrown (null is then answered).
ulkHostInstance* NewInstanceOf(ulkHostModel* model, std::string* thrown);

/// "Filter", "Compositor", "Title" or the number; "RGBA", "UYVY", ... or the number.
std::string PluginTypeText(ulkPluginType type);
std::string ImageFormatText(int32_t format);

/// One open model of a module and one instance of it.
class Effect {
  public:
    Effect() = default;
    /// Deletes the instance, then closes the model.
    ~Effect();
    Effect(const Effect&) = delete;
    Effect& operator=(const Effect&) = delete;

    /// Opens model modelIndex of path and makes an instance. False with "PATH: reason".
    bool Open(const std::string& path, int modelIndex, std::string* error);

    ulkHostModel* Model() const { return mModel.get(); }
    ulkHostInstance* Instance() const { return mInstance; }
    /// The model's name, or "model N" when it has none.
    std::string Name() const;

  private:
    std::unique_ptr<ulkHostModel> mModel;
    ulkHostInstance* mInstance = nullptr;
    int mIndex = 0;
};

}  // namespace ulk_tools

#endif  // ULK_TOOLS_EFFECT_H

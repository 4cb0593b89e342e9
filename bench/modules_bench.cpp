// Loading plug-in modules through the registry. ulkDLLMaker::Open and Close of
// a module kept loaded (kCloseKeep: a look-up and a reference count) and of one
// loaded afresh every time (kCloseNow: dlopen, start-up, shut-down, dlclose),
// each against bare dlopen/dlclose of the same file; then how Open grows with
// the number of modules loaded: 1, 10 and 100 copies of the benchmark module,
// each under its own file name in a temporary folder made at start-up.
#include <benchmark/benchmark.h>
#include <dlfcn.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "bench_host.h"
#include "bench_main.h"

namespace {

namespace fs = std::filesystem;
using ulk_bench::Goal;

constexpr int kMostLoaded = 100;
constexpr int kDlopenFlags = RTLD_NOW | RTLD_LOCAL;  // as the registry loads modules

// kMostLoaded + 1 copies of the benchmark module: m000.so to m100.so. The folder
// goes when the program ends.
class ModuleCopies {
  public:
    ModuleCopies() {
        char folder[] = "/tmp/ulk-modules-bench-XXXXXX";
        if (!mkdtemp(folder)) return;
        mFolder = folder;
        std::error_code error;
        for (int i = 0; i <= kMostLoaded && !error; ++i) {
            char name[16];
            std::snprintf(name, sizeof name, "/m%03d.so", i);
            mPaths.push_back(mFolder + name);
            fs::copy_file(ulk_bench::BenchPluginPath(), mPaths.back(), error);
        }
        if (error) mPaths.clear();
    }
    ~ModuleCopies() {
        std::error_code error;
        if (!mFolder.empty()) fs::remove_all(mFolder, error);
    }
    ModuleCopies(const ModuleCopies&) = delete;
    ModuleCopies& operator=(const ModuleCopies&) = delete;

    bool ok() const { return !mPaths.empty(); }
    const char* path(int index) const { return mPaths[index].c_str(); }

  private:
    std::string mFolder;
    std::vector<std::string> mPaths;
};

const ModuleCopies& Copies() {
    static const ModuleCopies copies;
    return copies;
}

// Host services, and the copies; false (benchmark skipped) when they are missing.
bool Ready(benchmark::State& state) {
    ulk_bench::InstallHostServices(kMostLoaded + 8);
    if (Copies().ok()) return true;
    state.SkipWithError("could not copy the benchmark module to a temporary folder");
    return false;
}

// Loads copies first to first + count - 1 into the registry and leaves them
// loaded but unused, as kCloseKeep does.
bool LoadKept(int first, int count) {
    for (int i = first; i < first + count; ++i) {
        ulkDLL* dll = ulkDLLMaker::Open(Copies().path(i), nullptr, nullptr);
        if (!dll) return false;
        ulkDLLMaker::Close(dll, kCloseKeep);
    }
    return true;
}

// Unloads the same copies: one more use, released with kCloseNow.
void UnloadKept(int first, int count) {
    for (int i = first; i < first + count; ++i)
        ulkDLLMaker::Close(ulkDLLMaker::Open(Copies().path(i), nullptr, nullptr), kCloseNow);
}

// Open and Close of a module another use keeps loaded: the registry finds it.
void BM_RegistryOpenKept(benchmark::State& state) {
    if (!Ready(state)) return;
    if (!LoadKept(0, 1)) return state.SkipWithError("the module did not load");
    for (auto _ : state) {
        ulkDLL* dll = ulkDLLMaker::Open(Copies().path(0), nullptr, nullptr);
        ulkDLLMaker::Close(dll, kCloseKeep);
        benchmark::DoNotOptimize(dll);
    }
    UnloadKept(0, 1);
}
BENCHMARK(BM_RegistryOpenKept);

// dlopen and dlclose of a library that another handle keeps loaded.
void BM_DlopenLoaded(benchmark::State& state) {
    if (!Ready(state)) return;
    void* held = dlopen(Copies().path(0), kDlopenFlags);
    if (!held) return state.SkipWithError(dlerror());
    for (auto _ : state) {
        void* handle = dlopen(Copies().path(0), kDlopenFlags);
        dlclose(handle);
        benchmark::DoNotOptimize(handle);
    }
    dlclose(held);
}
BENCHMARK(BM_DlopenLoaded);

// Open and Close with kCloseNow: loaded, started, shut down and unloaded each time.
void BM_RegistryOpenFresh(benchmark::State& state) {
    if (!Ready(state)) return;
    bool ok = true;
    for (auto _ : state) {
        ulkDLL* dll = ulkDLLMaker::Open(Copies().path(0), nullptr, nullptr);
        ok &= dll != nullptr;
        ulkDLLMaker::Close(dll, kCloseNow);
    }
    if (!ok) state.SkipWithError("the module did not load");
}
BENCHMARK(BM_RegistryOpenFresh);

// dlopen and dlclose of a library nothing else holds: mapped and unmapped each time.
void BM_DlopenFresh(benchmark::State& state) {
    if (!Ready(state)) return;
    bool ok = true;
    for (auto _ : state) {
        void* handle = dlopen(Copies().path(0), kDlopenFlags);
        ok &= handle != nullptr;
        if (handle) dlclose(handle);
    }
    if (!ok) state.SkipWithError("dlopen failed");
}
BENCHMARK(BM_DlopenFresh);

// Open and Close (kCloseKeep) of the module loaded last while N modules are
// loaded: the registry's look-up passes the N - 1 others.
void BM_RegistryOpenKeptAmong(benchmark::State& state) {
    if (!Ready(state)) return;
    const int loaded = static_cast<int>(state.range(0));
    if (!LoadKept(0, loaded)) return state.SkipWithError("the modules did not load");
    for (auto _ : state) {
        ulkDLL* dll = ulkDLLMaker::Open(Copies().path(loaded - 1), nullptr, nullptr);
        ulkDLLMaker::Close(dll, kCloseKeep);
        benchmark::DoNotOptimize(dll);
    }
    UnloadKept(0, loaded);
}
BENCHMARK(BM_RegistryOpenKeptAmong)->Arg(1)->Arg(10)->Arg(kMostLoaded);

// Open and Close (kCloseNow) of one more module while N others are loaded: a
// look-up that misses, then the loader with N more libraries in the process.
void BM_RegistryOpenFreshAmong(benchmark::State& state) {
    if (!Ready(state)) return;
    const int loaded = static_cast<int>(state.range(0));
    if (!LoadKept(0, loaded)) return state.SkipWithError("the modules did not load");
    bool ok = true;
    for (auto _ : state) {
        ulkDLL* dll = ulkDLLMaker::Open(Copies().path(kMostLoaded), nullptr, nullptr);
        ok &= dll != nullptr;
        ulkDLLMaker::Close(dll, kCloseNow);
    }
    UnloadKept(0, loaded);
    if (!ok) state.SkipWithError("the module did not load");
}
BENCHMARK(BM_RegistryOpenFreshAmong)->Arg(1)->Arg(10)->Arg(kMostLoaded);

[[maybe_unused]] const bool kRatios[] = {
    ulk_bench::AddRatio("registry Open/Close of a kept module / dlopen of a loaded library",
                        "BM_RegistryOpenKept", "BM_DlopenLoaded"),
    ulk_bench::AddRatio("registry Open/Close kCloseNow / bare dlopen+dlclose",
                        "BM_RegistryOpenFresh", "BM_DlopenFresh"),
    ulk_bench::AddRatio("kept Open among 10 loaded / among 1", "BM_RegistryOpenKeptAmong/10",
                        "BM_RegistryOpenKeptAmong/1"),
    ulk_bench::AddRatio("kept Open among 100 loaded / among 1", "BM_RegistryOpenKeptAmong/100",
                        "BM_RegistryOpenKeptAmong/1"),
    ulk_bench::AddRatio("fresh Open with 10 loaded / with 1", "BM_RegistryOpenFreshAmong/10",
                        "BM_RegistryOpenFreshAmong/1"),
    ulk_bench::AddRatio("fresh Open with 100 loaded / with 1", "BM_RegistryOpenFreshAmong/100",
                        "BM_RegistryOpenFreshAmong/1"),
};

}  // namespace

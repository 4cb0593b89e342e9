// The price of calling an effect through the runtime: ulkHostInstance::Execute
// of an effect that does nothing, against a direct virtual call of the plug-in
// instance's Execute, with no parameters and with 32 animated ones. The host
// prepared the run with PreProcess once, as a host rendering a shot does, and
// moves to the next frame before every call, so that each Execute evaluates
// every parameter between two of its keys.
#include <benchmark/benchmark.h>

#include "bench_host.h"
#include "bench_main.h"

namespace {

using ulk_bench::Goal;

constexpr int kFrames = 250;  // frames of the shot the calls step through
constexpr int kKeys = 5;      // keys of each parameter, at 0, 1/4, 1/2, 3/4 and 1

// Opens the model with `params` parameters, animates them and prepares the run.
// Answers null (the benchmark skipped) when anything fails.
ulkHostInstance* Prepare(benchmark::State& state, ulk_bench::Effect& effect, int params) {
    ulkHostInstance* instance = effect.instance();
    if (!instance || ulk_bench::AnimateNumbers(instance, kKeys) != params) {
        state.SkipWithError("the benchmark module did not open");
        return nullptr;
    }
    instance->SetTotalFrames(kFrames);
    if (!instance->PreProcess()) {
        state.SkipWithError("PreProcess failed");
        return nullptr;
    }
    return instance;
}

void BM_HostExecute(benchmark::State& state) {
    ulk_bench::InstallHostServices();
    const int params = static_cast<int>(state.range(0));
    ulk_bench::Effect effect(ulk_bench::BenchPluginPath(),
                             params ? ulk_bench::kModelNull32 : ulk_bench::kModelNull);
    ulkHostInstance* instance = Prepare(state, effect, params);
    if (!instance) return;
    int frame = 0;
    bool ok = true;
    for (auto _ : state) {
        instance->SetCurrentFrame(frame);
        ok &= instance->Execute(nullptr);
        if (++frame == kFrames) frame = 0;
    }
    instance->PostProcess();
    if (!ok) state.SkipWithError("Execute failed");
}
BENCHMARK(BM_HostExecute)->Arg(0)->Arg(32);

void BM_DirectExecute(benchmark::State& state) {
    ulk_bench::InstallHostServices();
    const int params = static_cast<int>(state.range(0));
    ulk_bench::Effect effect(ulk_bench::BenchPluginPath(),
                             params ? ulk_bench::kModelNull32 : ulk_bench::kModelNull);
    ulkHostInstance* instance = Prepare(state, effect, params);
    if (!instance) return;
    ulkInstance_v1* plugin = instance->GetPluginInstance();
    const ulkBounds whole = {0, 0, 0, 0};
    int frame = 0;
    bool ok = true;
    for (auto _ : state) {
        instance->SetCurrentFrame(frame);  // the same loop as the host's, minus the runtime
        ok &= plugin->Execute(&whole);
        if (++frame == kFrames) frame = 0;
    }
    instance->PostProcess();
    if (!ok) state.SkipWithError("Execute failed");
}
BENCHMARK(BM_DirectExecute)->Arg(0)->Arg(32);

[[maybe_unused]] const bool kRatios[] = {
    ulk_bench::AddRatio("host Execute / direct call, no parameters", "BM_HostExecute/0",
                        "BM_DirectExecute/0"),
    ulk_bench::AddRatio("host Execute / direct call, 32 animated parameters", "BM_HostExecute/32",
                        "BM_DirectExecute/32"),
    ulk_bench::AddTime("host Execute, 32 animated parameters", "BM_HostExecute/32", Goal::kAtMost,
                       1000.0),
};

}  // namespace

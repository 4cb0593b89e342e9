// Parameter evaluation as a host does it for every frame, against the number
// of keys; an instance's 32 parameters evaluated at once, through a real
// module; and building a long animation key by key.
#include <benchmark/benchmark.h>

#include <cstdint>

#include "bench_host.h"
#include "bench_main.h"
#include "ulk/ulk.h"

namespace {

// A number with keyCount keys spread evenly over 0 to 1.
ulkPNumber* Animated(double* value, int* target, int keyCount) {
    ulkPNumber* n =
        target
            ? ulkPNumber::New("N", "n", target, sizeof(int), -1e9, 1e9, 1, kPNumberInteger, false)
            : ulkPNumber::New("N", "n", value, sizeof(double), -1e9, 1e9, 1, kPNumberReal, false);
    for (int i = 0; i < keyCount; ++i) n->SetValue(double(i) / keyCount, i % 2 ? 100.0 : -100.0);
    return n;
}

// Evaluates frame after frame, each time halfway between two keys.
void Evaluate(benchmark::State& state, bool integer) {
    const int keys = static_cast<int>(state.range(0));
    double value = 0;
    int target = 0;
    ulkPNumber* n = Animated(&value, integer ? &target : nullptr, keys);
    int frame = 0;
    for (auto _ : state) {
        n->Evaluate((frame + 0.5) / keys, nullptr, 0, -1);
        if (++frame == keys) frame = 0;
        benchmark::DoNotOptimize(value);
        benchmark::DoNotOptimize(target);
    }
    ulkParameter::Delete(n);
}

void BM_EvaluateRealNumber(benchmark::State& state) {
    Evaluate(state, false);
}
void BM_EvaluateIntegerNumber(benchmark::State& state) {
    Evaluate(state, true);
}
BENCHMARK(BM_EvaluateRealNumber)->Arg(10)->Arg(1000)->Arg(100000);
BENCHMARK(BM_EvaluateIntegerNumber)->Arg(10)->Arg(1000)->Arg(100000);

// Evaluates at scattered times, as scrubbing through the timeline does.
void BM_EvaluateRealNumberScattered(benchmark::State& state) {
    const int keys = static_cast<int>(state.range(0));
    double value = 0;
    ulkPNumber* n = Animated(&value, nullptr, keys);
    uint32_t x = 12345;
    for (auto _ : state) {
        x = x * 1664525u + 1013904223u;  // cheap pseudo-random frame
        n->Evaluate(((x >> 8) % keys + 0.5) / keys, nullptr, 0, -1);
        benchmark::DoNotOptimize(value);
    }
    ulkParameter::Delete(n);
}
BENCHMARK(BM_EvaluateRealNumberScattered)->Arg(10)->Arg(1000)->Arg(100000);

void BM_AddKeysInTimeOrder(benchmark::State& state) {
    const int keys = static_cast<int>(state.range(0));
    for (auto _ : state) {
        double value = 0;
        ulkPNumber* n = Animated(&value, nullptr, keys);
        state.PauseTiming();
        ulkParameter::Delete(n);
        state.ResumeTiming();
    }
}
BENCHMARK(BM_AddKeysInTimeOrder)->Arg(100000)->Unit(benchmark::kMillisecond);

// Every parameter of an instance at a time between keys, as ulkHostInstance::Execute
// does before it calls the plug-in: the benchmark module's 32 real numbers, each
// with 5 keys, evaluated frame after frame of a 250-frame shot.
void BM_InstanceEvaluate(benchmark::State& state) {
    ulk_bench::InstallHostServices();
    ulk_bench::Effect effect(ulk_bench::BenchPluginPath(), ulk_bench::kModelNull32);
    if (!effect.ok() || ulk_bench::AnimateNumbers(effect.instance(), 5) != state.range(0)) {
        state.SkipWithError("the benchmark module did not open");
        return;
    }
    constexpr int kFrames = 250;
    int frame = 0;
    for (auto _ : state) {
        effect.instance()->Evaluate((frame + 0.5) / kFrames);
        if (++frame == kFrames) frame = 0;
    }
}
BENCHMARK(BM_InstanceEvaluate)->Arg(32);

using ulk_bench::Goal;
[[maybe_unused]] const bool kRatios[] = {
    ulk_bench::AddRatio("real number, 100,000 keys / 10 keys", "BM_EvaluateRealNumber/100000",
                        "BM_EvaluateRealNumber/10", Goal::kAtMost, 3.0),
    ulk_bench::AddRatio("integer number, 100,000 keys / 10 keys", "BM_EvaluateIntegerNumber/100000",
                        "BM_EvaluateIntegerNumber/10", Goal::kAtMost, 3.0),
    ulk_bench::AddRatio("real number scattered, 100,000 keys / 10 keys",
                        "BM_EvaluateRealNumberScattered/100000",
                        "BM_EvaluateRealNumberScattered/10"),
    ulk_bench::AddTime("instance of 32 animated parameters, one Evaluate", "BM_InstanceEvaluate/32",
                       Goal::kNone, 0.0),
};

}  // namespace

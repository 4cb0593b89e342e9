// Parameter evaluation as a host does it for every frame, against the number
// of keys, and building a long animation key by key.
#include <benchmark/benchmark.h>

#include <cstdint>

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

}  // namespace

// ulkImage::Copy of a whole RGBA frame against memcpy of the same bytes between
// the same two buffers: the copy a host makes when an effect has nothing to do.
// A full HD frame (8 MB, beyond most caches) and a small one that stays in cache.
#include <benchmark/benchmark.h>

#include <cstring>

#include "bench_host.h"
#include "bench_main.h"

namespace {

using ulk_bench::Goal;

void BM_Memcpy(benchmark::State& state) {
    ulk_bench::Image from(static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    ulk_bench::Image to(static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    for (auto _ : state) {
        std::memcpy(to.pixels(), from.pixels(), from.bytes());
        benchmark::ClobberMemory();
    }
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * from.bytes()));
}

void BM_ImageCopy(benchmark::State& state) {
    ulk_bench::Image from(static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    ulk_bench::Image to(static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    bool ok = true;
    for (auto _ : state) {
        ok &= to.get()->Copy(from.get(), nullptr);
        benchmark::ClobberMemory();
    }
    if (!ok || std::memcmp(to.pixels(), from.pixels(), from.bytes()) != 0)
        state.SkipWithError("ulkImage::Copy did not copy the frame");
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * from.bytes()));
}

BENCHMARK(BM_Memcpy)->Args({1920, 1080})->Args({320, 180});
BENCHMARK(BM_ImageCopy)->Args({1920, 1080})->Args({320, 180});

// Same bytes, so the bandwidth ratio is memcpy's time over Copy's.
[[maybe_unused]] const bool kRatios[] = {
    ulk_bench::AddRatio("Copy bandwidth / memcpy bandwidth, 1920x1080 RGBA", "BM_Memcpy/1920/1080",
                        "BM_ImageCopy/1920/1080", Goal::kAtLeast, 0.8),
    ulk_bench::AddRatio("Copy bandwidth / memcpy bandwidth, 320x180 RGBA (in cache)",
                        "BM_Memcpy/320/180", "BM_ImageCopy/320/180"),
};

}  // namespace

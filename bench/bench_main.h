// The main every benchmark program shares: it runs the benchmarks as Google
// Benchmark's own main does, then prints the ratios and goals the program
// registered, each computed from the times of this one run.
#ifndef ULK_BENCH_BENCH_MAIN_H
#define ULK_BENCH_BENCH_MAIN_H

namespace ulk_bench {

/// What a ratio or a time must be for its goal to be met.
enum class Goal { kNone, kAtMost, kAtLeast };

/// Registers a line printed after the run: real time per iteration of the benchmark
/// named numerator divided by that of denominator (names as printed, e.g.
/// "BM_HostExecute/32"), checked against limit when a goal is given. Answers true, so
/// that a namespace-scope constant can register it.
bool AddRatio(const char* label, const char* numerator, const char* denominator,
              Goal goal = Goal::kNone, double limit = 0.0);

/// Registers a line printed after the run: real time per iteration of benchmark, in
/// nanoseconds, checked against limitNs.
bool AddTime(const char* label, const char* benchmark, Goal goal, double limitNs);

}  // namespace ulk_bench

#endif  // ULK_BENCH_BENCH_MAIN_H

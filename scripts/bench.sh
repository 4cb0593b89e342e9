#!/usr/bin/env bash
# Runs every benchmark: the Google Benchmark programs built in BUILD_DIR/bench
# (ulk_*_bench), then bench/vs-ffmpeg.sh and bench/scaling.sh. Everything
# printed is also kept in BUILD_DIR/bench-results.txt.
#
#   scripts/bench.sh BUILD_DIR [Google Benchmark options...]
#
# Build first with -DCMAKE_BUILD_TYPE=Release -DULK_BUILD_BENCH=ON (make bench
# does both). Extra options go to every benchmark program, for example
# --benchmark_min_time=0.01 for a quick check; REPEAT, FRAMES and SHORT in the
# environment tune the two scripts (see bench/bench_lib.sh).
set -euo pipefail

build=${1:?usage: scripts/bench.sh BUILD_DIR [benchmark options...]}
shift
root=$(cd "$(dirname "$0")/.." && pwd)
build=$(cd "$build" && pwd)
log=$build/bench-results.txt

programs=("$build"/bench/ulk_*_bench)
[ -x "${programs[0]}" ] || {
    echo "scripts/bench.sh: no benchmark programs in $build/bench (build with -DULK_BUILD_BENCH=ON)" >&2
    exit 1
}

{
    echo "ULK benchmarks, $(date -u '+%Y-%m-%d %H:%M UTC')"
    echo "machine: $(nproc) processors, $(grep -m1 'model name' /proc/cpuinfo | cut -d: -f2- | sed 's/^ *//')"
    echo "load average at start: $(cut -d' ' -f1-3 /proc/loadavg)"
    for program in "${programs[@]}"; do
        echo
        echo "== $(basename "$program")"
        "$program" "$@"
    done
    for script in vs-ffmpeg.sh scaling.sh; do
        echo
        echo "== $script"
        "$root/bench/$script" "$build"
    done
    echo
    echo "load average at the end: $(cut -d' ' -f1-3 /proc/loadavg)"
} 2>&1 | tee "$log"
exit "${PIPESTATUS[0]}"

#!/usr/bin/env bash
# Builds the libFuzzer targets of fuzz/ with clang and the sanitizers, then runs each for
# SECONDS over its seeds (fuzz/corpus/<target>/) and what earlier runs found.
#   scripts/fuzz.sh SECONDS [BUILD]      BUILD: the fuzz build folder, default build-fuzz
# Fails when a target crashes; the input that did is kept in BUILD/artifacts/.
set -uo pipefail
seconds=${1:?usage: scripts/fuzz.sh SECONDS [BUILD]}
build=${2:-build-fuzz}
root=$(cd "$(dirname "$0")/.." && pwd)
targets=(param_text key_file image_layout)

# The fuzzers need neither the tests, the sample plug-ins nor the tools' image libraries.
cmake -S "$root" -B "$build" -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_BUILD_TYPE=RelWithDebInfo \
  -DULK_BUILD_FUZZERS=ON -DULK_SANITIZE=ON -DULK_WERROR=ON \
  -DULK_BUILD_TESTS=OFF -DULK_BUILD_PLUGINS=OFF -DULK_BUILD_TOOLS=OFF >/dev/null || exit 1
cmake --build "$build" -j "${JOBS:-2}" --target "${targets[@]/#/fuzz_}" >"$build/fuzz-build.log" 2>&1 || {
  tail -n 40 "$build/fuzz-build.log"
  exit 1
}

export ASAN_OPTIONS=detect_leaks=1:allocator_may_return_null=1
export UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1
mkdir -p "$build/artifacts"
passed=0
failed=0
for target in "${targets[@]}"; do
  corpus=$build/corpus/$target
  mkdir -p "$corpus"
  log=$build/fuzz-$target.log
  if "$build/fuzz/fuzz_$target" -max_total_time="$seconds" -timeout=20 -rss_limit_mb=2048 \
      -print_final_stats=1 -artifact_prefix="$build/artifacts/$target-" \
      "$corpus" "$root/fuzz/corpus/$target" >"$log" 2>&1; then
    passed=$((passed + 1))
    runs=$(sed -n 's/^stat::number_of_executed_units: *//p' "$log")
    echo "fuzz: $target passed (${runs:-?} runs in ${seconds}s)"
  else
    failed=$((failed + 1))
    echo "fuzz: $target FAILED (log $log, input in $build/artifacts/)"
    grep -E -A 12 'ERROR|runtime error|kind [0-9]+:' "$log" | head -n 40
  fi
done
echo "fuzz: $passed passed, $failed failed"
[ "$failed" -eq 0 ]

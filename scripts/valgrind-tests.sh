#!/usr/bin/env bash
# Runs the library's own GoogleTest programs once under valgrind's memcheck.
#   scripts/valgrind-tests.sh [BUILD]     BUILD: a normal (not sanitized) build folder, default build
# Fails on any memory error or definite leak. The tools' and samples' suites are left out:
# they spend their time in image libraries and are slow under valgrind.
set -uo pipefail
build=${1:-build}
suites=(core modules model instance params image overlay hardening)

passed=0
failed=0
for suite in "${suites[@]}"; do
  program=$build/tests/ulk_${suite}_tests
  if [ ! -x "$program" ]; then
    echo "valgrind: $program is missing (build first)"
    failed=$((failed + 1))
    continue
  fi
  log=$build/valgrind-$suite.log
  # nouserintercepts: a suite that replaces operator new to make allocations fail keeps
  # its own replacement (which valgrind still sees through malloc).
  args=(--tool=memcheck --leak-check=full --errors-for-leak-kinds=definite --error-exitcode=1
        --soname-synonyms=somalloc=nouserintercepts)
  if valgrind "${args[@]}" --log-file="$log" "$program" --gtest_brief=1 >"$log.out" 2>&1; then
    passed=$((passed + 1))
    echo "valgrind: $suite passed"
  else
    failed=$((failed + 1))
    echo "valgrind: $suite FAILED (see $log and $log.out)"
    tail -n 30 "$log"
  fi
done
echo "valgrind: $passed passed, $failed failed"
[ "$failed" -eq 0 ]

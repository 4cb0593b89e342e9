#!/usr/bin/env bash
# make demo: the SDK is built and installed; show the example host running the
# example plug-in.
set -euo pipefail
cd "$(dirname "$0")/.."
prefix=${1:-dist}
build=${BUILD:-build}

echo "== The ULK SDK is installed in $prefix"
echo "== Example host (examples/minimal_host) running the example plug-in (examples/minimal_plugin):"
"$build/examples/ulk-example-host" "$build/examples/fade.so"

#!/usr/bin/env bash
# Builds Quirnel, installing what it needs first, and starts it. Until the windows are there this is the tour:
# a sample library is made, tagged, searched and stripped before your eyes.
set -euo pipefail
cd "$(dirname "$0")"

tools/install-dependencies build
[ -f build/release/build.ninja ] || cmake --preset release -DQUIRNEL_TESTS=OFF -DQUIRNEL_BENCH=OFF >/dev/null
cmake --build build/release --target quirnelctl sample-library
exec tools/tour build/release/tools "$@"

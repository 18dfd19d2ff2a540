#!/usr/bin/env bash
# Builds Quirnel, installing what it needs first, and starts it. Without a display this is the tour: a sample
# library is made, tagged, searched and stripped before your eyes.
set -euo pipefail
cd "$(dirname "$0")"

tools/install-dependencies build
[ -f build/release/build.ninja ] || cmake --preset release -DQUIRNEL_TESTS=OFF -DQUIRNEL_BENCH=OFF >/dev/null
if [ -n "${DISPLAY:-}${WAYLAND_DISPLAY:-}" ]; then
    cmake --build build/release --target quirnel quirnelctl companions
    exec build/release/src/app/quirnel "$@"
fi
tools/install-dependencies tour || true # the tour's windows are left out where they cannot be shown
cmake --build build/release --target quirnel quirnelctl companions sample-library
exec tools/tour build/release/tools build/release/src/app

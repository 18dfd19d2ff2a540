#!/usr/bin/env bash
# Builds and runs the tests. Usage: ./test.sh [quick|full|soak]   (default full: everything but the soak tier)
# The last line says how many tests passed and failed.
set -uo pipefail
cd "$(dirname "$0")"
tier=${1:-full}

case "$tier" in
    quick) labels='^quick$' ;;
    full) labels='^(quick|full|desktop)$' ;;
    soak) labels='.' ;;
    *) echo "usage: $0 [quick|full|soak]" >&2; exit 2 ;;
esac

tools/install-dependencies test || { echo "0 passed, 1 failed"; exit 1; }

results=$PWD/build/test-results
rm -rf "$results"
mkdir -p "$results"
failures=0

# A step that is no GoogleTest program counts as one test.
step() {
    local name=$1
    shift
    printf '\n== %s\n' "$name"
    local start=$SECONDS
    if "$@"; then
        echo "step $name: passed" >>"$results/steps"
    else
        echo "step $name: FAILED"
        echo "step $name: failed" >>"$results/steps"
        failures=$((failures + 1))
    fi
    echo "($((SECONDS - start)) s)"
}

# configure_and_build PRESET [CMAKE --BUILD ARGUMENT...]
configure_and_build() {
    local preset=$1
    shift
    cmake --preset "$preset" >"$results/$preset-configure.log" 2>&1 || { cat "$results/$preset-configure.log"; return 1; }
    cmake --build --preset "$preset" "$@" >"$results/$preset-build.log" 2>&1 || { tail -n 60 "$results/$preset-build.log"; return 1; }
}

# The programs whose code runs in several threads.
threaded=(test_kits_support test_kits_kernel test_kits_app test_kits_interface test_kits_interface_windows test_host_linux test_host_threads
          test_host_sqlite test_indexing test_closing_races test_kits_app_races test_kits_kernel_races test_index_write_fault test_kits_app_processes
          test_host_transport test_column_list_columns test_soundplay_scripter test_soundplay_alone)

prepare_fuzzers() {
    configure_and_build fuzz --target fuzzers || return 1
    ctest --test-dir build/fuzz -j "$(nproc)" --no-tests=error --output-on-failure -R 'fuzzer$'
}

# As ./run.sh does it, which then finds nothing left to do.
prepare_tour() {
    {
        { [ -f build/release/build.ninja ] || cmake --preset release -DQUIRNEL_TESTS=OFF -DQUIRNEL_BENCH=OFF; } &&
            cmake --build build/release --target quirnel quirnelctl companions sample-library
    } >"$results/release-build.log" 2>&1 || { tail -n 60 "$results/release-build.log"; return 1; }
}

# ahead NAME COMMAND...: runs it for the step of that name, which takes its outcome with `outcome`.
ahead() {
    local name=$1
    shift
    "$@" >"$results/$name-ahead.log" 2>&1
    echo $? >"$results/$name-ahead.status"
}
# Waits for the outcome, shows what was written, and answers the status.
outcome() {
    until [ -s "$results/$1-ahead.status" ]; do
        kill -0 "$others" 2>/dev/null || [ -s "$results/$1-ahead.status" ] || { echo "ended before its time: $1"; return 1; }
        sleep 0.5
    done
    cat "$results/$1-ahead.log"
    return "$(cat "$results/$1-ahead.status")"
}

# Most of the first tests' time is waiting: for windows, sounds, and other processes. What the later steps need is done
# meanwhile, and gives way to the tests (nice), for which the machine is as good as idle.
do_the_rest_meanwhile() {
    set -m # a group of its own, to be ended with this script
    (
        renice -n 19 -p "$BASHPID" >/dev/null
        ahead tsan configure_and_build tsan --target "${threaded[@]}"
        ahead fuzz prepare_fuzzers
        ahead tour prepare_tour
    ) </dev/null &
    others=$!
    set +m
    trap 'kill -- "-$others" 2>/dev/null' EXIT
    trap 'exit 130' INT TERM
}

run_dev() { GTEST_OUTPUT="xml:$results/dev/" ctest --preset dev -j "$(nproc)" --no-tests=error -L "$labels"; }

run_tsan() {
    outcome tsan || return 1
    GTEST_OUTPUT="xml:$results/tsan/" ctest --preset tsan -j "$(nproc)" --no-tests=error \
        -R "^($(IFS='|'; echo "${threaded[*]}"))\$"
}

run_tour() {
    outcome tour || return 1
    env -u DISPLAY -u WAYLAND_DISPLAY ./run.sh
}

check_format() {
    git ls-files -z '*.cpp' '*.h' | xargs -0 -r -n 40 clang-format --dry-run -Werror
}

step "layers" tools/check-layers
step "layers check catches a breach" tests/tools/check-layers-test
if command -v clang-format >/dev/null && git rev-parse --git-dir >/dev/null 2>&1; then
    step "format" check_format
fi
step "build for AddressSanitizer and UndefinedBehaviorSanitizer" configure_and_build dev
do_the_rest_meanwhile
step "tests under AddressSanitizer and UndefinedBehaviorSanitizer" run_dev
step "tests under ThreadSanitizer" run_tsan
step "fuzzers" outcome fuzz
step "the tour, as ./run.sh shows it without a display" run_tour

python3 tests/support/count_results.py "$results"
exit $((failures > 0))

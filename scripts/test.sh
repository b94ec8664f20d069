#!/usr/bin/env bash
# Installs what is missing, then builds and tests in phases, each in a build folder of its own
# with every option it relies on given:
#   build/           g++, RelWithDebInfo: every target and every test (run.sh builds here too)
#   build-release/   g++, Release, as a user's default build: every target and every test
#   build-tsan/      clang with ThreadSanitizer: the channel thread tests
#   build-fuzz/      clang with libFuzzer: each fuzz target for a fixed number of inputs
#   build-sanitize/  clang with AddressSanitizer and UndefinedBehaviorSanitizer: every test
# Warnings are errors throughout. A phase fails on a failed test, on a skipped one and when ctest
# finds no test at all; the run stops at the first phase that fails and ends, pass or fail, with
# a summary of every phase and the totals in ctest's words.
set -euo pipefail
cd "$(dirname "$0")/.."
source scripts/main_build.sh

jobs=$(nproc)
run_started=$SECONDS
phase=""
phase_started=$SECONDS
summary=()
summary_format='%-53s %6s %6s %6s %7s %8s %8s'
total_tests=0
total_failed=0
total_skipped=0
total_test_seconds=0

# A build shows what the compiler says, not a line a step.
build() {
    cmake --build "$@" -- --quiet
}

begin_phase() {
    phase=$1
    phase_started=$SECONDS
    echo "== $phase"
}

# The value of a count of the testsuite element of a JUnit file that ctest wrote.
junit_count() {
    sed -n "s/^[[:space:]]*$1=\"\([0-9]*\)\".*/\1/p" "$2" | head -n 1
}

# run_tests DIR [ctest arguments]: the tests of the current phase, added to the summary.
run_tests() {
    local dir=$1
    shift
    local junit="$PWD/$dir/ctest-results.xml"
    rm -f "$junit"
    local started=$SECONDS
    local status=0
    ctest --test-dir "$dir" --no-tests=error --output-on-failure --output-junit "$junit" "$@" ||
        status=$?
    local seconds=$((SECONDS - started))
    local tests=0 failed=0 skipped=0
    if [ -f "$junit" ]; then
        tests=$(junit_count tests "$junit")
        failed=$(junit_count failures "$junit")
        skipped=$(junit_count skipped "$junit")
    fi
    if [ "$tests" -eq 0 ]; then
        status=1
    fi
    total_tests=$((total_tests + tests))
    total_failed=$((total_failed + failed))
    total_skipped=$((total_skipped + skipped))
    total_test_seconds=$((total_test_seconds + seconds))
    summary+=("$(printf "$summary_format" "$phase" "$tests" "$((tests - failed - skipped))" \
        "$failed" "$skipped" "$seconds s" "$((SECONDS - phase_started)) s")")
    if [ "$skipped" -ne 0 ]; then
        echo "test: $skipped skipped in '$phase': a test skipped here is a missing install step" >&2
        phase="$phase (a test skipped)"
        exit 1
    fi
    if [ "$status" -ne 0 ]; then
        phase="$phase (tests failed)"
        exit 1
    fi
    phase=""
}

print_summary() {
    local status=$?
    echo
    echo "== summary of the whole run"
    printf "$summary_format\n" "phase" "tests" "passed" "failed" "skipped" "testing" "in all"
    local line
    for line in "${summary[@]}"; do
        echo "$line"
    done
    if [ -n "$phase" ]; then
        echo "stopped in: $phase"
    fi
    echo "whole run: $((SECONDS - run_started)) s"
    echo
    # A skip counts as a failure here; a build that failed, or a phase without tests, as one more.
    local failed=$((total_failed + total_skipped))
    if [ "$status" -ne 0 ] && [ "$failed" -eq 0 ]; then
        failed=1
        total_tests=$((total_tests + 1))
    fi
    local passed=$((total_tests - failed))
    local percent=100
    if [ "$total_tests" -gt 0 ]; then
        percent=$((passed * 100 / total_tests))
    fi
    echo "$percent% tests passed, $failed tests failed out of $total_tests"
    echo
    echo "Total Test time (real) = $total_test_seconds sec"
    exit "$status"
}
trap print_summary EXIT

begin_phase "set-up"
./scripts/setup.sh build test
summary+=("$(printf "$summary_format" "$phase" - - - - - "$((SECONDS - phase_started)) s")")
phase=""

begin_phase "g++ RelWithDebInfo, every test (build/)"
configure_main_build
build build -j "$jobs"
run_tests build -j "$jobs"

begin_phase "g++ Release, every test (build-release/)"
cmake -S . -B build-release -G Ninja -DCMAKE_BUILD_TYPE=Release -DCMAKE_C_COMPILER=gcc \
      -DCMAKE_CXX_COMPILER=g++ -DVEXMAP_WERROR=ON -DVEXMAP_BUILD_TESTS=ON \
      -DVEXMAP_BUILD_TOOLS=ON -DVEXMAP_BUILD_BENCHMARKS=ON >/dev/null
build build-release -j "$jobs"
run_tests build-release -j "$jobs"

begin_phase "clang ThreadSanitizer, channel threads (build-tsan/)"
cmake -S . -B build-tsan -G Ninja -DCMAKE_BUILD_TYPE=Debug -DCMAKE_C_COMPILER=clang \
      -DCMAKE_CXX_COMPILER=clang++ -DVEXMAP_WERROR=ON -DVEXMAP_THREAD_SANITIZE=ON \
      -DVEXMAP_BUILD_TESTS=ON -DVEXMAP_BUILD_BENCHMARKS=OFF -DVEXMAP_BUILD_TOOLS=OFF >/dev/null
build build-tsan -j "$jobs" --target channel_thread_tests
TSAN_OPTIONS=halt_on_error=1 run_tests build-tsan -R '^channel_thread_tests$'

begin_phase "clang libFuzzer, fuzz targets (build-fuzz/)"
cmake -S . -B build-fuzz -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DCMAKE_C_COMPILER=clang \
      -DCMAKE_CXX_COMPILER=clang++ -DVEXMAP_WERROR=ON -DVEXMAP_FUZZ=ON \
      -DVEXMAP_BUILD_BENCHMARKS=OFF -DVEXMAP_BUILD_TOOLS=OFF -DVEXMAP_BUILD_TESTS=OFF >/dev/null
build build-fuzz -j "$jobs" --target fuzz_targets
run_tests build-fuzz

begin_phase "clang ASan+UBSan, every test (build-sanitize/)"
cmake -S . -B build-sanitize -G Ninja -DCMAKE_BUILD_TYPE=Debug -DCMAKE_C_COMPILER=clang \
      -DCMAKE_CXX_COMPILER=clang++ -DVEXMAP_WERROR=ON -DVEXMAP_SANITIZE=ON \
      -DVEXMAP_BUILD_TESTS=ON -DVEXMAP_BUILD_TOOLS=ON -DVEXMAP_BUILD_BENCHMARKS=OFF >/dev/null
build build-sanitize -j "$jobs"
ASAN_OPTIONS=detect_leaks=1:abort_on_error=0 UBSAN_OPTIONS=print_stacktrace=1 \
    run_tests build-sanitize -j "$jobs"

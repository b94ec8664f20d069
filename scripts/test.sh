#!/usr/bin/env bash
# Installs what is missing, builds, runs every test, then builds again with AddressSanitizer and
# UndefinedBehaviorSanitizer and runs every test again; before that last run, the channel thread
# tests are built and run alone under ThreadSanitizer, and the fuzz targets for a fixed number of
# inputs. Exits non-zero on any failure.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh
jobs=$(nproc)

echo "== build and test"
cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build build -j "$jobs"
ctest --test-dir build -j "$jobs" --output-on-failure

echo "== build with address and undefined-behaviour sanitizers"
cmake -S . -B build-sanitize -G Ninja -DCMAKE_BUILD_TYPE=Debug -DCMAKE_CXX_COMPILER=clang++ \
      -DVEXMAP_SANITIZE=ON -DVEXMAP_BUILD_BENCHMARKS=OFF >/dev/null
cmake --build build-sanitize -j "$jobs"

echo "== build and test the channel threads with the thread sanitizer"
cmake -S . -B build-tsan -G Ninja -DCMAKE_BUILD_TYPE=Debug -DCMAKE_CXX_COMPILER=clang++ \
      -DVEXMAP_THREAD_SANITIZE=ON -DVEXMAP_BUILD_BENCHMARKS=OFF -DVEXMAP_BUILD_TOOLS=OFF >/dev/null
cmake --build build-tsan -j "$jobs" --target channel_thread_tests
TSAN_OPTIONS=halt_on_error=1 ctest --test-dir build-tsan -R channel_thread_tests --output-on-failure

echo "== build and run the fuzz targets"
cmake -S . -B build-fuzz -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DCMAKE_CXX_COMPILER=clang++ \
      -DVEXMAP_FUZZ=ON -DVEXMAP_BUILD_BENCHMARKS=OFF -DVEXMAP_BUILD_TOOLS=OFF \
      -DVEXMAP_BUILD_TESTS=OFF >/dev/null
cmake --build build-fuzz -j "$jobs" --target fuzz_targets
ctest --test-dir build-fuzz --output-on-failure

echo "== test with address and undefined-behaviour sanitizers"
ASAN_OPTIONS=detect_leaks=1:abort_on_error=0 UBSAN_OPTIONS=print_stacktrace=1 \
    ctest --test-dir build-sanitize -j "$jobs" --output-on-failure

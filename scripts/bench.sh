#!/usr/bin/env bash
# Installs what the benchmarks need, builds them in Release and runs each one; arguments go to
# every benchmark binary (say --benchmark_filter=Remap). OpenCV is only the yardstick of the
# remap and map-build benchmarks: without it they build and run alone.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh build bench

benches=(image_processor_bench engine_bench classes_bench)
cmake -S . -B build-bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DVEXMAP_BUILD_TESTS=OFF \
      -DVEXMAP_BUILD_TOOLS=OFF -DVEXMAP_BUILD_BENCHMARKS=ON -DVEXMAP_WERROR=ON >/dev/null
cmake --build build-bench -j "$(nproc)" --target "${benches[@]}"
for bench in "${benches[@]}"; do
    echo "== $bench"
    "./build-bench/$bench" "$@"
done

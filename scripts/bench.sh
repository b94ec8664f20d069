#!/usr/bin/env bash
# Installs what the benchmarks need, builds them in Release and runs each one; arguments go to
# every benchmark binary (say --benchmark_filter=Remap). OpenCV is only the yardstick of the
# remap and map-build benchmarks: without it they build and run alone.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh

missing=()
for package in libbenchmark-dev libopencv-dev; do
    if ! dpkg -s "$package" 2>/dev/null | grep -q '^Status: install ok installed'; then
        missing+=("$package")
    fi
done
if [ ${#missing[@]} -ne 0 ]; then
    if [ "$(id -u)" -ne 0 ]; then
        echo "bench: missing packages: ${missing[*]}; run as root to install them" >&2
        exit 1
    fi
    echo "bench: installing ${missing[*]}"
    export DEBIAN_FRONTEND=noninteractive
    apt-get update -qq
    apt-get install -y -qq --no-install-recommends "${missing[@]}" >/dev/null
fi

benches=(image_processor_bench engine_bench classes_bench)
cmake -S . -B build-bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DVEXMAP_BUILD_TESTS=OFF \
      -DVEXMAP_BUILD_TOOLS=OFF >/dev/null
cmake --build build-bench -j "$(nproc)" --target "${benches[@]}"
for bench in "${benches[@]}"; do
    echo "== $bench"
    "./build-bench/$bench" "$@"
done

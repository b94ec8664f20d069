#!/usr/bin/env bash
# Installs what the benchmarks need, builds them in Release and runs each one; arguments go to
# every benchmark binary (say --benchmark_filter=Remap). OpenCV is only the yardstick of the
# remap and map-build benchmarks: without it they build and run alone. Ends with the table of the
# comparisons taken in turns (their counters), which is what the figures in the README quote.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh build bench

benches=(image_processor_bench engine_bench classes_bench)
cmake -S . -B build-bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DVEXMAP_BUILD_TESTS=OFF \
      -DVEXMAP_BUILD_TOOLS=OFF -DVEXMAP_BUILD_BENCHMARKS=ON -DVEXMAP_WERROR=ON >/dev/null
cmake --build build-bench -j "$(nproc)" --target "${benches[@]}"
log=build-bench/bench.log
: >"$log"
for bench in "${benches[@]}"; do
    echo "== $bench" | tee -a "$log"
    "./build-bench/$bench" "$@" | tee -a "$log"
done

# Every benchmark with a counter of a comparison in turns, one line each.
echo
echo "== comparisons in turns (ratios: ours over the yardstick, or the speed-up)"
awk '/(vexmap_share|vexmap_speedup|pan_over_steady|two_over_one|vector_speedup|over_memcpy)=/ {
    line = sprintf("%-62s", $1)
    for (i = 2; i <= NF; ++i) {
        if ($i ~ /^(vexmap_share|vexmap_speedup|pan_over_steady|two_over_one|vector_speedup|over_memcpy|vexmap_ms|former_ms|opencv_ms|pan_ms|steady_ms|one_band_ms|two_bands_ms)=/) {
            line = line " " $i
        }
    }
    print line
}' "$log"

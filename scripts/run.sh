#!/usr/bin/env bash
# Installs what is missing, builds, lists the dewarper kinds and dewarps the built-in sample picture
# into out/.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh
cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=Release -DVEXMAP_BUILD_TESTS=OFF \
      -DVEXMAP_BUILD_BENCHMARKS=OFF >/dev/null
cmake --build build --target vexmap vexmap_dewarp
./build/vexmap --list
./build/vexmap --output out "$@"
echo "The dewarped pictures are in $(pwd)/out/"

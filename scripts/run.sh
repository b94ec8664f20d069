#!/usr/bin/env bash
# Installs what is missing, builds the plug-in and the host tool in build/, lists the dewarper
# kinds and dewarps the built-in sample picture into out/. Arguments go to the tool.
set -euo pipefail
cd "$(dirname "$0")/.."
source scripts/main_build.sh

./scripts/setup.sh build
configure_main_build
# The stand-ins of the vendor libraries too, for the README's examples with them.
cmake --build build -j "$(nproc)" --target vexmap vexmap_dewarp standin_imv1 standin_fisheyesw \
      standin_geofisheye
./build/vexmap --list
./build/vexmap --output out "$@"
echo "The dewarped pictures are in $(pwd)/out/"

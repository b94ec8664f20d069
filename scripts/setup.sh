#!/usr/bin/env bash
# Installs what the build and the tests need from Debian's packages, skipping what is there.
set -euo pipefail

packages=(
    build-essential g++ clang clang-format cmake ninja-build pkg-config binutils
    libboost-dev libgtest-dev libgmock-dev libbenchmark-dev
    libpng-dev libturbojpeg0-dev libcli11-dev
)

missing=()
for package in "${packages[@]}"; do
    if ! dpkg-query -W -f='${Status}' "$package" 2>/dev/null | grep -q 'install ok installed'; then
        missing+=("$package")
    fi
done

if [ ${#missing[@]} -eq 0 ]; then
    exit 0
fi

if [ "$(id -u)" -ne 0 ]; then
    echo "setup: missing packages: ${missing[*]}; run as root to install them" >&2
    exit 1
fi
echo "setup: installing ${missing[*]}"
export DEBIAN_FRONTEND=noninteractive
apt-get update -qq
apt-get install -y -qq --no-install-recommends "${missing[@]}" >/dev/null

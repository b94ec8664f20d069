#!/usr/bin/env bash
# Installs from Debian's packages what the named parts of the work need, skipping what is there:
#   setup.sh build        the compiler, CMake and every library the default build finds
#   setup.sh build test   and what the tests run: clang with its sanitizer and fuzzer runtimes,
#                         clang-format, ffmpeg, help2man
#   setup.sh build bench  and OpenCV, the yardstick of the benchmarks
# Every package that a CMake package we find refers to is named here too: libturbojpeg0-dev's
# CMake package also names the library of libjpeg62-turbo-dev, which nothing else pulls in.
set -euo pipefail

build_packages=(
    build-essential g++ cmake ninja-build pkg-config binutils
    libboost-dev libgtest-dev libgmock-dev libbenchmark-dev
    libsleef-dev libpng-dev zlib1g-dev libturbojpeg0-dev libjpeg62-turbo-dev libcli11-dev
    help2man
)
test_packages=(
    clang libclang-rt-14-dev llvm-14 clang-format ffmpeg
)
bench_packages=(
    libopencv-dev
)

packages=()
for part in "$@"; do
    case "$part" in
        build) packages+=("${build_packages[@]}") ;;
        test) packages+=("${test_packages[@]}") ;;
        bench) packages+=("${bench_packages[@]}") ;;
        *)
            echo "setup: unknown part '$part' (build, test or bench)" >&2
            exit 2
            ;;
    esac
done

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

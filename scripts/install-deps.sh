#!/usr/bin/env bash
# Installs the Debian packages of the named groups that are missing: build, tool, tests, docs, packages,
# roots, demo, guide, bench.
set -euo pipefail

declare -A groups=(
    [build]="g++ cmake ninja-build"
    [tool]="libgdal-dev libcli11-dev"
    [tests]="clang libclang-rt-dev libomp-dev libgtest-dev libeigen3-dev libgeographiclib-dev pkg-config"
    [packages]="dpkg-dev lintian"
    [roots]="debootstrap"
    [docs]="doxygen"
    [demo]="gdal-bin proj-data xplanet-images"
    [guide]="gdal-bin"
    [bench]="libbenchmark-dev libopencv-dev libeigen3-dev libfftw3-dev libgeographiclib-dev"
)

missing=()
for group in "$@"; do
    for package in ${groups[$group]:?unknown group $group}; do
        if ! dpkg-query -W -f='${Status}\n' "$package" 2>/dev/null | grep -q '^install ok installed'; then
            missing+=("$package")
        fi
    done
done
if [ "${#missing[@]}" -eq 0 ]; then
    exit 0
fi

echo "installing: ${missing[*]}"
root=()
if [ "$(id -u)" -ne 0 ]; then
    root=(sudo)
fi
"${root[@]}" apt-get update -qq
"${root[@]}" env DEBIAN_FRONTEND=noninteractive \
    apt-get install -y -qq --no-install-recommends "${missing[@]}" >/dev/null

#!/usr/bin/env bash
# Builds the Debian packages, into build/release/packages. Installs what is missing on Debian.
#
# With --try DIR, as root, also makes a minimal Debian system in the new folder DIR, installs the
# packages there with what they depend on, and uses the tool and the library. Takes some minutes and a
# gigabyte.
set -euo pipefail
cd "$(dirname "$0")/.."

root=
if [ "${1:-}" = --try ]; then
    root=${2:?a folder is needed}
    if [ -e "$root" ]; then
        echo "$root exists" >&2
        exit 1
    fi
fi

scripts/install-deps.sh build tool packages ${root:+roots}
cmake --preset release -DVETRA_SHARED=ON -DVETRA_STATIC=ON -DVETRA_TOOL=ON >/dev/null
cmake --build --preset release --target vetra vetra_static vetra_tool
rm -f build/release/packages/*.deb
cpack -G DEB --config build/release/CPackConfig.cmake
lintian --allow-root --fail-on error build/release/packages/*.deb

if [ -n "$root" ]; then
    # The release that this system is of: the packages depend on its libraries.
    debootstrap --variant=minbase "$(. /etc/os-release && echo "$VERSION_CODENAME")" "$root"
    cp -r examples build/release/packages/*.deb "$root/root"
    chroot "$root" sh -euc '
        cd /root
        apt-get update -qq
        apt-get install -y -qq --no-install-recommends ./vetra-tools_*.deb ./libvetra0*.deb >/dev/null
        printf "ncols 2\nnrows 2\nxllcorner 0\nyllcorner 0\ncellsize 1\n1 2\n3 4\n" >four.asc
        vetra resample four.asc eight.asc --scale 2 --method KERNEL,FILE=/usr/share/vetra/kernels/cubic-0.5.txt
        cat eight.asc
        apt-get install -y -qq --no-install-recommends ./libvetra-dev_*.deb g++ cmake make pkg-config >/dev/null
        cmake -S examples -B build >/dev/null
        cmake --build build
        ctest --test-dir build --no-tests=error
        g++ -std=c++17 examples/blocks.cpp -o blocks $(pkg-config --cflags --libs vetra)
        ./blocks'
fi
ls -1 build/release/packages/*.deb

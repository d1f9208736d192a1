#!/usr/bin/env bash
# Builds and passes the tests: release with GCC, then Clang with AddressSanitizer and
# UndefinedBehaviorSanitizer. Warnings are errors. Installs what is missing on Debian.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/install-deps.sh build tool tests docs

for preset in check asan; do
    echo "== $preset"
    cmake --preset "$preset"
    cmake --build --preset "$preset"
    ctest --preset "$preset"
done

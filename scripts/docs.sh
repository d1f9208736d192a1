#!/usr/bin/env bash
# Makes the pages of documentation, of the guide and of every public name, and says where. Fails when a
# public name has no documentation. Installs what is missing on Debian.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/install-deps.sh build docs
cmake -S . -B build/docs -G Ninja -DVETRA_DOCS=ON -DVETRA_TOOL=OFF -DVETRA_TESTS=OFF \
    -DVETRA_EXAMPLES=OFF >/dev/null
cmake --build build/docs --target docs
echo "the first page: $PWD/build/docs/docs/html/index.html"

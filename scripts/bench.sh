#!/usr/bin/env bash
# Builds the benchmarks and prints ours beside OpenCV and GDAL, as a table. Options go to Google
# Benchmark, for instance --benchmark_filter='rotated.*8U x 1'. Installs what is missing on Debian.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/install-deps.sh build tool bench >&2
cmake --preset bench >&2
cmake --build --preset bench >&2
exec build/bench/bench/vetra_bench "$@"

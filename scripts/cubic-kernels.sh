#!/usr/bin/env bash
# Writes share/kernels: cubic convolution with other free parameters than that of CUBIC, by the
# formula of R. G. Keys, "Cubic convolution interpolation for digital image processing", IEEE
# Transactions on Acoustics, Speech, and Signal Processing 29 (1981), 1153-1160.
set -euo pipefail
cd "$(dirname "$0")/.."

mkdir -p share/kernels
for a in -0.5 -0.75; do
    awk -v a="$a" 'BEGIN {
        taps = 4
        subpixels = 64
        print taps "," subpixels
        print "# Cubic convolution with free parameter " a " (Keys 1981), written by scripts/cubic-kernels.sh"
        for (phase = 0; phase <= subpixels; ++phase) {
            for (tap = 0; tap < taps; ++tap) {
                x = phase / subpixels + 1 - tap
                if (x < 0) x = -x
                if (x < 1) h = ((a + 2) * x - (a + 3)) * x * x + 1
                else if (x < 2) h = a * (((x - 5) * x + 8) * x - 4)
                else h = 0
                printf "%s%.17g", tap ? "," : "", h + 0
            }
            printf "\n"
        }
    }' >"share/kernels/cubic$a.txt"
done

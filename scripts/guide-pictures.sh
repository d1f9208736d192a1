#!/usr/bin/env bash
# Makes the pictures of docs/choosing-a-method.md, into docs/images: kernel plots, and charts of its
# own enlarged and reduced by several methods. Builds the tool first, unless the path of one is
# given. Installs what is missing on Debian.
set -euo pipefail
cd "$(dirname "$0")/.."

vetra=${1:-}
if [ -z "$vetra" ]; then
    scripts/install-deps.sh build tool guide
    cmake --preset release -DVETRA_TESTS=OFF -DVETRA_EXAMPLES=OFF >/dev/null
    cmake --build --preset release --target vetra_tool
    vetra=build/release/apps/vetra/vetra
fi
out=docs/images
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
rm -rf "$out"
mkdir -p "$out"

cubic05=KERNEL,FILE=share/kernels/cubic-0.5.txt

# chart NAME COLUMNS ROWS FORMULA: an ESRI ASCII grid of the v, -9999 for none, that the formula sets
# for column x and row y.
chart() {
    awk -v cols="$2" -v rows="$3" "BEGIN {
        pi = atan2(0, -1)
        print \"ncols\", cols; print \"nrows\", rows
        print \"xllcorner 0\"; print \"yllcorner 0\"; print \"cellsize 1\"
        print \"NODATA_value -9999\"
        for (y = 0; y < rows; ++y)
            for (x = 0; x < cols; ++x) {
                $4
                printf \"%.3f%s\", v, x + 1 < cols ? \" \" : \"\n\"
            }
    }" >"$work/$1.asc"
}

# rings CHART PICTURE OPTIONS...: a chart without holes, resampled, as a grey picture.
rings() {
    local chart=$1 picture=$2
    shift 2
    "$vetra" resample "$work/$chart.asc" "$out/$picture.png" -q --type 8U --dst-nodata 0 "$@"
}

# edge PICTURE OPTIONS...: the chart of an edge, enlarged, with its hole in red.
printf 'nv 200 40 40\n0 0 0 0\n255 255 255 255\n' >"$work/colours.txt"
edge() {
    local picture=$1
    shift
    "$vetra" resample "$work/edge.asc" "$work/$picture.tif" -q --scale 8 "$@"
    gdaldem color-relief -q -of PNG "$work/$picture.tif" "$work/colours.txt" "$out/$picture.png"
}

# Rings that get finer outwards, to 0.5 cycles per pixel in the corners.
chart fine 64 64 'dx = x - 31.5; dy = y - 31.5
    v = 127.5 + 100 * cos(pi * 0.5 / 45 * (dx * dx + dy * dy))'
# The same to 0.25 cycles at the sides: four times finer than a quarter of the pixels can hold.
chart coarse 560 560 'dx = x - 279.5; dy = y - 279.5
    v = 127.5 + 100 * cos(pi * 0.25 / 280 * (dx * dx + dy * dy))'
# An edge, a spot, a line and a hole.
chart edge 32 24 'd = x - 10 - y / 4 + 0.5
    v = 60 + 135 * (d < 0 ? 0 : d > 1 ? 1 : d)
    if (x == 6 && y == 5) v = 195
    if (x == 28) v = 60
    if ((x - 21) ^ 2 + (y - 15) ^ 2 < 5) v = -9999'

rings fine fine-near --scale 4 --method NEAR
rings fine fine-bilin --scale 4 --method BILIN
rings fine fine-cubic05 --scale 4 --method "$cubic05"
rings fine fine-cubic --scale 4 --method CUBIC
rings fine fine-sinc8 --scale 4 --method SINC8
rings fine fine-sinc16 --scale 4 --method SINC16

rings coarse coarse-near --downsample 4 --method NEAR
rings coarse coarse-bilin --downsample 4 --method BILIN
rings coarse coarse-cubic --downsample 4 --method CUBIC
rings coarse coarse-average --downsample 4 --method AVERAGE
rings coarse coarse-median --downsample 4 --method MEDIAN
rings coarse coarse-gaussian --downsample 4 --method GAUSSIAN

edge edge-near --method NEAR
edge edge-bilin --method BILIN
edge edge-cubic --method CUBIC
edge edge-cubic-range --method CUBIC,MIN=60,MAX=195
edge edge-cubic-bgd --method CUBIC --fill bgd
edge edge-cubicps --method CUBICPS
edge edge-sinc16 --method SINC16

plot() {
    "$vetra" kernel "$2" --plot "$out/kernel-$1.svg"
}
plot near NEAR
plot bilin BILIN
plot cubic CUBIC
plot cubic05 "$cubic05"
plot lagrange4 LAGRANGE4
plot lagrange8 LAGRANGE8
plot sinc8 SINC8
plot sinc8-lanczos SINC8,SHAPINGWINDOW=LANCZOS
plot sinc16 SINC16
plot average AVERAGE,NUMCOLS=4,NUMROWS=4
plot gaussian GAUSSIAN,DSFACTORCOL=4
plot cplxsar CPLXSAR,NUMCOLS=7,NUMROWS=7,FC=0.2

rm -f "$out"/*.aux.xml
for picture in "$out"/*.png; do
    if [ "$(stat -c %s "$picture")" -gt 61440 ]; then
        echo "$picture is larger than 60 KB" >&2
        exit 1
    fi
done
du -sh "$out"

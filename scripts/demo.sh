#!/usr/bin/env bash
# Builds the tool and resamples two real rasters: the earth image of xplanet (8-bit colour) and the
# EGM96 geoid grid of PROJ (float). Leaves pictures in out/demo and says where. Installs what is
# missing on Debian.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/install-deps.sh build tool demo
cmake --preset release -DVETRA_TESTS=OFF -DVETRA_EXAMPLES=OFF >/dev/null
cmake --build --preset release

vetra=build/release/apps/vetra/vetra
out=out/demo
rm -rf "$out"
mkdir -p "$out"
earth=/usr/share/xplanet/images/earth.jpg
geoid=/usr/share/proj/egm96_15.gtx

echo "== the earth at half its size"
"$vetra" resample "$earth" "$out/earth_half.png" --scale 0.5 --method BILIN

echo "== each pixel the mean of 16 x 16"
"$vetra" resample "$earth" "$out/earth_small.png" --downsample 16

echo "== a detail of it, eight times as large: nearest, bilinear, cubic, windowed sinc"
read -r cols rows < <(gdalinfo "$earth" | sed -n 's/^Size is \([0-9]*\), \([0-9]*\)/\1 \2/p')
gdal_translate -q -of VRT -srcwin $((cols / 2)) $((rows / 4)) $((cols / 16)) $((rows / 8)) \
    "$earth" "$out/detail.vrt"
for method in NEAR BILIN CUBIC SINC8; do
    "$vetra" resample "$out/detail.vrt" "$out/detail_${method,,}.png" --scale 8 --method "$method"
done
rm "$out/detail.vrt"

echo "== the geoid's height on a grid of a tenth of a degree"
"$vetra" resample "$geoid" "$out/geoid.tif" --res 0.1 --method BILIN
gdalinfo -mm "$out/geoid.tif" | grep -E '^(Size is|Pixel Size)|Computed Min/Max'
printf '%s\n' '-110 40 0 90' '-50 30 90 190' '0 240 240 220' '40 230 150 40' '90 140 20 20' \
    >"$out/colours.txt"
gdaldem color-relief -q -of PNG "$out/geoid.tif" "$out/colours.txt" "$out/geoid.png"
rm -f "$out/colours.txt" "$out"/*.aux.xml

echo
echo "pictures to look at:"
ls -1 "$PWD/$out"/*.png
echo "and the geoid as float: $PWD/$out/geoid.tif"

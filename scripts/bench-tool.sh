#!/usr/bin/env bash
# Times the tool beside gdalwarp and gdal_translate on a real image, with the same target files and
# as many threads, and prints a table: medians of runs in turn. Fails when the targets' georeferences
# differ. Installs what is missing on Debian.
# Usage: bench-tool.sh [RUNS [THREADS]]
set -euo pipefail
cd "$(dirname "$0")/.."

runs=${1:-5}
threads=${2:-$(nproc)}
scripts/install-deps.sh build tool demo
cmake --preset release -DVETRA_TESTS=OFF -DVETRA_EXAMPLES=OFF >/dev/null
cmake --build --preset release >/dev/null
vetra=build/release/apps/vetra/vetra

folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
source=$folder/earth.tif
gdal_translate -q -outsize 10000 5000 -r cubic -a_ullr -180 90 180 -90 -a_srs EPSG:4326 \
    -co TILED=YES /usr/share/xplanet/images/earth.jpg "$source" 2>/dev/null

# Seconds of a command.
seconds() {
    local start=$EPOCHREALTIME
    "$@" >/dev/null 2>&1
    local end=$EPOCHREALTIME
    echo "$start $end" | awk '{ printf "%.3f\n", $2 - $1 }'
}

median() { sort -n | awk '{ v[NR] = $1 } END { printf "%.2f", (v[int((NR + 1) / 2)] + v[int(NR / 2) + 1]) / 2 }'; }

# Origin and pixel size of an image, a number per line.
georeference() { gdalinfo "$1" | sed -n 's/^\(Origin\|Pixel Size\) = (\(.*\),\(.*\))/\2\n\3/p'; }

compare_georeferences() {
    paste <(georeference "$1") <(georeference "$2") | awk '
        { d = $1 - $2; if (d < 0) d = -d; m = $1 < 0 ? -$1 : $1; if (d > 1e-9 * m) exit 1 }
        END { if (NR != 4) exit 1 }' || { echo "the georeferences differ" >&2; exit 1; }
}

# A line of the table: its name, then the options of both programs.
line() {
    local name=$1 ours_options=$2 theirs_options=$3 n
    : >"$folder/ours"
    : >"$folder/theirs"
    for ((n = 0; n < runs; ++n)); do
        rm -f "$folder"/a.tif "$folder"/b.tif
        # shellcheck disable=SC2086
        seconds "$vetra" $ours_options "$source" "$folder/a.tif" -q --threads "$threads" >>"$folder/ours"
        # shellcheck disable=SC2086
        seconds $theirs_options -q -co TILED=YES "$source" "$folder/b.tif" >>"$folder/theirs"
    done
    compare_georeferences "$folder/a.tif" "$folder/b.tif"
    local ours theirs
    ours=$(median <"$folder/ours")
    theirs=$(median <"$folder/theirs")
    echo "| $name | $ours | $theirs | $(echo "$ours $theirs" | awk '{ printf "%.2f", $1 / $2 }') |"
}

echo "| work | vetra, s | GDAL, s | ours / GDAL's |"
echo "|---|---|---|---|"
extent="-20000000 -15000000 20000000 15000000"
warp="warp --crs EPSG:3857 --extent $extent"
gdalwarp="gdalwarp -multi -wo NUM_THREADS=$threads -wm 256 -t_srs EPSG:3857 -te $extent"
lanczos=SINC8,SHAPINGWINDOW=LANCZOS
line "warp, bilinear" "$warp --res 4000 --method BILIN" "$gdalwarp -tr 4000 4000 -r bilinear"
line "warp, cubic" "$warp --res 4000 --method CUBIC" "$gdalwarp -tr 4000 4000 -r cubic"
line "warp, 8-tap windowed sinc" "$warp --res 4000 --method $lanczos" \
    "$gdalwarp -tr 4000 4000 -r lanczos"
line "warp, mean of 2 x 2" "$warp --res 8000 --method AVERAGE,NUMCOLS=2,NUMROWS=2" \
    "$gdalwarp -tr 8000 8000 -r average"
export GDAL_NUM_THREADS=$threads
translate="gdal_translate -r"
line "scale 0.8, bilinear" "resample --size 8000 4000 --method BILIN" \
    "$translate bilinear -outsize 8000 4000"
line "scale 0.8, cubic" "resample --size 8000 4000 --method CUBIC" \
    "$translate cubic -outsize 8000 4000"
line "scale 0.8, 8-tap windowed sinc" "resample --size 8000 4000 --method $lanczos" \
    "$translate lanczos -outsize 8000 4000"
line "scale 0.5, mean of 2 x 2" "resample --downsample 2" "$translate average -outsize 5000 2500"

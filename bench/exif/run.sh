#!/usr/bin/env bash
# Reads every Exif tag of 500 generated JPEGs with the module's code, with
# exiv2 and with exiftool, each as one process over all the files, and prints
# files per second and the ratios. The data lives under the build folder.
#   EXIF_BENCH_FILES (500), EXIF_BENCH_RUNS (3, the best run counts),
#   LOOMKIT_BUILD_DIR (build)
set -eu
cd "$(dirname "$0")/../.."
BUILD=${LOOMKIT_BUILD_DIR:-build}
COUNT=${EXIF_BENCH_FILES:-500}
RUNS=${EXIF_BENCH_RUNS:-3}
DATA=$BUILD/bench-data/exif
SOURCES=tests/fixtures/exif/camera

[ -f "$BUILD/CMakeCache.txt" ] || cmake -S . -B "$BUILD" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$BUILD" --target bench_exif_read bench_exif_images >/dev/null

if [ ! -f "$DATA/complete-$COUNT" ]; then
    echo "Generating $COUNT JPEGs in $DATA ..."
    rm -rf "$DATA"
    mkdir -p "$DATA"
    QT_QPA_PLATFORM=offscreen "$BUILD/bin/bench_exif_images" "$DATA" "$COUNT"
    # Five cameras' full Exif (maker notes included, both byte orders) in
    # turn, then GPS, a thumbnail and some text on every file.
    cameras=(Canon_40D Nikon_D70 Fujifilm_FinePix6900ZOOM Konica_Minolta_DiMAGE_Z3 Kodak_CX7530)
    for k in "${!cameras[@]}"; do
        group=()
        for ((i = k; i < COUNT; i += ${#cameras[@]})); do
            group+=("$DATA/$(printf 'photo-%03d.jpg' "$i")")
        done
        exiftool -q -q -overwrite_original -TagsFromFile "$SOURCES/${cameras[$k]}.jpg" -all:all \
            "-ThumbnailImage<=$DATA/thumbnail.jpg" \
            -GPSLatitude=48.8584 -GPSLatitudeRef=N -GPSLongitude=2.2945 -GPSLongitudeRef=E \
            -GPSAltitude=35 -GPSAltitudeRef=0 -GPSTimeStamp=12:34:56 -GPSDateStamp=2024:05:06 \
            -Artist="Loomkit bench" -Copyright="CC0" -ImageDescription="A generated test photo" \
            -UserComment="generated" -Software="bench_exif_images" "${group[@]}"
    done
    touch "$DATA/complete-$COUNT"
fi

FILES=("$DATA"/photo-*.jpg)
cat "${FILES[@]}" >/dev/null # every tool starts with the files in the page cache

# best_of <runs> <command...>: the shortest wall time in seconds.
best_of() {
    local runs=$1 best="" start end t
    shift
    for ((r = 0; r < runs; ++r)); do
        start=$(date +%s.%N)
        "$@" >/dev/null 2>&1 || true
        end=$(date +%s.%N)
        t=$(awk -v a="$start" -v b="$end" 'BEGIN { printf "%.6f", b - a }')
        if [ -z "$best" ] || awk -v t="$t" -v b="$best" 'BEGIN { exit !(t < b) }'; then best=$t; fi
    done
    echo "$best"
}

n=${#FILES[@]}
echo "Files: $n ($(du -sh "$DATA" | cut -f1)), best of $RUNS runs, wall time including process start"
"$BUILD/bin/bench_exif_read" "${FILES[@]}" 2>&1 >/dev/null | sed 's/^/  /'
echo "  lines printed: loomkit $("$BUILD/bin/bench_exif_read" "${FILES[@]}" 2>/dev/null | wc -l)," \
     "exiv2 $(exiv2 -q -pa "${FILES[@]}" 2>/dev/null | wc -l)," \
     "exiftool $(exiftool -fast2 -a -G1 -s "${FILES[@]}" 2>/dev/null | wc -l)"

ours=$(best_of "$RUNS" "$BUILD/bin/bench_exif_read" "${FILES[@]}")
exiv2=$(best_of "$RUNS" exiv2 -q -pa "${FILES[@]}")
exiftool=$(best_of "$RUNS" exiftool -fast2 -a -G1 -s "${FILES[@]}")

awk -v n="$n" -v a="$ours" -v b="$exiv2" -v c="$exiftool" 'BEGIN {
    printf "%-10s %9.3f s %10.0f files/s\n", "loomkit", a, n / a
    printf "%-10s %9.3f s %10.0f files/s\n", "exiv2", b, n / b
    printf "%-10s %9.3f s %10.0f files/s\n", "exiftool", c, n / c
    printf "loomkit is %.1fx exiv2 and %.1fx exiftool\n", b / a, c / a
}'

#!/bin/sh
# Extraction and writing speed of ZipReader/ZipWriter against Info-ZIP's
# unzip and zip, on one generated tree of ~300 MB in ~2000 files.
# Usage: bench/zip/run.sh [megabytes]   (BUILD_DIR defaults to build)
set -e
cd "$(dirname "$0")/../.."
BUILD_DIR=${BUILD_DIR:-build}
MB=${1:-300}
[ -f "$BUILD_DIR/CMakeCache.txt" ] || cmake -S . -B "$BUILD_DIR" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$BUILD_DIR" --target bench_zip >/dev/null
BENCH=$BUILD_DIR/bin/bench_zip
WORK=$(realpath "$BUILD_DIR")/bench-zip
TIME=/usr/bin/time
[ -x "$TIME" ] || { echo "needs /usr/bin/time (Debian package time)"; exit 1; }

if [ ! -f "$WORK/.generated-$MB" ]; then
    rm -rf "$WORK"
    mkdir -p "$WORK"
    "$BENCH" generate "$WORK/tree" "$MB"
    touch "$WORK/.generated-$MB"
fi
BYTES=$(du -sb --apparent-size "$WORK/tree" | cut -f1)
FILES=$(find "$WORK/tree" -type f | wc -l)

# measure NAME COMMAND...: runs it, records wall seconds, CPU seconds (user +
# system) and peak RSS (KiB). On a shared machine the CPU time is the
# steadier figure.
measure() {
    name=$1; shift
    sync
    $TIME -f "%e %U %S %M" -o "$WORK/$name.time" "$@"
    set -- $(cat "$WORK/$name.time")
    eval "${name}_s=$1 ${name}_cpu=$(awk -v u="$2" -v s="$3" 'BEGIN { printf "%.2f", u + s }') ${name}_kb=$4"
}
rate() { awk -v b="$BYTES" -v s="$1" 'BEGIN { printf "%.1f", b / 1e6 / s }'; }
ratio() { awk -v a="$1" -v b="$2" 'BEGIN { printf "%.2f", b / a }'; }

rm -f "$WORK/ref.zip" "$WORK/ours.zip"
measure zip sh -c "cd '$WORK/tree' && zip -q -r '$WORK/ref.zip' ."
measure writer "$BENCH" write "$WORK/tree" "$WORK/ours.zip"
unzip -tq "$WORK/ours.zip" >/dev/null

rm -rf "$WORK/out-unzip" "$WORK/out-reader"
measure unzip unzip -o -q "$WORK/ref.zip" -d "$WORK/out-unzip"
measure reader "$BENCH" extract "$WORK/ref.zip" "$WORK/out-reader"
diff -rq "$WORK/tree" "$WORK/out-reader" >/dev/null || { echo "extracted tree differs"; exit 1; }

echo "data: $FILES files, $(awk -v b="$BYTES" 'BEGIN { printf "%.1f", b / 1e6 }') MB; archive $(du -m "$WORK/ref.zip" | cut -f1) MB (zip), $(du -m "$WORK/ours.zip" | cut -f1) MB (ZipWriter)"
printf '%-28s %7s %9s %7s %9s %12s\n' "" "wall s" "MB/s" "CPU s" "MB/CPU s" "peak RSS MB"
for n in reader unzip writer zip; do
    eval "s=\$${n}_s cpu=\$${n}_cpu kb=\$${n}_kb"
    case $n in
        reader) label="ZipReader.extractAll" ;;
        unzip) label="unzip -o -q" ;;
        writer) label="ZipWriter.addFile (level 6)" ;;
        zip) label="zip -q -r (level 6)" ;;
    esac
    printf '%-28s %7s %9s %7s %9s %12s\n' "$label" "$s" "$(rate "$s")" "$cpu" "$(rate "$cpu")" \
        "$(awk -v k="$kb" 'BEGIN { printf "%.1f", k / 1024 }')"
done
echo "extraction ZipReader vs unzip: $(ratio "$reader_s" "$unzip_s")x wall, $(ratio "$reader_cpu" "$unzip_cpu")x CPU"
echo "writing    ZipWriter vs zip:   $(ratio "$writer_s" "$zip_s")x wall, $(ratio "$writer_cpu" "$zip_cpu")x CPU"

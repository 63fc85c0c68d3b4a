#!/bin/sh
# Download 1 GiB to a file and upload 1 GiB as a multipart part over
# loopback, with NetworkRequest and with curl, in the same run; prints MB/s,
# peak memory and the ratios. SIZE_MB changes the size (default 1024).
set -e
cd "$(dirname "$0")/../.."
BUILD_DIR=${LOOMKIT_BUILD_DIR:-build}
SIZE_MB=${SIZE_MB:-1024}
[ -f "$BUILD_DIR/CMakeCache.txt" ] || cmake -S . -B "$BUILD_DIR" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build "$BUILD_DIR" --target bench_network >/dev/null
BENCH="$BUILD_DIR/bin/bench_network"
DATA="$BUILD_DIR/bench-data/network"
mkdir -p "$DATA"
SIZE=$((SIZE_MB * 1024 * 1024))
UPLOAD="$DATA/upload.bin"
# A sparse file: the bytes come from the page cache, for both clients alike.
[ "$(stat -c %s "$UPLOAD" 2>/dev/null)" = "$SIZE" ] || { rm -f "$UPLOAD"; truncate -s "$SIZE" "$UPLOAD"; }

FIFO="$DATA/server.stdin"
rm -f "$FIFO"; mkfifo "$FIFO"
rm -f "$DATA/server.port"
python3 bench/network/bench_server.py < "$FIFO" > "$DATA/server.port" &
SERVER=$!
exec 3> "$FIFO"   # the server runs until this closes
trap 'exec 3>&-; wait $SERVER 2>/dev/null; rm -f "$FIFO" "$DATA"/download-*.bin' EXIT
while [ ! -s "$DATA/server.port" ]; do sleep 0.1; done
PORT=$(cat "$DATA/server.port")
BASE="http://127.0.0.1:$PORT"

# Best of RUNS (default 2) runs, each after a sync, so that the page cache
# of one run does not bill the next: prints "<seconds> <peak MiB>".
measure() {
    best=""
    for _ in $(seq "${RUNS:-2}"); do
        sync
        out=$(python3 bench/network/measure.py "$@" 2>>"$DATA/bench.log") || { echo "failed: $*" >&2; exit 1; }
        rm -f "$DATA"/download-*.bin
        best=$(printf '%s\n%s\n' "$best" "$out" | awk 'NF { if (!t || $1 < t) { t = $1; m = $2 } } END { print t, m }')
    done
    echo "$best"
}
rate() { awk -v b="$SIZE" -v s="$1" 'BEGIN { printf "%.1f", b / s / 1e6 }'; }

echo "Payload: $SIZE_MB MiB over loopback, best of ${RUNS:-2}"
# The download's size is checked once, apart from the timed runs.
"$BENCH" download "$BASE/download?size=$SIZE" "$DATA/download-check.bin" >/dev/null
[ "$(stat -c %s "$DATA/download-check.bin")" = "$SIZE" ] || { echo "NetworkRequest download is incomplete"; exit 1; }
rm -f "$DATA/download-check.bin"
set -- $(measure "$BENCH" download "$BASE/download?size=$SIZE" "$DATA/download-lk.bin"); lk_down_s=$1; lk_down_mem=$2
set -- $(measure curl -s -o "$DATA/download-curl.bin" "$BASE/download?size=$SIZE"); curl_down_s=$1; curl_down_mem=$2
set -- $(measure "$BENCH" upload "$BASE/upload" "$UPLOAD"); lk_up_s=$1; lk_up_mem=$2
set -- $(measure curl -s -o /dev/null -F "file=@$UPLOAD" "$BASE/upload"); curl_up_s=$1; curl_up_mem=$2

lk_down=$(rate "$lk_down_s"); curl_down=$(rate "$curl_down_s")
lk_up=$(rate "$lk_up_s"); curl_up=$(rate "$curl_up_s")
printf '%-34s %10s %10s %12s\n' "" "MB/s" "peak MiB" "seconds"
printf '%-34s %10s %10s %12s\n' "download to file, NetworkRequest" "$lk_down" "$lk_down_mem" "$lk_down_s"
printf '%-34s %10s %10s %12s\n' "download to file, curl" "$curl_down" "$curl_down_mem" "$curl_down_s"
printf '%-34s %10s %10s %12s\n' "multipart upload, NetworkRequest" "$lk_up" "$lk_up_mem" "$lk_up_s"
printf '%-34s %10s %10s %12s\n' "multipart upload, curl" "$curl_up" "$curl_up_mem" "$curl_up_s"
awk -v a="$lk_down" -v b="$curl_down" -v c="$lk_up" -v d="$curl_up" \
    'BEGIN { printf "ratio NetworkRequest/curl: download %.2f, upload %.2f\n", a / b, c / d }'

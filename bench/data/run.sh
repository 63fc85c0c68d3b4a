#!/bin/sh
# Hash and Base64/hex throughput of the module against coreutils, plus the
# JSON settings store. Data is generated under the build tree.
# Usage: bench/data/run.sh [build-dir] [megabytes]
set -e
cd "$(dirname "$0")/../.."
BUILD=${1:-build}
MB=${2:-256}
cmake --build "$BUILD" --target bench_data -j2 >/dev/null
BIN="$BUILD/bin/bench_data"
DATA="$BUILD/bench-data/data"
mkdir -p "$DATA"
FILE="$DATA/random.bin"
[ -f "$FILE" ] && [ "$(stat -c %s "$FILE")" -eq $((MB * 1024 * 1024)) ] || \
    head -c $((MB * 1024 * 1024)) /dev/urandom > "$FILE"
cat "$FILE" > /dev/null   # warm the page cache for both sides

now() { date +%s.%N; }
tool_rate() { # tool_rate <start> <end> -> MB/s
    awk -v a="$1" -v e="$2" -v b="$(stat -c %s "$FILE")" 'BEGIN { printf "%.1f", b / 1e6 / (e - a) }'
}
ratio() { awk -v m="$1" -v t="$2" 'BEGIN { printf "%.2f", m / t }'; }

printf '%-10s %12s %12s %8s\n' "what" "module MB/s" "tool MB/s" "ratio"
for pair in Md5:md5sum Sha1:sha1sum Sha256:sha256sum Sha512:sha512sum; do
    algorithm=${pair%%:*}; tool=${pair##*:}
    module=$("$BIN" hash "$algorithm" "$FILE" 2>/dev/null | awk '{ print $3 }')
    start=$(now); "$tool" "$FILE" > /dev/null; end=$(now)
    other=$(tool_rate "$start" "$end")
    printf '%-10s %12s %12s %8s\n' "$algorithm" "$module" "$other" "$(ratio "$module" "$other")"
done
for algorithm in Sha3_256 Keccak_256 Md4; do
    module=$("$BIN" hash "$algorithm" "$FILE" 2>/dev/null | awk '{ print $3 }')
    printf '%-10s %12s %12s %8s\n' "$algorithm" "$module" "-" "-"
done

module=$("$BIN" base64 "$FILE" | awk '{ print $3 }')
start=$(now); base64 -w0 "$FILE" > "$FILE.tool"; end=$(now)
other=$(tool_rate "$start" "$end")
printf '%-10s %12s %12s %8s\n' "base64" "$module" "$other" "$(ratio "$module" "$other")"
cmp -s "$FILE.out" "$FILE.tool" || { echo "base64 output differs from coreutils"; exit 1; }

module=$("$BIN" hex "$FILE" | awk '{ print $3 }')
start=$(now); basenc --base16 -w0 "$FILE" > "$FILE.tool"; end=$(now)
other=$(tool_rate "$start" "$end")
printf '%-10s %12s %12s %8s\n' "hex" "$module" "$other" "$(ratio "$module" "$other")"
tr a-f A-F < "$FILE.out" | cmp -s - "$FILE.tool" || { echo "hex output differs from basenc"; exit 1; }
rm -f "$FILE.out" "$FILE.tool"

"$BIN" settings 20000 "$DATA"

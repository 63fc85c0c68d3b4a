#!/bin/sh
# Builds the libFuzzer targets with clang (ASan+UBSan) in build-fuzz and runs
# each for a bounded time (FUZZ_SECONDS, default 60) over its seed corpus.
# Usage: scripts/fuzz.sh [target-name-pattern]
set -e
cd "$(dirname "$0")/.."
./scripts/setup-debian.sh
BUILD_DIR=${LOOMKIT_FUZZ_BUILD_DIR:-build-fuzz}
SECONDS_EACH=${FUZZ_SECONDS:-60}
PATTERN=${1:-}
[ -f "$BUILD_DIR/CMakeCache.txt" ] || CC=clang CXX=clang++ cmake -S . -B "$BUILD_DIR" -DCMAKE_BUILD_TYPE=RelWithDebInfo \
    -DLOOMKIT_BUILD_FUZZ=ON -DLOOMKIT_BUILD_TESTS=OFF -DLOOMKIT_BUILD_EXAMPLES=OFF -DLOOMKIT_BUILD_BENCH=OFF
cmake --build "$BUILD_DIR" --parallel "$(nproc)"
status=0
for fuzzer in "$BUILD_DIR"/fuzz/fuzz_*; do
    name=$(basename "$fuzzer")
    case "$name" in *"$PATTERN"*) ;; *) continue ;; esac
    # Seeds live beside the target's source: fuzz/<subsystem>/corpus/<name>/
    seeds=$(find fuzz -type d -path "*/corpus/$name" | head -n 1)
    work="$BUILD_DIR/corpus/$name"
    mkdir -p "$work" "$BUILD_DIR/artifacts/$name"
    echo "== $name for ${SECONDS_EACH}s"
    QT_QPA_PLATFORM=offscreen ASAN_OPTIONS=detect_leaks=0 UBSAN_OPTIONS=halt_on_error=1:print_stacktrace=1 \
        "$fuzzer" -max_total_time="$SECONDS_EACH" -timeout=10 -rss_limit_mb=2048 \
        -artifact_prefix="$BUILD_DIR/artifacts/$name/" "$work" ${seeds:+"$seeds"} || status=1
done
exit $status

#!/bin/sh
# Configures and builds into ./build (or $LOOMKIT_BUILD_DIR).
set -e
cd "$(dirname "$0")/.."
BUILD_DIR=${LOOMKIT_BUILD_DIR:-build}
GENERATOR=""
command -v ninja >/dev/null 2>&1 && GENERATOR="-G Ninja"
[ -f "$BUILD_DIR/CMakeCache.txt" ] || cmake -S . -B "$BUILD_DIR" $GENERATOR -DCMAKE_BUILD_TYPE=RelWithDebInfo "$@"
cmake --build "$BUILD_DIR" --parallel "$(nproc)"

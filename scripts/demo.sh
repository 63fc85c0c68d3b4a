#!/bin/sh
# Sets up, builds and runs the demo. With a display it opens a window; without
# one it renders offscreen, saves build/demo.png and quits.
set -e
cd "$(dirname "$0")/.."
./scripts/setup-debian.sh
./scripts/build.sh
BUILD_DIR=${LOOMKIT_BUILD_DIR:-build}
if [ -n "$DISPLAY$WAYLAND_DISPLAY" ]; then
    exec "$BUILD_DIR/bin/loomkit-run" examples/gallery/main.qml
fi
exec "$BUILD_DIR/bin/loomkit-run" --quit-after 4000 --screenshot "$BUILD_DIR/demo.png" examples/gallery/main.qml

#!/bin/sh
# Renders the viewer on the bundled demo company to a PNG, offscreen.
# Usage: app/qt/render-demo.sh BUILD_DIR [OUTPUT.png]
set -eu
build=${1:?usage: render-demo.sh BUILD_DIR [OUTPUT.png]}
output=${2:-$build/app/qt/dovrel-viewer-demo.png}
cmake --build "$build" --target QtDemoTest
QT_QPA_PLATFORM=offscreen "$build/app/qt/QtDemoTest" >/dev/null
if [ "$output" != "$build/app/qt/dovrel-viewer-demo.png" ]; then
    cp "$build/app/qt/dovrel-viewer-demo.png" "$output"
fi
echo "$output"

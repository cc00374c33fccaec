#!/bin/sh
# Renders the viewer's window on the bundled demo company to PNG files,
# offscreen: at its design size into OUTPUT.png and at 1600x1000 beside it
# (dovrel-viewer-1600x1000.png).
# Usage: app/qt/render-demo.sh BUILD_DIR [OUTPUT.png]
set -eu
build=${1:?usage: render-demo.sh BUILD_DIR [OUTPUT.png]}
output=${2:-$build/app/qt/dovrel-viewer-demo.png}
cmake --build "$build" --target QtViewerWindowTest
QT_QPA_PLATFORM=offscreen "$build/app/qt/QtViewerWindowTest" \
    --gtest_filter='*TheWindowGrowsAndShrinks*' >/dev/null
cp "$build/app/qt/dovrel-viewer-window.png" "$output"
cp "$build/app/qt/dovrel-viewer-1600x1000.png" "$(dirname "$output")/dovrel-viewer-1600x1000.png"
echo "$output"

#!/bin/sh
# Saves PNG screenshots of the Translate window and the text editor into
# docs/screenshots/: builds build-gui, translates the sample control file
# with the program itself, then opens the windows on it under Xvfb.
set -e
cd "$(dirname "$0")/.."
sh scripts/install-deps.sh
cmake -S . -B build-gui -G Ninja -DZV_GUI=ON >/dev/null
ninja -C build-gui -j2 zurevazidu zv_screenshots appdata >/dev/null
APP=build-gui/app
OUT=$(mktemp -d)
trap 'rm -rf "$OUT"' EXIT
mkdir -p docs/screenshots
# The program's own unattended run, answered from the console.
ZUREVAZIDU_UI=console "$APP/zurevazidu" "-t|CTL2PAC|$APP/samples/sample.ctl|$OUT/unattended.pac" </dev/null
test -s "$OUT/unattended.pac"
xvfb-run -a -s "-screen 0 1280x1024x24" \
  build-gui/tests/gui/zv_screenshots "$APP" "$PWD/$APP/samples/sample.ctl" "$OUT" "$PWD/docs/screenshots"

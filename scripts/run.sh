#!/bin/sh
# Builds and starts the program: the Translate window when a display is
# there, otherwise a demonstration translation of the shipped samples.
set -e
cd "$(dirname "$0")/.."
sh scripts/build.sh
APP=build/app
if [ -n "$DISPLAY$WAYLAND_DISPLAY" ] && [ "$QT_QPA_PLATFORM" != "offscreen" ]; then
  exec "$APP/zurevazidu" "$@"
fi
OUT=$(mktemp -d)
echo "No display: demonstration translations of $APP/samples into $OUT"
for job in "CTL2PAC|sample.ctl|sample.pac" "PAC2CTL|sample.pac|sample.ctl" "PRJ2CTL|sample.prj|from-prj.ctl"; do
  def=${job%%|*}; rest=${job#*|}; in=${rest%%|*}; out=${rest#*|}
  echo
  echo "== zurevazidu '-t|$def|$APP/samples/$in|$OUT/$out'"
  "$APP/zurevazidu" "-t|$def|$APP/samples/$in|$OUT/$out" </dev/null
  echo "-- wrote $OUT/$out:"
  head -n 24 "$OUT/$out" | tr -d '\r'
  echo "..."
done

#!/bin/sh
# Coordinate conversion from the window, by keyboard: a control file
# reprojected through the Coordinate Conversion dialog (its output side as
# the user left it last time), then one typed point converted and its report
# shown.
# Usage: coordinate-conversion.sh <application folder>
. "$(dirname "$0")/lib.sh"
start_session "$1"
D="$WORK/data"
mkdir -p "$D" "$XDG_CONFIG_HOME/VORN"
cp "$WORK/app/samples/sample.ctl" "$D/job.ctl"
# The choices remembered from an earlier session: to UTM zone 16 north in metres.
printf '%s\n' '[Coordinate%20Conversion]' \
  'Output%20Coordinate%20System=UTM NAD 83' 'Output%20Zone=Zone 16N' \
  'Output%20Horizontal%20Datum=NAD 83' 'Output%20Horizontal%20Units=Meters' \
  'Output%20Vertical%20Datum=NAVD 88' 'Output%20Vertical%20Units=Meters' \
  'Scale%20Factor=1' 'Convergence%20Angle=1' 'Lat%20Long=0' 'Geoid%20Heights=0' \
  >"$XDG_CONFIG_HOME/VORN/VORN Zurevazidu.ini"

start_app "-s|False|$D/|$D/|job"
MAIN="VORN Zurevazidu - $("$WORK/app/zurevazidu" --version | sed 's/.* //')"
wait_window "$MAIN" >/dev/null
expect_focus "$MAIN"
choose_item alt+i "VORN Con"
choose_item alt+u "VORN Con"
choose_item alt+a "Reproject"
replace_field alt+l "$D/utm.ctl"
keys Return
wait_window "Coordinate Conversion" >/dev/null
expect_focus "Coordinate Conversion"
keys Return
wait_window "VORN Zurevazidu" >/dev/null
expect_focus "VORN Zurevazidu"
keys Return
grep -q "^ZN:Zone 16N" "$D/utm.ctl" || fail "the reprojected file is not in UTM zone 16N"
grep -q "^YC:4932071.8324" "$D/utm.ctl" || fail "CP100 is not at its UTM northing"
expect_focus "$MAIN"

# One typed point: the dialog now remembers the file's input side.
choose_item alt+i "Coord"
keys Return
wait_window "Coordinate Conversion" >/dev/null
expect_focus "Coordinate Conversion"
keys Return
wait_window "Coordinate Entry" >/dev/null
expect_focus "Coordinate Entry"
type_text "CP100"
keys Tab
type_text "247795.6047"
keys Tab
type_text "2072520.8575"
keys Return
wait_window "Coordinate Conversion Results" >/dev/null
expect_focus "Coordinate Conversion Results"
keys Return
wait_gone "Coordinate Conversion Results"
expect_focus "$MAIN"
grep -q "Input%20Zone=Wisconsin Central 4802" "$XDG_CONFIG_HOME/VORN/VORN Zurevazidu.ini" ||
  fail "the accepted settings were not remembered"
pass

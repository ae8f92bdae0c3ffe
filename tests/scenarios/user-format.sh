#!/bin/sh
# A user-defined text file read into a control file by keyboard: the format
# chosen in the User-Defined Input Format dialog, its coordinate system and
# zone picked from the lists (the zone fills the datums and units), then the
# output and the choices remembered for the next time.
# Usage: user-format.sh <application folder>
. "$(dirname "$0")/lib.sh"
start_session "$1"
D="$WORK/data"
mkdir -p "$D"
cp "$WORK/app/samples/sample-pnezd.csv" "$D/job.csv"

start_app "-s|False|$D/|$D/|job"
MAIN="VORN Zurevazidu - $("$WORK/app/zurevazidu" --version | sed 's/.* //')"
wait_window "$MAIN" >/dev/null
expect_focus "$MAIN"
choose_item alt+i "User"
choose_item alt+u "VORN Con"
replace_field alt+f "$D/job.csv"
replace_field alt+l "$D/job.ctl"
keys Return
wait_window "User-Defined Input Format" >/dev/null
expect_focus "User-Defined Input Format"
# The format box is editable: F4 opens its list.
keys alt+f F4
type_text "PNEZD C"
keys Return
choose_item alt+s "State Plane 1983"
choose_item alt+z "Wisconsin S"
keys Return
wait_window "Conversion Complete" >/dev/null
expect_focus "Conversion Complete"
keys Return
wait_gone "Conversion Complete"
expect_focus "$MAIN"

[ -f "$D/job.ctl" ] || fail "no control file written"
grep -q "^ZN:Wisconsin South 4803" "$D/job.ctl" || fail "the chosen zone is not in the header"
grep -q "^HD:NAD 83" "$D/job.ctl" || fail "the zone did not fill the horizontal datum"
[ "$(grep -c '^AC:OS' "$D/job.ctl")" = 12 ] || fail "not every point of the file was read"
grep -q "^YC:412345.6780" "$D/job.ctl" || fail "point 100 lost its northing"
INI="$XDG_CONFIG_HOME/VORN/VORN Zurevazidu.ini"
sed -n '/^\[FlexIn\]/,/^\[/p' "$INI" >"$WORK/flexin"
grep -qx "Format=PNEZD Comma" "$WORK/flexin" || fail "the format was not remembered"
grep -qx "Zone=Wisconsin South 4803" "$WORK/flexin" || fail "the zone was not remembered"
grep -qx "Vertical%20Units=U.S. Survey Feet" "$WORK/flexin" ||
  fail "the vertical units were not remembered"
pass

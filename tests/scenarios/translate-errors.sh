#!/bin/sh
# A surveyor drives the Translate window with the keyboard: a reader error in
# the first moment of a run, a question during a run and a missing tool, each
# answered from the keyboard; then a good translation and its result box.
# Usage: translate-errors.sh <application folder>
. "$(dirname "$0")/lib.sh"
start_session "$1"
D="$WORK/data"
mkdir -p "$D"
printf 'AC:PD\r\nPN:1\r\n\r\nXX:5\r\n' >"$D/bad.ctl"
cp "$WORK/app/samples/sample.ctl" "$D/good.ctl"
printf 'EXTRACT.EXE\r\nExtract Points\r\nVORN Control Files (*.CTL)\r\nVORN Control Files (*.CTL)\r\nFEATCODES.TRN\r\n' \
  >"$WORK/app/UTIFiles/EXTRACT.uti"

start_app "-s|False|$D/|$D/|job"
MAIN="VORN Zurevazidu - $("$WORK/app/zurevazidu" --version | sed 's/.* //')"
wait_window "$MAIN" >/dev/null
expect_focus "$MAIN"

# Control file to points-and-chains, chosen by typing in the lists.
choose_item alt+i "VORN Con"
replace_field alt+f "$D/bad.ctl"
choose_item alt+u "VORN Poi"
replace_field alt+l "$D/out.pac"
keys Return
wait_window "Invalid VORN Control File" >/dev/null
sleep 1 # longer than the busy window's delay
expect_focus "Invalid VORN Control File"
keys Return
wait_gone "Invalid VORN Control File"
[ -e "$D/out.pac" ] && fail "a failed read wrote an output"

# The same translation of a good file ends with its result box, whole title.
replace_field alt+f "$D/good.ctl"
keys Return
BOX=$(wait_window "Conversion Complete")
expect_focus "Conversion Complete"
[ "$(window_width "$BOX")" -ge 200 ] || fail "the result box cuts its title"
keys Return
wait_gone "Conversion Complete"
grep -q '^PN:' "$D/out.pac" || fail "no points in the output"

# A question during a run, answered No by its letter, then a missing tool.
choose_item alt+u "VORN Con"
choose_item alt+a "Extract"
replace_field alt+l "$D/out.ctl"
keys Return
wait_window "Any Match?" >/dev/null
sleep 1
expect_focus "Any Match?"
keys n
wait_window "Program Not Found" >/dev/null
expect_focus "Program Not Found"
keys Return
wait_gone "Program Not Found"

# The window still answers: Escape ends the program.
expect_focus "$MAIN"
keys Escape
for _ in $(seq 50); do kill -0 "$APP_PID" 2>/dev/null || break; sleep 0.1; done
kill -0 "$APP_PID" 2>/dev/null && fail "the program did not end"
APP_PID=
pass

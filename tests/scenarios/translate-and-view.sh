#!/bin/sh
# A translation chosen from the keyboard, its output named in the save
# dialog without an extension, then the output opened in the viewer and
# looked at as records.
# Usage: translate-and-view.sh <application folder>
. "$(dirname "$0")/lib.sh"
start_session "$1"
D="$WORK/data"
mkdir -p "$D"
cp "$WORK/app/samples/sample.ctl" "$D/job.ctl"

start_app "-s|True|$D/|$D/|job"
MAIN="VORN Zurevazidu - $("$WORK/app/zurevazidu" --version | sed 's/.* //')"
wait_window "$MAIN" >/dev/null
expect_focus "$MAIN"
choose_item alt+i "VORN Con"
choose_item alt+u "VORN Poi"
keys alt+s
wait_window "Output to File:" >/dev/null
expect_focus "Output to File:"
type_text "result"
keys Return
wait_gone "Output to File:"
keys Return
wait_window "Conversion Complete" >/dev/null
keys Return
[ -f "$D/result.PAC" ] || fail "the save dialog did not add the type's extension"
VIEWER=$(windows | awk -v p="$D/result.PAC" 'index($0, p) { print $1; exit }')
[ -n "$VIEWER" ] || fail "no viewer on the output"
# The View menu is there for a points-and-chains file: the record view.
keys alt+v r
sleep 0.5
keys alt+f x
for _ in $(seq 30); do xdotool getwindowname "$VIEWER" >/dev/null 2>&1 || break; sleep 0.1; done
xdotool getwindowname "$VIEWER" >/dev/null 2>&1 && fail "the viewer did not close"
expect_focus "$MAIN"
pass

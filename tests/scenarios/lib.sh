# Shared steps of the scenario scripts: a private X server with a window
# manager, a copy of the application folder, and keyboard helpers that act as
# a user would (keys go to whatever window has the focus).
# Usage in a scenario: . lib.sh; start_session <app folder>; ...; pass
set -u

fail() {
  echo "FAIL: $*" >&2
  if [ -n "${DISPLAY:-}" ] && command -v xwd >/dev/null 2>&1; then
    xwd -root -silent -out "$WORK/failure.xwd" 2>/dev/null &&
      echo "screen saved in $WORK/failure.xwd" >&2
  fi
  windows >&2
  exit 1
}

cleanup() {
  [ -n "${APP_PID:-}" ] && kill "$APP_PID" 2>/dev/null
  [ -n "${WM_PID:-}" ] && kill "$WM_PID" 2>/dev/null
  [ -n "${X_PID:-}" ] && kill "$X_PID" 2>/dev/null
  if [ "${KEEP:-0}" = 1 ]; then echo "kept $WORK" >&2; else rm -rf "$WORK"; fi
}

# start_session APPFOLDER: X server, window manager, $WORK with a copy of the
# application folder in $WORK/app (its own instance lock).
start_session() {
  WORK=$(mktemp -d)
  trap cleanup EXIT
  trap 'exit 1' INT TERM
  cp -r "$1" "$WORK/app"
  exec 3>"$WORK/display"
  Xvfb -displayfd 3 -screen 0 1280x1024x24 -nolisten tcp >/dev/null 2>&1 &
  X_PID=$!
  exec 3>&-
  for _ in $(seq 50); do [ -s "$WORK/display" ] && break; sleep 0.1; done
  [ -s "$WORK/display" ] || fail "Xvfb did not start"
  DISPLAY=":$(cat "$WORK/display")"
  export DISPLAY
  unset WAYLAND_DISPLAY QT_QPA_PLATFORM ZUREVAZIDU_UI
  # Per-user settings of this session only.
  XDG_CONFIG_HOME="$WORK/config"
  export XDG_CONFIG_HOME
  openbox >/dev/null 2>&1 &
  WM_PID=$!
  sleep 0.5
}

# start_app ARGS...: the program, in the background, output in $WORK/app.log.
start_app() {
  "$WORK/app/zurevazidu" "$@" >"$WORK/app.log" 2>&1 &
  APP_PID=$!
}

windows() {
  for id in $(xdotool search --onlyvisible --name '.' 2>/dev/null); do
    printf '%s %s\n' "$id" "$(xdotool getwindowname "$id" 2>/dev/null)"
  done
}

# window_id TITLE: the visible window whose title is exactly TITLE.
window_id() { windows | awk -v t="$1" '{ id = $1; sub(/^[^ ]* /, ""); if ($0 == t) { print id; exit } }'; }

# wait_window TITLE [SECONDS]: prints the window's id once it is up.
wait_window() {
  for _ in $(seq $((${2:-10} * 10))); do
    id=$(window_id "$1")
    [ -n "$id" ] && { echo "$id"; return 0; }
    sleep 0.1
  done
  fail "no window '$1'"
}

# wait_gone TITLE [SECONDS]
wait_gone() {
  for _ in $(seq $((${2:-10} * 10))); do
    [ -z "$(window_id "$1")" ] && return 0
    sleep 0.1
  done
  fail "window '$1' is still open"
}

# The window with the keyboard focus must be TITLE (a box hidden under
# another, or one that cannot take the keyboard, fails here).
expect_focus() {
  for _ in $(seq 30); do
    [ "$(xdotool getactivewindow getwindowname 2>/dev/null)" = "$1" ] && return 0
    sleep 0.1
  done
  fail "focus is on '$(xdotool getactivewindow getwindowname 2>/dev/null)', not '$1'"
}

keys() { xdotool key --delay 60 "$@"; sleep 0.2; }
type_text() { xdotool type --delay 20 "$1"; sleep 0.2; }
# replace_field KEY TEXT: a mnemonic to a text box, then its new content.
replace_field() { keys "$1" ctrl+a; type_text "$2"; }

# choose_item KEY TEXT: a mnemonic to a list, then its entry by typing the
# start of it in the opened list.
choose_item() { keys "$1" space; type_text "$2"; keys Return; }

# window_width ID
window_width() { xdotool getwindowgeometry "$1" | sed -n 's/.*Geometry: \([0-9]*\)x.*/\1/p'; }

pass() {
  echo "PASS: $(basename "$0" .sh)"
  exit 0
}

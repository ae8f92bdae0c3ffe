#!/bin/sh
# Benchmarks the localization tool: grid to local of a generated control file
# (Wisconsin Central, U.S. survey feet, every point with an ellipsoid height)
# with the combined factor computed from all points. Prints the median wall
# time (with the CPU time of that run: on a busy machine the wall time
# includes waiting), peak memory and throughput.
# usage: scripts/bench-local.sh [points] [runs]
#   BUILD=build-dir (default build; built with scripts/build.sh when it is "build")
set -e
cd "$(dirname "$0")/.."
POINTS=${1:-1000000}
RUNS=${2:-5}
BUILD=${BUILD:-build}
WORK=$(mktemp -d)
trap 'rm -rf "$WORK"' EXIT
if [ "$BUILD" = build ]; then sh scripts/build.sh >/dev/null; fi
"$BUILD"/bench/translate/zv_make_control "$POINTS" "$WORK/grid.ctl"
printf '%s\r\n%s\r\n1\r\n\r\n' "$WORK/grid.ctl" "$WORK/local" >"$WORK/TRANS.JOB"
TOOL=$(pwd)/$BUILD/app/Pintrel/Local.EXE
IN_MB=$(du -m "$WORK/grid.ctl" | cut -f1)
for i in $(seq "$RUNS"); do
  rm -f "$WORK/local.ctl"
  (cd "$WORK" && /usr/bin/time -f "%e %M %U %S" -o "$WORK/time.$i" "$TOOL")
done
test -s "$WORK/local.ctl"
grep -m1 '^CM:COMB. FACTOR' "$WORK/local.ctl"
OUT_MB=$(du -m "$WORK/local.ctl" | cut -f1)
cat "$WORK"/time.* | sort -n | awk -v n="$RUNS" -v inmb="$IN_MB" -v outmb="$OUT_MB" -v pts="$POINTS" '
  { wall[NR] = $1; cpu[NR] = $3 + $4; if ($2 > mem) mem = $2 }
  END {
    med = wall[int((n + 1) / 2)]
    printf "grid to local: points %d, input %d MB, output %d MB, runs %d\n", pts, inmb, outmb, n
    printf "median wall %.2f s (CPU %.2f s), peak memory %.0f MB, %.0f points/s\n", med,
      cpu[int((n + 1) / 2)], mem / 1024, pts / med
  }'

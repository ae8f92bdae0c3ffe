#!/bin/sh
# Benchmarks an unattended translation of a generated control file: median
# wall time, peak memory and throughput.
#   translate: control to points-and-chains (default 1,000,000 points)
#   reproject: control reprojected from Wisconsin Central to Wisconsin South,
#              both NAD 83, no datum shift (default 100,000 points)
#   flex:      comma-separated point, northing, easting, elevation, code file
#              to a control file with the user format "PNEZD Comma"
#              (default 1,000,000 points)
# usage: scripts/bench-translate.sh [translate|reproject|flex] [points] [runs]
set -e
cd "$(dirname "$0")/.."
MODE=${1:-translate}
RUNS=${3:-5}
WORK=$(mktemp -d)
trap 'rm -rf "$WORK"' EXIT
case "$MODE" in
  translate)
    POINTS=${2:-1000000}
    JOB="CTL2PAC|$WORK/big.ctl|$WORK/big.out" ;;
  reproject)
    POINTS=${2:-100000}
    printf '[Coordinate Conversion]\r\nOutput Coordinate System=State Plane 1983\r\nOutput Zone=Wisconsin South 4803\r\nOutput Horizontal Datum=NAD 83\r\nOutput Horizontal Units=U.S. Survey Feet\r\nOutput Vertical Datum=NAVD 88\r\nOutput Vertical Units=U.S. Survey Feet\r\nScale Factor=1\r\nConvergence Angle=1\r\nLat Long=1\r\nGeoid Heights=0\r\n' >"$WORK/settings.TRN"
    JOB="CTLREPROJ|$WORK/big.ctl|$WORK/big.out|$WORK/settings.TRN" ;;
  flex)
    POINTS=${2:-1000000}
    JOB="FLEX2CTL|$WORK/big.csv|$WORK/big.out|PNEZD Comma" ;;
  *) echo "usage: $0 [translate|reproject|flex] [points] [runs]" >&2; exit 2 ;;
esac
sh scripts/build.sh >/dev/null
if [ "$MODE" = flex ]; then
  INPUT="$WORK/big.csv"
  awk -v n="$POINTS" 'BEGIN { for (i = 1; i <= n; i++)
    printf "%d,%.3f,%.3f,%.3f,CP\r\n", i, 400000 + i * 0.013, 2100000 + i * 0.021, 800 + (i % 997) * 0.1 }' >"$INPUT"
else
  INPUT="$WORK/big.ctl"
  build/bench/translate/zv_make_control "$POINTS" "$INPUT"
fi
IN_MB=$(du -m "$INPUT" | cut -f1)
for i in $(seq "$RUNS"); do
  rm -f "$WORK/big.out"
  ZUREVAZIDU_UI=console /usr/bin/time -f "%e %M" -o "$WORK/time.$i" build/app/zurevazidu "-t|$JOB" </dev/null
done
OUT_MB=$(du -m "$WORK/big.out" | cut -f1)
cat "$WORK"/time.* | sort -n | awk -v n="$RUNS" -v inmb="$IN_MB" -v outmb="$OUT_MB" -v pts="$POINTS" -v mode="$MODE" '
  { wall[NR] = $1; if ($2 > mem) mem = $2 }
  END {
    med = wall[int((n + 1) / 2)]
    printf "%s: points %d, input %d MB, output %d MB, runs %d\n", mode, pts, inmb, outmb, n
    printf "median wall %.2f s, peak memory %.0f MB\n", med, mem / 1024
    printf "throughput: %.0f MB/s read+write (input %.0f MB/s, output %.0f MB/s over the whole run)\n", (inmb + outmb) / med, inmb / med, outmb / med
  }'

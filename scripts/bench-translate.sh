#!/bin/sh
# Benchmarks an unattended control to points-and-chains translation of a
# generated control file: median wall time, peak memory and throughput.
# usage: scripts/bench-translate.sh [points] [runs]
set -e
cd "$(dirname "$0")/.."
POINTS=${1:-1000000}
RUNS=${2:-5}
sh scripts/build.sh >/dev/null
WORK=$(mktemp -d)
trap 'rm -rf "$WORK"' EXIT
build/bench/translate/zv_make_control "$POINTS" "$WORK/big.ctl"
IN_MB=$(du -m "$WORK/big.ctl" | cut -f1)
for i in $(seq "$RUNS"); do
  rm -f "$WORK/big.pac"
  /usr/bin/time -f "%e %M" -o "$WORK/time.$i" build/app/zurevazidu "-t|CTL2PAC|$WORK/big.ctl|$WORK/big.pac" </dev/null
done
OUT_MB=$(du -m "$WORK/big.pac" | cut -f1)
cat "$WORK"/time.* | sort -n | awk -v n="$RUNS" -v inmb="$IN_MB" -v outmb="$OUT_MB" -v pts="$POINTS" '
  { wall[NR] = $1; if ($2 > mem) mem = $2 }
  END {
    med = wall[int((n + 1) / 2)]
    printf "points %d, input %d MB, output %d MB, runs %d\n", pts, inmb, outmb, n
    printf "median wall %.2f s, peak memory %.0f MB\n", med, mem / 1024
    printf "throughput: %.0f MB/s read+write (input %.0f MB/s, output %.0f MB/s over the whole run)\n", (inmb + outmb) / med, inmb / med, outmb / med
  }'

#!/bin/sh
# Compares the unattended translations of two builds side by side: wall and
# CPU time (medians) and peak memory of a 1,000,000-point control file translated to a
# points-and-chains file and back, then one line per other reader and writer
# (each run reads one format and writes another, so its time bounds both).
#   usage: scripts/bench-workarea.sh [before-tree] [points] [runs]
# The before tree (default ../lean-before) is built as Release in
# build-before, this tree in build-lean.
set -e
cd "$(dirname "$0")/.."
AFTER_TREE=$(pwd)
BEFORE_TREE=${1:-$AFTER_TREE/../lean-before}
POINTS=${2:-1000000}
RUNS=${3:-5}
export CCACHE_DIR=${CCACHE_DIR:-/work/.ccache} CCACHE_NOHASHDIR=1

build() {  # tree builddir
  cmake -S "$1" -B "$1/$2" -G Ninja -DCMAKE_BUILD_TYPE=Release -DZV_SCENARIOS=OFF \
    -DCMAKE_CXX_COMPILER_LAUNCHER=ccache >/dev/null
  ninja -C "$1/$2" -j2 zurevazidu appdata zv_make_control >/dev/null
}
build "$BEFORE_TREE" build-before
build "$AFTER_TREE" build-lean
BEFORE=$BEFORE_TREE/build-before
AFTER=$AFTER_TREE/build-lean

WORK=$(mktemp -d)
trap 'rm -rf "$WORK"' EXIT

translate() {  # build job input output
  ZUREVAZIDU_UI=console "$1/app/zurevazidu" "-t|$2|$3|$4" </dev/null >/dev/null
}

run() {  # build job input timefile
  rm -f "$WORK/out"
  ZUREVAZIDU_UI=console /usr/bin/time -f "%e %U %S %M" -o "$4" \
    "$1/app/zurevazidu" "-t|$2|$3|$WORK/out" </dev/null >/dev/null
}

median() { sort -n | awk '{ v[NR] = $1 } END { print v[int((NR + 1) / 2)] }'; }

# Median wall and CPU seconds and peak MB of the runs in the files given.
summary() {
  wall=$(cat "$@" | awk '{ print $1 }' | median)
  cpu=$(cat "$@" | awk '{ print $2 + $3 }' | median)
  mb=$(cat "$@" | awk '$4 > m { m = $4 } END { printf "%.0f", m / 1024 }')
  printf '%6.2f %6.2f %5s' "$wall" "$cpu" "$mb"
}

"$AFTER/bench/translate/zv_make_control" "$POINTS" "$WORK/in.ctl"
translate "$AFTER" CTL2PAC "$WORK/in.ctl" "$WORK/in.pac"
translate "$AFTER" CTL2WSI "$WORK/in.ctl" "$WORK/in.wsi"
translate "$AFTER" CTL2SRV "$WORK/in.ctl" "$WORK/in.srv"
cp "$WORK/in.ctl" "$WORK/in.prj"  # a control file reads as a project file

echo "points $POINTS, control file $(du -m "$WORK/in.ctl" | cut -f1) MB; load: $(uptime | sed 's/.*load average: //')"
printf '%-20s %-22s %-22s\n' "" "   before" "   after"
printf '%-20s %-22s %-22s\n' "translation" "  wall    CPU s    MB" "  wall    CPU s    MB"
# Before and after runs alternate, so that both see the same load.
row() {  # label job input runs
  for i in $(seq "$4"); do
    run "$BEFORE" "$2" "$3" "$WORK/before.$i"
    run "$AFTER" "$2" "$3" "$WORK/after.$i"
  done
  printf '%-20s %s   %s\n' "$1" "$(summary "$WORK"/before.*)" "$(summary "$WORK"/after.*)"
  rm -f "$WORK"/before.* "$WORK"/after.*
}
row "control -> p&c" CTL2PAC "$WORK/in.ctl" "$RUNS"
row "p&c -> control" PAC2CTL "$WORK/in.pac" "$RUNS"
OTHER_RUNS=$(( RUNS < 3 ? RUNS : 3 ))
row "project -> control" PRJ2CTL "$WORK/in.prj" "$OTHER_RUNS"
row "control -> control" CTL2CTL "$WORK/in.ctl" "$OTHER_RUNS"
row "p&c -> p&c" PAC2PAC "$WORK/in.pac" "$OTHER_RUNS"
row "control -> WSI" CTL2WSI "$WORK/in.ctl" "$OTHER_RUNS"
row "WSI -> control" WSI2CTL "$WORK/in.wsi" "$OTHER_RUNS"
row "WSI -> WSI" WSI2WSI "$WORK/in.wsi" "$OTHER_RUNS"
row "control -> SRV" CTL2SRV "$WORK/in.ctl" "$OTHER_RUNS"
row "SRV -> control" SRV2CTL "$WORK/in.srv" "$OTHER_RUNS"
row "SRV -> SRV" SRV2SRV "$WORK/in.srv" "$OTHER_RUNS"

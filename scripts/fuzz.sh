#!/bin/sh
# Builds the libFuzzer targets of the tagged-file readers in build-fuzz (clang,
# AddressSanitizer and UndefinedBehaviorSanitizer) and runs each for a short
# time on a seed corpus made from tests/fixtures.
#   scripts/fuzz.sh [seconds per target]   (default 30, or FUZZ_SECONDS)
# FUZZ_TARGETS names the targets (default: all of them).
# Inputs that fail are kept in build-fuzz/findings/<target>/.
set -e
cd "$(dirname "$0")/.."
SECONDS_EACH=${1:-${FUZZ_SECONDS:-30}}
JOBS=${JOBS:-2}
TARGETS=${FUZZ_TARGETS:-control pac project ngs wsi srv flexin replace}
cmake -S . -B build-fuzz -G Ninja -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_BUILD_TYPE=RelWithDebInfo \
  -DZV_FUZZ=ON -DZV_SANITIZE=ON -DZV_BENCH=OFF -DZV_GUI=OFF >/dev/null
# shellcheck disable=SC2086
ninja -C build-fuzz -j"$JOBS" $(for t in $TARGETS; do printf 'zv_fuzz_%s ' "$t"; done)
status=0
for target in $TARGETS; do
  corpus=build-fuzz/corpus/$target
  findings=build-fuzz/findings/$target
  mkdir -p "$corpus" "$findings"
  case $target in
    control | pac | project)
      cp tests/fixtures/control/* tests/fixtures/pac/* tests/fixtures/project/* "$corpus"/ ;;
    flexin) cp -r tests/fixtures/flex/. "$corpus"/ ;;
    *)
      if [ -d "tests/fixtures/$target" ]; then cp -r "tests/fixtures/$target"/. "$corpus"/; fi ;;
  esac
  echo "fuzzing $target for $SECONDS_EACH s"
  if ! "build-fuzz/fuzz/zv_fuzz_$target" -max_total_time="$SECONDS_EACH" -timeout=10 \
      -rss_limit_mb=2048 -print_final_stats=1 -artifact_prefix="$findings/" "$corpus" \
      >"build-fuzz/fuzz-$target.log" 2>&1; then
    echo "zv_fuzz_$target found a failure: see build-fuzz/fuzz-$target.log and $findings/"
    status=1
  fi
  grep -E '^stat::(number_of_executed_units|peak_rss_mb)' "build-fuzz/fuzz-$target.log" || true
done
exit $status

#!/usr/bin/env bash
# scripts/fuzz.sh [--seconds S] [--jobs J] [--replay-only] [family...]
# Builds the libFuzzer programs of fuzz/ with clang (build-fuzz: coverage, AddressSanitizer,
# UndefinedBehaviorSanitizer), then for each family (all of them by default):
#   1. replays its seed corpus fuzz/corpus/<family> and its kept crash inputs
#      fuzz/regressions/<family>: any failure fails the run;
#   2. fuzzes it for S seconds (default 60), J families at a time (default 2), starting from
#      the seed corpus; new inputs go to build-fuzz/work/<family>, never into the sources.
# A crash, leak or hang input is copied to fuzz/regressions/<family>/ (commit it with the fix:
# step 1 then replays it for good) and the run fails. Executions per family are printed at the
# end. Environment: FUZZ_SECONDS and FUZZ_JOBS as defaults for S and J.
set -euo pipefail
cd "$(dirname "$0")/.."
seconds=${FUZZ_SECONDS:-60}
jobs=${FUZZ_JOBS:-2}
replay_only=0
families=()
while [ $# -gt 0 ]; do
  case "$1" in
    --seconds) seconds=$2; shift 2 ;;
    --jobs) jobs=$2; shift 2 ;;
    --replay-only) replay_only=1; shift ;;
    -*) echo "unknown argument: $1" >&2; exit 2 ;;
    *) families+=("$1"); shift ;;
  esac
done
bash scripts/deps.sh cmake ninja-build clang-14 libclang-rt-14-dev
if [ ${#families[@]} -eq 0 ]; then
  for src in fuzz/fuzz_*.cpp; do
    f=${src#fuzz/fuzz_}
    families+=("${f%.cpp}")
  done
fi

build=build-fuzz
CC=clang-14 CXX=clang++-14 cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release \
  -DORVQ7_BUILD_FUZZ=ON -DORVQ7_BUILD_TESTS=OFF -DORVQ7_FORTRAN=OFF >/dev/null
cmake --build "$build" -j 2 --target fuzz_all

export ASAN_OPTIONS=${ASAN_OPTIONS:-detect_leaks=1:abort_on_error=1}
export UBSAN_OPTIONS=${UBSAN_OPTIONS:-print_stacktrace=1:halt_on_error=1}
limits=(-timeout=10 -rss_limit_mb=2048 -max_len=4096)

printf '\n== replay of the seed corpora and the kept crash inputs\n'
for f in "${families[@]}"; do
  mkdir -p "fuzz/corpus/$f" "fuzz/regressions/$f"
  dirs=("fuzz/corpus/$f")
  [ -n "$(ls -A "fuzz/regressions/$f")" ] && dirs+=("fuzz/regressions/$f")
  if ! "$build/fuzz/fuzz_$f" "${limits[@]}" -runs=0 "${dirs[@]}" >"$build/replay_$f.log" 2>&1; then
    tail -n 40 "$build/replay_$f.log" >&2
    echo "fuzz_$f: a corpus or regression input fails (log: $build/replay_$f.log)" >&2
    exit 1
  fi
  echo "fuzz_$f: $(find "${dirs[@]}" -type f | wc -l) inputs replayed"
done
[ "$replay_only" = 1 ] && exit 0

printf '\n== fuzzing, %s s per family, %s at a time\n' "$seconds" "$jobs"
fuzz_one() {
  local f=$1 work=$build/work/$1 art=$build/artifacts/$1/ rc=0
  rm -rf "$art"
  mkdir -p "$work" "$art"
  "$build/fuzz/fuzz_$f" "${limits[@]}" -max_total_time="$seconds" -print_final_stats=1 \
    -artifact_prefix="$art" "$work" "fuzz/corpus/$f" >"$build/fuzz_$f.log" 2>&1 || rc=$?
  echo "$rc" >"$build/fuzz_$f.rc"
}
for f in "${families[@]}"; do
  while [ "$(jobs -rp | wc -l)" -ge "$jobs" ]; do wait -n || true; done
  fuzz_one "$f" &
done
wait

printf '\n== results\n'
failed=0
for f in "${families[@]}"; do
  log=$build/fuzz_$f.log
  runs=$(sed -n 's/^stat::number_of_executed_units: *//p' "$log" | tail -n 1)
  found=$(find "$build/artifacts/$f" -type f | wc -l)
  [ "$(cat "$build/fuzz_$f.rc")" = 0 ] || [ "$found" -gt 0 ] || {
    failed=1
    tail -n 20 "$log" >&2
  }
  printf 'fuzz_%-12s %12s executions  %s new inputs  %s failing\n' "$f" "${runs:-?}" \
    "$(find "$build/work/$f" -type f | wc -l)" "$found"
  if [ "$found" -gt 0 ]; then
    failed=1
    cp "$build/artifacts/$f"/* "fuzz/regressions/$f/"
    grep -m 3 -E 'ERROR|runtime error|\*\*\*' "$log" >&2 || true
    echo "  kept in fuzz/regressions/$f/: $(ls "$build/artifacts/$f" | tr '\n' ' ')" >&2
  fi
done
[ "$failed" = 0 ] || { echo "fuzzing found failures" >&2; exit 1; }
echo "fuzzing: no failure"
